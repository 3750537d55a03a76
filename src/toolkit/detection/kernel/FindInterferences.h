// Clashes, contacts and clearance violations between the products of an assembly.
#ifndef ZOR_TOOLKIT_DETECTION_KERNEL_FINDINTERFERENCES_H
#define ZOR_TOOLKIT_DETECTION_KERNEL_FINDINTERFERENCES_H

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

class TopoDS_Shape;

namespace ZORDetection {

/// Coordinates in millimetres.
using Point = std::array<double, 3>;

/// A rigid placement: a direct rotation by rows, each followed by its component of the translation.
using Placement = std::array<std::array<double, 4>, 3>;

/// What products are instances of. Exact geometry if there is any, else triangles.
struct Part {
  const TopoDS_Shape* shape = nullptr;  ///< borrowed for the call; gets triangles
  std::vector<Point> points;
  std::vector<std::array<std::uint32_t, 3>> triangles;
  /// Largest error of `points`: half a unit in the last place of a single-precision file.
  double pointPrecision = 0;
};

/// An instance of a part.
struct Product {
  std::uint32_t part = 0;
  Placement rootFromProduct{{{1, 0, 0, 0}, {0, 1, 0, 0}, {0, 0, 1, 0}}};
};

/// What a surface that encloses nothing means when it enters a solid.
enum class SheetPolicy { kClash, kContact, kIgnore };

/// Lengths in millimetres.
struct Options {
  double tolerance = 0.01;   ///< a clash is deeper
  double contactGap = 1e-5;  ///< a contact is at most this far apart
  double clearance = 0;      ///< 0: clearances are not looked for
  SheetPolicy sheets = SheetPolicy::kClash;
  unsigned threads = 1;
  double meshSize = 1;  ///< scales the triangles that the search starts from, not the result
  bool withCurves = true;
  // Of the verdicts only those in one share of several, less those that are known, are found.
  std::uint32_t shard = 1, shards = 1;
  std::vector<std::uint32_t> known;
  std::size_t tried = 0;  ///< more than 0: only so many of the share, timed one after another
  /// Whether a pair is checked; all are when it is empty. Called from the calling thread only.
  std::function<bool(std::uint32_t, std::uint32_t)> isWanted;
  /// Called with the numbers of verdicts that are done and of all; returns false to stop. From any
  /// thread, never twice at a time.
  std::function<bool(std::size_t, std::size_t)> progress;
  /// Handed what is known before the first verdict, then each verdict's findings alone, in any
  /// order and without costs. From any thread, never twice at a time.
  std::function<void(const struct Findings&)> keep;
};

enum class Kind { kClash, kContact, kClearance };

/// A clash, contact or clearance violation of two products.
struct Interference {
  std::uint32_t first = 0, second = 0;  ///< products, first < second
  Kind kind = Kind::kContact;
  double value = 0;  ///< minus the depth, 0, or the distance
  /// Deepest point and its foot, the closest points, or twice the middle of the patch of contact.
  /// The first lies on the first product unless the second product is the one that goes deeper.
  std::array<Point, 2> points{};
  double curveLength = 0;          ///< of the crossing, or of the border of the patch of contact
  std::uint32_t curve = 0;         ///< of the findings: points along it; see PointsAlong
  std::uint32_t curveProduct = 0;  ///< in whose frame that curve is
  bool isDuplicate = false;        ///< the same geometry at the same place
  bool isSheetInSolid = false;
  bool hasMeshPrecision = false;  ///< triangles were all there was
  double precision = 0;           ///< by how much such triangles may miss their surface
};

/// Something that could not be judged.
struct Unjudged {
  std::uint32_t part = 0;
  std::optional<std::uint32_t> other;  ///< the part against which it could not be judged
  bool isWholePart = true;             ///< nothing of the part was checked
  std::string reason;
  std::uint32_t verdict = 0;  ///< with another part: the number of the verdict
};

/// All that a search found, or a share of it.
struct Findings {
  std::vector<Interference> interferences;  ///< in the order of the products
  /// Shared by all interferences of the same parts in the same placement to each other; the first
  /// is empty.
  std::vector<std::vector<Point>> curves{{}};
  std::vector<Unjudged> unjudged;
  std::size_t pairsChecked = 0;       ///< of products whose boxes come near
  std::size_t verdicts = 0;           ///< pairs of parts in different placements to each other
  std::vector<std::uint64_t> costs;   ///< that each verdict is expected to have
  std::vector<std::uint32_t> judged;  ///< the verdicts that were found
  std::vector<double> seconds;        ///< that they took, where they were timed
  double openSeconds = 0;             ///< until the first
  bool isStopped = false;
};

/// Checks each pair of products once. The result does not depend on the number of threads.
/// @return what was found up to a stop that `progress` asked for.
Findings FindInterferences(const std::vector<Part>& inParts, const std::vector<Product>& inProducts,
                           const Options& inOptions);

/// @param inProducts those that were checked.
/// @return at most inMax points along the interference's curve, evenly spread.
inline std::vector<Point> PointsAlong(const Findings& inFindings,
                                      const Interference& inInterference,
                                      const std::vector<Product>& inProducts, std::size_t inMax) {
  const std::vector<Point>& curve = inFindings.curves.at(inInterference.curve);
  const Placement& placement = inProducts.at(inInterference.curveProduct).rootFromProduct;
  const std::size_t count = curve.size() < inMax ? curve.size() : inMax;
  std::vector<Point> points(count);
  for (std::size_t i = 0; i < count; ++i) {
    const Point& from = curve[i * curve.size() / count];
    for (std::size_t k = 0; k < 3; ++k) {
      const auto& [x, y, z, shift] = placement[k];
      points[i][k] = x * from[0] + y * from[1] + z * from[2] + shift;
    }
  }
  return points;
}

}  // namespace ZORDetection

#endif
