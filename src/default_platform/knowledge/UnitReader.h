// Lengths, angles and other quantities read from text.
#ifndef ZOR_DEFAULT_PLATFORM_KNOWLEDGE_UNITREADER_H
#define ZOR_DEFAULT_PLATFORM_KNOWLEDGE_UNITREADER_H

#include <map>
#include <optional>
#include <string>

#include "platform/system/ZORUnicodeString.h"

namespace ZORDefault {

/// Base units with their powers: a length is {m: 1}, an area {m: 2}.
using Dimension = std::map<std::string, int>;

/// @return true when the dictionary of units could be read (which is done at the first call).
bool IsUnitDictionaryThere();

/// Reads a decimal number followed by a unit of a dimension, blanks allowed around both.
/// @return the value in the dimension's base units; nothing when the text is anything else.
std::optional<double> ReadQuantity(const ZORUnicodeString& inText, const Dimension& inDimension);

}  // namespace ZORDefault

#endif
