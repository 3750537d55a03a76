#include "foundation/CharacterTables.h"

#include <locale.h>
#include <wchar.h>
#include <wctype.h>

namespace ZORFoundation {
namespace {

// Loaded when the first text beyond ASCII comes, whatever the process's locale, and kept.
locale_t Tables() {
  static const locale_t tables = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  return tables;
}

}  // namespace

char32_t CaseFoldedCharacter(char32_t inCharacter) {
  const locale_t tables = Tables();
  if (tables == nullptr) return inCharacter;
  return static_cast<char32_t>(
      towlower_l(towupper_l(static_cast<wint_t>(inCharacter), tables), tables));
}

int ColumnsOfCharacter(char32_t inCharacter) {
  const locale_t tables = Tables();
  if (tables == nullptr) return wcwidth(static_cast<wchar_t>(inCharacter));
  const locale_t previous = uselocale(tables);
  const int columns = wcwidth(static_cast<wchar_t>(inCharacter));
  uselocale(previous);
  return columns;
}

}  // namespace ZORFoundation
