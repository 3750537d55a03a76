#include "default_platform/product_structure/ModelData.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "support/SmallModel.h"

using support::TwoInstances;
using testing::ElementsAre;
using ZORDefault::DecodeModel;
using ZORDefault::EncodeModel;
using ZORDefault::ModelData;

namespace {
ModelData Decoded(const std::string& inBytes) {
  ModelData model;
  EXPECT_TRUE(DecodeModel(inBytes, model));
  return model;
}
}  // namespace

TEST(ModelData, DecodeGivesAllThatWasEncoded) {
  const ModelData model = Decoded(EncodeModel(TwoInstances()));
  ASSERT_EQ(model.parts.size(), 2u);
  EXPECT_TRUE(model.parts[0].isAssembly);
  EXPECT_EQ(model.parts[0].mesh, nullptr);
  EXPECT_EQ(model.parts[1].name, u"part \u00e9");
  EXPECT_EQ(model.parts[1].area, 0.5);
  EXPECT_EQ(model.parts[1].facesWithoutTriangles, 7u);
  ASSERT_EQ(model.products.size(), 3u);
  EXPECT_EQ(model.products[0].parent, -1);
  EXPECT_EQ(model.products[1].colour, (PartColour{1, 2, 3, 4}));
  EXPECT_FALSE(model.products[2].colour.has_value());
  EXPECT_EQ(model.products[2].name, u"second");
  EXPECT_EQ(model.products[2].parentFromProduct.GetVector().y, 6);
  ASSERT_EQ(model.referencedFiles.size(), 1u);
  EXPECT_EQ(model.referencedFiles[0].name, "other.bin");
  EXPECT_EQ(model.referencedFiles[0].state, ZORDefault::ReferencedFile::State::kRead);
  EXPECT_EQ(model.referencedFiles[0].hash, 42u);
  EXPECT_THAT(model.damages, ElementsAre("1 entity of the file could not be read"));
  EXPECT_FALSE(model.hadFailure);
  EXPECT_THAT(model.warnings, ElementsAre("a warning"));
}

TEST(ModelData, DecodeGivesTheWholeMesh) {
  const ModelData model = Decoded(EncodeModel(TwoInstances()));
  ASSERT_NE(model.parts[1].mesh, nullptr);
  const PartMesh& mesh = *model.parts[1].mesh;
  EXPECT_EQ(mesh.origin.z, 3);
  EXPECT_EQ(mesh.points.size(), 3u);
  EXPECT_EQ(mesh.normals[2][2], 1);
  EXPECT_EQ(mesh.triangles[0][2], 2u);
  EXPECT_THAT(mesh.triangleColours, ElementsAre(0));
  EXPECT_EQ(mesh.colours[0], (PartColour{10, 20, 30, 40}));
  EXPECT_EQ(mesh.edgePoints[1][0], 1);
  EXPECT_THAT(mesh.lineStarts, ElementsAre(0u, 2u));
  EXPECT_EQ(mesh.sphere.radius, 4);
}

TEST(ModelData, DecodeRefusesEveryShorterText) {
  const std::string bytes = EncodeModel(TwoInstances());
  ModelData model;
  for (std::size_t length = 0; length < bytes.size(); ++length)
    EXPECT_FALSE(DecodeModel(std::string_view(bytes).substr(0, length), model)) << length;
}

/// A count that is read from a damaged byte may be anything.
TEST(ModelData, DecodeSurvivesEveryDamagedByte) {
  const std::string bytes = EncodeModel(TwoInstances());
  ModelData model;
  std::size_t refused = 0;
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    for (const char damage : {'\x01', '\x80', '\xFF'}) {
      std::string damaged = bytes;
      damaged[i] = static_cast<char>(damaged[i] ^ damage);
      if (!DecodeModel(damaged, model)) ++refused;
    }
  }
  EXPECT_GT(refused, bytes.size() / 2);
}

TEST(ModelData, DecodeRefusesALongerText) {
  ModelData model;
  EXPECT_FALSE(DecodeModel(EncodeModel(TwoInstances()) + '\0', model));
}

TEST(ModelData, DecodeRefusesATriangleWithoutPoints) {
  ModelData damaged = TwoInstances();
  auto mesh = std::make_shared<PartMesh>(*damaged.parts[1].mesh);
  mesh->triangles[0][1] = 3;
  damaged.parts[1].mesh = mesh;
  ModelData model;
  EXPECT_FALSE(DecodeModel(EncodeModel(damaged), model));
}

TEST(ModelData, DecodeRefusesAParentThatComesLater) {
  ModelData damaged = TwoInstances();
  damaged.products[1].parent = 2;
  ModelData model;
  EXPECT_FALSE(DecodeModel(EncodeModel(damaged), model));
}

TEST(ModelData, DecodeRefusesAnUnknownPart) {
  ModelData damaged = TwoInstances();
  damaged.products[2].part = 2;
  ModelData model;
  EXPECT_FALSE(DecodeModel(EncodeModel(damaged), model));
}

TEST(ModelData, DecodeLeavesTheModelOnFailure) {
  ModelData model = TwoInstances();
  EXPECT_FALSE(DecodeModel("damaged", model));
  EXPECT_EQ(model.products.size(), 3u);
}
