// Meshes of parts with surfaces.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <numbers>

#include "default_platform/PartMesh.h"
#include "default_platform/product_structure/OpenedModels.h"

using products::FactsOf;

namespace {
const ZORDefault::OpenedModel& Assembly() {
  static const ZORDefault::OpenedModel model =
      products::OpenAnew(products::Sample("as1-oc-214.stp"));
  return model;
}

/// The mesh of the first product of a part.
const PartMesh& MeshOf(const std::string& inPartName) {
  for (const auto& leaf : products::Leaves(Assembly().root))
    if (FactsOf(leaf).partName == inPartName.c_str()) return *FactsOf(leaf).mesh;
  throw std::out_of_range(inPartName);
}

typedef std::array<double, 3> Vector;

Vector Difference(const std::array<float, 3>& inA, const std::array<float, 3>& inB) {
  return {double{inA[0]} - inB[0], double{inA[1]} - inB[1], double{inA[2]} - inB[2]};
}

Vector Cross(const Vector& inA, const Vector& inB) {
  return {inA[1] * inB[2] - inA[2] * inB[1], inA[2] * inB[0] - inA[0] * inB[2],
          inA[0] * inB[1] - inA[1] * inB[0]};
}

Vector AreaNormal(const PartMesh& inMesh, const std::array<std::uint32_t, 3>& inTriangle) {
  const auto& a = inMesh.points[inTriangle[0]];
  return Cross(Difference(inMesh.points[inTriangle[1]], a),
               Difference(inMesh.points[inTriangle[2]], a));
}

double Volume(const PartMesh& inMesh) {
  double volume = 0;
  for (const auto& triangle : inMesh.triangles) {
    const Vector normal = AreaNormal(inMesh, triangle);
    const auto& a = inMesh.points[triangle[0]];
    volume += (normal[0] * a[0] + normal[1] * a[1] + normal[2] * a[2]) / 6;
  }
  return volume;
}
}  // namespace

TEST(Meshes, TrianglesFaceOutwards) {
  // The rod is a cylinder of 200 mm with a diameter of 10 mm.
  EXPECT_NEAR(Volume(MeshOf("rod")), 25 * std::numbers::pi * 200,
              25 * std::numbers::pi * 200 * 0.02);
}

TEST(Meshes, NormalsStandOnTheirTriangles) {
  const PartMesh& mesh = MeshOf("bolt");
  ASSERT_EQ(mesh.normals.size(), mesh.points.size());
  for (const auto& triangle : mesh.triangles) {
    const Vector normal = AreaNormal(mesh, triangle);
    const double length = std::hypot(normal[0], normal[1], normal[2]);
    for (const std::uint32_t corner : triangle) {
      const auto& own = mesh.normals[corner];
      EXPECT_NEAR(std::hypot(own[0], own[1], own[2]), 1, 1e-5);
      EXPECT_GT((own[0] * normal[0] + own[1] * normal[1] + own[2] * normal[2]) / length, 0.8);
    }
  }
}

TEST(Meshes, EdgesOfARodAreItsTwoCirclesTwice) {
  // Its end faces are circles; both halves of the side meet without a bend.
  const PartMesh& mesh = MeshOf("rod");
  ASSERT_EQ(mesh.lineStarts.size(), 5u);
  for (const auto& point : mesh.edgePoints) {
    const double along = std::abs(*std::ranges::max_element(
        point, {}, [](float coordinate) { return std::abs(coordinate); }));
    EXPECT_NEAR(along, 100, 1e-3);
  }
}

TEST(Meshes, PointsLieAroundTheOrigin) {
  const PartMesh& mesh = MeshOf("plate");
  for (std::size_t axis = 0; axis < 3; ++axis) {
    const auto [low, high] = std::ranges::minmax(
        mesh.points, {}, [axis](const std::array<float, 3>& point) { return point[axis]; });
    EXPECT_NEAR(low[axis], -high[axis], 1e-3) << axis;
  }
}

TEST(Meshes, SphereHoldsAllPoints) {
  for (const char* part : {"plate", "rod", "nut", "bolt", "l-bracket"}) {
    const PartMesh& mesh = MeshOf(part);
    double farthest = 0;
    for (const auto& point : mesh.points)
      farthest =
          std::max(farthest, std::hypot(double{point[0]}, double{point[1]}, double{point[2]}));
    EXPECT_NEAR(mesh.sphere.radius, farthest, 1e-3) << part;
    EXPECT_EQ(mesh.sphere.centre.x, mesh.origin.x) << part;
  }
}

TEST(Meshes, PartOfOneColourHasNoneOnItsTriangles) {
  EXPECT_TRUE(MeshOf("nut").triangleColours.empty());
  EXPECT_TRUE(MeshOf("nut").colours.empty());
}

TEST(Meshes, FacesKeepTheirColours) {
  const auto model = products::OpenAnew(products::Sample("dissonance_assembly.step"));
  const auto cell = products::FindByAliasPath(model.root, "18650");
  ASSERT_FALSE(cell.IsNull());
  const PartMesh& mesh = *FactsOf(cell).mesh;
  ASSERT_EQ(mesh.triangleColours.size(), mesh.triangles.size());
  EXPECT_EQ(mesh.colours.size(), 3u);
  std::map<std::uint16_t, std::size_t> uses;
  for (const std::uint16_t colour : mesh.triangleColours) ++uses[colour];
  for (std::uint16_t colour = 0; colour < 3; ++colour) EXPECT_GT(uses[colour], 0u) << colour;
}

TEST(Meshes, FinerDeflectionGivesMoreTriangles) {
  ZORDefault::ModelOptions coarse, fine;
  coarse.useCache = fine.useCache = false;
  coarse.deflection = 0.02;
  fine.deflection = 0.0001;
  const auto count = [](const ZORDefault::ModelOptions& options) {
    const auto model = ZORDefault::OpenModel(products::Sample("as1-oc-214.stp"), options);
    std::size_t triangles = 0;
    for (const auto& leaf : products::Leaves(model.root)) triangles += FactsOf(leaf).triangles;
    return triangles;
  };
  EXPECT_LT(2 * count(coarse), count(fine));
}

TEST(Meshes, TwoReadingsGiveTheSame) {
  const auto again = products::OpenAnew(products::Sample("as1-oc-214.stp"));
  const auto one = products::Leaves(Assembly().root), two = products::Leaves(again.root);
  ASSERT_EQ(one.size(), two.size());
  for (std::size_t i = 0; i < one.size(); ++i) {
    EXPECT_EQ(FactsOf(one[i]).mesh->points, FactsOf(two[i]).mesh->points);
    EXPECT_EQ(FactsOf(one[i]).mesh->triangles, FactsOf(two[i]).mesh->triangles);
    EXPECT_EQ(FactsOf(one[i]).mesh->edgePoints, FactsOf(two[i]).mesh->edgePoints);
  }
}
