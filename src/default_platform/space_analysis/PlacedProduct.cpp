#include "default_platform/space_analysis/PlacedProduct.h"

#include <cstdlib>
#include <optional>
#include <vector>

#include "default_platform/product_structure/Product.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "foundation/Vector3.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace ZORDefault {
namespace {

using namespace ZORFoundation;

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

class PlacedProduct final : public CountedComponent, private CountedObject<PlacedProduct> {
 public:
  static const char* CountedName() { return "PlacedProduct"; }

  PlacedProduct(Product& inProduct, const ZORMathTransformation& rootFromProduct,
                const PartColour* inColour)
      : original_(inProduct.GetInterface()),
        properties_(inProduct.GetProperties()),
        product_(*this),
        geoVisu_(*this),
        visProperties_(*this) {
    if (inColour) {
      properties_.SetColor((*inColour)[0], (*inColour)[1], (*inColour)[2]);
      properties_.SetInheritance(ZORVisPropertiesValues::kColour, 1);
    }
    if (const ZOR3DRep* const rep = inProduct.GetRep())
      MakeRep(*rep, rootFromProduct * Inverse(inProduct.GetRootFromProduct()));
  }
  PlacedProduct(const PlacedProduct&) = delete;
  PlacedProduct& operator=(const PlacedProduct&) = delete;

  ZORBaseUnknown* FindFacet(const IID& inInterface) override {
    if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORIProduct::ClassId())
      return &product_;
    if (inInterface == ZORI3DGeoVisu::ClassId()) return &geoVisu_;
    return inInterface == ZORIVisProperties::ClassId() ? &visProperties_ : nullptr;
  }
  ZORMetaClass* GetClass() const override { return original_->GetMetaObject(); }
  ZORIProduct* GetInterface() { return &product_; }

 private:
  /// All interfaces but those of what is shown are the model's product's.
  template <class Interface>
  struct PlacedFacet : Facet<Interface, PlacedProduct> {
    using Base = Facet<Interface, PlacedProduct>;
    using Base::Base;
    using Base::QueryInterface;
    HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
      if (this->self_.FindFacet(inInterface))
        return Base::QueryInterface(inInterface, outInterface);
      return this->self_.original_->QueryInterface(inInterface, outInterface);
    }
  };
  struct ProductFacet final : PlacedFacet<ZORIProduct> {
    using PlacedFacet::PlacedFacet;
    ZORListValZORBaseUnknown_var* GetChildren(const char* inInterfaceName) override {
      return self_.original_->GetChildren(inInterfaceName);
    }
    ZORIProduct_var GetFatherProduct() override { return self_.original_->GetFatherProduct(); }
  };
  struct GeoVisuFacet final : PlacedFacet<ZORI3DGeoVisu> {
    using PlacedFacet::PlacedFacet;
    ZORRep* GetRep() override { return self_.rep_; }
  };

  struct VisPropertiesFacet final : PlacedFacet<ZORIVisProperties> {
    using PlacedFacet::PlacedFacet;
    HRESULT GetPropertiesAtt(ZORVisPropertiesValues& outValues, int inProperties, int inGeometry,
                             int inReserved, int inAlsoReserved) override {
      const HRESULT result =
          ZORIVisProperties_var(self_.original_)
              ->GetPropertiesAtt(outValues, inProperties, inGeometry, inReserved, inAlsoReserved);
      if (SUCCEEDED(result)) outValues = self_.properties_;
      return result;
    }
    HRESULT SetPropertiesAtt(const ZORVisPropertiesValues& inValues) override {
      self_.properties_ = inValues;
      return S_OK;
    }
  };

  ~PlacedProduct() override {
    if (rep_) rep_->Destroy();
    for (PlacedMeshRep* const mesh : meshes_) mesh->Destroy();
  }
  void MakeRep(const ZOR3DRep& inRep, const ZORMathTransformation& standingFromModel) {
    rep_ = new ZOR3DBagRep();
    for (const MeshInstance& drawn : CollectMeshInstances(inRep)) {
      meshes_.push_back(
          new PlacedMeshRep(drawn.mesh, standingFromModel * drawn.rootFromPart, &drawn.colour));
      if (drawn.isColourImposed)
        meshes_.back()->SetInheritanceMode(ZORRep::kOwnColour | ZORRep::kImposeColour);
      rep_->AddChild(meshes_.back());
    }
  }

  ZORIProduct_var original_;
  ZORVisPropertiesValues properties_;
  ZOR3DBagRep* rep_ = nullptr;
  std::vector<PlacedMeshRep*> meshes_;
  ProductFacet product_;
  GeoVisuFacet geoVisu_;
  VisPropertiesFacet visProperties_;
};

std::optional<PartColour> ImposedColourOf(const ZORIVisProperties_var& inProperties) {
  ZORVisPropertiesValues values;
  unsigned int isImposed = 0, red = 0, green = 0, blue = 0;
  constexpr int kAllProperties = 11, kWholeGeometry = 5;
  if (inProperties.IsNull() ||
      FAILED(inProperties->GetPropertiesAtt(values, kAllProperties, kWholeGeometry)))
    return {};
  if (FAILED(values.GetInheritance(ZORVisPropertiesValues::kColour, isImposed)) || !isImposed ||
      FAILED(values.GetColor(red, green, blue)))
    return {};
  return PartColour{static_cast<std::uint8_t>(red), static_cast<std::uint8_t>(green),
                    static_cast<std::uint8_t>(blue), 255};
}

}  // namespace

ZORIProduct_var PlaceProduct(const ZORIProduct_var& inProduct,
                             const ZORMathTransformation& rootFromProduct,
                             const PartColour* inColour) {
  const ZORInterfaceHandle<ProductIdentity> identity = inProduct;
  if (identity.IsNull()) return {};
  auto* const placed = new PlacedProduct(identity->GetProduct(), rootFromProduct, inColour);
  return ZORIProduct_var(placed->GetInterface());
}

PartColour MeanColourOf(const ZORIProduct_var& inProduct) {
  if (const auto imposed = ImposedColourOf(inProduct)) return *imposed;
  const ZORI3DGeoVisu_var visualised = inProduct;
  const auto* const rep =
      visualised.IsNull() ? nullptr : dynamic_cast<const ZOR3DRep*>(visualised->GetRep());
  double sums[4] = {}, count = 0;
  const auto add = [&](const PartColour& inColour, double inCount) {
    for (std::size_t i = 0; i < 4; ++i) sums[i] += inCount * inColour[i];
    count += inCount;
  };
  for (const MeshInstance& drawn : rep ? CollectMeshInstances(*rep) : std::vector<MeshInstance>()) {
    const PartMesh& mesh = *drawn.mesh;
    if (drawn.isColourImposed || mesh.triangleColours.empty())
      add(drawn.colour, static_cast<double>(mesh.triangles.size()));
    else
      for (const std::uint16_t own : mesh.triangleColours)
        add(own < mesh.colours.size() ? mesh.colours[own] : drawn.colour, 1);
  }
  PartColour mean{210, 210, 210, 255};
  if (count > 0)
    for (std::size_t i = 0; i < 4; ++i) mean[i] = static_cast<std::uint8_t>(sums[i] / count + 0.5);
  return mean;
}

int ColourDifference(const PartColour& inA, const PartColour& inB) {
  int difference = 0;
  for (std::size_t i = 0; i < 3; ++i) difference += std::abs(inA[i] - inB[i]);
  return difference;
}

}  // namespace ZORDefault
