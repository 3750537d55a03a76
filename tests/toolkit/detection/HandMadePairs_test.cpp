// Pairs whose interference is known.
#include "toolkit/detection/HandMadePairs.h"

#include <gtest/gtest.h>

#include <cmath>

namespace ZORDetection {
namespace {

using namespace Shapes;

Expected KindIn(const Findings& inFindings) {
  if (inFindings.interferences.empty()) return kNone;
  switch (inFindings.interferences.front().kind) {
    case Kind::kClash:
      return kClash;
    case Kind::kContact:
      return kContact;
    case Kind::kClearance:
      break;
  }
  return kClearance;
}

void ExpectAnswer(const PairOfShapes& inPair, const Findings& inFindings) {
  EXPECT_TRUE(inFindings.unjudged.empty());
  ASSERT_LE(inFindings.interferences.size(), 1U);
  EXPECT_EQ(KindIn(inFindings), inPair.kind)
      << "value "
      << (inFindings.interferences.empty() ? 0 : inFindings.interferences.front().value);
  if (inPair.kind == kNone || inFindings.interferences.empty()) return;
  const Interference& found = inFindings.interferences.front();
  EXPECT_NEAR(found.value, inPair.value, inPair.kind == kClash ? 1e-3 : 1e-6);
  EXPECT_EQ(found.isDuplicate, inPair.isDuplicate);
  double square = 0;
  for (std::size_t i = 0; i < 3; ++i)
    square += std::pow(found.points[0][i] - found.points[1][i], 2);
  EXPECT_NEAR(std::sqrt(square), std::abs(found.value), 1e-6);
}

template <typename Shape>
void ExpectAllAnswers(Shape inShape, double inMeshSize = 1) {
  for (const PairOfShapes& pair : Pairs()) {
    SCOPED_TRACE(pair.name);
    Options options;
    options.clearance = pair.clearance;
    options.meshSize = inMeshSize;
    ExpectAnswer(pair, FindIn({inShape(pair.first), inShape(pair.second)}, options));
  }
}

TEST(HandMadePairs, FirstAgainstSecond) {
  ExpectAllAnswers([](const TopoDS_Shape& shape) { return shape; });
}

TEST(HandMadePairs, SecondAgainstFirst) {
  for (const PairOfShapes& pair : Pairs()) {
    SCOPED_TRACE(pair.name);
    Options options;
    options.clearance = pair.clearance;
    ExpectAnswer(pair, FindIn({pair.second, pair.first}, options));
  }
}

TEST(HandMadePairs, WithFinerTriangles) {
  ExpectAllAnswers([](const TopoDS_Shape& shape) { return shape; }, 0.4);
}

}  // namespace
}  // namespace ZORDetection
