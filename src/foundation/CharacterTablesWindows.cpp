// ICU's tables, since the C library of Windows has none.
#include <unicode/uchar.h>

#include "foundation/CharacterTables.h"

namespace ZORFoundation {

char32_t CaseFoldedCharacter(char32_t inCharacter) {
  return static_cast<char32_t>(u_tolower(u_toupper(static_cast<UChar32>(inCharacter))));
}

int ColumnsOfCharacter(char32_t inCharacter) {
  const auto character = static_cast<UChar32>(inCharacter);
  const int width = u_getIntPropertyValue(character, UCHAR_EAST_ASIAN_WIDTH);
  if (width == U_EA_FULLWIDTH || width == U_EA_WIDE) return 2;
  constexpr unsigned int kWithoutColumn = U_GC_MN_MASK | U_GC_ME_MASK | U_GC_CF_MASK;
  constexpr char32_t kSoftHyphen = 0xAD;
  return (U_MASK(u_charType(character)) & kWithoutColumn) != 0 && inCharacter != kSoftHyphen ? 0
                                                                                             : 1;
}

}  // namespace ZORFoundation
