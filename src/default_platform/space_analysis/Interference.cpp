#include "default_platform/space_analysis/Interference.h"

#include <algorithm>

#include "default_platform/space_analysis/StandingProduct.h"
#include "platform/space_analysis/ZORISiSubInterference.h"

namespace ZORDefault {
namespace {

ZORMetaClass* ClassNamed(const char* inName, unsigned int inSize) {
  return fct_RetrieveMetaObject(inName, kZORTypeImplementation, ZORBaseUnknown::MetaObject(),
                                "ZORNull", "SpaceAnalysis", inSize);
}

/// One point of an interference, which it keeps alive.
class SubInterference final : public FacetedComponent, private CountedObject<SubInterference> {
 public:
  static const char* CountedName() { return "SubInterference"; }

  SubInterference(Interference& inOwner, std::size_t inPoint)
      : owner_(inOwner.GetInterface()),
        self_(inOwner),
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
  unsigned int AddReference() override { return ++referenceCount_; }
  unsigned int ReleaseReference() override {
    const unsigned int left = --referenceCount_;
    if (left == 0) delete this;
    return left;
  }
  ZORISpecObject* GetInterface() { return &specObject_; }

 private:
  class SubInterferenceFacet final : public Facet<ZORISiSubInterference> {
   public:
    explicit SubInterferenceFacet(SubInterference& inOwner) : Facet(inOwner), part_(inOwner) {}
    int FillViewpoint(ZOR3DViewpoint* ioViewpoint) override {
      if (!ioViewpoint) return 0;
      part_.self_.FillPointViewpoint(part_.point_, *ioViewpoint);
      return 1;
    }

   private:
    SubInterference& part_;
  };
  class SpecObjectFacet final : public Facet<ZORISpecObject> {
   public:
    explicit SpecObjectFacet(SubInterference& inOwner) : Facet(inOwner), part_(inOwner) {}
    ZORISpecObject* GetFather() override {
      part_.self_.AddReference();
      return part_.self_.GetSpecObject();
    }

   private:
    SubInterference& part_;
  };

  ~SubInterference() = default;

  unsigned int referenceCount_ = 0;
  ZORISiInterference_var owner_;
  Interference& self_;
  std::size_t point_;
  SubInterferenceFacet subInterference_;
  SpecObjectFacet specObject_;
};

const ZOR3DRep* RepOf(const ZORIProduct_var& inProduct) {
  const ZORI3DGeoVisu_var visualised = inProduct;
  return visualised.IsNull() ? nullptr : dynamic_cast<const ZOR3DRep*>(visualised->GetRep());
}

/// The first of these that stands out from both products, else the one that does so best.
PartColour MarkerColourFor(const std::array<ZORIProduct_var, 2>& inProducts) {
  constexpr PartColour kColours[] = {{255, 0, 140, 255}, {0, 190, 255, 255}, {255, 220, 0, 255}};
  constexpr int kClear = 230;
  const PartColour first = MeanColourOf(inProducts[0]), second = MeanColourOf(inProducts[1]);
  PartColour best = kColours[0];
  int most = -1;
  for (const PartColour& colour : kColours) {
    const int least = std::min(ColourDifference(colour, first), ColourDifference(colour, second));
    if (least > most) best = colour;
    most = std::max(most, least);
    if (least >= kClear) break;
  }
  return best;
}

}  // namespace

Interference::Interference(const InterferenceElement& inElement,
                           const std::array<ZORIProduct_var, 2>& inProducts)
    : element_(inElement),
      products_(inProducts),
      flags_(element_.points.size() + 1, 1),
      interference_(*this),
      geoVisu_(*this),
      specObject_(*this) {}

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

unsigned int Interference::ReleaseReference() {
  const unsigned int left = --referenceCount_;
  if (left == 0) delete this;
  return left;
}

const ChosenView& Interference::GetView() {
  if (view_) return *view_;
  view_ = element_.viewpoint ? StoredView()
                             : ChooseView({RepOf(products_[0]), RepOf(products_[1])},
                                          element_.points, element_.isClearance);
  view_->markers.colour = MarkerColourFor(products_);
  return *view_;
}

ChosenView Interference::StoredView() const {
  ZOR3DViewpoint viewpoint;
  element_.viewpoint->Fill(viewpoint);
  const double radius = viewpoint.viewHeight / 2;
  ChosenView view{{radius, viewpoint.sight, viewpoint.up, element_.isClearance},
                  {element_.points.front(), radius}};
  LengthenPins({RepOf(products_[0]), RepOf(products_[1])}, element_.points, viewpoint,
               view.markers);
  return view;
}

ZORRep* Interference::MakeRep() {
  std::vector<ZORMathVector> shown;
  for (std::size_t i = 0; i < element_.points.size(); ++i)
    if (flags_[i] != 0 && flags_.back() != 0) shown.push_back(element_.points[i]);
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
                      {element_.points[inPoint], kCloser * markers.viewRadius});
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
  if (const auto& stored = self_.element_.viewpoint) {
    stored->Fill(*ioViewpoint);
    return 1;
  }
  if (self_.element_.points.empty()) return 0;
  ioViewpoint->sight = self_.GetView().markers.sight;
  ioViewpoint->up = self_.GetView().markers.up;
  return 0;
}

double* Interference::InterferenceFacet::GetGeometricResult() {
  const std::vector<ZORMathVector>& points = self_.element_.points;
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
  for (std::size_t i = 0; i < self_.element_.points.size(); ++i)
    ioList.Append(ZORISpecObject_var((new SubInterference(self_, i))->GetInterface()));
}

}  // namespace ZORDefault
