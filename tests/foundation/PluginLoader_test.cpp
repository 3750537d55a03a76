#include "foundation/PluginLoader.h"

#include <gtest/gtest.h>

#include <filesystem>

using ZORFoundation::FindPluginFunction;
using ZORFoundation::LibraryDirectory;

TEST(PluginLoader, DirectoryIsThatOfTheLibraries) {
  EXPECT_TRUE(std::filesystem::exists(LibraryDirectory() + "/libZORFoundation.so"));
}

TEST(PluginLoader, FunctionOfALibraryBesideItIsFound) {
  std::string reason = "untouched";
  EXPECT_NE(FindPluginFunction("libZORFoundation.so", "_ZN13ZORFoundation12FileClockNowEv", reason),
            nullptr);
  EXPECT_EQ(reason, "untouched");
}

TEST(PluginLoader, MissingLibraryOrFunctionHasItsReason) {
  std::string reason;
  EXPECT_EQ(FindPluginFunction("libZORNone.so", "f", reason), nullptr);
  EXPECT_NE(reason.find("libZORNone.so"), reason.npos) << reason;
  EXPECT_EQ(FindPluginFunction("libZORFoundation.so", "noSuchFunction", reason), nullptr);
  EXPECT_NE(reason.find("noSuchFunction"), reason.npos) << reason;
}
