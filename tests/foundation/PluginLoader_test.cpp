#include "foundation/PluginLoader.h"

#include <gtest/gtest.h>

#include <filesystem>

using ZORFoundation::FindPluginFunction;
using ZORFoundation::LibraryDirectory;
using ZORFoundation::PluginPath;

TEST(PluginLoader, DirectoryIsThatOfTheLibraries) {
  EXPECT_TRUE(std::filesystem::exists(PluginPath("ZORFoundation")));
}

TEST(PluginLoader, FunctionOfALibraryBesideItIsFound) {
  std::string reason = "untouched";
  EXPECT_NE(FindPluginFunction("ZORFoundation", "_ZN13ZORFoundation12FileClockNowEv", reason),
            nullptr);
  EXPECT_EQ(reason, "untouched");
}

TEST(PluginLoader, MissingLibraryOrFunctionHasItsReason) {
  std::string reason;
  EXPECT_EQ(FindPluginFunction("ZORNone", "f", reason), nullptr);
  EXPECT_NE(reason.find("ZORNone"), reason.npos) << reason;
  EXPECT_EQ(FindPluginFunction("ZORFoundation", "noSuchFunction", reason), nullptr);
  EXPECT_NE(reason.find("noSuchFunction"), reason.npos) << reason;
}
