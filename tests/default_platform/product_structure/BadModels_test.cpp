#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "default_platform/product_structure/OpenedModels.h"

using products::Folder;
using products::ReasonOf;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

namespace {
/// A STEP file with this data section.
std::string Step(const std::string& inData) {
  return "ISO-10303-21;\nHEADER;\nFILE_DESCRIPTION((''),'2;1');\n"
         "FILE_NAME('','',(''),(''),'','','');\nFILE_SCHEMA(('CONFIG_CONTROL_DESIGN'));\nENDSEC;\n"
         "DATA;\n" +
         inData + "ENDSEC;\nEND-ISO-10303-21;\n";
}
}  // namespace

TEST(BadModels, MissingFile) {
  EXPECT_EQ(ReasonOf(Folder().GetPath() + "/none.stp"), "does not exist");
}

TEST(BadModels, Directory) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.GetPath()), "is a directory");
}

TEST(BadModels, EmptyFile) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.Write("a.stp", "")), "is empty");
}

TEST(BadModels, ErrorNamesTheFileInOneLine) {
  const Folder folder;
  const std::string path = folder.Write("a.stp", "hello\nworld\n");
  try {
    products::OpenAnew(path);
    FAIL() << "was opened";
  } catch (const ZORDefault::ModelError& error) {
    EXPECT_EQ(error.GetPath(), path);
    EXPECT_EQ(std::string(error.what()), path + ": is not a file of the format STEP");
    EXPECT_THAT(error.what(), Not(HasSubstr("\n")));
  }
}

TEST(BadModels, UnknownEnding) {
  const Folder folder;
  EXPECT_THAT(ReasonOf(folder.Write("a.txt", "hello")), StartsWith("is of no known format"));
}

TEST(BadModels, StepCutOffAnywhere) {
  const Folder folder;
  const std::string whole = products::ReadAll(products::Sample("as1-oc-214.stp"));
  for (const std::size_t length : {std::size_t{20}, whole.size() / 2, whole.size() - 40})
    EXPECT_EQ(ReasonOf(folder.Write("a.stp", whole.substr(0, length))),
              "is cut off: its STEP data has no end")
        << length;
}

TEST(BadModels, StepWithADamagedMiddle) {
  const Folder folder;
  std::string bytes = products::ReadAll(products::Sample("as1-oc-214.stp"));
  const std::size_t data = bytes.find("DATA;");
  bytes = bytes.substr(0, data) + "DATA;\n((((garbage\nENDSEC;\nEND-ISO-10303-21;\n";
  EXPECT_NE(ReasonOf(folder.Write("a.stp", bytes)), "");
}

TEST(BadModels, StepWithoutData) {
  const Folder folder;
  EXPECT_NE(ReasonOf(folder.Write("a.stp", Step(""))), "");
}

TEST(BadModels, StepWithAProductButNoShape) {
  const Folder folder;
  const std::string reason = ReasonOf(folder.Write(
      "a.stp", Step("#1=APPLICATION_CONTEXT('');\n#2=MECHANICAL_CONTEXT('',#1,'mechanical');\n"
                    "#3=PRODUCT('p','p','',(#2));\n")));
  EXPECT_THAT(reason, testing::AnyOf("holds no geometry", "cannot be read as STEP"));
}

TEST(BadModels, StepWithAnotherEndingIsOpened) {
  const Folder folder;
  const std::string bytes = products::ReadAll(products::Sample("as1-oc-214.stp"));
  EXPECT_EQ(ReasonOf(folder.Write("a.glb", bytes)), "");
  EXPECT_EQ(ReasonOf(folder.Write("a", bytes)), "");
}

TEST(BadModels, GlbCutOff) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.Write("a.glb", std::string("glTF\2\0\0\0\xFF\0\0\0abcd", 16))),
            "is cut off: its GLB data has no end");
}

TEST(BadModels, GltfOfOtherJson) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.Write("a.gltf", "{\"a\": 1}")), "is not a file of the format glTF");
}

TEST(BadModels, GltfWithBrokenJson) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.Write("a.gltf", "{\"asset\": {\"version\": \"2.0\"}")),
            "cannot be read as glTF");
}

TEST(BadModels, GltfWithoutGeometry) {
  const Folder folder;
  EXPECT_NE(ReasonOf(folder.Write("a.gltf", R"({"asset":{"version":"2.0"},"scene":0,
      "scenes":[{"nodes":[0]}],"nodes":[{"name":"empty"}]})")),
            "");
}

TEST(BadModels, ObjWithoutFaces) {
  const Folder folder;
  EXPECT_NE(ReasonOf(folder.Write("a.obj", "hello\n")), "");
}

TEST(BadModels, ObjWithAPipeForItsMaterials) {
  const Folder folder;
  ASSERT_EQ(mkfifo((folder.GetPath() + "/pipe").c_str(), 0600), 0);
  const std::string path =
      folder.Write("a.obj", "v 0 0 0\nv 1 0 0\nv 0 1 0\nmtllib  pipe \nf 1 2 3\n");
  EXPECT_EQ(ReasonOf(path), "names pipe, which is no file");
}

TEST(BadModels, GltfWithAPipeForItsBuffer) {
  const Folder folder;
  ASSERT_EQ(mkfifo((folder.GetPath() + "/pipe").c_str(), 0600), 0);
  EXPECT_EQ(ReasonOf(folder.Write("a.gltf", R"({"asset":{"version":"2.0"},
      "buffers":[{"uri":"p\u0069pe","byteLength":36}]})")),
            "names pipe, which is no file");
}

TEST(BadModels, StlCutOff) {
  const Folder folder;
  EXPECT_EQ(ReasonOf(folder.Write("a.stl", "solid a\n facet normal 0 0 1\n  outer loop\n")),
            "is cut off: its STL data has no end");
}

TEST(BadModels, StlWithoutTriangles) {
  const Folder folder;
  EXPECT_NE(ReasonOf(folder.Write("a.stl", std::string(84, '\0'))), "");
}

TEST(BadModels, DeflectionOutsideItsRange) {
  ZORDefault::ModelOptions options;
  for (const double deflection : {0.0, -1.0, 0.2, std::nan("")}) {
    options.deflection = deflection;
    EXPECT_THROW(ZORDefault::OpenModel(products::Sample("as1-oc-214.stp"), options),
                 ZORDefault::ModelError)
        << deflection;
  }
}
