// What an "Interference" element says of places.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCEELEMENT_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCEELEMENT_H

#include <optional>
#include <string>
#include <vector>

#include "ZORPlatformExport.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "platform/xml/DOM_Node.h"

namespace ZORDefault {

struct StoredViewpoint {
  ZOR3DViewpoint::Projection projection = ZOR3DViewpoint::kConic;
  ZORMathVector origin;
  ZORMathVector sight;  ///< unit
  double focusDistance = 0;
  double nearPlane = 0;
  double farPlane = 0;

  /// Sets all of a viewpoint; a cylindric one shows as much as a conic one at its focus.
  void Fill(ZOR3DViewpoint& outViewpoint) const;
};

/// Numbers are read with a decimal point or a decimal comma.
struct InterferenceElement {
  explicit InterferenceElement(const DOM_Node& inInterference);

  bool isClearance = false;           ///< its result type, in any language
  std::vector<ZORMathVector> points;  ///< those that differ, in order
  std::optional<StoredViewpoint> viewpoint;
  std::vector<DOM_Node> products;  ///< its "Product" elements
};

/// A projection type in English, French, German, Italian, Spanish or Japanese, in any letter case;
/// conic when it is none of them.
ZOR_PLATFORM_EXPORT ZOR3DViewpoint::Projection ProjectionNamed(const ZORUnicodeString& inText);

/// Why the placement that was read from a "Product" element cannot be where the product stood: the
/// element has no "Matrix", numbers are missing or were cut at a decimal comma, or the columns are
/// no rotation.
/// @return empty when it can.
ZOR_PLATFORM_EXPORT std::string WhyNotTrusted(const DOM_Node& inProduct,
                                              const ZORMathTransformation& inPlacement);

/// An attribute's value, empty when it is missing.
ZORUnicodeString AttributeOf(const DOM_Node& inElement, const char* inName);

}  // namespace ZORDefault

#endif
