#include "toolkit/detection/kernel/FindInterferences.h"

#include <gtest/gtest.h>

#include <cmath>

#include "toolkit/detection/Shapes.h"

namespace ZORDetection {
namespace {

using namespace Shapes;

Product At(std::uint32_t part, double x, double y, double z) {
  return {part, {{{1, 0, 0, x}, {0, 1, 0, y}, {0, 0, 1, z}}}};
}

/// A block as triangles alone.
Part MeshBlock(double x, double y, double z, double size, bool isOpen = false) {
  Part part;
  for (int i = 0; i < 8; ++i)
    part.points.push_back({x + (i & 1) * size, y + (i >> 1 & 1) * size, z + (i >> 2 & 1) * size});
  part.triangles = {{0, 2, 1}, {1, 2, 3}, {0, 1, 4}, {1, 5, 4}, {0, 4, 2},
                    {2, 4, 6}, {1, 3, 5}, {3, 7, 5}, {2, 6, 3}, {3, 6, 7}};
  if (!isOpen) part.triangles.insert(part.triangles.end(), {{4, 5, 6}, {5, 7, 6}});
  return part;
}

/// A prism of many sides around z: the triangles of a rod.
Part MeshRod(double radius, double length, int sides, double turn) {
  Part part;
  for (int i = 0; i < sides; ++i)
    for (const double z : {0.0, length}) {
      const double angle = turn + 2 * M_PI * i / sides;
      part.points.push_back({radius * std::cos(angle), radius * std::sin(angle), z});
    }
  const auto count = static_cast<std::uint32_t>(sides);
  for (std::uint32_t i = 0; i < count; ++i) {
    const std::uint32_t a = 2 * i, b = 2 * ((i + 1) % count);
    part.triangles.push_back({a, b, a + 1});
    part.triangles.push_back({b, b + 1, a + 1});
    if (i == 0 || i + 1 == count) continue;
    part.triangles.push_back({0, b, a});
    part.triangles.push_back({1, a + 1, b + 1});
  }
  return part;
}

Findings FindMeshes(const Part& first, const Part& second, double clearance = 0) {
  Options options;
  options.clearance = clearance;
  return FindInterferences({first, second}, {At(0, 0, 0, 0), At(1, 0, 0, 0)}, options);
}

TEST(FindInterferences, NothingGivesNothing) {
  const Findings findings = FindInterferences({}, {}, {});
  EXPECT_TRUE(findings.interferences.empty());
  EXPECT_TRUE(findings.unjudged.empty());
}

TEST(FindInterferences, PairsComeInTheOrderOfTheProducts) {
  const Findings findings = FindIn({Cube(20, 0, 0), Cube(10, 0, 0), Cube(0, 0, 0)});
  ASSERT_EQ(findings.interferences.size(), 2U);
  EXPECT_EQ(findings.interferences[0].first, 0U);
  EXPECT_EQ(findings.interferences[0].second, 1U);
  EXPECT_EQ(findings.interferences[1].first, 1U);
  EXPECT_EQ(findings.interferences[1].second, 2U);
}

TEST(FindInterferences, UnwantedPairsAreLeftOut) {
  Options options;
  options.isWanted = [](std::uint32_t first, std::uint32_t) { return first != 0; };
  const Findings findings = FindIn({Cube(20, 0, 0), Cube(10, 0, 0), Cube(0, 0, 0)}, options);
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].first, 1U);
}

/// A lattice of instances of two parts: many pairs, few different ones.
std::vector<Product> Lattice(int inSide) {
  std::vector<Product> products;
  for (int x = 0; x < inSide; ++x)
    for (int y = 0; y < inSide; ++y)
      for (int z = 0; z < inSide; ++z)
        products.push_back(At((x + y + z) % 2 == 0 ? 0 : 1, 9.9 * x + 1e-10 * y, 9.9 * y, 10 * z));
  return products;
}

TEST(FindInterferences, RepeatedPlacementsAreJudgedOnce) {
  const TopoDS_Shape cube = Cube(0, 0, 0), ball = Ball(5, 5, 5, 5);
  const std::vector<Part> parts{{&cube, {}, {}, 0}, {&ball, {}, {}, 0}};
  const Findings findings = FindInterferences(parts, Lattice(6), {});
  EXPECT_GT(findings.pairsChecked, 1000U);
  EXPECT_LT(findings.verdicts, 40U);
}

TEST(FindInterferences, ThreadsChangeNothing) {
  const TopoDS_Shape cube = Cube(0, 0, 0), ball = Ball(5, 5, 5, 5.2);
  const std::vector<Part> parts{{&cube, {}, {}, 0}, {&ball, {}, {}, 0}};
  Options options;
  options.clearance = 1;
  const Findings one = FindInterferences(parts, Lattice(4), options);
  options.threads = 3;
  const Findings three = FindInterferences(parts, Lattice(4), options);
  ASSERT_EQ(one.interferences.size(), three.interferences.size());
  ASSERT_GT(one.interferences.size(), 100U);
  for (std::size_t i = 0; i < one.interferences.size(); ++i) {
    EXPECT_EQ(one.interferences[i].value, three.interferences[i].value);
    EXPECT_EQ(one.interferences[i].points, three.interferences[i].points);
    EXPECT_EQ(PointsAlong(one, one.interferences[i], Lattice(4), 50),
              PointsAlong(three, three.interferences[i], Lattice(4), 50));
  }
}

TEST(FindInterferences, ProgressStopsTheSearch) {
  Options options;
  std::size_t seen = 0;
  options.progress = [&](std::size_t done, std::size_t) {
    seen = done;
    return done < 2;
  };
  const Findings findings =
      FindIn({Cube(0, 0, 0), Cube(10, 0, 0), Cube(20, 1, 0), Cube(30, 3, 0)}, options);
  EXPECT_TRUE(findings.isStopped);
  EXPECT_EQ(seen, 2U);
}

TEST(FindInterferences, PartWithoutTrianglesIsNamed) {
  const TopoDS_Shape cube = Cube(0, 0, 0);
  const std::vector<Part> parts{{&cube, {}, {}, 0}, {}};
  const Findings findings = FindInterferences(parts, {At(0, 0, 0, 0), At(1, 0, 0, 0)}, {});
  ASSERT_EQ(findings.unjudged.size(), 1U);
  EXPECT_EQ(findings.unjudged[0].part, 1U);
  EXPECT_TRUE(findings.unjudged[0].isWholePart);
}

TEST(FindInterferences, ContactIsInTheMiddleOfItsPatch) {
  const Findings findings = FindIn({Cube(0, 0, 0), Block(10, 2, 4, 5, 4, 4)});
  ASSERT_EQ(findings.interferences.size(), 1U);
  const Interference& found = findings.interferences[0];
  EXPECT_NEAR(found.points[0][0], 10, 1e-6);
  EXPECT_NEAR(found.points[0][1], 4, 1e-3);
  EXPECT_NEAR(found.points[0][2], 6, 1e-3);
  EXPECT_NEAR(found.curveLength, 16, 1e-3);
}

TEST(FindInterferences, BordersThatCoincideCountOnce) {
  const Findings cubes = FindIn({Cube(0, 0, 0), Cube(10, 0, 0)});
  ASSERT_EQ(cubes.interferences.size(), 1U);
  EXPECT_NEAR(cubes.interferences[0].curveLength, 40, 1e-3);
}

TEST(FindInterferences, SeamsAreNoBorders) {
  const TopoDS_Shape hole =
      Minus(Block(-10, -10, 0, 20, 20, 10), Rod(gp_Pnt(0, 0, -1), gp::DZ(), 3, 12));
  const Findings findings = FindIn({hole, Rod(gp_Pnt(0, 0, -5), gp::DZ(), 3, 20)});
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_NEAR(findings.interferences[0].curveLength, 2 * 2 * M_PI * 3, 0.01);
}

TEST(FindInterferences, CrossingHasItsExactLength) {
  const Findings findings =
      FindIn({Block(0, 0, 0, 200, 200, 10), Rod(gp_Pnt(50, 60, -20), gp::DZ(), 3, 25)});
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_NEAR(findings.interferences[0].curveLength, 2 * M_PI * 3, 0.1);
  const std::vector<Point> points =
      PointsAlong(findings, findings.interferences[0], {At(0, 0, 0, 0), At(1, 0, 0, 0)}, 8);
  EXPECT_EQ(points.size(), 8U);
  for (const Point& point : points) EXPECT_NEAR(std::hypot(point[0] - 50, point[1] - 60), 3, 0.05);
}

TEST(FindInterferences, SheetsFollowTheirPolicy) {
  const std::vector<TopoDS_Shape> shapes{OpenBox(-20, -20, 0, 40, 40, 5),
                                         Rod(gp_Pnt(3, 4, -10), gp::DZ(), 1.5, 20)};
  Options options;
  const Findings clash = FindIn(shapes, options);
  ASSERT_EQ(clash.interferences.size(), 1U);
  EXPECT_TRUE(clash.interferences[0].isSheetInSolid);
  options.sheets = SheetPolicy::kContact;
  const Findings contact = FindIn(shapes, options);
  ASSERT_EQ(contact.interferences.size(), 1U);
  EXPECT_EQ(contact.interferences[0].kind, Kind::kContact);
  EXPECT_EQ(contact.interferences[0].value, 0);
  options.sheets = SheetPolicy::kIgnore;
  EXPECT_TRUE(FindIn(shapes, options).interferences.empty());
}

TEST(FindInterferences, SharedFacesSewnTogetherAreASolid) {
  std::vector<TopoDS_Shape> faces;
  for (TopExp_Explorer face(Cube(0, 0, 0), TopAbs_FACE); face.More(); face.Next())
    faces.push_back(BRepBuilderAPI_Copy(face.Current()).Shape());
  const Findings findings = FindIn({Together(faces), Cube(4, 4, 4, 2)});
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kClash);
  EXPECT_NEAR(findings.interferences[0].value, -4, 1e-3);
  EXPECT_FALSE(findings.interferences[0].isSheetInSolid);
}

TEST(FindInterferences, TrianglesTouch) {
  const Findings findings = FindMeshes(MeshBlock(0, 0, 0, 10), MeshBlock(10, 2, 2, 5));
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kContact);
  EXPECT_TRUE(findings.interferences[0].hasMeshPrecision);
}

TEST(FindInterferences, TrianglesOverlap) {
  const Findings findings = FindMeshes(MeshBlock(0, 0, 0, 10), MeshBlock(9.5, 2, 2, 5));
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kClash);
  EXPECT_NEAR(findings.interferences[0].value, -0.5, 1e-3);
}

TEST(FindInterferences, TrianglesApart) {
  const Findings findings = FindMeshes(MeshBlock(0, 0, 0, 10), MeshBlock(10.3, 10.4, 0, 5), 1);
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kClearance);
  EXPECT_NEAR(findings.interferences[0].value, 0.5, 1e-9);
}

TEST(FindInterferences, TrianglesInsideOthers) {
  const Findings findings = FindMeshes(MeshBlock(0, 0, 0, 20), MeshBlock(8, 8, 8, 4));
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_NEAR(findings.interferences[0].value, -8, 1e-3);
}

TEST(FindInterferences, OpenTrianglesEncloseNothing) {
  EXPECT_TRUE(
      FindMeshes(MeshBlock(0, 0, 0, 20, true), MeshBlock(8, 8, 8, 4)).interferences.empty());
}

TEST(FindInterferences, TrianglesOfAPinInItsHoleOnlyTouch) {
  Part hole = MeshRod(3, 10, 24, 0.1);
  for (auto& triangle : hole.triangles) std::swap(triangle[0], triangle[1]);  // a cavity
  Part block = MeshBlock(-10, -10, -5, 20);
  for (const auto& triangle : hole.triangles)
    block.triangles.push_back({triangle[0] + 8, triangle[1] + 8, triangle[2] + 8});
  block.points.insert(block.points.end(), hole.points.begin(), hole.points.end());
  const Findings findings = FindMeshes(block, MeshRod(3, 10, 24, 0));
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kContact);
  EXPECT_GT(findings.interferences[0].precision, 0.02);
}

TEST(FindInterferences, TrianglesAgainstExactGeometry) {
  const TopoDS_Shape ball = Ball(5, 5, 14.9, 5);
  const std::vector<Part> parts{MeshBlock(0, 0, 0, 10), {&ball, {}, {}, 0}};
  const Findings findings = FindInterferences(parts, {At(0, 0, 0, 0), At(1, 0, 0, 0)}, {});
  ASSERT_EQ(findings.interferences.size(), 1U);
  EXPECT_EQ(findings.interferences[0].kind, Kind::kClash);
  EXPECT_NEAR(findings.interferences[0].value, -0.1, 1e-3);
}

}  // namespace
}  // namespace ZORDetection
