#include "platform/system/ZORMsgCatalog.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/PlatformFolder.h"

using support::PlatformFolder;
using support::ScopedVariable;
using support::TemporaryFolder;

namespace {

std::string MessageOf(const char* inCatalogue, const char* inKey) {
  ZORMsgCatalog catalogue;
  if (!catalogue.LoadMsgCatalog(inCatalogue)) return "not loaded";
  return catalogue.GetCatalogMsg(inKey).BuildMessage().ConvertToChar();
}

// Three languages' catalogues "Greeting" in a folder of catalogues.
class Greetings : public PlatformFolder {
 public:
  Greetings() {
    WriteFile("en/Greeting.toml", "hello = \"Hello\"");
    WriteFile("fr/Greeting.toml", "hello = \"Bonjour\"");
    WriteFile("de/Greeting.toml", "hello = \"Hallo\"");
  }
};

}  // namespace

TEST(ZORMsgCatalog, LoadMsgCatalogFindsAShippedCatalogue) {
  ZORMsgCatalog catalogue;
  EXPECT_EQ(catalogue.LoadMsgCatalog("ZORLyraITFClashDialog3"), 1);
  EXPECT_TRUE(catalogue.GetCatalogMsg("Clash").BuildMessage() == "Clash");
}

TEST(ZORMsgCatalog, ShippedCataloguesAreFoundBesideTheLibrary) {
  const ScopedVariable path("ZOR_CATALOGUE_PATH", "");
  EXPECT_EQ(MessageOf("ZORSiMuXMLServicesV12", "NLSstr_Stylesheet"), "clash-report.xsl");
}

TEST(ZORMsgCatalog, LoadMsgCatalogOfUnknownNameFails) {
  ZORMsgCatalog catalogue;
  EXPECT_EQ(catalogue.LoadMsgCatalog("NoSuchCatalogue"), 0);
  EXPECT_EQ(catalogue.LoadMsgCatalog(nullptr), 0);
  EXPECT_EQ(catalogue.LoadMsgCatalog(""), 0);
  EXPECT_EQ(catalogue.LoadMsgCatalog("../en/ZORLyraITFClashDialog3"), 0);
}

TEST(ZORMsgCatalog, LoadMsgCatalogThatFailsLeavesItEmpty) {
  ZORMsgCatalog catalogue;
  ASSERT_EQ(catalogue.LoadMsgCatalog("ZORLyraITFClashDialog3"), 1);
  EXPECT_EQ(catalogue.LoadMsgCatalog("NoSuchCatalogue"), 0);
  EXPECT_TRUE(catalogue.GetCatalogMsg("Clash").BuildMessage() == "");
}

TEST(ZORMsgCatalog, DamagedCatalogueDoesNotLoad) {
  const PlatformFolder folder;
  folder.DamageCatalogue("ZORLyraITFClashDialog3");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Clash"), "not loaded");
}

TEST(ZORMsgCatalog, GetCatalogMsgOfUnknownKeyIsEmpty) {
  ZORMsgCatalog catalogue;
  EXPECT_TRUE(catalogue.GetCatalogMsg("Clash").BuildMessage() == "") << "before loading";
  ASSERT_EQ(catalogue.LoadMsgCatalog("ZORLyraITFClashDialog3"), 1);
  EXPECT_TRUE(catalogue.GetCatalogMsg("NoSuchKey").BuildMessage() == "");
  EXPECT_TRUE(catalogue.GetCatalogMsg(nullptr).BuildMessage() == "");
}

TEST(ZORMsgCatalog, MessagesOutliveTheCatalogue) {
  ZORMsg message;
  {
    ZORMsgCatalog catalogue;
    catalogue.LoadMsgCatalog("ZORLyraITFClashDialog3");
    message = catalogue.GetCatalogMsg("Contact");
  }
  EXPECT_TRUE(message.BuildMessage() == "Contact");
}

TEST(ZORMsgCatalog, ChangedCatalogueIsReadAgain) {
  const PlatformFolder folder;
  for (int round = 0; round < 20; ++round) {
    folder.WriteCatalogue("Round", "number = \"" + std::to_string(10 + round) + "\"");
    EXPECT_EQ(MessageOf("Round", "number"), std::to_string(10 + round));
  }
}

TEST(ZORMsgCatalog, LanguageIsZorLang) {
  const Greetings folder;
  const ScopedVariable locale("LC_ALL", "de_DE.UTF-8");
  const ScopedVariable language("ZOR_LANG", "fr");
  EXPECT_EQ(MessageOf("Greeting", "hello"), "Bonjour");
}

TEST(ZORMsgCatalog, LanguageIsTheLocalesOtherwise) {
  const Greetings folder;
  const ScopedVariable language("ZOR_LANG", "");
  const ScopedVariable lang("LANG", "de_DE.UTF-8");
  const ScopedVariable all("LC_ALL", "");
  {
    const ScopedVariable messages("LC_MESSAGES", "");
    EXPECT_EQ(MessageOf("Greeting", "hello"), "Hallo");
  }
  const ScopedVariable messages("LC_MESSAGES", "fr_FR@euro");
  EXPECT_EQ(MessageOf("Greeting", "hello"), "Bonjour");
  const ScopedVariable allAgain("LC_ALL", "C.UTF-8");
  EXPECT_EQ(MessageOf("Greeting", "hello"), "Hello");
}

TEST(ZORMsgCatalog, LanguageWithoutCatalogueFallsBackToEnglish) {
  const Greetings folder;
  for (const char* const name : {"pt_BR.UTF-8", "POSIX", "C", "../de", "x"}) {
    const ScopedVariable language("ZOR_LANG", name);
    EXPECT_EQ(MessageOf("Greeting", "hello"), "Hello") << name;
  }
}

TEST(ZORMsgCatalog, FirstDirectoryOfThePathWins) {
  const TemporaryFolder first, second;
  second.WriteFile("en/Which.toml", "name = \"second\"");
  const ScopedVariable path("ZOR_CATALOGUE_PATH",
                            first.path.string() + support::kListSeparator + second.path.string());
  EXPECT_EQ(MessageOf("Which", "name"), "second");
  first.WriteFile("en/Which.toml", "name = \"first\"");
  EXPECT_EQ(MessageOf("Which", "name"), "first");
}

TEST(ZORMsgCatalog, BuildMessageGivesTheMessageWithItsParameters) {
  const PlatformFolder folder;
  folder.WriteCatalogue("Forms", "count = \"/p1 of /p2\"");
  const ZORUnicodeString parameters[] = {"3", "7"};
  EXPECT_TRUE(ZORMsgCatalog::BuildMessage("Forms", "count", parameters, 2, "") == "3 of 7");
}

TEST(ZORMsgCatalog, BuildMessageGivesTheDefaultOtherwise) {
  EXPECT_TRUE(ZORMsgCatalog::BuildMessage("NoSuchCatalogue", "a", nullptr, 0, "none") == "none");
  EXPECT_TRUE(ZORMsgCatalog::BuildMessage("ZORLyraITFClashDialog3", "a", nullptr, 0, "none") ==
              "none");
  EXPECT_TRUE(ZORMsgCatalog::BuildMessage(nullptr, nullptr, nullptr, 0, "none") == "none");
  EXPECT_TRUE(ZORMsgCatalog::BuildMessage("NoSuchCatalogue", "a") == "");
}

class ShippedCatalogues : public testing::TestWithParam<const char*> {
 protected:
  std::string Text(const char* inKey) const { return MessageOf("ZORLyraITFClashDialog3", inKey); }

 private:
  const ScopedVariable language_{"ZOR_LANG", GetParam()};
};

TEST_P(ShippedCatalogues, HoldEveryTextOfClashResults) {
  for (const char* const key :
       {"ClashAllLanguages", "ContactAllLanguages", "ClearanceAllLanguages", "Clash", "Contact",
        "Clearance", "Relevant", "Irrelevant", "NotInspected", "Old", "New"}) {
    EXPECT_NE(Text(key), "") << key;
    EXPECT_EQ(Text(key).find_first_of("/\n\t"), std::string::npos) << key;
  }
}

TEST_P(ShippedCatalogues, EachWordOccursInTheListOfItsTypeOnly) {
  const char* const types[] = {"Clash", "Contact", "Clearance"};
  for (const char* const type : types) {
    for (const char* const other : types) {
      const bool occurs =
          Text((other + std::string("AllLanguages")).c_str()).find(Text(type)) != std::string::npos;
      EXPECT_EQ(occurs, type == other) << Text(type) << " in the list of " << other;
    }
  }
}

TEST_P(ShippedCatalogues, ListsAreTheSameInAllLanguages) {
  for (const char* const key :
       {"ClashAllLanguages", "ContactAllLanguages", "ClearanceAllLanguages"}) {
    const std::string here = Text(key);
    const ScopedVariable english("ZOR_LANG", "en");
    EXPECT_EQ(here, Text(key));
  }
}

TEST_P(ShippedCatalogues, StatesAreDistinct) {
  EXPECT_NE(Text("Relevant"), Text("Irrelevant"));
  EXPECT_NE(Text("Relevant"), Text("NotInspected"));
  EXPECT_NE(Text("Irrelevant"), Text("NotInspected"));
  EXPECT_NE(Text("Old"), Text("New"));
}

TEST_P(ShippedCatalogues, HoldTheDeclarationAndTheStyleSheet) {
  EXPECT_EQ(MessageOf("ZORLyraNLSXMLEncoding", "nlsEncoding"),
            "<?xml version=\"1.0\" encoding=\"UTF-8\"?>");
  EXPECT_EQ(MessageOf("ZORSiMuXMLServicesV12", "NLSstr_Stylesheet"), "clash-report.xsl");
}

INSTANTIATE_TEST_SUITE_P(Languages, ShippedCatalogues,
                         testing::Values("en", "fr", "de", "it", "es", "ja"),
                         [](const auto& inLanguage) { return std::string(inLanguage.param); });

TEST(ZORMsgCatalog, FrenchWordsAreThoseOfRealResults) {
  const ScopedVariable language("ZOR_LANG", "fr");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Clash"), "Collision");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Contact"), "Contact");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Clearance"), "Jeu");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Relevant"), "Pertinent");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "NotInspected"), "Non inspect\xC3\xA9");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "New"), "Nouveau");
}

TEST(ZORMsgCatalog, EnglishWordsAreThoseOfTheNeutralForm) {
  const ScopedVariable language("ZOR_LANG", "en");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Irrelevant"), "Irrelevant");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "NotInspected"), "Not inspected");
  EXPECT_EQ(MessageOf("ZORLyraITFClashDialog3", "Old"), "Old");
}
