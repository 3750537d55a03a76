#include "default_platform/product_structure/ModelDocument.h"

#include <algorithm>
#include <map>
#include <set>

#include "foundation/Utf8.h"
#include "platform/system/ZORUnicodeChar.h"

namespace ZORDefault {

ZORUnicodeString UnicodeFromUtf16(const std::u16string& inText) {
  ZORUnicodeString text;
  text.BuildFromUTF16(inText.data(), inText.size());
  return text;
}

namespace {

bool IsXmlUnit(char16_t inUnit) {
  if (inUnit < 0x20) return inUnit == u'\t' || inUnit == u'\n' || inUnit == u'\r';
  return inUnit != 0xFFFE && inUnit != 0xFFFF;
}

bool IsPairAt(const std::u16string& inText, std::size_t inPosition) {
  return inPosition + 1 < inText.size() && ZORFoundation::IsHighSurrogate(inText[inPosition]) &&
         ZORFoundation::IsLowSurrogate(inText[inPosition + 1]);
}

std::u16string NameOf(const ModelData& inModel, const ModelProduct& inProduct,
                      const std::u16string& inFileName) {
  if (!inProduct.name.empty()) return inProduct.name;
  const std::u16string& partName = inModel.parts[inProduct.part].name;
  if (!partName.empty()) return partName;
  const bool isRoot = inProduct.parent == ModelProduct::kNoParent;
  return isRoot && !inFileName.empty() ? inFileName : u"Component";
}

std::u16string Numbered(const std::u16string& inName, std::size_t inNumber) {
  const std::string digits = std::to_string(inNumber);
  return inName + u'.' + std::u16string(digits.begin(), digits.end());
}

void NumberDuplicates(const std::vector<std::size_t>& inSiblings,
                      std::vector<std::u16string>& ioAliases) {
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

ModelDocument::ModelDocument(ModelData inModel, const std::u16string& inFileName)
    : model_(std::move(inModel)), document_(*this), providersFacet_(*this) {
  for (const std::u16string& alias : AliasesOf(model_, inFileName))
    aliases_.push_back(UnicodeFromUtf16(alias));
  products_.reserve(model_.products.size());
  for (const ModelProduct& product : model_.products) {
    const bool isRoot = product.parent == ModelProduct::kNoParent;
    Product* const parent =
        isRoot ? nullptr : products_[static_cast<std::size_t>(product.parent)].get();
    products_.push_back(std::make_unique<Product>(*this, products_.size(), parent));
    if (parent) parent->AddChild(products_.back().get());
  }
}

ZORBaseUnknown* ModelDocument::FindFacet(const IID& inInterface) {
  if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORDocument::ClassId())
    return &document_;
  return inInterface == ZORIProviders::ClassId() ? &providersFacet_ : nullptr;
}

ZORMetaClass* ModelDocument::GetClass() const {
  static ZORMetaClass* const meta = fct_RetrieveMetaObject(
      "ZORModelDocument", kZORTypeImplementation, ZORBaseUnknown::MetaObject(), "ZORNull",
      "ProductStructure", sizeof(ModelDocument));
  return meta;
}

bool ModelDocument::Holds(ZORBaseUnknown* inComponent) const {
  const ZORInterfaceHandle<ProductIdentity> product = ZORBaseUnknown_var(inComponent);
  return !product.IsNull() && &product->GetProduct().GetDocument() == this;
}

HRESULT ModelDocument::ProvidersFacet::AddProvider(const IID& inInterface,
                                                   ZORBaseUnknown* inProvider) {
  if (!inProvider) return E_INVALIDARG;
  const bool isKnown = std::ranges::any_of(self_.providers_, [&](const Provider& provider) {
    return provider.interfaceId == inInterface && provider.component->IsEqual(inProvider);
  });
  if (isKnown) return E_FAIL;
  // A reference to one of its own products would be a cycle.
  const bool isOwn = self_.Holds(inProvider) || inProvider->IsEqual(&self_.document_);
  self_.providers_.push_back(
      {inInterface, inProvider, isOwn ? ZORBaseUnknown_var() : ZORBaseUnknown_var(inProvider)});
  return S_OK;
}

std::u16string ReplaceInvalidXmlChars(std::u16string inText) {
  for (std::size_t i = 0; i < inText.size(); ++i) {
    if (IsPairAt(inText, i)) {
      ++i;
    } else if (!IsXmlUnit(inText[i]) || ZORFoundation::IsHighSurrogate(inText[i]) ||
               ZORFoundation::IsLowSurrogate(inText[i])) {
      inText[i] = ZORFoundation::kReplacementCharacter;
    }
  }
  return inText;
}

std::vector<std::u16string> AliasesOf(const ModelData& inModel, const std::u16string& inFileName) {
  std::vector<std::u16string> aliases;
  std::vector<std::vector<std::size_t>> children(inModel.products.size());
  for (const ModelProduct& product : inModel.products) {
    if (product.parent != ModelProduct::kNoParent)
      children[static_cast<std::size_t>(product.parent)].push_back(aliases.size());
    aliases.push_back(ReplaceInvalidXmlChars(NameOf(inModel, product, inFileName)));
  }
  for (const auto& siblings : children) NumberDuplicates(siblings, aliases);
  return aliases;
}

}  // namespace ZORDefault
