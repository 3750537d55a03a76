#include "platform/system/ZORSettingRepository.h"

#include <gtest/gtest.h>

#include <climits>
#include <string>

#include "default_platform/SettingOverride.h"
#include "platform/system/ZORSysSettingRepository.h"
#include "support/PlatformFolder.h"

using support::PlatformFolder;
using support::ScopedVariable;
using support::TemporaryFolder;

namespace {

constexpr const char* kAllKinds = R"(
text = "caf\u00E9"
number = 42
negative = -7
real = 2.5
whole = 3.0
truth = true
digits = "12"
decimals = "12.5"
large = 2147483648
numbers = [1, 2, 3]
mixed = [1, "two"]
empty = ""
)";

template <class Value>
Value Read(const char* inName, Value inBefore) {
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  EXPECT_NE(repository, nullptr);
  const Value before = inBefore;
  const HRESULT result = repository->ReadSetting(inName, &inBefore);
  if (FAILED(result)) {
    EXPECT_EQ(result, E_FAIL);
    EXPECT_TRUE(inBefore == before) << "changed by a failure";
  }
  return inBefore;
}

std::string ReadText(const char* inName) {
  const ZORUnicodeString text = Read(inName, ZORUnicodeString("before"));
  EXPECT_STREQ(Read(inName, ZORString("before")).CastToCharPtr(), text.ConvertToChar());
  return text.ConvertToChar();
}

}  // namespace

TEST(ZORSettingRepository, UnknownRepositoryIsNull) {
  const PlatformFolder folder;
  EXPECT_EQ(ZORSettingRepository::GetRepository("NoSuchRepository"), nullptr);
  EXPECT_EQ(ZORSettingRepository::GetRepository(nullptr), nullptr);
  EXPECT_EQ(ZORSettingRepository::GetRepository(""), nullptr);
}

TEST(ZORSettingRepository, DamagedRepositoryIsNull) {
  const PlatformFolder folder;
  folder.WriteSettings("Damaged", "a = ");
  EXPECT_EQ(ZORSettingRepository::GetRepository("Damaged"), nullptr);
}

TEST(ZORSettingRepository, FolderInItsPlaceIsNull) {
  const PlatformFolder folder;
  folder.WriteFile("Folder.toml/inside", "a = 1");
  EXPECT_EQ(ZORSettingRepository::GetRepository("Folder"), nullptr);
}

TEST(ZORSettingRepository, NameCannotLeaveItsDirectory) {
  const PlatformFolder folder;
  folder.WriteFile("system/Inner.toml", "a = 1");
  EXPECT_EQ(ZORSettingRepository::GetRepository("system/Inner"), nullptr);
  EXPECT_EQ(ZORSettingRepository::GetRepository("../Inner"), nullptr);
  EXPECT_NE(ZORSysSettingRepository::GetRepository("Inner"), nullptr);
}

TEST(ZORSettingRepository, EveryModeAndAccessGivesTheSame) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  ASSERT_NE(repository, nullptr);
  EXPECT_EQ(ZORSettingRepository::GetRepository("Kinds", 0, 1, nullptr), repository);
  EXPECT_EQ(ZORSettingRepository::GetRepository("Kinds", 3, 2, nullptr), repository);
}

TEST(ZORSettingRepository, ReadSettingGivesTexts) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  EXPECT_EQ(ReadText("text"), "caf\xC3\xA9");
  EXPECT_EQ(ReadText("number"), "42");
  EXPECT_EQ(ReadText("real"), "2.5");
  EXPECT_EQ(ReadText("truth"), "true");
  EXPECT_EQ(ReadText("empty"), "");
}

TEST(ZORSettingRepository, ReadSettingGivesNumbers) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  EXPECT_EQ(Read("number", 0), 42);
  EXPECT_EQ(Read("negative", 0), -7);
  EXPECT_EQ(Read("digits", 0), 12);
  EXPECT_EQ(Read("whole", 0), 3);
  EXPECT_EQ(Read("real", 0.0), 2.5);
  EXPECT_EQ(Read("number", 0.0), 42.0);
  EXPECT_EQ(Read("decimals", 0.0), 12.5);
}

TEST(ZORSettingRepository, ReadSettingOfWhatDoesNotConvertFails) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  for (const char* const name :
       {"missing", "text", "real", "decimals", "truth", "large", "mixed", "numbers", "empty"})
    EXPECT_EQ(Read(name, -99), -99) << name;
  EXPECT_EQ(Read("text", -99.5), -99.5);
  EXPECT_EQ(ReadText("numbers"), "before");
  EXPECT_EQ(ReadText("missing"), "before");
}

TEST(ZORSettingRepository, ReadSettingGivesSeveralNumbers) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  int values[3] = {9, 9, 9};
  EXPECT_EQ(repository->ReadSetting("numbers", values, 2), S_OK);
  EXPECT_EQ(values[1], 2);
  EXPECT_EQ(values[2], 9);
  EXPECT_EQ(repository->ReadSetting("number", values, 1), S_OK);
  EXPECT_EQ(values[0], 42);
}

TEST(ZORSettingRepository, ReadSettingOfTooManyNumbersChangesNothing) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  int values[4] = {9, 9, 9, 9};
  EXPECT_EQ(repository->ReadSetting("numbers", values, 4), E_FAIL);
  EXPECT_EQ(repository->ReadSetting("number", values, 2), E_FAIL);
  EXPECT_EQ(repository->ReadSetting("mixed", values, 1), E_FAIL);
  EXPECT_EQ(repository->ReadSetting("numbers", values, 0), E_INVALIDARG);
  for (const int value : values) EXPECT_EQ(value, 9);
}

TEST(ZORSettingRepository, ReadSettingRefusesNull) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", kAllKinds);
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  int number = 9;
  EXPECT_EQ(repository->ReadSetting(nullptr, &number), E_INVALIDARG);
  EXPECT_EQ(repository->ReadSetting("number", static_cast<int*>(nullptr)), E_INVALIDARG);
  EXPECT_EQ(repository->ReadSetting("number", static_cast<ZORString*>(nullptr)), E_INVALIDARG);
}

TEST(ZORSettingRepository, ReadSettingSeesEveryChangeOfTheFile) {
  const PlatformFolder folder;
  for (int round = 0; round < 20; ++round) {  // same size, perhaps the same tick of the clock
    folder.WriteSettings("Kinds", "number = " + std::to_string(10 + round));
    EXPECT_EQ(Read("number", 0), 10 + round);
    EXPECT_EQ(Read("number", 0), 10 + round);
  }
}

TEST(ZORSettingRepository, RepositoryOutlivesItsFile) {
  const PlatformFolder folder;
  folder.WriteSettings("Kinds", "number = 1");
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("Kinds");
  std::filesystem::remove(folder.FilePath("Kinds.toml"));
  int number = 9;
  EXPECT_EQ(repository->ReadSetting("number", &number), E_FAIL);
  EXPECT_EQ(number, 9);
  EXPECT_EQ(ZORSettingRepository::GetRepository("Kinds"), nullptr);
}

TEST(ZORSettingRepository, FirstDirectoryOfThePathWins) {
  const TemporaryFolder first, second;
  second.WriteFile("Kinds.toml", "number = 2");
  const std::string separator = support::kListSeparator;
  const ScopedVariable path("ZOR_SETTINGS_PATH", separator + separator + first.path.string() +
                                                     separator + second.path.string() + separator);
  EXPECT_EQ(Read("number", 0), 2);
  first.WriteFile("Kinds.toml", "other = 1");
  EXPECT_EQ(Read("number", 0), 0) << "files are not merged";
}

TEST(ZORSettingRepository, UserDirectoryComesAfterThePath) {
  const PlatformFolder folder;
  const TemporaryFolder configuration;
#ifdef _WIN32
  const ScopedVariable variable("APPDATA", configuration.path.string());
#else
  const ScopedVariable variable("XDG_CONFIG_HOME", configuration.path.string());
#endif
  configuration.WriteFile("zorlyra/Kinds.toml", "number = 5");
  EXPECT_EQ(Read("number", 0), 5);
  folder.WriteSettings("Kinds", "number = 6");
  EXPECT_EQ(Read("number", 0), 6);
}

#ifndef _WIN32
TEST(ZORSettingRepository, HomeHoldsTheUserDirectoryByDefault) {
  const PlatformFolder folder;
  const TemporaryFolder home;
  const ScopedVariable configuration("XDG_CONFIG_HOME", "");
  const ScopedVariable variable("HOME", home.path.string());
  home.WriteFile(".config/zorlyra/Kinds.toml", "number = 5");
  EXPECT_EQ(Read("number", 0), 5);
}
#endif

TEST(ZORSettingRepository, InstalledDefaultsAreFoundBesideTheLibrary) {
  const PlatformFolder folder;
  ZORSettingRepository* const repository = ZORSettingRepository::GetRepository("ClashPublish");
  ASSERT_NE(repository, nullptr);
  ZORUnicodeString text("before");
  for (const char* const name : {"PublishDefDir", "XslTemplate", "PictureZoom"})
    EXPECT_EQ(repository->ReadSetting(name, &text), E_FAIL) << name << " has a default of its own";
}

TEST(ZORSysSettingRepository, ReadsFromTheSystemFolderOnly) {
  const PlatformFolder folder;
  folder.WriteSettings("Plain", "number = 1");
  folder.WriteFile("system/Admin.toml", "number = 2\nnumbers = [3, 4]");
  EXPECT_EQ(ZORSysSettingRepository::GetRepository("Plain"), nullptr);
  EXPECT_EQ(ZORSettingRepository::GetRepository("Admin"), nullptr);
  ZORSysSettingRepository* const repository = ZORSysSettingRepository::GetRepository("Admin", 0);
  ASSERT_NE(repository, nullptr);
  int number = 0;
  EXPECT_EQ(repository->ReadSetting("number", &number), S_OK);
  EXPECT_EQ(number, 2);
}

TEST(ZORSysSettingRepository, ReadAttrGivesNumbers) {
  const PlatformFolder folder;
  folder.WriteFile("system/Admin.toml", "number = 2\nnumbers = [3, 4]");
  ZORSysSettingRepository* const repository = ZORSysSettingRepository::GetRepository("Admin");
  int values[2] = {0, 0};
  EXPECT_EQ(repository->ReadAttr("number", values), S_OK);
  EXPECT_EQ(values[0], 2);
  EXPECT_EQ(repository->ReadAttr("numbers", values, 2), S_OK);
  EXPECT_EQ(values[1], 4);
  EXPECT_EQ(repository->ReadAttr("missing", values, 1), E_FAIL);
  EXPECT_EQ(values[0], 3);
}

TEST(ZORSysSettingRepository, InstalledClashSettingsHaveNoValueSet) {
  const PlatformFolder folder;
  ZORSysSettingRepository* const repository = ZORSysSettingRepository::GetRepository("Clash");
  ASSERT_NE(repository, nullptr);
  int mode = 9;
  EXPECT_EQ(repository->ReadAttr("ModeOfSubInterf", &mode, 1), E_FAIL);
  EXPECT_EQ(mode, 9);
}

TEST(SettingOverride, GoesBeforeTheFilesAndEndsWithItself) {
  const support::PlatformFolder folder;
  folder.WriteSettings("ClashPublish", "PictureZoom = 3\n");
  const auto zoom = [] {
    int value = -1;
    ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("ClashPublish");
    if (settings != nullptr) settings->ReadSetting("PictureZoom", &value, 1);
    return value;
  };
  {
    const ZORDefault::SettingOverride first("ClashPublish", "PictureZoom", 1);
    EXPECT_EQ(1, zoom());
    const ZORDefault::SettingOverride second("ClashPublish", "PictureZoom", 2);
    EXPECT_EQ(2, zoom());
  }
  EXPECT_EQ(3, zoom());
}

TEST(SettingOverride, MakesARepositoryThatHasNoFile) {
  const support::PlatformFolder folder;
  EXPECT_EQ(nullptr, ZORSettingRepository::GetRepository("NoSuchFile"));
  const ZORDefault::SettingOverride setting("NoSuchFile", "Number", 7);
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("NoSuchFile");
  ASSERT_NE(nullptr, settings);
  int value = 0;
  EXPECT_EQ(S_OK, settings->ReadSetting("Number", &value));
  EXPECT_EQ(7, value);
  EXPECT_NE(S_OK, settings->ReadSetting("Other", &value));
}
