#include "foundation/TerminationSignals.h"

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <deque>
#include <filesystem>

#include "foundation/AtomicFile.h"
#include "support/PlatformFolder.h"

using namespace ZORFoundation;
using support::TemporaryFolder;

namespace {

/// The code of a process that went on.
constexpr int kWentOn = 77;

void ExpectNothingLeftBy(int inSignal) {
  const TemporaryFolder folder;
  EXPECT_EXIT(
      {
        HandleTerminationSignals();
        const AtomicFile file(folder.FilePath("report.xml"));
        if (std::filesystem::is_empty(folder.path)) std::_Exit(kWentOn);
        raise(inSignal);
      },
      testing::KilledBySignal(inSignal), "");
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

}  // namespace

TEST(TerminationSignals, InterruptLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGINT); }
TEST(TerminationSignals, TerminationLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGTERM); }
TEST(TerminationSignals, ClosedTerminalLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGHUP); }

TEST(TerminationSignals, FolderGoesWithItsUnfinishedFiles) {
  const TemporaryFolder folder;
  const std::string work = folder.FilePath("work");
  EXPECT_EXIT(
      {
        HandleTerminationSignals();
        const RemoveOnSignal removeFolder(work.c_str());
        std::filesystem::create_directory(work);
        const AtomicFile file(work + "/report.xml");
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

TEST(TerminationSignals, FolderThatHoldsMoreStays) {
  const TemporaryFolder folder;
  const std::string work = folder.FilePath("work");
  std::filesystem::create_directories(work + "/more");
  EXPECT_EXIT(
      {
        HandleTerminationSignals();
        const RemoveOnSignal removeFolder(work.c_str());
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_TRUE(std::filesystem::exists(work + "/more"));
}

TEST(TerminationSignals, FinishedFileStays) {
  const TemporaryFolder folder;
  EXPECT_EXIT(
      {
        HandleTerminationSignals();
        AtomicFile file(folder.FilePath("report.xml"));
        file.Commit();
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_TRUE(std::filesystem::exists(folder.FilePath("report.xml")));
}

TEST(TerminationSignals, IgnoredOneStaysIgnored) {
  const TemporaryFolder folder;
  EXPECT_EXIT(
      {
        signal(SIGHUP, SIG_IGN);
        HandleTerminationSignals();
        const AtomicFile file(folder.FilePath("report.xml"));
        raise(SIGHUP);
        std::_Exit(kWentOn);
      },
      testing::ExitedWithCode(kWentOn), "");
}

TEST(TerminationSignals, AreLeftAloneUnlessTheProgramAsks) {
  const TemporaryFolder folder;
  EXPECT_EXIT(
      {
        const AtomicFile file(folder.FilePath("report.xml"));
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_FALSE(std::filesystem::is_empty(folder.path));
}

TEST(TerminationSignals, ForkedProcessLeavesItsParentsFiles) {
  const TemporaryFolder folder;
  HandleTerminationSignals();
  const AtomicFile file(folder.FilePath("report.xml"));
  const pid_t child = fork();
  if (child == 0) raise(SIGTERM);
  int status = 0;
  waitpid(child, &status, 0);
  for (const int signal : {SIGINT, SIGTERM, SIGHUP}) ::signal(signal, SIG_DFL);
  EXPECT_EQ(WTERMSIG(status), SIGTERM);
  EXPECT_FALSE(std::filesystem::is_empty(folder.path));
}

TEST(TerminationSignals, ManyUnfinishedFilesAreAllRemoved) {
  const TemporaryFolder folder;
  EXPECT_EXIT(
      {
        HandleTerminationSignals();
        std::deque<AtomicFile> files;
        for (int i = 0; i < 50; ++i) files.emplace_back(folder.FilePath(std::to_string(i)));
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_TRUE(std::filesystem::is_empty(folder.path));
}

TEST(StopRequest, FirstSignalIsOnlyNoted) {
  EXPECT_EXIT(
      {
        const StopRequest stop;
        const bool wasMade = stop.IsMade();
        raise(SIGINT);
        std::_Exit(!wasMade && stop.IsMade() ? kWentOn : 1);
      },
      testing::ExitedWithCode(kWentOn), "");
}

TEST(StopRequest, SecondSignalEndsTheProcess) {
  EXPECT_EXIT(
      {
        const StopRequest stop;
        raise(SIGINT);
        raise(SIGINT);
      },
      testing::KilledBySignal(SIGINT), "");
}

TEST(StopRequest, CheckRaisesTheSignal) {
  EXPECT_EXIT(
      {
        const StopRequest stop;
        stop.Check();
        raise(SIGTERM);
        try {
          stop.Check();
        } catch (const Interrupted& interrupted) {
          EndBySignal(interrupted.signal);
        }
      },
      testing::KilledBySignal(SIGTERM), "");
}

TEST(StopRequest, SignalsAreHandledAsBeforeWhenItEnds) {
  EXPECT_EXIT(
      {
        signal(SIGINT, [](int) { std::_Exit(kWentOn); });
        { const StopRequest stop; }
        raise(SIGINT);
      },
      testing::ExitedWithCode(kWentOn), "");
}
