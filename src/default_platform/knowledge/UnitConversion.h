// What one unit is of another.
#ifndef ZOR_DEFAULT_PLATFORM_KNOWLEDGE_UNIT_CONVERSION_H
#define ZOR_DEFAULT_PLATFORM_KNOWLEDGE_UNIT_CONVERSION_H

#include <optional>
#include <string>

namespace ZORDefault {

/// False where the dictionary of units cannot be read: then there are no magnitudes.
bool AreUnitsKnown();

/// What a unit has to be multiplied by to give another. Both are products of words with whole
/// powers, in UTF-8, such as "mm", "m^2" or "kg.m/s2". Not for several threads at once.
/// @return nothing where one is unknown or they are no multiples of each other.
std::optional<double> ConversionFactor(const std::string& inFrom, const std::string& inTo);

}  // namespace ZORDefault

#endif
