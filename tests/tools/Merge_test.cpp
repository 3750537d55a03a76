// Merging from a shell, and how outputs take their place.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>

#include "tools/Command.h"

using testing::ElementsAre;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

namespace {

const std::string kAs1 = "samples/as1.clash.xml";                 // 32 interferences
const std::string kDissonance = "samples/dissonance.clash.xml";   // 20
const std::string kTwoSets = "tests/golden/inputs/two_sets.xml";  // 2 and 1, declared 2 and 2

nlohmann::json Info(const std::string& inPath) {
  const CommandResult result = RunCommand({"info", "--json", inPath});
  EXPECT_EQ(result.code, 0) << result.error;
  return nlohmann::json::parse(result.out);
}

std::vector<std::string> FilesIn(const std::string& inDirectory) {
  std::vector<std::string> names;
  for (const auto& entry : std::filesystem::directory_iterator(inDirectory))
    names.push_back(entry.path().filename().string());
  return names;
}

}  // namespace

TEST(Merge, ResultHoldsTheInterferencesOfAll) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  const CommandResult result = RunCommand({"merge", kAs1, kDissonance, kAs1, "-o", out});
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.out, "");
  EXPECT_EQ(result.error, "");
  const nlohmann::json info = Info(out);
  EXPECT_EQ(info["interferences"], 84);
  EXPECT_EQ(info["results"][0]["declared"], 84);
  EXPECT_EQ(info["specifications"], 3);
  EXPECT_EQ(info["document"], "as1");
}

TEST(Merge, InterferencesFollowInOrderAndUnchanged) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand({"merge", kAs1, kDissonance, "-o", out}).code, 0);
  const auto merged = nlohmann::json::parse(RunCommand({"list", "--json", out}).out);
  const auto second = nlohmann::json::parse(RunCommand({"list", "--json", kDissonance}).out);
  for (std::size_t i = 0; i < second.size(); ++i) {
    EXPECT_EQ(merged[32 + i]["products"], second[i]["products"]);
    EXPECT_EQ(merged[32 + i]["geometry"], second[i]["geometry"]);
    EXPECT_EQ(merged[32 + i]["comment"], second[i]["comment"]);
  }
}

TEST(Merge, CountsAreTheDeclaredSumUnlessAskedOtherwise) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  // The last of several result sets is the one whose declared number counts.
  ASSERT_EQ(RunCommand({"merge", kAs1, kTwoSets, "-o", out}).code, 0);
  EXPECT_EQ(Info(out)["results"][0]["declared"], 34);
  EXPECT_EQ(Info(out)["results"][0]["found"], 35);
  ASSERT_EQ(RunCommand({"merge", kAs1, kTwoSets, "--sum-counts", "-o", out}).code, 0);
  EXPECT_EQ(Info(out)["results"][0]["declared"], 35);
}

TEST(Merge, SumCountsSetsEveryResultSet) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand({"merge", kTwoSets, kAs1, "--sum-counts", "-o", out}).code, 0);
  const nlohmann::json results = Info(out)["results"];
  EXPECT_EQ(results[0]["declared"], 34);
  EXPECT_EQ(results[1]["declared"], 1);
}

TEST(Merge, OutputMayBeAnInput) {
  const TemporaryDirectory directory;
  const std::string path = directory.Write("a.xml", ReadFile(ZOR_SOURCE_DIR "/" + kAs1));
  EXPECT_EQ(RunCommand({"merge", path, path, "-o", path}).code, 0);
  EXPECT_EQ(Info(path)["interferences"], 64);
  EXPECT_THAT(FilesIn(directory.Path("")), ElementsAre("a.xml"));
}

TEST(Merge, InputsStayAsTheyAre) {
  const TemporaryDirectory directory;
  const std::string before = ReadFile(ZOR_SOURCE_DIR "/" + kAs1);
  RunCommand({"merge", kAs1, kDissonance, "-o", directory.Path("out.xml")});
  EXPECT_EQ(ReadFile(ZOR_SOURCE_DIR "/" + kAs1), before);
}

TEST(Merge, PrologueIsAsAsked) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand({"merge", kAs1, kAs1, "--dtd", "a.dtd", "--xsl", "b&c.xsl", "-o", out}).code,
            0);
  EXPECT_THAT(ReadFile(out),
              StartsWith("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                         "<?xml-stylesheet type=\"text/xsl\" href=\"b&amp;c.xsl\"?>\n"
                         "<!DOCTYPE ClashElement SYSTEM \"a.dtd\">"));
  EXPECT_EQ(Info(out)["interferences"], 64);
}

TEST(Merge, PrologueOfTheFirstInputIsReplacedNotDoubled) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  for (int run = 0; run < 2; ++run) {
    const std::string first = run == 0 ? kAs1 : out;
    ASSERT_EQ(
        RunCommand({"merge", first, kAs1, "--dtd", "a.dtd", "--xsl", "b.xsl", "-o", out}).code, 0);
  }
  const std::string text = ReadFile(out);
  EXPECT_EQ(text.find("<!DOCTYPE"), text.rfind("<!DOCTYPE"));
  EXPECT_EQ(text.find("<?xml-stylesheet"), text.rfind("<?xml-stylesheet"));
  EXPECT_EQ(Info(out)["interferences"], 96);
}

TEST(Merge, TypeNameAndNoPrologue) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand({"merge", kAs1, kAs1, "--dtd", "a", "--type-name", "T", "-o", out}).code, 0);
  EXPECT_THAT(ReadFile(out), HasSubstr("<!DOCTYPE T SYSTEM \"a\">"));
  ASSERT_EQ(RunCommand({"merge", kAs1, kAs1, "--no-prologue", "-o", out}).code, 0);
  EXPECT_THAT(ReadFile(out), StartsWith("<ClashElement "));
}

TEST(Merge, ReferencesThatWouldBreakTheDocumentAreWrongUsage) {
  for (const std::vector<std::string>& options : {std::vector<std::string>{"--dtd", "a\"b"},
                                                  {"--xsl", "a?>b"},
                                                  {"--type-name", "a b"},
                                                  {"--no-prologue", "--dtd", "a"}}) {
    std::vector<std::string> arguments = {"merge", kAs1, kAs1, "-o", "/dev/null"};
    arguments.insert(arguments.end(), options.begin(), options.end());
    EXPECT_EQ(RunCommand(arguments).code, 2) << options[0];
  }
}

TEST(Merge, TraceGoesToStandardErrorWhenAsked) {
  const CommandResult result = RunCommand({"merge", kAs1, kAs1, "-v", "-o", "/dev/null"});
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.out, "");
  EXPECT_THAT(result.error, StartsWith("About to get Root Node of First Document\n"));
  EXPECT_THAT(result.error, EndsWith("About to set Number of Interference in XML\n"));
}

TEST(Merge, DashWritesStandardOutput) {
  const CommandResult result = RunCommand({"merge", kAs1, kAs1, "-o", "-"});
  EXPECT_EQ(result.code, 0);
  const CommandResult info = RunCommand({"info", "--json", "-"}, result.out);
  EXPECT_EQ(nlohmann::json::parse(info.out)["interferences"], 64);
}

TEST(Merge, OneFileIsWrongUsage) {
  EXPECT_EQ(RunCommand({"merge", kAs1, "-o", "/dev/null"}).code, 2);
}

TEST(Merge, WithoutOutputIsWrongUsage) { EXPECT_EQ(RunCommand({"merge", kAs1, kAs1}).code, 2); }

TEST(Merge, ComponentListIsRefusedAndNothingIsWritten) {
  const TemporaryDirectory directory;
  const CommandResult result = RunCommand(
      {"merge", kAs1, "tests/golden/inputs/components.xml", "-o", directory.Path("out.xml")});
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, HasSubstr("a component list (\"Components\") has no result sets"));
  EXPECT_THAT(FilesIn(directory.Path("")), ElementsAre());
}

TEST(Merge, FirstWithoutPlaceForInterferencesIsRefused) {
  const TemporaryDirectory directory;
  const std::string first = directory.Write("a.xml", "<ClashElement>text</ClashElement>");
  const CommandResult result = RunCommand({"merge", first, kAs1, "-o", directory.Path("out.xml")});
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, HasSubstr("there is no result set"));
  EXPECT_THAT(FilesIn(directory.Path("")), ElementsAre("a.xml"));
}

// Outputs

TEST(Outputs, FailedWriteLeavesTheOldFileAndNothingElse) {
  const TemporaryDirectory directory;
  const std::string out = directory.Write("out.xml", "old");
  // The limit stands for a full disk; it is counted in units of 1024 bytes.
  for (const std::string& command : std::vector<std::string>{
           "merge " + kAs1 + " " + kAs1, "report " + kAs1, "federate " + kAs1}) {
    const std::string limit = command.starts_with("federate") ? "0" : "16";
    const CommandResult result = RunShell("(ulimit -f " + limit + "; lyra " + command + " -o " +
                                          out + ") 2>&1 | cat >&2; exit ${PIPESTATUS[0]}");
    EXPECT_EQ(result.code, 1) << command;
    EXPECT_THAT(result.error, StartsWith("lyra: " + out + ": "));
    EXPECT_EQ(std::count(result.error.begin(), result.error.end(), '\n'), 1) << result.error;
    EXPECT_EQ(ReadFile(out), "old");
    EXPECT_THAT(FilesIn(directory.Path("")), ElementsAre("out.xml"));
  }
}

TEST(Outputs, FullDeviceIsReported) {
  const CommandResult result = RunCommand({"merge", kAs1, kAs1, "-o", "/dev/full"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: /dev/full: No space left on device\n");
}

TEST(Outputs, DirectoryThatCannotBeWrittenIsReported) {
  const CommandResult result = RunCommand({"report", kAs1, "-o", "/proc/report.xml"});
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, StartsWith("lyra: /proc/report.xml: "));
}

TEST(Outputs, MissingDirectoryIsReported) {
  const CommandResult result = RunCommand({"report", kAs1, "-o", "no/such/report.xml"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: no/such/report.xml: No such file or directory\n");
}

TEST(Outputs, DirectoryIsNoOutput) {
  EXPECT_EQ(RunCommand({"report", kAs1, "-o", "samples"}).error, "lyra: samples: Is a directory\n");
}

#ifndef _WIN32
TEST(Outputs, LinkIsFollowedAndPermissionsAreKept) {
  namespace fs = std::filesystem;
  const TemporaryDirectory directory;
  const std::string real = directory.Write("real.xml", "old");
  fs::permissions(real, fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read);
  const std::string link = directory.Path("link.xml");
  fs::create_symlink("real.xml", link);
  ASSERT_EQ(RunCommand({"report", kAs1, "-o", link}).code, 0);
  EXPECT_TRUE(fs::is_symlink(link));
  EXPECT_THAT(ReadFile(real), StartsWith("<?xml"));
  EXPECT_EQ(fs::status(real).permissions(),
            fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read);
}

TEST(Outputs, NewFileHasTheUsualPermissions) {
  namespace fs = std::filesystem;
  const TemporaryDirectory directory;
  const std::string out = directory.Path("new.xml");
  ASSERT_EQ(RunShell("umask 027; lyra report " + kAs1 + " -o " + out).code, 0);
  EXPECT_EQ(static_cast<int>(fs::status(out).permissions()), 0640);
}

TEST(Outputs, PathOfBytesThatAreNoTextWorks) {
  const TemporaryDirectory directory;
  const std::string folder = directory.Path("caf\xE9");
  std::filesystem::create_directory(folder);
  for (const std::vector<std::string>& command : std::vector<std::vector<std::string>>{
           {"merge", kAs1, kAs1}, {"report", kAs1}, {"federate", kAs1}}) {
    std::vector<std::string> arguments = command;
    arguments.insert(arguments.end(), {"-o", folder + "/out\xFF.xml"});
    const CommandResult result = RunCommand(arguments);
    EXPECT_EQ(result.code, 0) << result.error;
    EXPECT_EQ(RunCommand({"info", folder + "/out\xFF.xml"}).code, 0);
    EXPECT_EQ(FilesIn(folder).size(), 1u);
  }
  EXPECT_EQ(FilesIn(directory.Path("")).size(), 1u);
}
#endif
