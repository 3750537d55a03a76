#include "default_platform/product_structure/Aliases.h"

#include <map>
#include <set>

#include "default_platform/system/Utf8.h"

namespace ZORDefault {
namespace {

bool IsCarriedUnit(char16_t inUnit) {
  if (inUnit < 0x20) return inUnit == u'\t' || inUnit == u'\n' || inUnit == u'\r';
  return inUnit != 0xFFFE && inUnit != 0xFFFF;
}

bool IsPairAt(const std::u16string& inText, std::size_t inPosition) {
  return inPosition + 1 < inText.size() && IsHighSurrogate(inText[inPosition]) &&
         IsLowSurrogate(inText[inPosition + 1]);
}

std::u16string NameOf(const ModelData& inModel, const ModelProduct& inProduct,
                      const std::u16string& inFileName) {
  if (!inProduct.name.empty()) return inProduct.name;
  const std::u16string& partName = inModel.parts[inProduct.part].name;
  if (!partName.empty()) return partName;
  const bool isRoot = inProduct.father == ModelProduct::kNoFather;
  return isRoot && !inFileName.empty() ? inFileName : u"Component";
}

std::u16string Numbered(const std::u16string& inName, std::size_t inNumber) {
  const std::string digits = std::to_string(inNumber);
  return inName + u'.' + std::u16string(digits.begin(), digits.end());
}

/// Numbers the aliases that several of these siblings bear.
void TellApart(const std::vector<std::size_t>& inSiblings, std::vector<std::u16string>& ioAliases) {
  std::map<std::u16string, std::size_t> bearers;
  for (const std::size_t sibling : inSiblings) ++bearers[ioAliases[sibling]];
  if (bearers.size() == inSiblings.size()) return;
  std::map<std::u16string, std::size_t> numbers;
  std::set<std::u16string> given;
  for (const std::size_t sibling : inSiblings) {
    const std::u16string name = ioAliases[sibling];
    if (bearers[name] < 2) continue;
    std::u16string alias;
    do alias = Numbered(name, ++numbers[name]);
    while (bearers.contains(alias) || !given.insert(alias).second);
    ioAliases[sibling] = alias;
  }
}

}  // namespace

std::u16string CarriedByXml(std::u16string inText) {
  for (std::size_t i = 0; i < inText.size(); ++i) {
    if (IsPairAt(inText, i)) {
      ++i;
    } else if (!IsCarriedUnit(inText[i]) || IsHighSurrogate(inText[i]) ||
               IsLowSurrogate(inText[i])) {
      inText[i] = kReplacementCharacter;
    }
  }
  return inText;
}

std::vector<std::u16string> AliasesOf(const ModelData& inModel, const std::u16string& inFileName) {
  std::vector<std::u16string> aliases;
  std::vector<std::vector<std::size_t>> children(inModel.products.size());
  for (const ModelProduct& product : inModel.products) {
    if (product.father != ModelProduct::kNoFather)
      children[static_cast<std::size_t>(product.father)].push_back(aliases.size());
    aliases.push_back(CarriedByXml(NameOf(inModel, product, inFileName)));
  }
  for (const auto& siblings : children) TellApart(siblings, aliases);
  return aliases;
}

}  // namespace ZORDefault
