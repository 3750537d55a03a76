// What the tables of Unicode say of a character.
#ifndef ZOR_FOUNDATION_CHARACTERTABLES_H
#define ZOR_FOUNDATION_CHARACTERTABLES_H

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// The small letter of the capital, so that both forms of a letter such as the Greek sigma meet.
ZOR_FOUNDATION_EXPORT char32_t CaseFoldedCharacter(char32_t inCharacter);

/// How many columns of a terminal it takes: 0 to 2; negative when that is not known.
ZOR_FOUNDATION_EXPORT int ColumnsOfCharacter(char32_t inCharacter);

}  // namespace ZORFoundation

#endif
