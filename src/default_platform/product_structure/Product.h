// A product of an opened model.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_PRODUCT_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_PRODUCT_H

#include <vector>

#include "default_platform/OpenModel.h"
#include "default_platform/product_structure/ModelData.h"
#include "default_platform/system/InterfaceRegistry.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"

class ZOR3DRep;

namespace ZORDefault {

class ModelDocument;

/// Gives the product behind any of its interfaces; private to this platform.
class ProductIdentity : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  virtual class Product& GetProduct() = 0;
};

/// A product and all its interfaces. Products belong to their document and share its reference
/// count: a handle on one keeps the document, and so the whole tree, alive; no product counts
/// another.
class Product final : public FacetedComponent, private CountedObject<Product> {
 public:
  static const char* CountedName() { return "Product"; }

  /// @param inIndex in the document's model.
  Product(ModelDocument& inDocument, std::size_t inIndex, Product* inParent);
  ~Product();
  Product(const Product&) = delete;
  Product& operator=(const Product&) = delete;

  ZORBaseUnknown* FindFacet(const IID& inInterface) override;
  ZORMetaClass* GetClass() const override;
  unsigned int AddReference() override;
  unsigned int ReleaseReference() override;

  ZORIProduct* GetInterface() { return &product_; }
  Product* GetParent() const { return parent_; }
  const std::vector<Product*>& GetChildren() const { return children_; }
  void AddChild(Product* inChild) { children_.push_back(inChild); }
  ModelDocument& GetDocument() const { return *document_; }
  const ModelProduct& GetModelProduct() const;
  const ModelPart& GetPart() const;
  const ZORUnicodeString& GetAlias() const;
  const ZORMathTransformation& GetRootFromProduct() const { return rootFromProduct_; }
  ProductInfo GetInfo() const;
  /// Whether a name in an alias path refers to this product among its siblings.
  bool IsCalled(const ZORUnicodeString& inName) const;

  /// The representation, made at the first call; null when there is nothing to show.
  ZOR3DRep* GetRep();
  const ZORVisPropertiesValues& GetProperties() const { return properties_; }
  void SetProperties(const ZORVisPropertiesValues& inValues);
  /// Whether the product itself has triangles or edges, not only its descendants.
  bool HasGeometry() const { return GetPart().mesh != nullptr; }

 private:
  struct ProductFacet final : Facet<ZORIProduct, Product> {
    using Facet::Facet;
    ZORListValZORBaseUnknown_var* GetChildren(const char* inInterfaceName) override;
    ZORIProduct_var GetFatherProduct() override;
  };
  struct InSessionFacet final : Facet<ZORIProductInSession, Product> {
    using Facet::Facet;
    HRESULT GetRepresentationName(int& outState, int inShown, ZORUnicodeString& outName) override;
    HRESULT GetRepresentation(int& outState, int inShown, ZORBaseUnknown_var& outRep) override;
  };
  struct AliasFacet final : Facet<ZORIAlias, Product> {
    using Facet::Facet;
    ZORUnicodeString GetAlias() override { return self_.GetAlias(); }
  };
  struct SpecObjectFacet final : Facet<ZORISpecObject, Product> {
    using Facet::Facet;
    ZORISpecObject* GetFather() override;
  };
  struct LinkableFacet final : Facet<ZORILinkableObject, Product> {
    using Facet::Facet;
    ZORDocument* GetDocument() override;
  };
  struct GeoVisuFacet final : Facet<ZORI3DGeoVisu, Product> {
    using Facet::Facet;
    ZORRep* GetRep() override;
  };
  struct VisPropertiesFacet final : Facet<ZORIVisProperties, Product> {
    using Facet::Facet;
    HRESULT GetPropertiesAtt(ZORVisPropertiesValues& outValues, int inProperties, int inGeometry,
                             int inReserved, int inAlsoReserved) override;
    HRESULT SetPropertiesAtt(const ZORVisPropertiesValues& inValues) override;
  };
  struct IdentityFacet final : Facet<ProductIdentity, Product> {
    using Facet::Facet;
    Product& GetProduct() override { return self_; }
  };

  void MakeRep();
  void ShowColour(const ZORVisPropertiesValues& inValues);

  ModelDocument* document_;
  std::size_t index_;
  Product* parent_;
  std::vector<Product*> children_;
  ZORMathTransformation rootFromProduct_;
  ZORVisPropertiesValues properties_;
  ZOR3DRep* rep_ = nullptr;
  bool isRepMade_ = false;

  ProductFacet product_;
  InSessionFacet inSession_;
  AliasFacet alias_;
  SpecObjectFacet specObject_;
  LinkableFacet linkable_;
  GeoVisuFacet geoVisu_;
  VisPropertiesFacet visProperties_;
  IdentityFacet identity_;
};

}  // namespace ZORDefault

#endif
