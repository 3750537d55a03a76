// Models of all formats, damaged at random places: each ends in a result or in one line.
#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <random>

#include "default_platform/product_structure/ModelWriting.h"
#include "default_platform/product_structure/OpenedModels.h"

namespace {

using products::Folder;
using ZORDefault::ModelErrorKind;

struct Seed {
  std::string name;
  std::string bytes;
};

std::string StlOfTwoTriangles() {
  return "solid a\nfacet normal 0 0 1\nouter loop\nvertex 0 0 0\nvertex 1 0 0\nvertex 0 1 0\n"
         "endloop\nendfacet\nfacet normal 0 0 -1\nouter loop\nvertex 0 0 0\nvertex 0 1 0\n"
         "vertex 1 0 1\nendloop\nendfacet\nendsolid a\n";
}

const std::string kGltf =
    R"({"asset":{"version":"2.0"},"scene":0,"scenes":[{"nodes":[0,1]}],)"
    R"("nodes":[{"name":"a","mesh":0,"children":[2]},{"name":"b","mesh":0,"translation":[2,0,0]},)"
    R"({"name":"c","mesh":0}],"meshes":[{"primitives":[{"attributes":{"POSITION":0}}]}],)"
    R"("accessors":[{"bufferView":0,"componentType":5126,"count":3,"type":"VEC3",)"
    R"("min":[0,0,0],"max":[1,1,0]}],"bufferViews":[{"buffer":0,"byteLength":36}],)"
    R"("buffers":[{"byteLength":36,"uri":"data:application/octet-stream;base64,)"
    R"(AAAAAAAAAAAAAAAAAACAPwAAAAAAAAAAAAAAAAAAgD8AAAAA"}]})";

std::string Number(std::size_t inNumber) {
  const auto value = static_cast<std::uint32_t>(inNumber);
  std::string bytes(sizeof value, '\0');
  std::memcpy(bytes.data(), &value, sizeof value);
  return bytes;
}

/// The scene above, its points in a chunk of their own.
std::string Glb() {
  std::string text = kGltf;
  const std::size_t uri = text.find(",\"uri\"");
  text.erase(uri, text.find("\"}]}", uri) + 1 - uri);
  text.resize((text.size() + 3) / 4 * 4, ' ');
  const float points[9] = {0, 0, 0, 1, 0, 0, 0, 1, 0};
  const std::string chunk(reinterpret_cast<const char*>(points), sizeof points);
  return "glTF" + Number(2) + Number(12 + 8 + text.size() + 8 + chunk.size()) +
         Number(text.size()) + "JSON" + text + Number(chunk.size()) + std::string("BIN\0", 4) +
         chunk;
}

Seed SeedOf(const std::string& inFormat, const Folder& inFolder) {
  const std::string path = inFolder.GetPath() + "/seed." + inFormat;
  if (inFormat == "stp") products::WriteStep(path, {});
  if (inFormat == "igs") products::WriteIges(path, "MM");
  if (inFormat == "stp" || inFormat == "igs") return {"a." + inFormat, products::ReadAll(path)};
  if (inFormat == "gltf") return {"a.gltf", kGltf};
  if (inFormat == "glb") return {"a.glb", Glb()};
  if (inFormat == "stl") return {"a.stl", StlOfTwoTriangles()};
  return {"a.obj",
          "o a\nv 0 0 0\nv 1 0 0\nv 1 1 0\nv 0 1 0\nvn 0 0 1\nf 1//1 2//1 3//1\nf 1 3 4\n"};
}

/// One to three of: another byte, a number changed, a piece left out, doubled or moved.
std::string Mutated(std::string inBytes, std::mt19937& ioRandom) {
  const auto below = [&](std::size_t inLimit) {
    return std::uniform_int_distribution<std::size_t>(0, inLimit - 1)(ioRandom);
  };
  for (std::size_t change = below(3) + 1; change > 0 && !inBytes.empty(); --change) {
    const std::size_t at = below(inBytes.size());
    const std::string piece = inBytes.substr(at, below(60) + 1);
    switch (below(5)) {
      case 0:
        inBytes[at] = static_cast<char>(below(256));
        break;
      case 1:
        if (const std::size_t digit = inBytes.find_first_of("0123456789", at);
            digit != std::string::npos)
          inBytes[digit] = static_cast<char>('0' + below(10));
        break;
      case 2:
        inBytes.erase(at, piece.size());
        break;
      case 3:
        inBytes.insert(at, piece);
        break;
      default:
        inBytes.erase(at, piece.size());
        inBytes.insert(below(inBytes.size() + 1), piece);
    }
  }
  return inBytes;
}

class ModelMutations : public testing::TestWithParam<const char*> {};

TEST_P(ModelMutations, EndInAResultOrInOneLine) {
  const auto numberFrom = [](const char* variable, int otherwise) {
    const char* const text = std::getenv(variable);
    return text ? std::atoi(text) : otherwise;
  };
  const int count = numberFrom("ZOR_MODEL_MUTATIONS", 200);
  const Folder folder;
  const Seed seed = SeedOf(GetParam(), folder);
  std::mt19937 random(static_cast<unsigned>(numberFrom("ZOR_MODEL_SEED", 20240607)));
  ZORDefault::ModelOptions options;
  options.useCache = false;
  options.maxSeconds = 2;
  options.maxMemory = std::uint64_t{256} << 20;
  int opened = 0, refused = 0, crashed = 0;
  ASSERT_NO_THROW(ZORDefault::OpenModel(folder.Write(seed.name, seed.bytes), options));
  for (int i = 0; i < count; ++i) {
    const std::string path = folder.Write(seed.name, Mutated(seed.bytes, random));
    try {
      ZORDefault::OpenModel(path, options);
      ++opened;
    } catch (const ZORDefault::ModelError& error) {
      EXPECT_FALSE(error.GetReason().empty());
      EXPECT_EQ(error.GetReason().find('\n'), std::string::npos) << error.GetReason();
      ++(error.GetKind() == ModelErrorKind::kCrash ? crashed : refused);
    }
  }
  EXPECT_EQ(opened + refused + crashed, count);
  // Otherwise the damage would be too great, or too small, to test anything.
  EXPECT_GT(opened, 0);
  EXPECT_GT(refused + crashed, 0);
  std::printf("%s: %d opened, %d refused, %d ended the reader\n", GetParam(), opened, refused,
              crashed);
}

INSTANTIATE_TEST_SUITE_P(OfAllFormats, ModelMutations,
                         testing::Values("stp", "igs", "gltf", "glb", "obj", "stl"),
                         [](const auto& inInfo) { return std::string(inInfo.param); });

}  // namespace
