#include "MeshPeer.h"

#ifdef ZOR_WITH_FCL
#include <fcl/fcl.h>

#include <ctime>
#include <memory>

#include "toolkit/detection/kernel/Body.h"
#endif

namespace ZORDetection {

#ifdef ZOR_WITH_FCL
namespace {

using Mesh = fcl::BVHModel<fcl::OBBRSSd>;

std::shared_ptr<Mesh> MeshOf(const TopoDS_Shape& inShape) {
  Part part;
  part.shape = &inShape;
  const PartGeometry geometry = GeometryOf(part, 1);
  auto mesh = std::make_shared<Mesh>();
  mesh->beginModel();
  const auto toPoint = [](const gp_XYZ& point) {
    return fcl::Vector3d(point.X(), point.Y(), point.Z());
  };
  for (const Body& body : geometry.bodies)
    for (std::uint32_t i = 0; i < body.triangles.size(); ++i) {
      const auto [a, b, c] = body.CornersOf(i);
      mesh->addTriangle(toPoint(a), toPoint(b), toPoint(c));
    }
  mesh->endModel();
  return mesh;
}

fcl::Transform3d ToTransform(const Placement& inPlacement) {
  fcl::Transform3d transform = fcl::Transform3d::Identity();
  for (int row = 0; row < 3; ++row)
    for (int column = 0; column < 4; ++column)
      transform(row, column) =
          inPlacement[static_cast<std::size_t>(row)][static_cast<std::size_t>(column)];
  return transform;
}

}  // namespace

double MeshPeerSeconds(const Assembly& inAssembly, const NearPairs& inPairs) {
  std::vector<std::shared_ptr<Mesh>> meshes;
  for (const TopoDS_Shape& shape : inAssembly.shapes) meshes.push_back(MeshOf(shape));
  const auto objectOf = [&](std::uint32_t number) {
    const Product& product = inAssembly.products[number];
    return fcl::CollisionObjectd(meshes[product.part], ToTransform(product.rootFromProduct));
  };
  const std::clock_t start = std::clock();
  for (const auto& [a, b] : inPairs) {
    const fcl::CollisionObjectd first = objectOf(a), second = objectOf(b);
    fcl::CollisionResultd collision;
    fcl::collide(&first, &second, fcl::CollisionRequestd(), collision);
    fcl::DistanceResultd distance;
    fcl::distance(&first, &second, fcl::DistanceRequestd(true), distance);
  }
  return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}
#else
double MeshPeerSeconds(const Assembly&, const NearPairs&) { return 0; }
#endif

}  // namespace ZORDetection
