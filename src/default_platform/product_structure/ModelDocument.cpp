#include "default_platform/product_structure/ModelDocument.h"

#include <algorithm>

#include "default_platform/product_structure/Aliases.h"
#include "platform/system/ZORUnicodeChar.h"

namespace ZORDefault {
namespace {

ZORUnicodeString ToUnicode(const std::u16string& inText) {
  ZORUnicodeString text;
  text.BuildFromUTF16(inText.data(), inText.size());
  return text;
}

}  // namespace

ModelDocument::ModelDocument(ModelData inModel, const std::u16string& inFileName)
    : model_(std::move(inModel)), document_(*this), providersFacet_(*this) {
  for (const std::u16string& alias : AliasesOf(model_, inFileName))
    aliases_.push_back(ToUnicode(alias));
  products_.reserve(model_.products.size());
  for (const ModelProduct& product : model_.products) {
    const bool isRoot = product.father == ModelProduct::kNoFather;
    Product* const father =
        isRoot ? nullptr : products_[static_cast<std::size_t>(product.father)].get();
    products_.push_back(std::make_unique<Product>(*this, products_.size(), father));
    if (father) father->AddChild(products_.back().get());
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

unsigned int ModelDocument::AddReference() { return ++referenceCount_; }

unsigned int ModelDocument::ReleaseReference() {
  const unsigned int left = --referenceCount_;
  if (left == 0) delete this;
  return left;
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
  // A reference on one of its own products would keep the document alive for ever.
  const bool isOwn = self_.Holds(inProvider) || inProvider->IsEqual(&self_.document_);
  self_.providers_.push_back(
      {inInterface, inProvider, isOwn ? ZORBaseUnknown_var() : ZORBaseUnknown_var(inProvider)});
  return S_OK;
}

}  // namespace ZORDefault
