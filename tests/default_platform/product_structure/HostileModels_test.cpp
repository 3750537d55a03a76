// Damaged and malicious models: each ends in a result or in one line, and the process lives on.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/stat.h>

#include <filesystem>
#include <sstream>

#include "default_platform/product_structure/OpenedModels.h"

using products::Folder;
using products::OwnCache;
using testing::AnyOf;
using testing::HasSubstr;
using testing::StartsWith;
using ZORDefault::ModelError;
using ZORDefault::ModelErrorKind;
using ZORDefault::ModelOptions;

namespace fs = std::filesystem;

namespace {

struct Outcome {
  bool isOpened = false;
  ModelErrorKind kind = ModelErrorKind::kFile;
  std::string reason;
  std::vector<std::string> warnings;
};

Outcome Open(const std::string& inPath, ModelOptions inOptions = {}) {
  Outcome outcome;
  inOptions.warn = [&](const std::string& warning) { outcome.warnings.push_back(warning); };
  try {
    ZORDefault::OpenModel(inPath, inOptions);
    outcome.isOpened = true;
  } catch (const ModelError& error) {
    outcome.kind = error.GetKind();
    outcome.reason = error.GetReason();
  }
  EXPECT_EQ(outcome.reason.find('\n'), std::string::npos);
  return outcome;
}

Outcome OpenAnew(const std::string& inPath) {
  ModelOptions options;
  options.useCache = false;
  return Open(inPath, options);
}

std::string Hostile(const std::string& inName) {
  return std::string(ZOR_SOURCE_DIR) + "/tests/default_platform/product_structure/hostile/" +
         inName;
}

/// The sample without one of its lines, counted from 1.
std::string SampleWithoutLine(std::size_t inLine) {
  std::istringstream sample(products::ReadAll(products::Sample("as1-oc-214.stp")));
  std::string text;
  std::size_t number = 0;
  for (std::string line; std::getline(sample, line);)
    if (++number != inLine) text += line + '\n';
  return text;
}

TEST(HostileModels, StepWithAMissingLineEndsTheReaderAlone) {
  const Folder folder;
  const Outcome outcome = OpenAnew(folder.Write("a.stp", SampleWithoutLine(2146)));
  EXPECT_FALSE(outcome.isOpened);
  EXPECT_EQ(outcome.kind, ModelErrorKind::kCrash);
  EXPECT_THAT(outcome.reason, StartsWith("cannot be read: the CAD kernel crashed"));
  EXPECT_THAT(outcome.reason, HasSubstr("while building its shapes"));
}

TEST(HostileModels, StepThatLosesFacesSaysSo) {
  const Folder folder;
  const std::string path = folder.Write("a.stp", SampleWithoutLine(5895));  // a point of an edge
  ModelOptions options;
  options.useCache = false;
  const Outcome outcome = Open(path, options);
  EXPECT_TRUE(outcome.isOpened);
  EXPECT_THAT(outcome.warnings,
              testing::Contains(path + ": is damaged: 4 entities of the file could not be built"));
  options.isStrict = true;
  const Outcome strict = Open(path, options);
  EXPECT_FALSE(strict.isOpened);
  EXPECT_EQ(strict.kind, ModelErrorKind::kDamaged);
  EXPECT_EQ(strict.reason, "is damaged: 4 entities of the file could not be built");
}

TEST(HostileModels, DamageIsKnownFromTheCacheToo) {
  const OwnCache cache;
  const Folder folder;
  const std::string path = folder.Write("a.stp", SampleWithoutLine(5895));
  const Outcome first = Open(path), second = Open(path);
  EXPECT_FALSE(first.warnings.empty());
  EXPECT_EQ(first.warnings, second.warnings);
}

TEST(HostileModels, StepFilesThatNameEachOther) {
  ModelOptions options;
  options.useCache = false;
  options.maxMemory = std::uint64_t{200} << 20;
  const Outcome outcome = Open(Hostile("names-the-other-1.stp"), options);
  EXPECT_THAT(outcome.kind, AnyOf(ModelErrorKind::kCrash, ModelErrorKind::kMemoryLimit,
                                  ModelErrorKind::kTimeLimit));
}

TEST(HostileModels, CoordinatesThatAreNoNumbersEndAtTheTimeLimit) {
  ModelOptions options;
  options.useCache = false;
  options.maxSeconds = 1;
  const Outcome outcome = Open(Hostile("nums_nan.stp"), options);
  EXPECT_EQ(outcome.kind, ModelErrorKind::kTimeLimit);
  EXPECT_EQ(outcome.reason, "takes more than 1 s to read; stopped while building its shapes");
}

TEST(HostileModels, OutOfMemoryIsAnErrorAndLeavesNothingInTheCache) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "the sanitizer maps far more memory than is used";
#endif
  const OwnCache cache;
  ModelOptions options;
  options.maxMemory = std::uint64_t{8} << 20;
  const Outcome outcome = Open(products::Sample("as1-oc-214.stp"), options);
  EXPECT_EQ(outcome.kind, ModelErrorKind::kMemoryLimit);
  EXPECT_THAT(outcome.reason, StartsWith("takes more than 8 MB to read; stopped while "));
  EXPECT_FALSE(fs::exists(cache.GetDirectory()));
}

TEST(HostileModels, GltfFaultsAreNamed) {
  EXPECT_EQ(OpenAnew(Hostile("gltf-node-own-child.gltf")).reason,
            "its node 0 is its own descendant");
  EXPECT_EQ(OpenAnew(Hostile("gltf-10-to-the-7.gltf")).reason, "has more than a million products");
  EXPECT_EQ(OpenAnew(Hostile("count1_1000000000.gltf")).reason,
            "its accessor 1 claims more bytes than there are");
  EXPECT_EQ(OpenAnew(Hostile("gltf-base64-80.gltf")).kind, ModelErrorKind::kCrash);
}

std::string ObjWithFaceOf(int inCorners) {
  std::string text = "v 0 0 0\n";
  std::string face = "f 1";
  for (int i = 1; i < inCorners; ++i) {
    text += "v " + std::to_string(std::cos(6.28 * i / inCorners)) + " " +
            std::to_string(std::sin(6.28 * i / inCorners)) + " 0\n";
    face += (i % 100 == 0 ? " \\\n " : " ") + std::to_string(i + 1);
  }
  return text + face + "\n";
}

TEST(HostileModels, ObjFaceWithMoreCornersThanTheKernelHasRoomFor) {
  const Folder folder;
  for (const int corners : {1000, 1024, 1025, 5000}) {
    const Outcome outcome = OpenAnew(folder.Write("a.obj", ObjWithFaceOf(corners)));
    EXPECT_TRUE(outcome.isOpened) << corners << ": " << outcome.reason;
    EXPECT_THAT(outcome.warnings, testing::IsEmpty());
  }
  std::string missing = ObjWithFaceOf(2000);
  missing.replace(missing.find("f 1"), 3, "f 9999");
  EXPECT_EQ(OpenAnew(folder.Write("b.obj", missing)).reason,
            "line 2001: a face refers to a missing vertex");
}

TEST(HostileModels, PipesAreRefusedUnderWhateverNameTheKernelReads) {
  const Folder folder;
  for (const char* const name : {"/fifo", "/ pipe.stp"})
    ASSERT_EQ(mkfifo((folder.GetPath() + name).c_str(), 0600), 0);
  const std::string triangle = "v 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n";
  EXPECT_EQ(OpenAnew(folder.Write("a.obj", "mtllib \\\nfifo\n" + triangle)).reason,
            "names fifo, which is no file");
  EXPECT_EQ(
      OpenAnew(folder.Write("a.stp", products::ReadAll(Hostile("step-names-a-pipe.stp")))).reason,
      "names  pipe.stp, which is no file");
  fs::create_symlink("/dev/zero", folder.GetPath() + "/endless.mtl");
  EXPECT_EQ(OpenAnew(folder.Write("b.obj", "mtllib endless.mtl\n" + triangle)).reason,
            "names endless.mtl, which is no file");
}

TEST(HostileModels, FilesOutsideTheFolderAreNotRead) {
  const Folder outside, folder;
  const std::string materials = outside.Write("a.mtl", "newmtl m\nKd 1 0 0\n");
  const std::string body = "usemtl m\nv 0 0 0\nv 1 0 0\nv 0 1 0\nf 1 2 3\n";
  const std::string name = fs::path(materials).lexically_relative(folder.GetPath()).string();
  const std::string path = folder.Write("a.obj", "mtllib " + name + "\n" + body);
  const Outcome outcome = OpenAnew(path);
  EXPECT_TRUE(outcome.isOpened);
  EXPECT_THAT(outcome.warnings,
              testing::ElementsAre(path + ": its file " + name + " is outside its folder"));
}

TEST(HostileModels, HostMayReapItsChildrenItself) {
  const auto before = signal(SIGCHLD, SIG_IGN);
  EXPECT_TRUE(OpenAnew(products::Sample("as1-oc-214.stp")).isOpened);
  signal(SIGCHLD, before);
}

TEST(HostileModels, WhatTheProgressFunctionRaisesEndsTheReading) {
  ModelOptions options;
  options.useCache = false;
  options.progress = [](double) { throw std::string("stop"); };
  EXPECT_THROW(ZORDefault::OpenModel(products::Sample("as1-oc-214.stp"), options), std::string);
}

}  // namespace
