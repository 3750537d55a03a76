#include "default_platform/product_structure/model_reader/ObjFaces.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>

#include "default_platform/ReaderProgram.h"

using ZORDefault::ObjWithoutLargeFaces;
using ZORDefault::Point;
using ZORDefault::TrianglesOf;

namespace {

/// A star, whose every second corner turns inwards, in a plane that lies askew.
std::vector<Point> Star(int inCorners, double inTurn) {
  std::vector<Point> star;
  for (int i = 0; i < inCorners; ++i) {
    const double angle = inTurn * 2 * std::numbers::pi * i / inCorners;
    const double radius = i % 2 == 0 ? 10 : 4;
    const double x = radius * std::cos(angle), y = radius * std::sin(angle);
    star.push_back({x, y, 0.5 * x - 2 * y});
  }
  return star;
}

/// Of the shadow along z, with its sign.
double AreaOf(const std::vector<Point>& inPoints) {
  double twice = 0;
  for (std::size_t i = 0; i < inPoints.size(); ++i) {
    const Point &a = inPoints[i], &b = inPoints[(i + 1) % inPoints.size()];
    twice += a[0] * b[1] - a[1] * b[0];
  }
  return twice / 2;
}

std::size_t CountLines(const std::string& inText, const std::string& inStart) {
  std::size_t count = inText.starts_with(inStart) ? 1 : 0;
  for (std::size_t at = inText.find("\n" + inStart); at != std::string::npos;
       at = inText.find("\n" + inStart, at + 1))
    ++count;
  return count;
}

}  // namespace

TEST(ObjFaces, TrianglesCoverAStarOnceAndTurnAsItDoes) {
  for (const double turn : {1.0, -1.0}) {
    const std::vector<Point> star = Star(1200, turn);
    const auto triangles = TrianglesOf(star);
    ASSERT_EQ(triangles.size(), star.size() - 2);
    double area = 0, size = 0;
    for (const auto& [a, b, c] : triangles) {
      const double one = AreaOf({star[a], star[b], star[c]});
      area += one;
      size += std::abs(one);
    }
    EXPECT_NEAR(area, AreaOf(star), 1e-9);
    EXPECT_NEAR(size, std::abs(area), 1e-9);
  }
}

TEST(ObjFaces, DegeneratePolygonsEndToo) {
  EXPECT_TRUE(TrianglesOf({}).empty());
  EXPECT_TRUE(TrianglesOf({{0, 0, 0}, {1, 0, 0}}).empty());
  EXPECT_EQ(TrianglesOf(std::vector<Point>(50, Point{1, 2, 3})).size(), 48u);
  EXPECT_EQ(TrianglesOf({{0, 0, 0}, {1, 1, 0}, {1, 0, 0}, {0, 1, 0}}).size(), 2u);
}

TEST(ObjFaces, OnlyLargeFacesAreReplaced) {
  std::string text = "v 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n", face = "f";
  for (int i = 0; i < 1025; ++i) face += i % 7 == 0 ? " \\\n 1/2/3" : " -2//3";
  EXPECT_FALSE(ObjWithoutLargeFaces(text));
  const auto replaced = ObjWithoutLargeFaces(text + face + "\nf 3 2 1");
  ASSERT_TRUE(replaced);
  EXPECT_TRUE(replaced->starts_with(text));
  EXPECT_TRUE(replaced->ends_with("\nf 3 2 1"));
  EXPECT_EQ(CountLines(*replaced, "f "), 1025u);
  EXPECT_NE(replaced->find(" -2//3"), std::string::npos);
}

TEST(ObjFaces, CornerWithoutVertexIsRefusedWithItsLine) {
  std::string face = "v 0 0 0\nf";
  for (int i = 0; i < 1025; ++i) face += " 1";
  for (const char* const corner : {" 2", " -2", " 0", " x"})
    EXPECT_THROW(ObjWithoutLargeFaces(face + corner), ZORDefault::Refusal) << corner;
}
