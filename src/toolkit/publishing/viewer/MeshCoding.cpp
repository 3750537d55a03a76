#include "toolkit/publishing/viewer/MeshCoding.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <limits>
#include <map>
#include <span>

#include "toolkit/publishing/page/PageLibrary.h"

namespace ZORToolkit {

std::string ColourText(const std::array<std::uint8_t, 4>& inColour) {
  char text[8];
  std::snprintf(text, sizeof text, "#%02x%02x%02x", inColour[0], inColour[1], inColour[2]);
  return text;
}

namespace {

typedef std::array<float, 3> Float3;
constexpr double kSteps = 65535;

/// The corners of all triangles by colour, in the order of the colours.
std::map<std::string, std::vector<std::uint32_t>> CornersByColour(const PartMesh& inMesh) {
  std::map<std::string, std::vector<std::uint32_t>> corners;
  for (std::size_t i = 0; i < inMesh.triangles.size(); ++i) {
    const std::uint16_t colour =
        inMesh.triangleColours.empty() ? PartMesh::kNoColour : inMesh.triangleColours[i];
    const std::string text =
        colour == PartMesh::kNoColour ? "" : ColourText(inMesh.colours[colour]);
    std::vector<std::uint32_t>& list = corners[text];
    list.insert(list.end(), inMesh.triangles[i].begin(), inMesh.triangles[i].end());
  }
  return corners;
}

/// Numbers the points by their first use; unused ones are left out.
std::vector<std::uint32_t> NumberByUse(std::vector<std::uint32_t>& ioCorners,
                                       std::size_t inPoints) {
  constexpr std::uint32_t kUnused = 0xFFFFFFFF;
  std::vector<std::uint32_t> newOfOld(inPoints, kUnused), used;
  for (std::uint32_t& corner : ioCorners) {
    std::uint32_t& number = newOfOld[corner];
    if (number == kUnused) {
      number = static_cast<std::uint32_t>(used.size());
      used.push_back(corner);
    }
    corner = number;
  }
  return used;
}

class Box {
 public:
  explicit Box(const PartMesh& inMesh) {
    low_.fill(std::numeric_limits<double>::max());
    high_.fill(std::numeric_limits<double>::lowest());
    for (const auto* const points : {&inMesh.points, &inMesh.edgePoints})
      for (const Float3& point : *points)
        for (std::size_t axis = 0; axis < 3; ++axis) {
          low_[axis] = std::min<double>(low_[axis], point[axis]);
          high_[axis] = std::max<double>(high_[axis], point[axis]);
        }
  }

  std::array<std::uint16_t, 3> Quantised(const Float3& inPoint) const {
    std::array<std::uint16_t, 3> steps{};
    for (std::size_t axis = 0; axis < 3; ++axis) {
      const double side = Side(axis);
      const double share = side > 0 ? (inPoint[axis] - low_[axis]) / side : 0;
      steps[axis] = static_cast<std::uint16_t>(std::lround(std::clamp(share, 0.0, 1.0) * kSteps));
    }
    return steps;
  }
  double Low(std::size_t inAxis) const { return low_[inAxis]; }
  double Side(std::size_t inAxis) const { return high_[inAxis] - low_[inAxis]; }

 private:
  std::array<double, 3> low_{}, high_{};
};

void AppendPositions(const Box& inBox, std::span<const Float3> inPoints, std::string& ioBytes) {
  std::string planes[6];
  std::array<std::uint16_t, 3> last{};
  for (const Float3& point : inPoints) {
    const std::array<std::uint16_t, 3> steps = inBox.Quantised(point);
    for (std::size_t axis = 0; axis < 3; ++axis) {
      const auto difference = static_cast<std::int16_t>(steps[axis] - last[axis]);
      // Small ones of either sign become small ones without.
      const auto folded = static_cast<std::uint16_t>((difference << 1) ^ (difference >> 15));
      planes[axis] += static_cast<char>(folded & 0xFF);
      planes[axis + 3] += static_cast<char>(folded >> 8);
    }
    last = steps;
  }
  for (const std::string& plane : planes) ioBytes += plane;
}

void AppendNormals(std::span<const Float3> inNormals, std::string& ioBytes) {
  std::string planes[2];
  for (const Float3& normal : inNormals) {
    const float sum = std::abs(normal[0]) + std::abs(normal[1]) + std::abs(normal[2]);
    const float scale = sum > 0 ? 1 / sum : 0;
    float x = normal[0] * scale, y = normal[1] * scale;
    if (normal[2] < 0) {
      const float foldedX = std::copysign(1 - std::abs(y), x);
      y = std::copysign(1 - std::abs(x), y);
      x = foldedX;
    }
    planes[0] += static_cast<char>(std::lround(x * 127));
    planes[1] += static_cast<char>(std::lround(y * 127));
  }
  ioBytes += planes[0] + planes[1];
}

void AppendNumber(std::uint32_t inNumber, std::string& ioBytes) {
  for (; inNumber >= 0x80; inNumber >>= 7) ioBytes += static_cast<char>(inNumber | 0x80);
  ioBytes += static_cast<char>(inNumber);
}

void AppendCorners(std::span<const std::uint32_t> inCorners, std::string& ioBytes) {
  std::uint32_t next = 0;
  for (const std::uint32_t corner : inCorners) {
    AppendNumber(next - corner, ioBytes);
    if (corner == next) ++next;
  }
}

template <class Item>
std::vector<Item> Chosen(const std::vector<Item>& inItems, std::span<const std::uint32_t> inWhich) {
  std::vector<Item> chosen;
  chosen.reserve(inWhich.size());
  for (const std::uint32_t index : inWhich) chosen.push_back(inItems[index]);
  return chosen;
}

}  // namespace

CodedMesh CodeMesh(const PartMesh& inMesh, double inShare) {
  const PageLibrary& library = LoadPageLibrary();
  const Box box(inMesh);
  CodedMesh coded;
  // Half a step an axis, along the diagonal.
  coded.error = std::sqrt(3.0) / 2 / kSteps;
  std::vector<std::uint32_t> corners;
  double simplified = 0;
  for (auto& [colour, some] : CornersByColour(inMesh)) {
    if (inShare < 1)
      simplified = std::max<double>(simplified, library.simplify(inMesh.points, some, inShare));
    library.reorder(some, inMesh.points.size());
    coded.ranges.push_back({colour, some.size() / 3});
    corners.insert(corners.end(), some.begin(), some.end());
  }
  coded.error += simplified;
  const std::vector<std::uint32_t> used = NumberByUse(corners, inMesh.points.size());
  for (std::size_t axis = 0; axis < 3; ++axis) coded.size[axis] = box.Side(axis);
  coded.low = {inMesh.origin.x + box.Low(0), inMesh.origin.y + box.Low(1),
               inMesh.origin.z + box.Low(2)};
  coded.points = used.size();
  coded.triangles = corners.size() / 3;
  AppendPositions(box, Chosen(inMesh.points, used), coded.bytes);
  AppendNormals(Chosen(inMesh.normals, used), coded.bytes);
  AppendCorners(corners, coded.bytes);
  if (inShare < 1 || inMesh.lineStarts.size() < 2) return coded;
  coded.lines = inMesh.lineStarts.size() - 1;
  coded.linePoints = inMesh.edgePoints.size();
  AppendPositions(box, inMesh.edgePoints, coded.bytes);
  for (std::size_t i = 0; i < coded.lines; ++i)
    AppendNumber(inMesh.lineStarts[i + 1] - inMesh.lineStarts[i], coded.bytes);
  return coded;
}

}  // namespace ZORToolkit
