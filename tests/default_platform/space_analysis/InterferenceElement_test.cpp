#include "default_platform/space_analysis/InterferenceElement.h"

#include <gtest/gtest.h>

#include "default_platform/space_analysis/Assembly.h"

namespace {

using assembly::ProductText;
using assembly::ReadMatrix;
using ZORDefault::ProjectionNamed;
using ZORDefault::WhyNotTrusted;

TEST(InterferenceElement, ParallelProjectionIsNamedInSixLanguages) {
  for (const char* const word : {"Cylindric", "Cylindrique", "Zylindrisch", "Cilindrica",
                                 "Cilíndrica", "円筒", "CYLINDRIC", " cylindric ", "Parallel"})
    EXPECT_EQ(ZOR3DViewpoint::kCylindric, ProjectionNamed(word)) << word;
}

TEST(InterferenceElement, CentralProjectionIsNamedInSixLanguages) {
  for (const char* const word : {"Conic", "Conique", "Konisch", "Conica", "Cónica", "円錐"})
    EXPECT_EQ(ZOR3DViewpoint::kConic, ProjectionNamed(word)) << word;
}

TEST(InterferenceElement, UnknownProjectionIsConic) {
  EXPECT_EQ(ZOR3DViewpoint::kConic, ProjectionNamed(""));
  EXPECT_EQ(ZOR3DViewpoint::kConic, ProjectionNamed("otherwise"));
}

std::string WhyNot(const std::string& inProduct, const ZORMathTransformation& inPlacement) {
  return WhyNotTrusted(support::RootOf(inProduct), inPlacement);
}

TEST(InterferenceElement, RotationAndTranslationAreTrusted) {
  EXPECT_EQ("", WhyNot(ProductText("a"), ReadMatrix()));
}

TEST(InterferenceElement, PlacementWithoutMatrixIsNotTrusted) {
  EXPECT_EQ("the result has no matrix of it", WhyNot(ProductText("a", ""), ReadMatrix()));
}

TEST(InterferenceElement, PlacementOfZerosIsNotTrusted) {
  ZORMathTransformation zeros;
  zeros.SetMatrix(ZORMath3x3Matrix({0, 0, 0}, {0, 0, 0}, {0, 0, 0}));
  EXPECT_EQ("its matrix is no rotation", WhyNot(ProductText("a"), zeros));
}

TEST(InterferenceElement, ScaleShearAndMirrorAreNotTrusted) {
  const ZORMath3x3Matrix matrices[] = {
      {{2, 0, 0}, {0, 2, 0}, {0, 0, 2}},
      {{1, 0, 0}, {0.5, 1, 0}, {0, 0, 1}},
      {{-1, 0, 0}, {0, 1, 0}, {0, 0, 1}},
  };
  for (const ZORMath3x3Matrix& matrix : matrices) {
    ZORMathTransformation placement;
    placement.SetMatrix(matrix);
    EXPECT_EQ("its matrix is no rotation", WhyNot(ProductText("a"), placement));
  }
}

TEST(InterferenceElement, RotationOfSixDigitsIsTrusted) {
  ZORMathTransformation placement;
  placement.SetMatrix(
      ZORMath3x3Matrix({0.707107, 0.707107, 0}, {-0.707107, 0.707107, 0}, {0, 0, 1}));
  EXPECT_EQ("", WhyNot(ProductText("a"), placement));
}

TEST(InterferenceElement, DecimalCommaIsNotTrusted) {
  std::string text = ProductText("a");
  text.replace(text.find("Uy='2'"), 6, "Uy='2,5'");
  EXPECT_EQ("its numbers are cut at a decimal comma", WhyNot(text, ReadMatrix()));
}

TEST(InterferenceElement, MissingNumberIsNotTrusted) {
  std::string text = ProductText("a");
  text.replace(text.find("Uy='2'"), 6, "");
  EXPECT_EQ("a number of its matrix is missing", WhyNot(text, ReadMatrix()));
}

}  // namespace
