// Properties of characters, from the tables of Unicode.
#ifndef ZOR_FOUNDATION_CHARACTERTABLES_H
#define ZOR_FOUNDATION_CHARACTERTABLES_H

#include "ZORFoundationExport.h"

namespace ZORFoundation {

/// Case folding by way of the capital letter, so that both small forms of the Greek sigma compare
/// equal.
ZOR_FOUNDATION_EXPORT char32_t CaseFoldedCharacter(char32_t inCharacter);

/// The number of terminal columns that a character takes, 0 to 2; negative when unknown.
ZOR_FOUNDATION_EXPORT int ColumnsOfCharacter(char32_t inCharacter);

}  // namespace ZORFoundation

#endif
