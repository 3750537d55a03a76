// What signals that end the command leave behind.
#include "lyra/EndingSignals.h"

#include <gtest/gtest.h>
#include <signal.h>

#include <cstdlib>
#include <filesystem>

#include "lyra/ReplacedFile.h"
#include "tools/Command.h"

namespace {

/// The code of a process that went on.
constexpr int kWentOn = 77;

void ExpectNothingLeftBy(int inSignal) {
  const TemporaryDirectory directory;
  EXPECT_EXIT(
      {
        const lyra::ReplacedFile file(directory.Path("report.xml"));
        if (std::filesystem::is_empty(directory.Path(""))) std::_Exit(kWentOn);
        raise(inSignal);
      },
      testing::KilledBySignal(inSignal), "");
  EXPECT_TRUE(std::filesystem::is_empty(directory.Path("")));
}

}  // namespace

TEST(EndingSignals, InterruptLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGINT); }
TEST(EndingSignals, TerminationLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGTERM); }
TEST(EndingSignals, ClosedTerminalLeavesNoUnfinishedFile) { ExpectNothingLeftBy(SIGHUP); }

TEST(EndingSignals, FinishedFileStays) {
  const TemporaryDirectory directory;
  EXPECT_EXIT(
      {
        lyra::Output output(stdout);
        lyra::ReplacedFile file(directory.Path("report.xml"));
        file.Finish(output);
        raise(SIGTERM);
      },
      testing::KilledBySignal(SIGTERM), "");
  EXPECT_TRUE(std::filesystem::exists(directory.Path("report.xml")));
}

TEST(EndingSignals, IgnoredOneStaysIgnored) {
  const TemporaryDirectory directory;
  EXPECT_EXIT(
      {
        signal(SIGHUP, SIG_IGN);
        const lyra::ReplacedFile file(directory.Path("report.xml"));
        raise(SIGHUP);
        std::_Exit(kWentOn);
      },
      testing::ExitedWithCode(kWentOn), "");
}

TEST(StopRequest, FirstSignalIsOnlyNoted) {
  EXPECT_EXIT(
      {
        const lyra::StopRequest stop;
        const bool wasMade = stop.IsMade();
        raise(SIGINT);
        std::_Exit(!wasMade && stop.IsMade() ? kWentOn : 1);
      },
      testing::ExitedWithCode(kWentOn), "");
}

TEST(StopRequest, SecondSignalEndsTheProcess) {
  EXPECT_EXIT(
      {
        const lyra::StopRequest stop;
        raise(SIGINT);
        raise(SIGINT);
      },
      testing::KilledBySignal(SIGINT), "");
}

TEST(StopRequest, CheckRaisesTheSignal) {
  EXPECT_EXIT(
      {
        const lyra::StopRequest stop;
        stop.Check();
        raise(SIGTERM);
        try {
          stop.Check();
        } catch (const lyra::Interrupted& interrupted) {
          lyra::EndBy(interrupted.signal);
        }
      },
      testing::KilledBySignal(SIGTERM), "");
}
