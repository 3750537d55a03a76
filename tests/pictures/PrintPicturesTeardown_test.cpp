// Taking a picture's scene apart, on a platform whose calls raise errors. This program's operators
// new and delete tell when a block of memory was freed.
#include <gtest/gtest.h>

#include <cstdlib>
#include <new>
#include <stdexcept>
#include <string>

#include "PrintPictures.h"
#include "default_platform/system/ObjectCounters.h"
#include "pictures/FakeObjects.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "support/AbandonedMemory.h"
#include "support/OriginalFunction.h"

namespace {

const void* watched = nullptr;
bool isWatchedFree = false;

void Free(void* inBlock) {
  if (inBlock && inBlock == watched) isWatchedFree = true;
  std::free(inBlock);
}

/// The calls that take a scene apart.
struct TeardownCalls {
  bool isOn = false;
  std::string steps;  ///< in order, each followed by a semicolon
  int raising = 0;    ///< the number of the step that raises an error; -1: every one
  int count = 0;

  void Make(const std::string& inStep) {
    if (!isOn) return;
    steps += inStep + ";";
    if (++count == raising || raising == -1) throw std::runtime_error(inStep);
  }
} teardown;

std::string NameOf(const ZORRep* inRep) {
  const auto* const named = dynamic_cast<const NamedRep*>(inRep);
  return named ? named->GetName() : "bag";
}

}  // namespace

void* operator new(std::size_t inSize) {
  if (void* const block = std::malloc(inSize)) return block;
  throw std::bad_alloc();
}
void* operator new[](std::size_t inSize) { return operator new(inSize); }
void operator delete(void* inBlock) noexcept { Free(inBlock); }
void operator delete[](void* inBlock) noexcept { Free(inBlock); }
void operator delete(void* inBlock, std::size_t) noexcept { Free(inBlock); }
void operator delete[](void* inBlock, std::size_t) noexcept { Free(inBlock); }

void ZOR3DBagRep::RemoveChild(ZORRep* inChild) {
  teardown.Make("remove " + NameOf(inChild));
  std::erase(children_, inChild);
}

void ZORRep::Destroy() {
  teardown.Make("destroy " + NameOf(this));
  delete this;
}

unsigned int ZORBaseUnknown::Release() {
  if (dynamic_cast<ZOR3DViewpoint*>(this) && recorded.calls.ends_with("image released;"))
    teardown.Make("release viewpoint");
  return support::CallOriginal<unsigned int>("_ZN14ZORBaseUnknown7ReleaseEv", this);
}

namespace {

constexpr char kAllSteps[] =
    "release viewpoint;remove clash;destroy clash;remove bag;remove a;destroy bag;"
    "remove bag;remove b;destroy bag;destroy bag;";
constexpr int kStepCount = 10;

class Teardowns : public testing::Test {
 protected:
  Teardowns() {
    recorded = {};
    teardown = {};
    recorded.findRep = [this](const std::string& inPath) -> ZORRep* {
      return inPath == "a" ? first.rep : second.rep;
    };
  }
  ~Teardowns() override { teardown = {}; }

  void Print() {
    teardown.isOn = true;
    PrintPictures::PrintListVisuToFile(first.Handle(), "a", second.Handle(), "b", clash.Handle(),
                                       "itf.png", "PNG", 300, 200, 0, 1);
  }
  void Preview() {
    teardown.isOn = true;
    PrintPictures::PrintListVisuToFilePreview(first.Handle(), "a", "a.png", "PNG", 40, 30, 0, 1);
  }
  PictureProduct first{"a"}, second{"b"};
  FakeInterference clash;
};

TEST_F(Teardowns, GoesFromTheViewpointToTheTopBag) {
  Print();
  EXPECT_EQ(kAllSteps, teardown.steps);
}

TEST_F(Teardowns, ErrorOfAnyStepReachesTheCallerAndTheOtherStepsAreMade) {
  const support::AbandonedMemory abandoned;  // what could not be ended
  for (int step = 1; step <= kStepCount; ++step) {
    recorded.calls.clear();
    teardown = {};
    teardown.raising = step;
    EXPECT_THROW(Print(), std::runtime_error) << step;
    EXPECT_EQ(kAllSteps, teardown.steps) << step;
    EXPECT_TRUE(recorded.calls.ends_with("builder deleted;")) << step;
  }
}

TEST_F(Teardowns, FirstErrorArrivesThoughEveryStepRaisesAnother) {
  const support::AbandonedMemory abandoned;
  teardown.raising = -1;
  try {
    Print();
    ADD_FAILURE() << "no error";
  } catch (const std::runtime_error& error) {
    EXPECT_STREQ("release viewpoint", error.what());
  }
  EXPECT_EQ(kAllSteps, teardown.steps);
}

TEST_F(Teardowns, ErrorOfDrawingArrivesThoughEveryStepRaisesAnother) {
  const support::AbandonedMemory abandoned;
  teardown.raising = -1;
  clash.failsToAnswer = true;
  EXPECT_THROW(Print(), ZORNullVarError);
  EXPECT_TRUE(teardown.steps.ends_with("remove b;destroy bag;destroy bag;"));
}

TEST_F(Teardowns, ErrorOfBuildingTheSceneEndsWhatWasBuilt) {
  clash.onRepresentation = [] { throw std::runtime_error("representation"); };
  EXPECT_THROW(Print(), std::runtime_error);
  EXPECT_EQ("remove a;destroy bag;remove b;destroy bag;destroy bag;", teardown.steps);
}

TEST_F(Teardowns, PreviewPassesTheErrorOfItsBagOn) {
  const support::AbandonedMemory abandoned;
  for (int step = 1; step <= 2; ++step) {
    recorded.calls.clear();
    teardown = {};
    teardown.raising = step;
    EXPECT_THROW(Preview(), std::runtime_error);
    EXPECT_EQ("remove a;destroy bag;", teardown.steps);
    EXPECT_TRUE(recorded.calls.ends_with("path deleted;builder deleted;"));
  }
}

TEST_F(Teardowns, ArrayOfOnesIsFreedBeforeTheRepresentationIsTaken) {
  bool wasFree = false;
  clash.onRepresentation = [&] { wasFree = isWatchedFree; };
  clash.onFlags = [&] {
    if (!watched) watched = clash.givenFlags;
  };
  isWatchedFree = false;
  Print();
  watched = nullptr;
  EXPECT_TRUE(wasFree);
}

}  // namespace
