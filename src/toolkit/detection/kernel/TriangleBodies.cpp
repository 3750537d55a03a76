// Bodies of mesh formats, which have triangles alone.
#include <map>
#include <numeric>

#include "toolkit/detection/kernel/Body.h"

namespace ZORDetection {
namespace {

// Flatter than this, an edge between triangles is taken for one inside a curved surface.
constexpr double kSmoothAngle = 0.6;  // radians
constexpr double kWeldShare = 1e-6;

using EdgeKey = std::pair<std::uint32_t, std::uint32_t>;

class Soup {
 public:
  Soup(const std::vector<gp_XYZ>& inPoints,
       const std::vector<std::array<std::uint32_t, 3>>& inTriangles)
      : points_(inPoints) {
    Box box;
    for (const gp_XYZ& point : inPoints) box.Add(point);
    const std::vector<std::uint32_t> welded = WeldPoints(inPoints, kWeldShare * box.Diagonal());
    for (const auto& triangle : inTriangles) {
      const std::uint32_t a = welded[triangle[0]], b = welded[triangle[1]], c = welded[triangle[2]];
      if (a != b && b != c && c != a) triangles_.push_back({a, b, c});
    }
    parents_.resize(triangles_.size());
    std::iota(parents_.begin(), parents_.end(), 0U);
    for (std::uint32_t i = 0; i < triangles_.size(); ++i)
      for (std::size_t k = 0; k < 3; ++k) byEdge_[KeyOf(i, k)].push_back(i);
    for (const auto& [key, users] : byEdge_)
      for (const std::uint32_t user : users) parents_[RootOf(user)] = RootOf(users.front());
  }

  std::vector<Body> Bodies() {
    std::map<std::uint32_t, std::vector<std::uint32_t>> components;
    for (std::uint32_t i = 0; i < triangles_.size(); ++i) components[RootOf(i)].push_back(i);
    std::vector<std::uint32_t> open;
    std::vector<std::vector<std::uint32_t>> hulls, cavities;
    for (auto& [root, members] : components) {
      if (!IsClosed(members))
        open.insert(open.end(), members.begin(), members.end());
      else
        (VolumeOf(members) < 0 ? cavities : hulls).push_back(std::move(members));
    }
    std::vector<Body> bodies;
    bodies.reserve(hulls.size() + 1);
    for (auto& hull : hulls) bodies.push_back(BodyOf(hull, true));
    for (auto& cavity : cavities) PlaceCavity(cavity, hulls, bodies);
    if (!open.empty()) bodies.push_back(BodyOf(open, false));
    return bodies;
  }

 private:
  EdgeKey KeyOf(std::uint32_t inTriangle, std::size_t inEdge) const {
    const std::uint32_t a = triangles_[inTriangle][inEdge];
    const std::uint32_t b = triangles_[inTriangle][(inEdge + 1) % 3];
    return {std::min(a, b), std::max(a, b)};
  }

  std::uint32_t RootOf(std::uint32_t inTriangle) {
    while (parents_[inTriangle] != inTriangle) {
      parents_[inTriangle] = parents_[parents_[inTriangle]];
      inTriangle = parents_[inTriangle];
    }
    return inTriangle;
  }

  bool IsClosed(const std::vector<std::uint32_t>& inMembers) const {
    for (const std::uint32_t member : inMembers)
      for (std::size_t k = 0; k < 3; ++k)
        if (byEdge_.at(KeyOf(member, k)).size() % 2 != 0) return false;
    return true;
  }

  Corners CornersOf(std::uint32_t inTriangle) const {
    const auto& [a, b, c] = triangles_[inTriangle];
    return {points_[a], points_[b], points_[c]};
  }

  gp_XYZ NormalOf(std::uint32_t inTriangle) const {
    const auto [a, b, c] = CornersOf(inTriangle);
    return (b - a) ^ (c - a);
  }

  double VolumeOf(const std::vector<std::uint32_t>& inMembers) const {
    const gp_XYZ origin = points_[triangles_[inMembers.front()][0]];
    double sum = 0;
    for (const std::uint32_t member : inMembers) {
      const auto [a, b, c] = CornersOf(member);
      sum += (a - origin) * ((b - origin) ^ (c - origin)) / 6;
    }
    return sum;
  }

  /// A chord of length w at whose ends the direction turns by t is off its arc by w/2 tan(t/4).
  double DeviationOf(std::uint32_t inTriangle) const {
    const gp_XYZ normal = NormalOf(inTriangle);
    double largest = 0;
    for (std::size_t k = 0; k < 3; ++k) {
      const EdgeKey key = KeyOf(inTriangle, k);
      const auto& users = byEdge_.at(key);
      if (users.size() != 2) continue;
      const gp_XYZ other = NormalOf(users[0] == inTriangle ? users[1] : users[0]);
      const double angle = std::atan2((normal ^ other).Modulus(), normal * other);
      if (!(angle < kSmoothAngle)) continue;
      const double width = normal.Modulus() / (points_[key.first] - points_[key.second]).Modulus();
      largest = std::max(largest, width / 2 * std::tan(angle / 4));
    }
    return largest;
  }

  Body BodyOf(const std::vector<std::uint32_t>& inMembers, bool inIsSolid) const {
    Body body;
    body.isSolid = inIsSolid;
    body.faces.emplace_back();
    Append(inMembers, body);
    body.Finish();
    return body;
  }

  void Append(const std::vector<std::uint32_t>& inMembers, Body& ioBody) const {
    std::map<std::uint32_t, std::uint32_t> places;
    for (const std::uint32_t member : inMembers) {
      BodyTriangle triangle;
      for (std::size_t k = 0; k < 3; ++k) {
        const std::uint32_t node = triangles_[member][k];
        const auto [place, isNew] =
            places.try_emplace(node, static_cast<std::uint32_t>(ioBody.nodes.size()));
        if (isNew) ioBody.nodes.push_back(points_[node]);
        triangle.nodes[k] = place->second;
      }
      ioBody.triangles.push_back(triangle);
      ioBody.deviations.push_back(DeviationOf(member));
    }
  }

  /// A surface that is turned inwards bounds the smallest hull around it from within; without one
  /// it is a body turned inside out.
  void PlaceCavity(const std::vector<std::uint32_t>& inCavity,
                   std::vector<std::vector<std::uint32_t>>& ioHulls, std::vector<Body>& ioBodies) {
    const gp_XYZ& point = points_[triangles_[inCavity.front()][0]];
    std::size_t best = ioHulls.size();
    for (std::size_t i = 0; i < ioHulls.size(); ++i)
      if (ioBodies[i].Encloses(point) &&
          (best == ioHulls.size() || ioBodies[i].volume < ioBodies[best].volume))
        best = i;
    if (best == ioHulls.size()) {
      ioBodies.push_back(BodyOf(inCavity, true));
      return;
    }
    ioHulls[best].insert(ioHulls[best].end(), inCavity.begin(), inCavity.end());
    ioBodies[best] = BodyOf(ioHulls[best], true);
  }

  const std::vector<gp_XYZ>& points_;
  std::vector<std::array<std::uint32_t, 3>> triangles_;
  std::vector<std::uint32_t> parents_;
  std::map<EdgeKey, std::vector<std::uint32_t>> byEdge_;
};

}  // namespace

std::vector<Body> BodiesOfTriangles(const std::vector<gp_XYZ>& inPoints,
                                    const std::vector<std::array<std::uint32_t, 3>>& inTriangles) {
  if (inTriangles.empty()) return {};
  return Soup(inPoints, inTriangles).Bodies();
}

}  // namespace ZORDetection
