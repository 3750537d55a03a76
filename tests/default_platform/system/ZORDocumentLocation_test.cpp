#include "platform/system/ZORDocumentLocation.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "platform/system/ZORGetEnv.h"
#include "support/PlatformFolder.h"

using support::PlatformFolder;
using support::ScopedVariable;

namespace {

// The directory of a name; "failed" when there is none.
std::string DirectoryOf(const char* inName) {
  ZORUnicodeString* directory = nullptr;
  const HRESULT result = ZORGetDLName(ZORUnicodeString(inName), &directory);
  const std::unique_ptr<ZORUnicodeString> owned(directory);
  EXPECT_EQ(SUCCEEDED(result), directory != nullptr);
  return directory ? directory->ConvertToChar() : "failed";
}

std::string Expanded(const char* inText) {
  ZORUnicodeString text(inText);
  const HRESULT result = ZORExpandString(&text);
  if (SUCCEEDED(result)) return text.ConvertToChar();
  EXPECT_EQ(result, E_FAIL);
  EXPECT_TRUE(text == inText) << "changed by a failure";
  return "failed";
}

}  // namespace

TEST(ZORGetDLName, FindsTheDirectoryOfAName) {
  const PlatformFolder folder;
  folder.WriteLogicalNames("Reports = \"/srv/reports\"\n\"Mes \\u00E9tudes\" = \"/srv/\\u00E9\"");
  EXPECT_EQ(DirectoryOf("Reports"), "/srv/reports");
  EXPECT_EQ(DirectoryOf("Mes \xC3\xA9tudes"), "/srv/\xC3\xA9");
}

TEST(ZORGetDLName, DirectoryIsNotExpanded) {
  const PlatformFolder folder;
  folder.WriteLogicalNames("Reports = \"${HOME}/reports\"");
  EXPECT_EQ(DirectoryOf("Reports"), "${HOME}/reports");
}

TEST(ZORGetDLName, UnknownNameFails) {
  const PlatformFolder folder;
  folder.WriteLogicalNames("Reports = \"/srv/reports\"\nNumber = 1");
  EXPECT_EQ(DirectoryOf("reports"), "failed");
  EXPECT_EQ(DirectoryOf(""), "failed");
  EXPECT_EQ(DirectoryOf("Number"), "failed");
}

TEST(ZORGetDLName, MissingOrDamagedTableFails) {
  const PlatformFolder folder;
  EXPECT_EQ(DirectoryOf("Reports"), "failed");
  folder.WriteLogicalNames("Reports = ");
  EXPECT_EQ(DirectoryOf("Reports"), "failed");
}

TEST(ZORGetDLName, NullOutputIsRefused) {
  EXPECT_EQ(ZORGetDLName(ZORUnicodeString("Reports"), nullptr), E_INVALIDARG);
}

TEST(ZORExpandString, ReplacesEveryVariable) {
  const ScopedVariable a("ZOR_TEST_A", "left"), b("ZOR_TEST_B", "");
  EXPECT_EQ(Expanded("/x/${ZOR_TEST_A}/${ZOR_TEST_B}/${ZOR_TEST_A}"), "/x/left//left");
}

TEST(ZORExpandString, ValuesAreNotExpandedAgain) {
  const ScopedVariable a("ZOR_TEST_A", "${ZOR_TEST_A}");
  EXPECT_EQ(Expanded("${ZOR_TEST_A}"), "${ZOR_TEST_A}");
}

TEST(ZORExpandString, TextWithoutPlaceStays) {
  EXPECT_EQ(Expanded("/srv/$reports {x} $"), "/srv/$reports {x} $");
  EXPECT_EQ(Expanded(""), "");
}

TEST(ZORExpandString, UnknownVariableFails) {
  const ScopedVariable a("ZOR_TEST_A", "left");
  EXPECT_EQ(Expanded("${ZOR_TEST_A}/${ZOR_TEST_UNKNOWN}"), "failed");
  EXPECT_EQ(Expanded("${}"), "failed");
}

TEST(ZORExpandString, UnclosedBraceFails) {
  const ScopedVariable a("ZOR_TEST_A", "left");
  EXPECT_EQ(Expanded("${ZOR_TEST_A}/${ZOR_TEST_A"), "failed");
}

TEST(ZORExpandString, NullIsRefused) { EXPECT_EQ(ZORExpandString(nullptr), E_INVALIDARG); }

TEST(ZORGetEnv, ReadsTheEnvironmentNow) {
  const ScopedVariable a("ZOR_TEST_A", "one");
  EXPECT_STREQ(ZORGetEnv("ZOR_TEST_A"), "one");
  const ScopedVariable again("ZOR_TEST_A", "two");
  EXPECT_STREQ(ZORGetEnv("ZOR_TEST_A"), "two");
}

TEST(ZORGetEnv, UnknownVariableIsNull) {
  EXPECT_EQ(ZORGetEnv("ZOR_TEST_UNKNOWN"), nullptr);
  EXPECT_EQ(ZORGetEnv(nullptr), nullptr);
}
