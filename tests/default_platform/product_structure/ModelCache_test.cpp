#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "default_platform/PartMesh.h"
#include "default_platform/product_structure/OpenedModels.h"

using products::FactsOf;
using products::Folder;
using products::OwnCache;
using testing::ElementsAre;
using testing::IsEmpty;
using ZORDefault::ModelOptions;
using ZORDefault::OpenedModel;
using ZORDefault::OpenModel;

namespace fs = std::filesystem;

namespace {
const std::string kSample = products::Sample("as1-oc-214.stp");

/// A model that is opened at once.
class TinyModel {
 public:
  const std::string& GetPath() const { return path_; }

 private:
  Folder folder_;
  std::string path_ = folder_.Write("tiny.obj", "v 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n");
};

/// Opens with warnings collected.
OpenedModel OpenWarned(const std::string& inPath, std::vector<std::string>& outWarnings) {
  ModelOptions options;
  options.warn = [&](const std::string& warning) { outWarnings.push_back(warning); };
  return OpenModel(inPath, options);
}

void Damage(const std::string& inPath, std::streamoff inPosition) {
  std::fstream file(inPath, std::ios::in | std::ios::out | std::ios::binary);
  file.seekg(inPosition);
  const char byte = static_cast<char>(file.get() ^ 1);
  file.seekp(inPosition);
  file.put(byte);
}
}  // namespace

TEST(ModelCache, SecondOpeningComesFromIt) {
  const TinyModel tiny;
  const OwnCache cache;
  EXPECT_FALSE(OpenModel(tiny.GetPath()).isFromCache);
  EXPECT_TRUE(OpenModel(tiny.GetPath()).isFromCache);
}

TEST(ModelCache, SecondOpeningGivesTheSame) {
  const OwnCache cache;
  const OpenedModel first = OpenModel(kSample), second = OpenModel(kSample);
  const auto one = products::AllProducts(first.root), two = products::AllProducts(second.root);
  ASSERT_EQ(one.size(), two.size());
  for (std::size_t i = 0; i < one.size(); ++i) {
    const auto a = FactsOf(one[i]), b = FactsOf(two[i]);
    EXPECT_EQ(a.alias, b.alias);
    EXPECT_EQ(a.partName, b.partName);
    EXPECT_EQ(a.part, b.part);
    EXPECT_EQ(a.colour, b.colour);
    EXPECT_EQ(a.area, b.area);
    EXPECT_EQ(a.rootFromProduct.GetVector().x, b.rootFromProduct.GetVector().x);
    ASSERT_EQ(a.mesh == nullptr, b.mesh == nullptr);
    if (a.mesh) {
      EXPECT_EQ(a.mesh->points, b.mesh->points);
    }
  }
}

TEST(ModelCache, SecondOpeningStillShares) {
  const OwnCache cache;
  OpenModel(kSample);
  const OpenedModel model = OpenModel(kSample);
  EXPECT_EQ(FactsOf(products::FindByAliasPath(model.root, "rod-assembly_1 --++-- nut_1")).mesh,
            FactsOf(products::FindByAliasPath(model.root, "rod-assembly_1 --++-- nut_2")).mesh);
}

TEST(ModelCache, NameOfTheFileDoesNotMatter) {
  const OwnCache cache;
  const Folder folder;
  OpenModel(folder.Write("one.stl",
                         "solid\nfacet normal 0 0 1\nouter loop\nvertex 0 0 0\n"
                         "vertex 1 0 0\nvertex 0 1 0\nendloop\nendfacet\nendsolid\n"));
  fs::rename(folder.GetPath() + "/one.stl", folder.GetPath() + "/two.stl");
  const OpenedModel model = OpenModel(folder.GetPath() + "/two.stl");
  EXPECT_TRUE(model.isFromCache);
  EXPECT_EQ(products::AliasOf(model.root), "two");
}

TEST(ModelCache, OtherBytesAreAnotherModel) {
  const OwnCache cache;
  const Folder folder;
  const std::string bytes = products::ReadAll(kSample);
  OpenModel(folder.Write("a.stp", bytes));
  EXPECT_FALSE(OpenModel(folder.Write("a.stp", bytes + "\n")).isFromCache);
}

TEST(ModelCache, OtherDeflectionIsAnotherModel) {
  const TinyModel tiny;
  const OwnCache cache;
  OpenModel(tiny.GetPath());
  ModelOptions options;
  options.deflection = 0.01;
  EXPECT_FALSE(OpenModel(tiny.GetPath(), options).isFromCache);
}

TEST(ModelCache, SwitchedOffWritesNothing) {
  const TinyModel tiny;
  const OwnCache cache;
  products::OpenAnew(tiny.GetPath());
  EXPECT_FALSE(fs::exists(cache.GetDirectory()));
}

TEST(ModelCache, DamagedEntryIsNoticedAndMadeAnew) {
  const TinyModel tiny;
  const OwnCache cache;
  OpenModel(tiny.GetPath());
  const std::string entry = cache.GetOnlyEntry(), whole = products::ReadAll(entry);
  ASSERT_FALSE(whole.empty());
  const auto size = static_cast<std::streamoff>(whole.size());
  for (const std::streamoff position : {std::streamoff{0}, std::streamoff{9}, std::streamoff{17},
                                        std::streamoff{25}, size / 2, size - 1}) {
    Damage(entry, position);
    std::vector<std::string> warnings;
    EXPECT_FALSE(OpenWarned(tiny.GetPath(), warnings).isFromCache) << position;
    EXPECT_THAT(warnings, ElementsAre(tiny.GetPath() +
                                      ": its entry in the cache was damaged and is made anew"));
    EXPECT_EQ(products::ReadAll(entry), whole) << position;
  }
}

TEST(ModelCache, CutEntryIsNoticedAndMadeAnew) {
  const TinyModel tiny;
  const OwnCache cache;
  OpenModel(tiny.GetPath());
  const std::string entry = cache.GetOnlyEntry(), whole = products::ReadAll(entry);
  for (const std::size_t length : {std::size_t{0}, std::size_t{10}, whole.size() / 2}) {
    std::ofstream(entry, std::ios::binary) << whole.substr(0, length);
    EXPECT_FALSE(OpenModel(tiny.GetPath()).isFromCache) << length;
    EXPECT_EQ(products::ReadAll(entry), whole) << length;
  }
}

TEST(ModelCache, UnwritableDirectoryIsNoFailure) {
  const TinyModel tiny;
  const Folder folder;
  const support::ScopedVariable variable("XDG_CACHE_HOME", folder.Write("file", "in the way"));
  EXPECT_FALSE(OpenModel(tiny.GetPath()).isFromCache);
  EXPECT_FALSE(OpenModel(tiny.GetPath()).isFromCache);
}

TEST(ModelCache, StandsBelowHomeWithoutItsOwnVariable) {
  const TinyModel tiny;
  const Folder folder;
  const support::ScopedVariable cache("XDG_CACHE_HOME", "");
  const support::ScopedVariable home("HOME", folder.GetPath());
  OpenModel(tiny.GetPath());
  EXPECT_TRUE(fs::exists(folder.GetPath() + "/.cache/zorlyra"));
  EXPECT_TRUE(OpenModel(tiny.GetPath()).isFromCache);
}

TEST(ModelCache, LeavesNothingBesideItsEntry) {
  const TinyModel tiny;
  const OwnCache cache;
  OpenModel(tiny.GetPath());
  EXPECT_THAT(cache.GetOnlyEntry(), testing::EndsWith(".model"));
}

TEST(ModelCache, ChangedOtherFileIsReadAnew) {
  const OwnCache cache;
  const Folder folder;
  const std::string path =
      folder.Write("a.obj", "mtllib a.mtl\nusemtl m\nv 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n");
  folder.Write("a.mtl", "newmtl m\nKd 1 0 0\n");
  EXPECT_FALSE(OpenModel(path).isFromCache);
  EXPECT_TRUE(OpenModel(path).isFromCache);
  folder.Write("a.mtl", "newmtl m\nKd 0 1 0\n");
  EXPECT_FALSE(OpenModel(path).isFromCache);
}

TEST(ModelCache, ProgressRunsToItsEnd) {
  for (const bool useCache : {false, true}) {
    const OwnCache cache;
    OpenModel(kSample);
    std::vector<double> told;
    ModelOptions options;
    options.useCache = useCache;
    options.progress = [&](double done) { told.push_back(done); };
    OpenModel(kSample, options);
    ASSERT_FALSE(told.empty());
    EXPECT_TRUE(std::ranges::is_sorted(told));
    EXPECT_EQ(told.back(), 1);
    EXPECT_EQ(told.size() > 5, !useCache);
  }
}
