#include "default_platform/product_structure/ModelFormat.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using testing::HasSubstr;
using ZORDefault::DecideFormat;
using ZORDefault::FormatOfContent;
using ZORDefault::FormatOfEnding;
using ZORDefault::IsWhole;
using ZORDefault::ModelFormat;

namespace {
const std::string kStep = "ISO-10303-21;\nHEADER;\nENDSEC;\nEND-ISO-10303-21;\n";

/// A binary STL that says it has this many triangles, and has one.
std::string BinaryStl(char inCount) {
  std::string bytes(84 + 50, '\0');
  bytes[80] = inCount;
  return bytes;
}

std::string IgesLine(char inSection) {
  return std::string(72, ' ') + inSection + std::string(6, ' ') + "1\n";
}

ModelFormat Decided(const std::string& inPath, const std::string& inBytes) {
  std::string reason;
  return DecideFormat(inPath, inBytes, reason);
}

std::string ReasonFor(const std::string& inPath, const std::string& inBytes) {
  std::string reason;
  DecideFormat(inPath, inBytes, reason);
  return reason;
}
}  // namespace

TEST(ModelFormat, EndingInAnyLetterCase) {
  EXPECT_EQ(FormatOfEnding("a.STEP"), ModelFormat::kStep);
  EXPECT_EQ(FormatOfEnding("dir.stl/a.stp"), ModelFormat::kStep);
  EXPECT_EQ(FormatOfEnding("a.Iges"), ModelFormat::kIges);
  EXPECT_EQ(FormatOfEnding("a.igs"), ModelFormat::kIges);
  EXPECT_EQ(FormatOfEnding("a.gltf"), ModelFormat::kGltf);
  EXPECT_EQ(FormatOfEnding("a.glb"), ModelFormat::kGlb);
  EXPECT_EQ(FormatOfEnding("a.obj"), ModelFormat::kObj);
  EXPECT_EQ(FormatOfEnding("a.stl"), ModelFormat::kStl);
}

TEST(ModelFormat, EndingThatIsNone) {
  EXPECT_EQ(FormatOfEnding("a.txt"), ModelFormat::kUnknown);
  EXPECT_EQ(FormatOfEnding("a"), ModelFormat::kUnknown);
  EXPECT_EQ(FormatOfEnding(""), ModelFormat::kUnknown);
}

TEST(ModelFormat, ContentShowsTheFormat) {
  EXPECT_EQ(FormatOfContent(kStep), ModelFormat::kStep);
  EXPECT_EQ(FormatOfContent("\xEF\xBB\xBF\n" + kStep), ModelFormat::kStep);
  EXPECT_EQ(FormatOfContent("glTF\2"), ModelFormat::kGlb);
  EXPECT_EQ(FormatOfContent("{\"asset\":{}}"), ModelFormat::kGltf);
  EXPECT_EQ(FormatOfContent("solid a\nfacet normal 0 0 1\n"), ModelFormat::kStl);
  EXPECT_EQ(FormatOfContent(BinaryStl(1)), ModelFormat::kStl);
  EXPECT_EQ(FormatOfContent(IgesLine('S')), ModelFormat::kIges);
}

TEST(ModelFormat, ContentShowsNone) {
  EXPECT_EQ(FormatOfContent(""), ModelFormat::kUnknown);
  EXPECT_EQ(FormatOfContent("hello"), ModelFormat::kUnknown);
  EXPECT_EQ(FormatOfContent("{\"a\":1}"), ModelFormat::kUnknown);
  EXPECT_EQ(FormatOfContent(IgesLine('X')), ModelFormat::kUnknown);
}

TEST(ModelFormat, ContentWinsOverTheEnding) {
  EXPECT_EQ(Decided("a.glb", kStep), ModelFormat::kStep);
  EXPECT_EQ(Decided("a.txt", kStep), ModelFormat::kStep);
}

TEST(ModelFormat, ObjIsKnownByItsEndingAlone) {
  EXPECT_EQ(Decided("a.obj", "v 0 0 0\n"), ModelFormat::kObj);
  EXPECT_EQ(Decided("a.txt", "v 0 0 0\n"), ModelFormat::kUnknown);
}

TEST(ModelFormat, RefusedContentSaysWhatItIsNot) {
  EXPECT_EQ(ReasonFor("a.stp", "hello"), "is not a file of the format STEP");
}

TEST(ModelFormat, UnknownEndingListsTheKnownOnes) {
  EXPECT_THAT(ReasonFor("a.txt", "hello"), HasSubstr(".step, .stp, .iges, .igs, .gltf, .glb"));
}

TEST(ModelFormat, StepIsWholeWithItsEnd) {
  EXPECT_TRUE(IsWhole(ModelFormat::kStep, kStep));
  EXPECT_FALSE(IsWhole(ModelFormat::kStep, kStep.substr(0, 30)));
}

TEST(ModelFormat, GlbIsWholeWithItsLength) {
  const std::string header("glTF\2\0\0\0\x0d\0\0\0", 12);
  EXPECT_TRUE(IsWhole(ModelFormat::kGlb, header + "x"));
  EXPECT_FALSE(IsWhole(ModelFormat::kGlb, header));
  EXPECT_FALSE(IsWhole(ModelFormat::kGlb, "glTF"));
}

TEST(ModelFormat, StlIsWholeWithAllTriangles) {
  EXPECT_TRUE(IsWhole(ModelFormat::kStl, BinaryStl(1)));
  EXPECT_FALSE(IsWhole(ModelFormat::kStl, BinaryStl(2)));
  EXPECT_TRUE(IsWhole(ModelFormat::kStl, "solid a\nfacet\nendsolid a\n"));
  EXPECT_FALSE(IsWhole(ModelFormat::kStl, "solid a\nfacet\n"));
}

TEST(ModelFormat, IgesIsWholeWithItsLastSection) {
  EXPECT_TRUE(IsWhole(ModelFormat::kIges, IgesLine('S') + IgesLine('T')));
  EXPECT_FALSE(IsWhole(ModelFormat::kIges, IgesLine('S') + IgesLine('G')));
}
