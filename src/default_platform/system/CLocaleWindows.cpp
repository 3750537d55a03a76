#include <locale.h>

#include <string>

#include "default_platform/system/CLocale.h"

namespace ZORDefault {

// From here on this thread has a locale of its own, at first a copy of the process's.
CLocaleScope::CLocaleScope() : previous_(nullptr) {
  const std::string present = setlocale(LC_NUMERIC, nullptr);
  if (present == "C") return;
  _configthreadlocale(_ENABLE_PER_THREAD_LOCALE);
  previous_ = new std::string(present);
  setlocale(LC_NUMERIC, "C");
}

CLocaleScope::~CLocaleScope() {
  if (previous_ == nullptr) return;
  const auto* const previous = static_cast<std::string*>(previous_);
  setlocale(LC_NUMERIC, previous->c_str());
  delete previous;
}

}  // namespace ZORDefault
