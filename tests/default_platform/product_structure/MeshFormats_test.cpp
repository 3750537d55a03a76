// Formats that hold triangles instead of surfaces.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>

#include "default_platform/PartMesh.h"
#include "default_platform/product_structure/OpenedModels.h"

using products::ChildrenOf;
using products::FactsOf;
using products::Folder;

namespace {
/// A cube with sides of 10 as an OBJ text.
const char kCubeObj[] =
    "v 0 0 0\nv 10 0 0\nv 10 10 0\nv 0 10 0\nv 0 0 10\nv 10 0 10\nv 10 10 10\nv 0 10 10\n"
    "f 1 4 3 2\nf 5 6 7 8\nf 1 2 6 5\nf 2 3 7 6\nf 3 4 8 7\nf 4 1 5 8\n";

std::string StlFacet(const std::string& inA, const std::string& inB, const std::string& inC) {
  return "facet normal 0 0 0\nouter loop\nvertex " + inA + "\nvertex " + inB + "\nvertex " + inC +
         "\nendloop\nendfacet\n";
}

/// Two triangles in the corner (0, 0, 0) that share the edge along x.
std::string BentStl(const std::string& inThird) {
  return "solid bent\n" + StlFacet("0 0 0", "10 0 0", "0 10 0") +
         StlFacet("10 0 0", "0 0 0", inThird) + "endsolid bent\n";
}

std::string Floats(const std::vector<float>& inValues) {
  return {reinterpret_cast<const char*>(inValues.data()), inValues.size() * sizeof(float)};
}

/// A triangle of 1 m by 2 m upwards in "points.bin"; `inNodes` are the scene's nodes.
std::string Gltf(const std::string& inNodes, const std::string& inRoots) {
  return R"({"asset":{"version":"2.0"},"scene":0,"scenes":[{"nodes":)" + inRoots +
         R"(}],"nodes":)" + inNodes +
         R"(,"meshes":[{"primitives":[{"attributes":{"POSITION":0},"material":0}]}],
      "materials":[{"pbrMetallicRoughness":{"baseColorFactor":[1,0,0,0.5]},"alphaMode":"BLEND"}],
      "accessors":[{"bufferView":0,"componentType":5126,"count":3,"type":"VEC3",
                    "min":[0,0,0],"max":[1,2,0]}],
      "bufferViews":[{"buffer":0,"byteLength":36}],
      "buffers":[{"uri":"points.bin","byteLength":36}]})";
}

const std::vector<float> kTriangle = {0, 0, 0, 1, 0, 0, 0, 2, 0};

std::string LittleEndian32(std::size_t inNumber) {
  std::string bytes;
  for (int shift = 0; shift < 32; shift += 8) bytes += static_cast<char>(inNumber >> shift & 0xFF);
  return bytes;
}

/// The same scene in one binary file, points included.
std::string Glb(const std::string& inNodes, const std::string& inRoots) {
  std::string text = Gltf(inNodes, inRoots);
  const std::string reference = R"("uri":"points.bin",)";
  text.erase(text.find(reference), reference.size());
  text.resize((text.size() + 3) / 4 * 4, ' ');
  const std::string points = Floats(kTriangle);
  const std::string chunks = LittleEndian32(text.size()) + "JSON" + text +
                             LittleEndian32(points.size()) + std::string("BIN\0", 4) + points;
  return "glTF" + LittleEndian32(2) + LittleEndian32(12 + chunks.size()) + chunks;
}

/// Two squares of 10 by 10, of different materials, as two objects.
const char kTwoObjects[] =
    "mtllib a.mtl\nv 0 0 0\nv 10 0 0\nv 10 10 0\nv 0 10 0\nv 0 0 5\nv 10 0 5\nv 10 10 5\nv 0 10 "
    "5\no low\nusemtl red\nf 1 2 3 4\no high\nusemtl green\nf 5 6 7\nf 5 7 8\n";

const ZORIProduct_var OnlyLeaf(const ZORDefault::OpenedModel& inModel) {
  const auto leaves = products::Leaves(inModel.root);
  EXPECT_EQ(leaves.size(), 1u);
  return leaves.at(0);
}

/// The colour in which all of a product is shown, wherever the file has it.
PartColour ColourOf(const ZORIProduct_var& inProduct) {
  const auto facts = FactsOf(inProduct);
  if (facts.mesh->colours.empty()) return facts.colour.value_or(PartColour());
  EXPECT_EQ(facts.mesh->colours.size(), 1u);
  return facts.mesh->colours[0];
}
}  // namespace

TEST(MeshFormats, ObjCubeHasItsFacesAndSharpEdges) {
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("cube.obj", kCubeObj));
  const auto facts = FactsOf(OnlyLeaf(model));
  EXPECT_EQ(facts.triangles, 12u);
  EXPECT_NEAR(facts.area, 600, 1e-3);
  ASSERT_NE(facts.mesh, nullptr);
  EXPECT_EQ(facts.mesh->lineStarts.size(), 13u);  // twelve edges, no diagonal
  EXPECT_EQ(facts.mesh->points.size(), 24u);      // three normals in each corner
  EXPECT_NEAR(facts.mesh->origin.x, 5, 1e-6);
  EXPECT_NEAR(facts.mesh->origin.z, 5, 1e-6);
  EXPECT_NEAR(facts.mesh->sphere.radius, std::sqrt(75.0), 1e-4);
}

TEST(MeshFormats, ObjObjectsArePartsWithTheirNamesAndColours) {
  const Folder folder;
  folder.Write("a.mtl", "newmtl red\nKd 1 0 0\nnewmtl green\nKd 0 1 0\n");
  const auto model = products::OpenAnew(folder.Write("pair.obj", kTwoObjects));
  EXPECT_EQ(products::AliasOf(model.root), "pair");
  const auto leaves = products::Leaves(model.root);
  ASSERT_EQ(leaves.size(), 2u);
  EXPECT_EQ(products::AliasOf(leaves[0]), "low");
  EXPECT_EQ(products::AliasOf(leaves[1]), "high");
  for (const auto& leaf : leaves) {
    EXPECT_EQ(FactsOf(leaf).triangles, 2u);
    EXPECT_NEAR(FactsOf(leaf).area, 100, 1e-4);  // the numbers are millimetres
  }
  EXPECT_EQ(ColourOf(leaves[0]), (PartColour{255, 0, 0, 255}));
  EXPECT_EQ(ColourOf(leaves[1]), (PartColour{0, 255, 0, 255}));
}

TEST(MeshFormats, RootWithoutNameTakesTheFileName) {
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("bent.stl", BentStl("0 -10 0")));
  EXPECT_EQ(products::AliasOf(model.root), "bent");
}

TEST(MeshFormats, StlFlatPairHasNoInnerEdge) {
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("a.stl", BentStl("0 -10 0")));
  const auto facts = FactsOf(OnlyLeaf(model));
  EXPECT_EQ(facts.triangles, 2u);
  EXPECT_NEAR(facts.area, 100, 1e-4);
  EXPECT_EQ(facts.mesh->lineStarts.size(), 5u);
}

TEST(MeshFormats, StlSharpPairHasAnInnerEdge) {
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("a.stl", BentStl("0 0 10")));
  EXPECT_EQ(FactsOf(OnlyLeaf(model)).mesh->lineStarts.size(), 6u);
}

TEST(MeshFormats, StlGentlePairSharesItsNormals) {
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("a.stl", BentStl("0 -10 2")));
  const auto facts = FactsOf(OnlyLeaf(model));
  EXPECT_EQ(facts.mesh->points.size(), 4u);  // 11 degrees: one normal along the shared edge
  for (const auto& normal : facts.mesh->normals)
    EXPECT_NEAR(std::hypot(normal[0], normal[1], normal[2]), 1, 1e-5);
}

TEST(MeshFormats, StlBinary) {
  std::string bytes(84, '\0');
  bytes[80] = 1;
  bytes += Floats({0, 0, 1, 0, 0, 0, 3, 0, 0, 0, 4, 0}) + std::string(2, '\0');
  const Folder folder;
  const auto model = products::OpenAnew(folder.Write("a.stl", bytes));
  EXPECT_NEAR(FactsOf(OnlyLeaf(model)).area, 6, 1e-5);
}

TEST(MeshFormats, GltfBecomesMillimetresWithZUpwards) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  const auto model =
      products::OpenAnew(folder.Write("a.gltf", Gltf(R"([{"name":"leaf","mesh":0}])", "[0]")));
  const auto facts = FactsOf(OnlyLeaf(model));
  EXPECT_EQ(facts.triangles, 1u);
  EXPECT_NEAR(facts.area, 1e6, 1);
  const ZORMathVector middle = facts.rootFromProduct * facts.mesh->origin;
  EXPECT_NEAR(middle.x, 500, 1e-3);
  EXPECT_NEAR(middle.y, 0, 1e-3);
  EXPECT_NEAR(middle.z, 1000, 1e-3);
}

TEST(MeshFormats, GltfMaterialGivesTheColour) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  const auto model =
      products::OpenAnew(folder.Write("a.gltf", Gltf(R"([{"name":"leaf","mesh":0}])", "[0]")));
  EXPECT_EQ(ColourOf(OnlyLeaf(model)), (PartColour{255, 0, 0, 128}));
}

TEST(MeshFormats, GltfNodesShareTheirMeshAndKeepTheirNames) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  const auto model = products::OpenAnew(folder.Write(
      "a.gltf", Gltf(R"([{"name":"top","children":[1,2]},{"name":"1/4\" bolt <a>","mesh":0},
                         {"name":"moved","mesh":0,"translation":[1,2,3]}])",
                     "[0]")));
  EXPECT_EQ(products::AliasOf(model.root), "top");
  const auto leaves = products::Leaves(model.root);
  ASSERT_EQ(leaves.size(), 2u);
  EXPECT_EQ(FactsOf(leaves[0]).mesh, FactsOf(leaves[1]).mesh);
  EXPECT_EQ(products::AliasOf(ChildrenOf(model.root)[0]), "1/4\" bolt <a>");
  const ZORMathVector moved = FactsOf(leaves[1]).rootFromProduct.GetVector();
  EXPECT_NEAR(moved.x, 1000, 1e-3);
  EXPECT_NEAR(moved.y, -3000, 1e-3);
  EXPECT_NEAR(moved.z, 2000, 1e-3);
}

TEST(MeshFormats, GlbBecomesMillimetresWithZUpwards) {
  const Folder folder;
  const auto model = products::OpenAnew(
      folder.Write("a.glb", Glb(R"([{"name":"top","children":[1,2]},{"name":"one","mesh":0},
                       {"name":"two","mesh":0,"translation":[0,3,0]}])",
                                "[0]")));
  const auto leaves = products::Leaves(model.root);
  ASSERT_EQ(leaves.size(), 2u);
  EXPECT_EQ(FactsOf(leaves[0]).mesh, FactsOf(leaves[1]).mesh);
  EXPECT_EQ(FactsOf(leaves[0]).triangles, 1u);
  EXPECT_NEAR(FactsOf(leaves[0]).area, 1e6, 1);
  const ZORMathVector place = FactsOf(leaves[1]).rootFromProduct.GetVector();
  EXPECT_NEAR(place.x, 0, 1e-3);
  EXPECT_NEAR(place.z, 3000, 1e-3);
}

TEST(MeshFormats, GltfWithSeveralRootsGetsOneAbove) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  const auto model = products::OpenAnew(folder.Write(
      "pair.gltf",
      Gltf(R"([{"name":"one","mesh":0},{"name":"two","mesh":0,"translation":[1,0,0]}])", "[0,1]")));
  EXPECT_EQ(products::AliasOf(model.root), "pair");
  EXPECT_EQ(products::Leaves(model.root).size(), 2u);
}

TEST(MeshFormats, GltfScalesAreWarnedOf) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  ZORDefault::ModelOptions options;
  options.useCache = false;
  std::vector<std::string> warnings;
  options.warn = [&](const std::string& warning) { warnings.push_back(warning); };
  const std::string path =
      folder.Write("a.gltf", Gltf(R"([{"name":"top","children":[1,2,3]},{"mesh":0,"scale":[2,2,2]},
                         {"mesh":0,"scale":[1,1,1]},{"mesh":0,"scale":[-1,1,1]}])",
                                  "[0]"));
  ZORDefault::OpenModel(path, options);
  EXPECT_THAT(warnings, testing::ElementsAre(path + ": 2 scaled nodes are shown without scale"));
}

TEST(MeshFormats, GltfPlacementThatCannotBeUndoneIsRefused) {
  const Folder folder;
  folder.Write("points.bin", Floats(kTriangle));
  EXPECT_EQ(products::ReasonOf(folder.Write(
                "a.gltf", Gltf(R"([{"name":"flat","mesh":0,"scale":[0,0,0]}])", "[0]"))),
            "cannot be read as glTF");
  EXPECT_EQ(
      products::ReasonOf(folder.Write(
          "b.gltf", Gltf(R"([{"mesh":0,"matrix":[0,0,0,0,0,0,0,0,0,0,0,0,0,0,0,1]}])", "[0]"))),
      "cannot be read: gp_Trsf::SetValues, null determinant");
}

TEST(MeshFormats, GltfWithoutItsOtherFile) {
  const Folder folder;
  EXPECT_NE(
      products::ReasonOf(folder.Write("a.gltf", Gltf(R"([{"name":"leaf","mesh":0}])", "[0]"))), "");
}
