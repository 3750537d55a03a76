// Scenes made of simple meshes, without a CAD file.
#ifndef ZOR_TESTS_SUPPORT_MESHSCENES_H
#define ZOR_TESTS_SUPPORT_MESHSCENES_H

#include <cmath>
#include <cstdint>
#include <initializer_list>
#include <memory>
#include <vector>

#include "default_platform/visualisation/SceneGraph.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace support {

inline constexpr double kPi = 3.14159265358979323846;

inline ZORMathTransformation MovedBy(double inX, double inY, double inZ) {
  ZORMathTransformation move;
  move.SetVector({inX, inY, inZ});
  return move;
}

/// A turn around z, then a move.
inline ZORMathTransformation TurnedAndMoved(double inAngle, double inX, double inY, double inZ) {
  ZORMathTransformation placement = MovedBy(inX, inY, inZ);
  const double sine = std::sin(inAngle), cosine = std::cos(inAngle);
  placement.SetMatrix({{cosine, sine, 0}, {-sine, cosine, 0}, {0, 0, 1}});
  return placement;
}

/// A box around its origin, with its twelve edges; flat faces have normals of their own.
inline std::shared_ptr<PartMesh> MakeBox(float inX, float inY, float inZ) {
  auto mesh = std::make_shared<PartMesh>();
  const std::array<float, 3> half{inX / 2, inY / 2, inZ / 2};
  for (std::size_t axis = 0; axis < 3; ++axis) {
    const std::size_t across = (axis + 1) % 3, along = (axis + 2) % 3;
    for (const float side : {-1.F, 1.F}) {
      const auto first = static_cast<std::uint32_t>(mesh->points.size());
      std::array<float, 3> normal{};
      normal[axis] = side;
      for (const auto& [a, b] : {std::pair(-1.F, -1.F), {1.F, -1.F}, {1.F, 1.F}, {-1.F, 1.F}}) {
        std::array<float, 3> point{};
        point[axis] = side * half[axis];
        point[across] = side * a * half[across];
        point[along] = b * half[along];
        mesh->points.push_back(point);
        mesh->normals.push_back(normal);
      }
      mesh->triangles.push_back({first, first + 1, first + 2});
      mesh->triangles.push_back({first, first + 2, first + 3});
    }
    for (const auto& [a, b] : {std::pair(-1.F, -1.F), {1.F, -1.F}, {1.F, 1.F}, {-1.F, 1.F}}) {
      mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
      for (const float side : {-1.F, 1.F}) {
        std::array<float, 3> point{};
        point[axis] = side * half[axis];
        point[across] = a * half[across];
        point[along] = b * half[along];
        mesh->edgePoints.push_back(point);
      }
    }
  }
  mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
  mesh->sphere = {{0, 0, 0}, std::hypot(half[0], half[1], half[2])};
  return mesh;
}

/// A surface over a grid of two parameters, 0 to 1 each: inPoint gives point and normal.
template <class Function>
std::shared_ptr<PartMesh> MakeGrid(std::uint32_t inAcross, std::uint32_t inAlong,
                                   const Function& inPoint) {
  auto mesh = std::make_shared<PartMesh>();
  for (std::uint32_t j = 0; j <= inAlong; ++j) {
    for (std::uint32_t i = 0; i <= inAcross; ++i) {
      const auto [point, normal] = inPoint(double(i) / inAcross, double(j) / inAlong);
      mesh->points.push_back(point);
      mesh->normals.push_back(normal);
    }
  }
  for (std::uint32_t j = 0; j < inAlong; ++j) {
    for (std::uint32_t i = 0; i < inAcross; ++i) {
      const std::uint32_t a = j * (inAcross + 1) + i, b = a + inAcross + 1;
      mesh->triangles.push_back({a, a + 1, b + 1});
      mesh->triangles.push_back({a, b + 1, b});
    }
  }
  return mesh;
}

inline std::array<float, 3> ToPoint(double inX, double inY, double inZ) {
  return {static_cast<float>(inX), static_cast<float>(inY), static_cast<float>(inZ)};
}

/// A sphere around its origin, without edges.
inline std::shared_ptr<PartMesh> MakeSphere(double inRadius, std::uint32_t inSteps) {
  auto mesh = MakeGrid(2 * inSteps, inSteps, [&](double inAround, double inUp) {
    const double around = 2 * kPi * inAround, up = kPi * (inUp - 0.5);
    const double x = std::cos(up) * std::cos(around), y = std::cos(up) * std::sin(around);
    const double z = std::sin(up);
    return std::pair(ToPoint(inRadius * x, inRadius * y, inRadius * z), ToPoint(x, y, z));
  });
  mesh->sphere = {{0, 0, 0}, inRadius};
  return mesh;
}

/// An open tube around z, with its two rims as edges.
inline std::shared_ptr<PartMesh> MakeTube(double inRadius, double inLength, std::uint32_t inSteps) {
  const auto onCircle = [&](double inShare, double inZ) {
    const double angle = 2 * kPi * inShare;
    return ToPoint(inRadius * std::cos(angle), inRadius * std::sin(angle), inZ);
  };
  auto mesh = MakeGrid(inSteps, 1, [&](double inAround, double inUp) {
    const double angle = 2 * kPi * inAround;
    return std::pair(onCircle(inAround, inLength * (inUp - 0.5)),
                     ToPoint(std::cos(angle), std::sin(angle), 0));
  });
  for (const double end : {-0.5, 0.5}) {
    mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
    for (std::uint32_t i = 0; i <= inSteps; ++i)
      mesh->edgePoints.push_back(onCircle(double(i) / inSteps, end * inLength));
  }
  mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
  mesh->sphere = {{0, 0, 0}, std::hypot(inRadius, inLength / 2)};
  return mesh;
}

/// A bag with placed meshes in it; both end with the scene.
class MeshScene {
 public:
  MeshScene() : bag_(new ZOR3DBagRep) {}
  ~MeshScene() {
    bag_->Destroy();
    for (PlacedMeshRep* const rep : reps_) rep->Destroy();
  }
  MeshScene(const MeshScene&) = delete;
  MeshScene& operator=(const MeshScene&) = delete;

  PlacedMeshRep* Add(std::shared_ptr<const PartMesh> inMesh,
                     const ZORMathTransformation& inPlacement, const PartColour& inColour) {
    reps_.push_back(new PlacedMeshRep(std::move(inMesh), inPlacement, &inColour));
    bag_->AddChild(reps_.back());
    return reps_.back();
  }
  ZOR3DBagRep* Bag() const { return bag_; }

 private:
  ZOR3DBagRep* bag_;
  std::vector<PlacedMeshRep*> reps_;
};

}  // namespace support

#endif
