#include "default_platform/space_analysis/Interference.h"

#include <algorithm>
#include <cmath>
#include <set>

#include "default_platform/InterferenceScene.h"
#include "default_platform/OpenModel.h"
#include "default_platform/space_analysis/PlacedProduct.h"
#include "default_platform/visualisation/Rendering.h"
#include "foundation/Vector3.h"
#include "platform/space_analysis/ZORISiSubInterference.h"

namespace ZORDefault {
namespace {

using namespace ZORFoundation;

ZORMetaClass* ClassNamed(const char* inName, unsigned int inSize) {
  return fct_RetrieveMetaObject(inName, kZORTypeImplementation, ZORBaseUnknown::MetaObject(),
                                "ZORNull", "SpaceAnalysis", inSize);
}

/// One point of an interference, which it keeps alive.
class SubInterference final : public CountedComponent, private CountedObject<SubInterference> {
 public:
  static const char* CountedName() { return "SubInterference"; }

  SubInterference(Interference& inOwner, std::size_t inPoint)
      : owner_(inOwner.GetInterface()),
        interference_(inOwner),
        point_(inPoint),
        subInterference_(*this),
        specObject_(*this) {}

  ZORBaseUnknown* FindFacet(const IID& inInterface) override {
    if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORISpecObject::ClassId())
      return &specObject_;
    return inInterface == ZORISiSubInterference::ClassId() ? &subInterference_ : nullptr;
  }
  ZORMetaClass* GetClass() const override {
    static ZORMetaClass* const meta = ClassNamed("ZORSubInterference", sizeof(SubInterference));
    return meta;
  }
  ZORISpecObject* GetInterface() { return &specObject_; }

 private:
  struct SubInterferenceFacet final : Facet<ZORISiSubInterference, SubInterference> {
    using Facet::Facet;
    int FillViewpoint(ZOR3DViewpoint* ioViewpoint) override {
      if (!ioViewpoint) return 0;
      self_.interference_.FillPointViewpoint(self_.point_, *ioViewpoint);
      return 1;
    }
  };
  struct SpecObjectFacet final : Facet<ZORISpecObject, SubInterference> {
    using Facet::Facet;
    ZORISpecObject* GetFather() override {
      self_.interference_.AddReference();
      return self_.interference_.GetSpecObject();
    }
  };

  ZORISiInterference_var owner_;
  Interference& interference_;
  std::size_t point_;
  SubInterferenceFacet subInterference_;
  SpecObjectFacet specObject_;
};

const ZOR3DRep* RepOf(const ZORIProduct_var& inProduct) {
  const ZORI3DGeoVisu_var visualised = inProduct;
  return visualised.IsNull() ? nullptr : dynamic_cast<const ZOR3DRep*>(visualised->GetRep());
}

/// Those that differ, in the order in which they first occur.
std::vector<ZORMathVector> DistinctPoints(const std::vector<ZORMathVector>& inPoints) {
  std::vector<ZORMathVector> distinct;
  std::set<std::array<double, 3>> known;
  for (const ZORMathVector& point : inPoints)
    if (known.insert({point.x, point.y, point.z}).second) distinct.push_back(point);
  return distinct;
}

/// Sets all of a viewpoint; an orthographic one shows as much as a perspective one at its focus.
void Fill(const StoredViewpoint& inStored, ZOR3DViewpoint& outViewpoint) {
  const ZOR3DViewpoint usual;
  outViewpoint.projection = inStored.projection;
  outViewpoint.origin = inStored.origin;
  outViewpoint.sight = (1 / Length(inStored.sight)) * inStored.sight;
  outViewpoint.up = UpFor(outViewpoint.sight);
  outViewpoint.focusDistance = PositiveOr(inStored.focusDistance, usual.focusDistance);
  outViewpoint.viewAngle = usual.viewAngle;
  outViewpoint.viewHeight = 2 * outViewpoint.focusDistance * std::tan(usual.viewAngle / 2);
  // A near plane close to the eye cuts nothing that matters, but would keep markers from being
  // an overlay.
  constexpr double kRightBefore = 0.02;
  const bool cutsNothing = inStored.projection == ZOR3DViewpoint::kConic &&
                           inStored.nearPlane <= kRightBefore * outViewpoint.focusDistance;
  outViewpoint.nearPlane = cutsNothing ? 0 : std::max(inStored.nearPlane, 0.0);
  outViewpoint.farPlane = inStored.farPlane > inStored.nearPlane ? inStored.farPlane : 0;
}

/// Whether two parts of these colours could not be told apart.
bool AreAlike(const SceneColour& inA, const SceneColour& inB) {
  constexpr int kAlike = 90;
  return ColourDifference(inA, inB) < kAlike;
}

/// Of those that stand out from every other colour here, markers' included.
SceneColour ContrastTo(const SceneColour& inColour) {
  constexpr SceneColour kOrange = {240, 150, 30, 255}, kBlue = {70, 130, 220, 255};
  return AreAlike(inColour, kOrange) ? kBlue : kOrange;
}

/// The first of these that stands out from both products, else the one that does so best.
SceneColour MarkerColour(const SceneColour& inFirst, const SceneColour& inSecond) {
  constexpr SceneColour kColours[] = {{255, 0, 140, 255}, {0, 190, 255, 255}, {255, 220, 0, 255}};
  constexpr int kClear = 230;
  SceneColour best = kColours[0];
  int most = -1;
  for (const SceneColour& colour : kColours) {
    const int least =
        std::min(ColourDifference(colour, inFirst), ColourDifference(colour, inSecond));
    if (least > most) best = colour;
    most = std::max(most, least);
    if (least >= kClear) break;
  }
  return best;
}

}  // namespace

Interference::Interference(const InterferenceGeometry& inGeometry,
                           const std::array<ZORIProduct_var, 2>& inProducts,
                           const SceneColour& inMarkerColour)
    : geometry_(inGeometry),
      products_(inProducts),
      markerColour_(inMarkerColour),
      interference_(*this),
      geoVisu_(*this),
      specObject_(*this) {
  geometry_.points = DistinctPoints(inGeometry.points);
  flags_.assign(geometry_.points.size() + 1, 1);
}

ZORBaseUnknown* Interference::FindFacet(const IID& inInterface) {
  if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORISiInterference::ClassId())
    return &interference_;
  if (inInterface == ZORI3DGeoVisu::ClassId()) return &geoVisu_;
  return inInterface == ZORISpecObject::ClassId() ? &specObject_ : nullptr;
}

ZORMetaClass* Interference::GetClass() const {
  static ZORMetaClass* const meta = ClassNamed("ZORInterference", sizeof(Interference));
  return meta;
}

const ChosenView& Interference::GetView() {
  if (view_) return *view_;
  const bool isDimension = geometry_.markers == MarkerKind::kDimension;
  view_ = geometry_.viewpoint ? StoredView()
                              : ChooseView({RepOf(products_[0]), RepOf(products_[1])},
                                           geometry_.points, isDimension);
  view_->markers.colour = markerColour_;
  return *view_;
}

ChosenView Interference::StoredView() const {
  ZOR3DViewpoint viewpoint;
  Fill(*geometry_.viewpoint, viewpoint);
  const double radius = viewpoint.viewHeight / 2;
  ChosenView view{
      {radius, viewpoint.sight, viewpoint.up, geometry_.markers == MarkerKind::kDimension},
      {geometry_.points.front(), radius}};
  LengthenPins({RepOf(products_[0]), RepOf(products_[1])}, geometry_.points, viewpoint,
               view.markers);
  return view;
}

ZORRep* Interference::MakeRep() {
  std::vector<ZORMathVector> shown;
  for (std::size_t i = 0; i < geometry_.points.size(); ++i)
    if (flags_[i] != 0 && flags_.back() != 0) shown.push_back(geometry_.points[i]);
  if (shown.empty()) return nullptr;
  return new InterferenceRep(shown, GetView().markers, GetView().framed);
}

void Interference::FillPointViewpoint(std::size_t inPoint, ZOR3DViewpoint& ioViewpoint) {
  // Of a picture that is wider than high, the height decides.
  constexpr float kWidth = 3, kHeight = 2;
  constexpr double kCloser = 0.5;
  const MarkerStyle& markers = GetView().markers;
  ioViewpoint.sight = markers.sight;
  ioViewpoint.up = markers.up;
  ioViewpoint.Reframe(kWidth, kHeight, 1, 1,
                      {geometry_.points[inPoint], kCloser * markers.viewRadius});
}

int* Interference::InterferenceFacet::GetFlags() {
  int* const flags = new int[self_.flags_.size()];
  std::ranges::copy(self_.flags_, flags);
  return flags;
}

void Interference::InterferenceFacet::SetFlags(const int* inFlags) {
  if (inFlags) std::copy_n(inFlags, self_.flags_.size(), self_.flags_.begin());
}

int Interference::InterferenceFacet::FillViewpoint(ZOR3DViewpoint* ioViewpoint) {
  if (!ioViewpoint) return 0;
  if (const auto& stored = self_.geometry_.viewpoint) {
    Fill(*stored, *ioViewpoint);
    return 1;
  }
  if (self_.geometry_.points.empty()) return 0;
  ioViewpoint->sight = self_.GetView().markers.sight;
  ioViewpoint->up = self_.GetView().markers.up;
  return 0;
}

double* Interference::InterferenceFacet::GetGeometricResult() {
  const std::vector<ZORMathVector>& points = self_.geometry_.points;
  if (points.empty()) return nullptr;
  double* const result = new double[3 * points.size()];
  for (std::size_t i = 0; i < points.size(); ++i) {
    result[3 * i] = points[i].x;
    result[3 * i + 1] = points[i].y;
    result[3 * i + 2] = points[i].z;
  }
  return result;
}

void Interference::InterferenceFacet::GetSubInterferences(ZORListValZORISpecObject_var& ioList) {
  for (std::size_t i = 0; i < self_.geometry_.points.size(); ++i)
    ioList.Append(ZORISpecObject_var((new SubInterference(self_, i))->GetInterface()));
}

SceneColours ChooseColours(const std::array<ZORIProduct_var, 2>& inProducts) {
  const SceneColour first = MeanColourOf(inProducts[0]), second = MeanColourOf(inProducts[1]);
  const bool areBoth = !inProducts[0].IsNull() && !inProducts[1].IsNull();
  SceneColours colours;
  if (areBoth && AreAlike(first, second)) colours.imposedOnSecond = ContrastTo(first);
  colours.markers = MarkerColour(first, colours.imposedOnSecond.value_or(second));
  return colours;
}

InterferenceScene MakeInterferenceScene(const InterferenceGeometry& inGeometry,
                                        const std::array<SceneProduct, 2>& inProducts,
                                        const std::optional<SceneColours>& inColours) {
  const SceneColours colours =
      inColours ? *inColours : ChooseColours({inProducts[0].product, inProducts[1].product});
  InterferenceScene scene;
  for (std::size_t i = 0; i < 2; ++i) {
    ProductInfo info;
    if (!GetProductInfo(inProducts[i].product.GetInterface(), info)) continue;
    scene.products[i] = PlaceProduct(
        inProducts[i].product, inProducts[i].rootFromProduct.value_or(info.rootFromProduct),
        i == 1 && colours.imposedOnSecond ? &*colours.imposedOnSecond : nullptr);
  }
  scene.interference = ZORISiInterference_var(
      (new Interference(inGeometry, scene.products, colours.markers))->GetInterface());
  return scene;
}

}  // namespace ZORDefault
