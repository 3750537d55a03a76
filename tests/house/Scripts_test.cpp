// The scripts that judge: a failure must reach whoever asked.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <map>

#include "house/Program.h"
#include "support/PlatformFolder.h"

using testing::ElementsAre;

namespace {
/// Runs one of the project's scripts on a file of this content; the last line is the exit code.
std::vector<std::string> RunScript(const std::string& inScript, const std::string& inContent) {
  const testing::TestInfo& test = *testing::UnitTest::GetInstance()->current_test_info();
  const std::string file = testing::TempDir() + "/zor script " + test.name() + ".txt";
  std::ofstream(file) << inContent;
  auto lines = house::LinesOf("bash '" ZOR_SOURCE_DIR "/scripts/" + inScript + "' '" + file +
                              "' 2>/dev/null; echo code $?");
  std::filesystem::remove(file);
  return lines;
}
}  // namespace

TEST(RunReadmeCommands, RunsTheShellBlocksInOrder) {
  EXPECT_THAT(RunScript("run-readme-commands",
                        "# Title\n```sh\necho one\n\necho two\n```\ntext\n```cpp\nexit(1);\n```\n"),
              ElementsAre("$ echo one", "one", "$ echo two", "two", "2 commands", "code 0"));
}

TEST(RunReadmeCommands, StopsAtACommandThatFails) {
  EXPECT_THAT(RunScript("run-readme-commands", "```sh\nfalse\necho beyond\n```\n"),
              ElementsAre("$ false", "code 1"));
}

TEST(RunReadmeCommands, NoticesAFailureBeforeAPipe) {
  EXPECT_THAT(RunScript("run-readme-commands", "```sh\nfalse | true\n```\n"),
              ElementsAre("$ false | true", "code 1"));
}

TEST(RunReadmeCommands, RefusesAFileWithoutCommands) {
  EXPECT_THAT(RunScript("run-readme-commands", "no block\n"), ElementsAre("code 1"));
}

namespace {
/// What `test-counts` makes of this report of a run and of the reports that programs left of their cases.
std::vector<std::string> Counts(const std::string& inReport,
                                const std::map<std::string, std::string>& inPrograms = {}) {
  const support::TemporaryFolder folder;
  folder.WriteFile("run.xml", inReport);
  for (const auto& [program, cases] : inPrograms) folder.WriteFile(program + ".xml", cases);
  return house::LinesOf("bash " ZOR_SOURCE_DIR "/scripts/test-counts '" +
                        folder.FilePath("run.xml") + "' '" + folder.path.string() +
                        "' 2>/dev/null; echo code $?");
}

const char* const kCases =
    "<testsuites tests=\"9\"><testsuite name=\"x\" tests=\"9\" failures=\"2\" disabled=\"1\" "
    "skipped=\"3\" errors=\"0\">\n<testcase name=\"case\" "
    "status=\"run\"/></testsuite></testsuites>";
}  // namespace

TEST(TestCounts, AreThoseOfTheRunWithoutReportsOfPrograms) {
  EXPECT_THAT(
      Counts("<testsuite>\n<testcase name=\"a\" status=\"run\"/>\n"
             "<testcase name=\"b\"\tstatus=\"fail\">\n<testcase name=\"c\" status=\"notrun\">"
             "<testcase name=\"d\" status=\"disabled\"></testsuite>"),
      ElementsAre("1 1 2", "code 0"));
}

TEST(TestCounts, AreThoseOfTheCasesOfAProgram) {
  EXPECT_THAT(Counts("<testcase name=\"a\" status=\"run\"/><testcase name=\"b\" status=\"fail\"/>",
                     {{"b", kCases}}),
              ElementsAre("4 2 4", "code 0"));
}

TEST(TestCounts, FailWithAProgramWhoseCasesAllPassed) {
  EXPECT_THAT(
      Counts("<testcase name=\"a\" status=\"fail\"/>",
             {{"a", "<testsuite tests=\"5\" failures=\"0\" disabled=\"0\" skipped=\"0\">"}}),
      ElementsAre("5 1 0", "code 0"));
}

TEST(TestCounts, RefuseReportsWithoutCounts) {
  EXPECT_THAT(Counts(""), ElementsAre("code 1"));
  EXPECT_THAT(Counts("<testcase name=\"a\">"), ElementsAre("code 1"));
  EXPECT_THAT(Counts("<testcase name=\"a\" status=\"run\"/>", {{"a", "<testsuite tests=\"5\">"}}),
              ElementsAre("code 1"));
}

namespace {
/// What `install-packages format` prints on a system where `dpkg-query` answers inState for every
/// package, the user has this number and `apt-get` is this script; the last line is the exit code.
std::vector<std::string> Install(const std::string& inState, int inUser,
                                 const std::string& inAptGet = "echo apt-get \"$@\"") {
  const std::string user = std::to_string(inUser);
  return house::LinesOf(
      "dir=$(mktemp -d) && cd \"$dir\" && "
      "printf '#!/bin/sh\\necho " +
      inState +
      "\\n' >dpkg-query && "
      "printf '#!/bin/sh\\necho " +
      user +
      "\\n' >id && "
      "printf '#!/bin/sh\\n%s\\n' '" +
      inAptGet +
      "' >apt-get && "
      "printf '#!/bin/sh\\necho sudo; exec \"$@\"\\n' >sudo && "
      "printf '#!/bin/sh\\necho sleep \"$@\"\\n' >sleep && "
      "chmod +x dpkg-query id apt-get sudo sleep && "
      "PATH=\"$dir:$PATH\" bash '" ZOR_SOURCE_DIR
      "/scripts/install-packages' format 2>&1; "
      "echo code $?; rm -r \"$dir\"");
}

const std::string kInstalling = "Installing git clang-format clang-tidy";
const std::string kUpdate = "apt-get -o DPkg::Lock::Timeout=600 update -qq";
const std::string kInstall =
    "apt-get -o DPkg::Lock::Timeout=600 install -y -qq --no-install-recommends "
    "git clang-format clang-tidy";
}  // namespace

TEST(InstallPackages, AskNothingWhenAllAreInstalled) {
  EXPECT_THAT(Install("installed", 0), ElementsAre("code 0"));
}

TEST(InstallPackages, InstallWhatIsMissing) {
  EXPECT_THAT(Install("not-installed", 0), ElementsAre(kInstalling, kUpdate, kInstall, "code 0"));
}

TEST(InstallPackages, BecomeRootBySudo) {
  EXPECT_THAT(Install("not-installed", 1000),
              ElementsAre(kInstalling, "sudo", kUpdate, "sudo", kInstall, "code 0"));
}

TEST(InstallPackages, WaitWhileTheListsAreLocked) {
  EXPECT_THAT(
      Install("not-installed", 0,
              "if mkdir locked 2>/dev/null; then echo E: Could not get lock x >&2; exit 100; "
              "fi; echo done"),
      ElementsAre(kInstalling, "E: Could not get lock x",
                  "install-packages: waiting for another package manager", "sleep 5", "done",
                  "done", "code 0"));
}

TEST(InstallPackages, FailWhenAPackageCannotBeInstalled) {
  EXPECT_THAT(Install("not-installed", 0, "echo E: no such package >&2; exit 100"),
              ElementsAre(kInstalling, "E: no such package", "code 100"));
}
