// The names by which people know products.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_ALIASES_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_ALIASES_H

#include <string>
#include <vector>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// The text with U+FFFD for each character that XML 1.0 cannot carry.
std::u16string CarriedByXml(std::u16string inText);

/// The alias of each product of a model, in the model's order: its own name, or its part's, or
/// "Component"; siblings that would have the same are numbered from .1 on, passing over a number
/// that would give the name of another sibling.
/// @param inFileName stands for the root's name where it has none.
std::vector<std::u16string> AliasesOf(const ModelData& inModel, const std::u16string& inFileName);

}  // namespace ZORDefault

#endif
