#include "default_platform/space_analysis/StandingProduct.h"

#include <vector>

#include "default_platform/product_structure/Product.h"
#include "default_platform/space_analysis/Vectors.h"
#include "default_platform/visualisation/DrawnMesh.h"
#include "default_platform/visualisation/PlacedMeshRep.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace ZORDefault {
namespace {

/// The rows of an inverse matrix are the cross products of the columns.
ZORMathTransformation Inverse(const ZORMathTransformation& inPlacement) {
  const ZORMath3x3Matrix& matrix = inPlacement.GetMatrix();
  const ZORMathVector a = matrix.GetColumn(0), b = matrix.GetColumn(1), c = matrix.GetColumn(2);
  const double scale = 1 / matrix.Determinant();
  const ZORMathVector x = scale * Cross(b, c), y = scale * Cross(c, a), z = scale * Cross(a, b);
  const ZORMath3x3Matrix inverse({x.x, y.x, z.x}, {x.y, y.y, z.y}, {x.z, y.z, z.z});
  ZORMathTransformation result;
  result.SetMatrix(inverse);
  result.SetVector(-1 * (inverse * inPlacement.GetVector()));
  return result;
}

class StandingProduct final : public FacetedComponent, private CountedObject<StandingProduct> {
 public:
  static const char* CountedName() { return "StandingProduct"; }

  StandingProduct(Product& inProduct, const ZORMathTransformation& rootFromProduct)
      : original_(inProduct.GetInterface()), product_(*this), geoVisu_(*this) {
    if (const ZOR3DRep* const rep = inProduct.GetRep())
      MakeRep(*rep, rootFromProduct * Inverse(inProduct.GetRootFromProduct()));
  }
  StandingProduct(const StandingProduct&) = delete;
  StandingProduct& operator=(const StandingProduct&) = delete;

  ZORBaseUnknown* FindFacet(const IID& inInterface) override {
    if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORIProduct::ClassId())
      return &product_;
    return inInterface == ZORI3DGeoVisu::ClassId() ? &geoVisu_ : nullptr;
  }
  ZORMetaClass* GetClass() const override { return original_->GetMetaObject(); }
  unsigned int AddReference() override { return ++referenceCount_; }
  unsigned int ReleaseReference() override {
    const unsigned int left = --referenceCount_;
    if (left == 0) delete this;
    return left;
  }
  ZORIProduct* GetInterface() { return &product_; }

 private:
  /// All interfaces but the representation's are the model's product's.
  template <class Interface>
  class StandingFacet : public Facet<Interface> {
   public:
    explicit StandingFacet(StandingProduct& inOwner) : Facet<Interface>(inOwner), self_(inOwner) {}
    HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
      if (self_.FindFacet(inInterface))
        return Facet<Interface>::QueryInterface(inInterface, outInterface);
      return self_.original_->QueryInterface(inInterface, outInterface);
    }
    using Facet<Interface>::QueryInterface;

   protected:
    StandingProduct& self_;
  };
  class ProductFacet final : public StandingFacet<ZORIProduct> {
   public:
    using StandingFacet::StandingFacet;
    ZORListValZORBaseUnknown_var* GetChildren(const char* inInterfaceName) override {
      return self_.original_->GetChildren(inInterfaceName);
    }
    ZORIProduct_var GetFatherProduct() override { return self_.original_->GetFatherProduct(); }
  };
  class GeoVisuFacet final : public StandingFacet<ZORI3DGeoVisu> {
   public:
    using StandingFacet::StandingFacet;
    ZORRep* GetRep() override { return self_.rep_; }
  };

  ~StandingProduct() {
    if (rep_) rep_->Destroy();
    for (PlacedMeshRep* const mesh : meshes_) mesh->Destroy();
  }
  void MakeRep(const ZOR3DRep& inRep, const ZORMathTransformation& standingFromModel) {
    rep_ = new ZOR3DBagRep();
    for (const DrawnMesh& drawn : CollectDrawnMeshes(inRep)) {
      meshes_.push_back(
          new PlacedMeshRep(drawn.mesh, standingFromModel * drawn.rootFromPart, &drawn.colour));
      if (drawn.isColourImposed)
        meshes_.back()->SetInheritanceMode(ZORRep::kOwnColour | ZORRep::kImposeColour);
      rep_->AddChild(meshes_.back());
    }
  }

  unsigned int referenceCount_ = 0;
  ZORIProduct_var original_;
  ZOR3DBagRep* rep_ = nullptr;
  std::vector<PlacedMeshRep*> meshes_;
  ProductFacet product_;
  GeoVisuFacet geoVisu_;
};

}  // namespace

ZORIProduct_var StandAt(const ZORIProduct_var& inProduct,
                        const ZORMathTransformation& rootFromProduct) {
  const ZORInterfaceHandle<ProductIdentity> product = inProduct;
  if (product.IsNull()) return {};
  return ZORIProduct_var(
      (new StandingProduct(product->GetProduct(), rootFromProduct))->GetInterface());
}

}  // namespace ZORDefault
