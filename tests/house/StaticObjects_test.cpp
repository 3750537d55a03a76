// The order in which the library's process-wide strings are built and destroyed.
//
// This program is linked to the platform but not to the library. It takes the place of the string's
// constructors and destructor, notes what the library's own memory sees of them, and lets the
// platform do the work. The replacements are plain functions under the operations' names, since a
// second definition of the class's own would also construct and destroy its members.
#include <dlfcn.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {
struct Event {
  const void* object;
  std::string text;
};

bool isRecording = false;
std::vector<Event> built;
std::vector<const void*> destroyed;

/// Objects on the stack or the heap lie in no file; those of other libraries in another one.
bool IsStaticObjectOfLibrary(const void* inObject) {
  Dl_info info{};
  return dladdr(inObject, &info) != 0 && info.dli_fname != nullptr &&
         std::string(info.dli_fname).find("libZORLyra.so") != std::string::npos;
}

template <class Operation>
Operation* Original(const char* inName) {
  return reinterpret_cast<Operation*>(dlsym(RTLD_NEXT, inName));
}

void NoteBuilt(const void* inObject, const char* inText) {
  if (isRecording && IsStaticObjectOfLibrary(inObject)) built.push_back({inObject, inText});
}
}  // namespace

#define ZOR_REPLACES(name) __asm__(name) __attribute__((visibility("default")))

void BuildFromText(void* outString, const char* inText) ZOR_REPLACES("_ZN16ZORUnicodeStringC1EPKc");
void BuildEmpty(void* outString) ZOR_REPLACES("_ZN16ZORUnicodeStringC1Ev");
void Destroy(void* ioString) ZOR_REPLACES("_ZN16ZORUnicodeStringD1Ev");

void BuildFromText(void* outString, const char* inText) {
  static auto* original = Original<void(void*, const char*)>("_ZN16ZORUnicodeStringC1EPKc");
  original(outString, inText);
  NoteBuilt(outString, inText);
}

void BuildEmpty(void* outString) {
  static auto* original = Original<void(void*)>("_ZN16ZORUnicodeStringC1Ev");
  original(outString);
  NoteBuilt(outString, "");
}

void Destroy(void* ioString) {
  static auto* original = Original<void(void*)>("_ZN16ZORUnicodeStringD1Ev");
  if (isRecording && IsStaticObjectOfLibrary(ioString)) destroyed.push_back(ioString);
  original(ioString);
}

namespace {
class StaticObjects : public testing::Test {
 protected:
  /// Loads and unloads the library, noting what happens.
  void SetUp() override {
    built.clear();
    destroyed.clear();
    isRecording = true;
    void* library = dlopen(ZOR_BINARY_DIR "/lib/libZORLyra.so", RTLD_NOW | RTLD_LOCAL);
    ASSERT_NE(library, nullptr) << dlerror();
    destroyedWhileLoading_ = destroyed.size();
    ASSERT_EQ(dlclose(library), 0) << dlerror();
    isRecording = false;
  }

  std::size_t destroyedWhileLoading_ = 0;
};
}  // namespace

TEST_F(StaticObjects, AreBuiltInOrderAtLoad) {
  std::vector<std::string> texts;
  for (const Event& event : built) texts.push_back(event.text);
  EXPECT_THAT(texts, testing::ElementsAre(
                         "Name", "AttrType", "AttrValue", "Component", "Components", "Alias",
                         "Alien", "ComponentAttribute", "ComponentAttributes",
                         "DocumentVersionUUID", "ComponentUuid", "PartNumber", "ShapePosition",
                         "ComponentShape", "ComponentShapes", "ComponentType", "ZORDocument", "Rx",
                         "Ry", "Rz", "T", "Ux", "Uy", "Uz", "PRCName", "ServerMarker", "ShapeId",
                         "ShapeName", "ShapeOnDisk", "ShapeType", "Transaction", "", "", ""));
}

TEST_F(StaticObjects, StayWhileTheLibraryIsLoaded) { EXPECT_EQ(destroyedWhileLoading_, 0u); }

TEST_F(StaticObjects, AreDestroyedInReverseOrderAtUnload) {
  std::vector<const void*> reversed;
  for (auto event = built.rbegin(); event != built.rend(); ++event) {
    reversed.push_back(event->object);
  }
  ASSERT_FALSE(reversed.empty());
  EXPECT_EQ(destroyed, reversed);
}

TEST_F(StaticObjects, AreBuiltAgainAtTheNextLoad) {
  const std::size_t count = built.size();
  SetUp();
  EXPECT_GT(count, 0u);
  EXPECT_EQ(built.size(), count);
  EXPECT_EQ(destroyed.size(), count);
}
