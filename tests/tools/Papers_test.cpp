// The manual page and the completions, held against the command's own help and tried in the shells.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <regex>
#include <set>
#include <sstream>

#include "tools/Command.h"

using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::IsSupersetOf;
using testing::Not;

namespace {

using Words = std::vector<std::string>;

const std::string kPapers = ZOR_BINARY_DIR "/tools/lyra/manual/";
const std::string kManualPage = kPapers + "lyra.1", kBash = kPapers + "lyra",
                  kZsh = kPapers + "_lyra", kFish = kPapers + "lyra.fish";

Words AllMatches(const std::string& inText, const char* inPattern) {
  const std::regex pattern(inPattern);
  std::set<std::string> found;
  for (std::sregex_iterator at(inText.begin(), inText.end(), pattern), end; at != end; ++at)
    found.insert((*at)[1]);
  return {found.begin(), found.end()};
}

std::string AfterHeading(const std::string& inHelp, const std::string& inHeading) {
  const std::size_t at = inHelp.find("\n" + inHeading + ":\n");
  return at == std::string::npos ? "" : inHelp.substr(at);
}

Words Verbs() {
  return AllMatches(AfterHeading(RunCommand({"--help"}).out, "Verbs"), "\n  ([a-z]+) ");
}

/// The names at the beginning of the lines of a verb's help, "-o" and "--output" apart.
Words OptionsOf(const std::string& inVerb) {
  const Words call = inVerb.empty() ? Words{"--help"} : Words{inVerb, "--help"};
  const std::string options = AfterHeading(RunCommand(call).out, "Options");
  Words names = AllMatches(options, "\n  (?:-[a-z],)?(--[a-z-]+)");
  for (const std::string& name : AllMatches(options, "\n  (-[a-z])[, ]")) names.push_back(name);
  return names;
}

/// From a beginning to the next end, or to the text's end.
std::string Part(const std::string& inText, const std::string& inBegin, const std::string& inEnd) {
  const std::size_t begin = inText.find(inBegin);
  if (begin == std::string::npos) return "";
  return inText.substr(begin, inText.find(inEnd, begin + inBegin.size()) - begin);
}

std::string PartOfManualPage(const std::string& inVerb) {
  const std::string page = ReadFile(kManualPage);
  if (inVerb.empty()) return Part(page, ".SH OPTIONS\n", ".SH");
  return Part(page, ".SS " + inVerb + "\n", "\n.S");
}

std::string InRoff(const std::string& inText) {
  return std::regex_replace(inText, std::regex("-"), "\\-");
}

bool HasShell(const std::string& inName) {
  return RunShell("command -v " + inName + " >/dev/null").code == 0;
}

Words Lines(const std::string& inText) {
  Words lines;
  std::istringstream stream(inText);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

std::string Quoted(const std::string& inText) {
  return "'" + std::regex_replace(inText, std::regex("'"), "'\\''") + "'";
}

/// What bash offers for the last of these words; "compopt -o default" where it completes files.
Words InBash(const Words& inWords) {
  std::string line =
      "compopt() { echo \"compopt $*\"; }\nsource " + Quoted(kBash) + "\nset -u\nCOMP_WORDS=(";
  for (const std::string& word : inWords) line += " " + Quoted(word);
  line += ")\nCOMP_CWORD=" + std::to_string(inWords.size() - 1) +
          "\n_lyra\n((${#COMPREPLY[@]} == 0)) || printf '%s\\n' \"${COMPREPLY[@]}\"";
  const CommandResult result = RunShell(line);
  EXPECT_EQ(result.error, "");
  return Lines(result.out);
}

/// What bash offers for the value of an option, which is known to be something.
Words WordsOf(const std::string& inVerb, const std::string& inOption) {
  const Words words = InBash({"lyra", inVerb, inOption, ""});
  EXPECT_THAT(words, Not(IsEmpty())) << inVerb << " " << inOption;
  return words;
}

/// What fish offers at the end of a line, without what it says of each.
Words InFish(const std::string& inLine) {
  const CommandResult result = RunShell(
      "cd resources && HOME=/nonexistent fish --no-config -c " +
      Quoted("source " + Quoted(kFish) + "; complete -C \"" + inLine + "\"") + " | cut -f1");
  EXPECT_EQ(result.code, 0);
  Words words = Lines(result.out);
  std::sort(words.begin(), words.end());
  return words;
}

}  // namespace

TEST(Help, TellsVerbsAndOptionsToTheseTests) {
  EXPECT_THAT(Verbs(), IsSupersetOf({"info", "list", "publish", "filename"}));
  EXPECT_THAT(OptionsOf(""), ElementsAre("--help", "--lang", "--version", "-h"));
  EXPECT_THAT(OptionsOf("render"),
              ElementsAre("--help", "--keep-background", "--limit-memory", "--limit-time",
                          "--output", "--product", "--size", "--strict", "--view", "-h", "-o"));
}

TEST(ManualPage, HasTheUsualSectionsInTheirOrder) {
  const std::string page = ReadFile(kManualPage);
  std::size_t at = 0;
  for (const char* section :
       {".TH LYRA 1", ".SH NAME", ".SH SYNOPSIS", ".SH DESCRIPTION", ".SH OPTIONS", ".SH VERBS",
        ".SH EXIT STATUS", ".SH ENVIRONMENT", ".SH EXAMPLES"}) {
    const std::size_t found = page.find(section, at);
    ASSERT_NE(found, std::string::npos) << section;
    at = found;
  }
}

TEST(ManualPage, HasEveryOptionOfEveryVerb) {
  Words verbs = Verbs();
  verbs.push_back("");
  for (const std::string& verb : verbs)
    for (const std::string& option : OptionsOf(verb))
      EXPECT_THAT(PartOfManualPage(verb), HasSubstr("\\fB" + InRoff(option) + "\\fR")) << verb;
}

TEST(ManualPage, SaysWhichOptionsAndFilesAVerbNeeds) {
  EXPECT_THAT(PartOfManualPage("merge"),
              HasSubstr("\n\\fBlyra merge\\fR \\fB\\-o\\fR \\fIOUT\\fR [\\fIOPTION\\fR]... "
                        "\\fIFILE\\fR...\n"));
}

TEST(ManualPage, BackslashesOfHelpAreShown) {
  EXPECT_THAT(PartOfManualPage("path"), HasSubstr("ZORDLN://NAME\\efolder\\efile"));
}

TEST(ManualPage, GroffHasNoComplaint) {
  if (!HasShell("groff")) GTEST_SKIP() << "there is no groff";
  const CommandResult result = RunShell("groff -man -Tutf8 -ww -z " + Quoted(kManualPage));
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.error, "");
}

TEST(ManualPage, ShowsHyphensAsTheyAreTyped) {
  if (!HasShell("groff")) GTEST_SKIP() << "there is no groff";
  const CommandResult result =
      RunShell("GROFF_NO_SGR=1 groff -man -Tutf8 -P-cbou " + Quoted(kManualPage));
  EXPECT_THAT(result.out, AllOf(HasSubstr("--keep-background"), HasSubstr("document's words")));
}

TEST(BashCompletion, OffersEveryVerb) {
  Words offered = InBash({"lyra", ""});
  std::sort(offered.begin(), offered.end());
  EXPECT_EQ(offered, Verbs());
}

TEST(BashCompletion, OffersEveryOptionOfEveryVerb) {
  for (const std::string& verb : Verbs())
    EXPECT_THAT(InBash({"lyra", verb, "-"}), IsSupersetOf(OptionsOf(verb))) << verb;
}

TEST(BashCompletion, OffersOptionsBeforeTheVerb) {
  EXPECT_THAT(InBash({"lyra", "--"}), ElementsAre("--help", "--version", "--lang"));
}

TEST(BashCompletion, OffersVerbsThatBeginSo) {
  EXPECT_THAT(InBash({"lyra", "li"}), ElementsAre("list", "links"));
}

TEST(BashCompletion, OffersTheWordsOfAnOption) {
  EXPECT_THAT(InBash({"lyra", "list", "--type", "c"}),
              ElementsAre("clash", "contact", "clearance"));
  EXPECT_THAT(InBash({"lyra", "list", "a.xml", "--status", "n"}), ElementsAre("not-inspected"));
  EXPECT_THAT(InBash({"lyra", "publish", "--zoom", ""}), ElementsAre("interference", "products"));
}

TEST(BashCompletion, OffersTheWordsAfterAnEqualsSign) {
  EXPECT_THAT(InBash({"lyra", "render", "--view", "="}), testing::SizeIs(7));
  EXPECT_THAT(InBash({"lyra", "render", "--view", "=", "to"}), ElementsAre("top"));
}

TEST(BashCompletion, FindsTheVerbBehindTheLanguage) {
  EXPECT_THAT(InBash({"lyra", "--lang", "fr", "convert", "--to", ""}),
              ElementsAre("json", "bcf", "xlsx", "csv"));
  EXPECT_THAT(InBash({"lyra", "--lang", "=", "fr", "convert", "--to", ""}),
              ElementsAre("json", "bcf", "xlsx", "csv"));
}

TEST(BashCompletion, LeavesFilesToTheShell) {
  EXPECT_THAT(InBash({"lyra", "info", ""}), ElementsAre("compopt -o default"));
  EXPECT_THAT(InBash({"lyra", "merge", "a.xml", "-o", ""}), ElementsAre("compopt -o default"));
}

TEST(BashCompletion, TakesAWordBehindTwoHyphensForAFile) {
  EXPECT_THAT(InBash({"lyra", "info", "--", "-"}), ElementsAre("compopt -o default"));
}

TEST(BashCompletion, OffersFoldersForAFolder) {
  EXPECT_THAT(InBash({"lyra", "publish", "--output", ""}), ElementsAre("compopt -o dirnames"));
}

TEST(BashCompletion, OffersNothingForFreeText) {
  EXPECT_THAT(InBash({"lyra", "list", "--result", ""}), IsEmpty());
  EXPECT_THAT(InBash({"lyra", "escape", ""}), IsEmpty());
}

TEST(ZshCompletion, HasEveryOptionOfEveryVerb) {
  const std::string text = ReadFile(kZsh);
  EXPECT_TRUE(text.starts_with("#compdef lyra\n"));
  for (const std::string& verb : Verbs()) {
    EXPECT_THAT(text, HasSubstr("\n    '" + verb + ":"));
    const std::string part = Part(text, "\n        " + verb + ")\n", ";;");
    for (const std::string& option : OptionsOf(verb))
      EXPECT_TRUE(std::regex_search(part, std::regex("[)*]" + option + "[=+]?\\[")))
          << verb << option;
  }
}

TEST(ZshCompletion, IsReadByZsh) {
  if (!HasShell("zsh")) GTEST_SKIP() << "there is no zsh";
  const CommandResult result = RunShell("zsh -f -n " + Quoted(kZsh));
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.error, "");
}

TEST(FishCompletion, HasEveryOptionOfEveryVerb) {
  const std::string text = ReadFile(kFish);
  for (const std::string& verb : Verbs()) {
    EXPECT_THAT(text, HasSubstr(" -a " + verb + " -d "));
    for (const std::string& option : OptionsOf(verb)) {
      const std::string name = option.starts_with("--") ? " -l " + option.substr(2) + " "
                                                        : " -s " + option.substr(1) + " ";
      EXPECT_TRUE(std::regex_search(text, std::regex("'__lyra_verb_is " + verb + "'.*" + name)))
          << verb << option;
    }
  }
}

TEST(FishCompletion, OffersVerbsOptionsAndWords) {
  if (!HasShell("fish")) GTEST_SKIP() << "there is no fish";
  EXPECT_EQ(InFish("lyra "), Verbs());
  EXPECT_THAT(InFish("lyra --lang fr convert --to "), ElementsAre("bcf", "csv", "json", "xlsx"));
  EXPECT_THAT(InFish("lyra list --type c"), ElementsAre("clash", "clearance", "contact"));
  EXPECT_THAT(InFish("lyra render --k"), ElementsAre("--keep-background"));
}

TEST(FishCompletion, OffersFilesOnlyWhereTheyAreWanted) {
  if (!HasShell("fish")) GTEST_SKIP() << "there is no fish";
  EXPECT_THAT(InFish("lyra info clash-p"), ElementsAre("clash-page.xsl"));
  EXPECT_THAT(InFish("lyra list --result clash-p"), IsEmpty());
  EXPECT_THAT(InFish("lyra publish -o "), ElementsAre("catalogues/", "settings/"));
}

TEST(OptionWords, AreKnownToTheirVerbs) {
  const std::string file = "samples/as1.clash.xml";
  for (const char* option : {"--type", "--status"})
    for (const std::string& word : WordsOf("list", option))
      EXPECT_EQ(RunCommand({"list", file, option, word}).code, 0) << option << word;
  // No such file, but no wrong usage.
  for (const std::string& word : WordsOf("render", "--view"))
    EXPECT_EQ(RunCommand({"render", "none.stp", "-o", "/dev/null/a.png", "--view", word}).code, 1)
        << word;
  for (const char* option : {"--format", "--zoom"})
    for (const std::string& word : WordsOf("publish", option))
      EXPECT_EQ(RunCommand({"publish", "none.xml", "-o", "/dev/null/a", option, word}).code, 1)
          << option << word;
}

TEST(OptionWords, LanguagesAreThoseOfTheCatalogues) {
  Words folders;
  for (const auto& entry :
       std::filesystem::directory_iterator(ZOR_SOURCE_DIR "/resources/catalogues"))
    folders.push_back(entry.path().filename().string());
  std::sort(folders.begin(), folders.end());
  EXPECT_EQ(InBash({"lyra", "list", "--lang", ""}), folders);
  EXPECT_EQ(InBash({"lyra", "--lang", ""}), folders);
}
