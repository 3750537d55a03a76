#include "lyra/Language.h"

#include <cstdlib>

namespace lyra {

void ChooseLanguage(const std::string& inLanguage) {
  if (!inLanguage.empty()) setenv("ZOR_LANG", inLanguage.c_str(), 1);
}

}  // namespace lyra
