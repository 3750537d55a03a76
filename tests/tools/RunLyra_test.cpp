// Exit codes and streams.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <nlohmann/json.hpp>

#include "support/ScopedVariable.h"
#include "tools/Command.h"

using testing::HasSubstr;
using testing::StartsWith;

namespace {
void ExpectWrongUsage(const std::vector<std::string>& inArguments, const std::string& inReason) {
  const CommandResult result = RunCommand(inArguments);
  EXPECT_EQ(result.code, 2);
  EXPECT_EQ(result.out, "");
  EXPECT_EQ(result.error, "lyra: " + inReason + "\nsee lyra --help\n");
}
}  // namespace

TEST(Usage, HelpGoesToStandardOutput) {
  const CommandResult result = RunCommand({"--help"});
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.out, HasSubstr("Usage: lyra"));
}

TEST(Usage, EveryVerbOfTheHelpHasItsOwnHelp) {
  for (const char* verb : {"info", "list", "show", "components", "specs", "links", "convert"}) {
    EXPECT_THAT(RunCommand({"--help"}).out, HasSubstr(std::string("\n  ") + verb + " "));
    const CommandResult result = RunCommand({verb, "--help"});
    EXPECT_EQ(result.code, 0);
    EXPECT_THAT(result.out, HasSubstr(std::string("Usage: lyra ") + verb));
  }
}

TEST(Usage, VersionIsPrinted) {
  const CommandResult result = RunCommand({"--version"});
  EXPECT_EQ(result.code, 0);
  unsigned int major = 0, minor = 0, patch = 0;
  EXPECT_EQ(std::sscanf(result.out.c_str(), "lyra %u.%u.%u", &major, &minor, &patch), 3);
  EXPECT_EQ(result.out, "lyra " + std::to_string(major) + "." + std::to_string(minor) + "." +
                            std::to_string(patch) + "\n");
}

TEST(Usage, NothingAtAllIsWrong) { ExpectWrongUsage({}, "a verb is missing"); }
TEST(Usage, UnknownVerbIsWrong) { ExpectWrongUsage({"inform"}, "unknown verb \"inform\""); }
TEST(Usage, UnknownVerbWithHelpIsWrong) {
  ExpectWrongUsage({"inform", "--help"}, "unknown verb \"inform\"");
  ExpectWrongUsage({"--help", "inform"}, "unknown verb \"inform\"");
}
TEST(Usage, UnknownOptionIsWrong) { ExpectWrongUsage({"--fast"}, "unknown option \"--fast\""); }
TEST(Usage, MissingFileArgumentIsWrong) { ExpectWrongUsage({"list"}, "list: FILE is required"); }

TEST(Usage, UnknownOptionOfAVerbIsWrong) {
  ExpectWrongUsage({"info", "--fast", "a"},
                   "info: The following argument was not expected: --fast");
}

TEST(Usage, NumberThatIsNoneIsWrong) {
  ExpectWrongUsage({"show", "samples/as1.clash.xml", "one"}, "show: Could not convert: N = one");
}

TEST(Usage, EmptyNameOfAFileIsWrong) {
  for (const std::string option : {"--model", "--xsl"})
    ExpectWrongUsage({"publish", "-o", "nowhere", "samples/as1.clash.xml", option, ""},
                     "publish: " + option + ": must not be empty");
}

TEST(Usage, LimitThatIsNoneIsWrong) {
  for (const std::string option : {"--limit-time", "--limit-memory"})
    for (const char* limit : {"0", "-1", "1000001"})
      ExpectWrongUsage({"tree", "samples/as1-oc-214.stp", option, limit},
                       option + ": 1 to 1000000");
}

TEST(Usage, UnknownFormatIsWrong) {
  ExpectWrongUsage({"convert", "samples/as1.clash.xml", "--to", "yaml"},
                   "--to: unknown word \"yaml\"; known are json, bcf, xlsx, csv");
}

TEST(Streams, StandardInputIsReadForADash) {
  const std::string sample = ReadFile(ZOR_SOURCE_DIR "/samples/as1.clash.xml");
  const CommandResult piped = RunCommand({"list", "-"}, sample);
  EXPECT_EQ(piped.code, 0) << piped.error;
  EXPECT_EQ(piped.out, RunCommand({"list", "samples/as1.clash.xml"}).out);
}

TEST(Streams, PipeOnStandardInputIsReadForADash) {
  const CommandResult piped = RunShell("cat samples/stamp_c6lora.clash.xml | lyra list --csv -");
  EXPECT_EQ(piped.code, 0) << piped.error;
  EXPECT_EQ(piped.out, RunCommand({"list", "--csv", "samples/stamp_c6lora.clash.xml"}).out);
}

TEST(Streams, ReaderThatLeavesEndsTheCommandQuietly) {
  const CommandResult result =
      RunShell("set -o pipefail; lyra list --json samples/stamp_c6lora.clash.xml | head -n 1");
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.out, "[\n");
  EXPECT_EQ(result.error, "");
}

TEST(Streams, FullDiskIsReported) {
  const CommandResult result = RunShell("lyra list samples/as1.clash.xml >/dev/full");
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: standard output: No space left on device\n");
}

TEST(Streams, FullDiskIsReportedForAShortAnswerToo) {
  EXPECT_EQ(RunShell("lyra --version >/dev/full").code, 1);
  EXPECT_EQ(RunShell("lyra --help >/dev/full").code, 1);
}

TEST(Streams, ClosedStandardOutputIsReported) {
  EXPECT_EQ(RunShell("lyra info samples/as1.clash.xml >&-").code, 1);
}

TEST(InfoOfSeveral, GoesOnAfterOneThatFails) {
  const CommandResult result =
      RunCommand({"info", "--json", "missing.xml", "samples/as1.clash.xml"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: missing.xml: No such file or directory\n");
  const auto records = nlohmann::json::parse(result.out);
  ASSERT_EQ(records.size(), 1u);
  EXPECT_EQ(records[0]["file"], "samples/as1.clash.xml");
}

TEST(InfoOfSeveral, IsAnEmptyArrayWhenAllFail) {
  const CommandResult result = RunCommand({"info", "--json", "a.xml", "b.xml"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(nlohmann::json::parse(result.out), nlohmann::json::array());
}

TEST(InfoOfSeveral, IsABlockEachInText) {
  const CommandResult result =
      RunCommand({"info", "samples/as1.clash.xml", "samples/dissonance.clash.xml"});
  EXPECT_THAT(result.out, StartsWith("samples/as1.clash.xml\n"));
  EXPECT_THAT(result.out, HasSubstr("\n\nsamples/dissonance.clash.xml\n"));
}

TEST(InfoCounts, DeclaredAndFoundAreTold) {
  const CommandResult result = RunCommand(
      {"info", "--json", "-"},
      "<ClashElement><ClashResult Name='a' NbInterf='7'><Interference/></ClashResult>"
      "<ClashResult Name='b' NbInterf='many'/><ClashResult/><ClashResult NbInterf='1e99'/>"
      "</ClashElement>");
  const auto results = nlohmann::json::parse(result.out).at("results");
  EXPECT_EQ(results[0]["declared"], 7);
  EXPECT_EQ(results[0]["found"], 1);
  EXPECT_EQ(results[1]["declared"], 0);
  EXPECT_EQ(results[2]["declared"], 0);
  EXPECT_EQ(results[3]["declared"], 2147483647);
}

TEST(Terminal, TableIsCutToTheColumnsAndItsHeaderIsBold) {
  const CommandResult result = RunShell(
      "COLUMNS=60 script -qec \"lyra list samples/as1.clash.xml\" /dev/null | tr -d '\\r'");
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(result.out, StartsWith("\033[1m"));
  EXPECT_THAT(result.out, HasSubstr("…"));
  EXPECT_THAT(result.out, HasSubstr("nut_1"));
}

TEST(Terminal, NoColorKeepsTheHeaderPlain) {
  const CommandResult result =
      RunShell("NO_COLOR=1 COLUMNS=200 script -qec \"lyra list samples/as1.clash.xml\" /dev/null");
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.out.find('\033'), std::string::npos);
}

TEST(Terminal, NothingIsCutOrBoldInAFile) {
  const support::ScopedVariable columns("COLUMNS", "20");
  const CommandResult result = RunCommand({"list", "samples/as1.clash.xml"});
  EXPECT_EQ(result.out.find('\033'), std::string::npos);
  EXPECT_EQ(result.out.find("…"), std::string::npos);
}

TEST(Terminal, CsvOfADocumentCannotDriveIt) {
  const CommandResult result =
      RunShell("script -qec \"lyra list --csv tests/golden/inputs/hostile.xml\" /dev/null");
  EXPECT_THAT(result.out, HasSubstr("\\u{9B}2J"));
  EXPECT_EQ(result.out.find("\xC2\x9B"), std::string::npos);
}

TEST(Language, OptionWorksBeforeAndAfterTheVerb) {
  const std::string sample = "samples/dissonance.clash.xml";
  const CommandResult after = RunCommand({"list", sample, "--lang", "fr"});
  EXPECT_EQ(RunCommand({"--lang", "fr", "list", sample}).out, after.out);
  EXPECT_THAT(after.out, HasSubstr("Not inspected"));
  EXPECT_EQ(after.out.find("error"), std::string::npos);
  EXPECT_THAT(RunCommand({"list", sample}).out, HasSubstr("error"));
}
