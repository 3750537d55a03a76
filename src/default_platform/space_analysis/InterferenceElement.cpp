#include "default_platform/space_analysis/InterferenceElement.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <set>
#include <string_view>

#include "default_platform/space_analysis/Vectors.h"
#include "default_platform/space_analysis/ViewChoice.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/xml/DOMString.h"
#include "platform/xml/DOM_NamedNodeMap.h"

namespace ZORDefault {
namespace {

template <class Visit>
void ForEachChild(const DOM_Node& inParent, const char* inName, const Visit& inVisit) {
  for (DOM_Node child = inParent.getFirstChild(); !child.isNull(); child = child.getNextSibling())
    if (child.getNodeType() == DOM_Node::ELEMENT_NODE && child.getNodeName().equals(inName))
      inVisit(child);
}

std::optional<double> NumberOf(const DOM_Node& inElement, const char* inName) {
  ZORUnicodeString text = AttributeOf(inElement, inName);
  text.ReplaceSubString(",", ".");
  double number = 0;
  if (text.ConvertToNum(&number, "%le") != 1 || !std::isfinite(number)) return std::nullopt;
  return number;
}

std::optional<ZORMathVector> VectorOf(const DOM_Node& inElement, const char* inX, const char* inY,
                                      const char* inZ) {
  const auto x = NumberOf(inElement, inX), y = NumberOf(inElement, inY),
             z = NumberOf(inElement, inZ);
  if (!x || !y || !z) return std::nullopt;
  return ZORMathVector(*x, *y, *z);
}

std::optional<ZORMathVector> PointOf(const DOM_Node& inElement) {
  return VectorOf(inElement, "Ux", "Uy", "Uz");
}

/// Without an eye and a direction there is no viewpoint.
std::optional<StoredViewpoint> ViewpointOf(const DOM_Node& inElement) {
  std::optional<ZORMathVector> origin, sight;
  ForEachChild(inElement, "Point", [&](const DOM_Node& inPoint) { origin = PointOf(inPoint); });
  ForEachChild(inElement, "Vector", [&](const DOM_Node& inVector) {
    if (AttributeOf(inVector, "CorrespondingData") == "Sight")
      sight = VectorOf(inVector, "Vx", "Vy", "Vz");
  });
  const double length = sight ? Length(*sight) : 0;
  if (!origin || !(length > 0)) return std::nullopt;
  StoredViewpoint viewpoint;
  viewpoint.projection = ProjectionNamed(AttributeOf(inElement, "ProjectionType"));
  viewpoint.origin = *origin;
  viewpoint.sight = (1 / length) * *sight;
  viewpoint.focusDistance = NumberOf(inElement, "FocusDistance").value_or(0);
  viewpoint.nearPlane = NumberOf(inElement, "NearPlane").value_or(0);
  viewpoint.farPlane = NumberOf(inElement, "FarPlane").value_or(0);
  return viewpoint;
}

/// The catalogue's text lists the word of every language.
bool IsClearanceWord(const ZORUnicodeString& inWord) {
  if (inWord == "Clearance") return true;
  const ZORUnicodeString words =
      ZORMsgCatalog::BuildMessage("ZORLyraITFClashDialog3", "ClearanceAllLanguages");
  return words.SearchSubString(inWord) >= 0;
}

bool IsClearance(const DOM_Node& inInterference) {
  const ZORUnicodeString neutral = AttributeOf(inInterference, "ResultTypeNoNLS");
  const bool isNeutral = neutral.GetLengthInChar() > 0;
  return IsClearanceWord(isNeutral ? neutral : AttributeOf(inInterference, "ResultType").Strip());
}

/// Points that differ, in the order in which they first occur.
class DistinctPoints {
 public:
  explicit DistinctPoints(std::vector<ZORMathVector>& outPoints) : points_(outPoints) {}
  void Add(const ZORMathVector& inPoint) {
    if (known_.insert({inPoint.x, inPoint.y, inPoint.z}).second) points_.push_back(inPoint);
  }

 private:
  std::vector<ZORMathVector>& points_;
  std::set<std::array<double, 3>> known_;
};

/// What makes a matrix' numbers other than they were written.
std::string WhyMisread(const DOM_Node& inMatrix) {
  std::string why;
  const auto check = [&](const DOM_Node& inElement, const char* inName) {
    const ZORUnicodeString text = AttributeOf(inElement, inName);
    double number = 0;
    if (text.SearchSubString(",") >= 0)
      why = "its numbers are cut at a decimal comma";
    else if (text.ConvertToNum(&number, "%le") != 1)
      why = "a number of its matrix is missing";
  };
  ForEachChild(inMatrix, "Point", [&](const DOM_Node& inPoint) {
    for (const char* const name : {"Ux", "Uy", "Uz"}) check(inPoint, name);
  });
  ForEachChild(inMatrix, "Vector", [&](const DOM_Node& inVector) {
    for (const char* const name : {"Vx", "Vy", "Vz"}) check(inVector, name);
  });
  return why;
}

/// Within what six digits and rounding leave of one.
bool IsRotation(const ZORMath3x3Matrix& inMatrix) {
  constexpr double kTolerance = 1e-3;
  for (int i = 0; i < 3; ++i)
    for (int j = 0; j <= i; ++j) {
      const double product = Dot(inMatrix.GetColumn(i), inMatrix.GetColumn(j));
      if (!(std::fabs(product - (i == j ? 1 : 0)) < kTolerance)) return false;
    }
  return inMatrix.Determinant() > 0;
}

}  // namespace

ZORUnicodeString AttributeOf(const DOM_Node& inElement, const char* inName) {
  const DOM_Node attribute = inElement.getAttributes().getNamedItem(inName);
  return attribute.isNull() ? ZORUnicodeString()
                            : attribute.getNodeValue().DOMStringToZORUnicodeString();
}

void StoredViewpoint::Fill(ZOR3DViewpoint& outViewpoint) const {
  const ZOR3DViewpoint usual;
  outViewpoint.projection = projection;
  outViewpoint.origin = origin;
  outViewpoint.sight = sight;
  outViewpoint.up = UpFor(sight);
  outViewpoint.focusDistance = PositiveOr(focusDistance, usual.focusDistance);
  outViewpoint.viewAngle = usual.viewAngle;
  outViewpoint.viewHeight = 2 * outViewpoint.focusDistance * std::tan(usual.viewAngle / 2);
  // Right before the eye a near plane cuts nothing that matters, but would keep markers from being
  // drawn over all else.
  constexpr double kRightBefore = 0.02;
  const bool cutsNothing = projection == ZOR3DViewpoint::kConic &&
                           nearPlane <= kRightBefore * outViewpoint.focusDistance;
  outViewpoint.nearPlane = cutsNothing ? 0 : std::max(nearPlane, 0.0);
  outViewpoint.farPlane = farPlane > nearPlane ? farPlane : 0;
}

InterferenceElement::InterferenceElement(const DOM_Node& inInterference)
    : isClearance(IsClearance(inInterference)) {
  ForEachChild(inInterference, "Product", [&](const DOM_Node& inProduct) {
    if (products.size() == 2) products.pop_back();
    products.push_back(inProduct);
  });
  DistinctPoints distinct(points);
  ForEachChild(inInterference, "GeometricAspect", [&](const DOM_Node& inAspect) {
    ForEachChild(inAspect, "Point", [&](const DOM_Node& inPoint) {
      if (const auto point = PointOf(inPoint)) distinct.Add(*point);
    });
    ForEachChild(inAspect, "Viewpoint",
                 [&](const DOM_Node& inViewpoint) { viewpoint = ViewpointOf(inViewpoint); });
  });
}

ZOR3DViewpoint::Projection ProjectionNamed(const ZORUnicodeString& inText) {
  static constexpr std::string_view kParallel[] = {
      "cylind", "parall", "zylind", "cilind", "cilínd", "orthog", "ortog", "円筒", "平行",
  };
  std::string text = inText.Strip().ConvertToChar();
  std::ranges::transform(text, text.begin(), [](unsigned char inByte) {
    return static_cast<char>(inByte < 0x80 ? std::tolower(inByte) : inByte);
  });
  const bool isParallel = std::ranges::any_of(
      kParallel, [&](std::string_view inStart) { return text.starts_with(inStart); });
  return isParallel ? ZOR3DViewpoint::kCylindric : ZOR3DViewpoint::kConic;
}

std::string WhyNotTrusted(const DOM_Node& inProduct, const ZORMathTransformation& inPlacement) {
  DOM_Node matrix;
  ForEachChild(inProduct, "Matrix", [&](const DOM_Node& inMatrix) { matrix = inMatrix; });
  if (matrix.isNull()) return "the result has no matrix of it";
  if (const std::string why = WhyMisread(matrix); !why.empty()) return why;
  if (!IsRotation(inPlacement.GetMatrix())) return "its matrix is no rotation";
  if (!IsFinite(inPlacement.GetVector())) return "its position is not finite";
  return {};
}

}  // namespace ZORDefault
