// The document of an opened model.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDOCUMENT_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELDOCUMENT_H

#include <memory>
#include <string>
#include <vector>

#include "default_platform/product_structure/ModelData.h"
#include "default_platform/product_structure/Product.h"
#include "default_platform/system/InterfaceRegistry.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/system/ZORUnicodeString.h"

namespace ZORDefault {

ZORUnicodeString UnicodeFromUtf16(const std::u16string& inText);

/// Owns a model and its products. Deleted with the last reference to itself or to any of them.
class ModelDocument final : public CountedComponent, private CountedObject<ModelDocument> {
 public:
  static const char* CountedName() { return "ModelDocument"; }

  /// @param inFileName the root's name where it has none.
  ModelDocument(ModelData inModel, const std::u16string& inFileName);
  ModelDocument(const ModelDocument&) = delete;
  ModelDocument& operator=(const ModelDocument&) = delete;

  ZORBaseUnknown* FindFacet(const IID& inInterface) override;
  ZORMetaClass* GetClass() const override;

  ZORDocument* GetInterface() { return &document_; }
  Product& GetRoot() { return *products_.front(); }
  const ModelData& GetModel() const { return model_; }
  const ZORUnicodeString& GetAlias(std::size_t inProduct) const { return aliases_[inProduct]; }

 private:
  struct ProvidersFacet final : Facet<ZORIProviders, ModelDocument> {
    using Facet::Facet;
    HRESULT AddProvider(const IID& inInterface, ZORBaseUnknown* inProvider) override;
  };
  struct Provider {
    IID interfaceId;
    ZORBaseUnknown* component;
    ZORBaseUnknown_var reference;  // empty for the document's own products
  };

  bool Holds(ZORBaseUnknown* inComponent) const;

  ModelData model_;
  std::vector<ZORUnicodeString> aliases_;
  std::vector<std::unique_ptr<Product>> products_;
  std::vector<Provider> providers_;
  Facet<ZORDocument> document_;
  ProvidersFacet providersFacet_;
};

/// The text with U+FFFD for each character that XML 1.0 cannot carry.
ZOR_PLATFORM_EXPORT std::u16string ReplaceInvalidXmlChars(std::u16string inText);

/// The alias of each product of a model, in the model's order: its own name, or its part's, or
/// "Component"; siblings with the same alias are numbered from .1 on, skipping a number that
/// would give the name of another sibling.
/// @param inFileName stands for the root's name where it has none.
ZOR_PLATFORM_EXPORT std::vector<std::u16string> AliasesOf(const ModelData& inModel,
                                                          const std::u16string& inFileName);

}  // namespace ZORDefault

#endif
