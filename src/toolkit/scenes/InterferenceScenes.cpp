#include "toolkit/scenes/InterferenceScenes.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <unordered_map>

#include "default_platform/OpenModel.h"
#include "foundation/Vector3.h"
#include "platform/visualisation/ZORIVisProperties.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

using ZORFoundation::Cross;
using ZORFoundation::Dot;

constexpr char kPlainGrey[] = "#d2d2d2";  // of parts without a colour

std::optional<ZORMathVector> VectorOf(const NumberTriple& inNumbers) {
  const auto& [x, y, z] = inNumbers;
  if (!x.value || !y.value || !z.value) return std::nullopt;
  return ZORMathVector(*x.value, *y.value, *z.value);
}

std::optional<ZORDefault::StoredViewpoint> ViewpointOf(const ViewpointRecord& inRecord) {
  const auto origin = VectorOf(inRecord.point), sight = VectorOf(inRecord.sight);
  if (!origin || !sight || !(ZORFoundation::Length(*sight) > 0)) return std::nullopt;
  const bool isOrthographic = ProjectionNamed(inRecord.projection) == Projection::kOrthographic;
  return ZORDefault::StoredViewpoint{
      isOrthographic ? ZOR3DViewpoint::kCylindric : ZOR3DViewpoint::kConic,
      *origin,
      *sight,
      inRecord.focusDistance.value.value_or(0),
      inRecord.nearPlane.value.value_or(0),
      inRecord.farPlane.value.value_or(0)};
}

ZORMathVector VectorAt(const Placement& inPlacement, std::size_t inFirst) {
  return {inPlacement[inFirst], inPlacement[inFirst + 1], inPlacement[inFirst + 2]};
}

ZORMathTransformation TransformationOf(const Placement& inPlacement) {
  ZORMathTransformation transformation;
  transformation.SetMatrix(ZORMath3x3Matrix(VectorAt(inPlacement, 0), VectorAt(inPlacement, 3),
                                            VectorAt(inPlacement, 6)));
  transformation.SetVector(VectorAt(inPlacement, 9));
  return transformation;
}

/// Within what six digits and rounding leave of one.
bool IsRotation(const Placement& inPlacement) {
  constexpr double kTolerance = 1e-3;
  const auto column = [&](std::size_t inFirst) {
    return ZORFoundation::Vector3d{inPlacement[inFirst], inPlacement[inFirst + 1],
                                   inPlacement[inFirst + 2]};
  };
  const ZORFoundation::Matrix3<double> rotation = {{column(0), column(3), column(6)}};
  const auto& [x, y, z] = rotation.columns;
  return IsOrthonormal(rotation, kTolerance) && Dot(Cross(x, y), z) > 0;
}

std::string WhyNoneIsTrusted(const InterferenceRecord& inRecord,
                             const ResolvedInterference& inResolved) {
  for (std::size_t i = 0; i < 2; ++i) {
    const std::string why = WhyNotTrusted(inRecord.products[i]);
    if (!why.empty()) return inResolved.products[i].path + ": " + why;
  }
  return {};
}

template <class Component>
std::string ColourText(Component inRed, Component inGreen, Component inBlue) {
  char text[8];
  std::snprintf(text, sizeof text, "#%02x%02x%02x", inRed & 0xFFU, inGreen & 0xFFU, inBlue & 0xFFU);
  return text;
}

/// The colour that the highest ancestor imposes, else the product itself; else empty.
std::string ImposedColour(const ZORIProduct_var& inProduct) {
  std::string colour;
  for (ZORIProduct_var product = inProduct; !product.IsNull();
       product = product->GetFatherProduct()) {
    const ZORIVisProperties_var properties = product;
    ZORVisPropertiesValues values;
    unsigned isImposed = 0, red = 0, green = 0, blue = 0;
    if (properties.IsNull() || FAILED(properties->GetPropertiesAtt(values, 11, 5)) ||
        FAILED(values.GetInheritance(ZORVisPropertiesValues::kColour, isImposed)) ||
        isImposed == 0 || FAILED(values.GetColor(red, green, blue)))
      continue;
    colour = ColourText(red, green, blue);
  }
  return colour;
}

/// The colour of its part; empty for an assembly of many colours.
std::string OwnColour(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo info;
  if (!ZORDefault::GetProductInfo(inProduct.GetInterface(), info)) return {};
  if (!info.colour) return info.triangles > 0 ? kPlainGrey : "";
  return ColourText((*info.colour)[0], (*info.colour)[1], (*info.colour)[2]);
}

}  // namespace

/// A product as it is in the model.
struct InterferenceScenes::Found {
  ZORIProduct_var product;
  std::string colour;
  bool isColourOfAncestor = false;  // which no colour of the product's own can change
};

struct InterferenceScenes::Memory {
  ZORIProduct_var root;
  std::unordered_map<std::string, Found> products;  // by path
};

ZORDefault::InterferenceGeometry GeometryOf(const InterferenceRecord& inRecord) {
  ZORDefault::InterferenceGeometry geometry;
  for (const NumberTriple& numbers : inRecord.points)
    if (const auto point = VectorOf(numbers)) geometry.points.push_back(*point);
  if (inRecord.type == "Clearance") geometry.markers = ZORDefault::MarkerKind::kDimension;
  if (inRecord.viewpoint) geometry.viewpoint = ViewpointOf(*inRecord.viewpoint);
  return geometry;
}

std::string WhyNotTrusted(const ProductRecord& inProduct) {
  if (!inProduct.whyMisread.empty()) return inProduct.whyMisread;
  if (!IsRotation(inProduct.placement)) return "its matrix is no rotation";
  if (!ZORFoundation::IsFinite(VectorAt(inProduct.placement, 9)))
    return "its position is not finite";
  return {};
}

InterferenceScenes::InterferenceScenes(const ZORIProduct_var& inRoot)
    : memory_(std::make_unique<Memory>()) {
  memory_->root = inRoot;
}

InterferenceScenes::~InterferenceScenes() = default;

const InterferenceScenes::Found& InterferenceScenes::Find(const std::string& inPath) {
  const auto [place, isNew] = memory_->products.try_emplace(inPath);
  Found& found = place->second;
  if (!isNew) return found;
  found.product = ZORDefault::FindProduct(memory_->root, FromUtf8(inPath));
  if (found.product.IsNull()) return found;
  found.colour = ImposedColour(found.product->GetFatherProduct());
  found.isColourOfAncestor = !found.colour.empty();
  if (!found.isColourOfAncestor) found.colour = ImposedColour(found.product);
  if (found.colour.empty()) found.colour = OwnColour(found.product);
  return found;
}

// Products that another system manages have their path in the alias, all others in the identifier.
void InterferenceScenes::Resolve(const ProductRecord& inRecord, ResolvedProduct& outProduct) {
  for (const std::string* const path : {&inRecord.id, &inRecord.alias}) {
    if (path->empty()) continue;
    const Found& found = Find(*path);
    if (outProduct.path.empty() || !found.product.IsNull()) outProduct.path = *path;
    if (found.product.IsNull()) continue;
    outProduct.shown.product = found.product;
    outProduct.colour = found.colour;
    return;
  }
}

ResolvedInterference InterferenceScenes::Resolve(const InterferenceRecord& inRecord,
                                                 ProductPlaces inPlaces) {
  ResolvedInterference resolved;
  auto& [first, second] = resolved.products;
  resolved.geometry = GeometryOf(inRecord);
  resolved.curveLength = std::max(0.0, inRecord.curveLength.value.value_or(0));
  Resolve(inRecord.products[0], first);
  Resolve(inRecord.products[1], second);
  resolved.colours = ZORDefault::ChooseColours({first.shown.product, second.shown.product});
  if (const auto& imposed = resolved.colours.imposedOnSecond;
      imposed && !Find(second.path).isColourOfAncestor)
    second.colour = ColourText((*imposed)[0], (*imposed)[1], (*imposed)[2]);
  if (inPlaces == ProductPlaces::kModel || !inRecord.products[1].exists) return resolved;
  resolved.whyAsInModel = WhyNoneIsTrusted(inRecord, resolved);
  for (std::size_t i = 0; i < 2 && resolved.whyAsInModel.empty(); ++i)
    resolved.products[i].shown.rootFromProduct = TransformationOf(inRecord.products[i].placement);
  return resolved;
}

ZORDefault::InterferenceScene MakeScene(const ResolvedInterference& inResolved) {
  const auto& [first, second] = inResolved.products;
  return ZORDefault::MakeInterferenceScene(inResolved.geometry, {first.shown, second.shown},
                                           inResolved.colours);
}

ZORDefault::InterferenceScene MakeScene(const InterferenceRecord& inRecord,
                                        const ZORIProduct_var& inRoot) {
  return MakeScene(InterferenceScenes(inRoot).Resolve(inRecord, ProductPlaces::kResult));
}

}  // namespace ZORToolkit
