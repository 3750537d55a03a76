// Where a clash result says that products stand.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_CLASHPLACEMENTS_H
#define ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_CLASHPLACEMENTS_H

#include <array>
#include <map>
#include <string>

namespace products {

/// As GetCoefficients gives them: three columns, then the translation.
typedef std::array<double, 12> Placement;

/// The placements of all products of a clash result, by their alias paths.
std::map<std::string, Placement> PlacementsIn(const std::string& inPath);

}  // namespace products

#endif
