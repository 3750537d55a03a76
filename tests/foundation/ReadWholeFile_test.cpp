#include "foundation/ReadWholeFile.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#ifndef _WIN32
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>
#endif

#include <cerrno>
#include <filesystem>
#include <thread>

#include "support/PlatformFolder.h"

namespace fs = std::filesystem;
using support::TemporaryFolder;
using ZORFoundation::FileError;
using ZORFoundation::ReadOptions;
using ZORFoundation::ReadWholeFile;
using ZORFoundation::StampOfFile;
using ZORFoundation::TryReadWholeFile;

namespace {

int CodeOf(const std::string& inPath, const ReadOptions& inOptions = {}) {
  try {
    ReadWholeFile(inPath, inOptions);
    return 0;
  } catch (const FileError& error) {
    EXPECT_EQ(error.Path(), inPath);
    return error.Code();
  }
}

}  // namespace

TEST(ReadWholeFile, GivesAllBytes) {
  const TemporaryFolder folder;
  std::string bytes(300001, 'x');
  bytes[17] = '\0';
  folder.WriteFile("a", bytes);
  EXPECT_EQ(ReadWholeFile(folder.FilePath("a")).bytes, bytes);
}

TEST(ReadWholeFile, EmptyFileGivesNoBytes) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "");
  EXPECT_EQ(ReadWholeFile(folder.FilePath("a")).bytes, "");
}

TEST(ReadWholeFile, StampsAreTheFilesAndAgree) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  const auto whole = ReadWholeFile(folder.FilePath("a"));
  EXPECT_TRUE(whole.IsConsistent());
  EXPECT_EQ(whole.before, StampOfFile(folder.FilePath("a")));
  EXPECT_EQ(whole.before.size, 4U);
}

TEST(ReadWholeFile, StampOfAChangedFileDiffers) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  const auto before = StampOfFile(folder.FilePath("a"));
  folder.WriteFile("a", "longer text");
  EXPECT_NE(before, StampOfFile(folder.FilePath("a")));
  EXPECT_EQ(StampOfFile(folder.FilePath("b")), std::nullopt);
}

TEST(ReadWholeFile, MissingFileHasItsReason) {
  try {
    ReadWholeFile("/no/such/file");
    FAIL();
  } catch (const FileError& error) {
    EXPECT_EQ(error.Code(), ENOENT);
    EXPECT_STREQ(error.what(), "/no/such/file: No such file or directory");
  }
}

TEST(ReadWholeFile, FolderIsRefused) {
  const TemporaryFolder folder;
  EXPECT_EQ(CodeOf(folder.path.string()), EISDIR);
}

#ifndef _WIN32
TEST(ReadWholeFile, PipeIsRefusedWithoutWaiting) {
  const TemporaryFolder folder;
  ASSERT_EQ(mkfifo(folder.FilePath("pipe").c_str(), 0600), 0);
  EXPECT_EQ(CodeOf(folder.FilePath("pipe")), ESPIPE);
}

TEST(ReadWholeFile, PipeIsReadWhereStreamsAreAllowed) {
  const TemporaryFolder folder;
  const std::string path = folder.FilePath("pipe");
  ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
  std::thread writer([&] { std::ofstream(path) << "through the pipe"; });
  EXPECT_EQ(ReadWholeFile(path, {.mayBeStream = true}).bytes, "through the pipe");
  writer.join();
}

TEST(ReadWholeFile, DeviceIsRefusedOrReadUpToTheLimit) {
  EXPECT_EQ(CodeOf("/dev/zero"), ESPIPE);
  EXPECT_EQ(CodeOf("/dev/zero", {.maxSize = 1 << 20, .mayBeStream = true}), EFBIG);
  EXPECT_EQ(ReadWholeFile("/dev/null", {.mayBeStream = true}).bytes, "");
}

TEST(ReadWholeFile, SocketIsRefused) {
  const TemporaryFolder folder;
  const std::string path = folder.FilePath("socket");
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  ASSERT_LT(path.size(), sizeof address.sun_path);
  path.copy(address.sun_path, path.size());
  const int socket = ::socket(AF_UNIX, SOCK_STREAM, 0);
  ASSERT_EQ(bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
  EXPECT_EQ(CodeOf(path), ESPIPE);
  close(socket);
}
#endif

TEST(ReadWholeFile, LimitIsTheLargestThatIsRead) {
  const TemporaryFolder folder;
  folder.WriteFile("a", std::string(1000, 'x'));
  EXPECT_EQ(ReadWholeFile(folder.FilePath("a"), {.maxSize = 1000}).bytes.size(), 1000U);
  EXPECT_EQ(CodeOf(folder.FilePath("a"), {.maxSize = 999}), EFBIG);
}

#ifndef _WIN32
TEST(ReadWholeFile, LinkIsFollowedAndACircleRefused) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  fs::create_symlink("a", folder.FilePath("link"));
  fs::create_symlink("circle", folder.FilePath("circle"));
  EXPECT_EQ(ReadWholeFile(folder.FilePath("link")).bytes, "text");
  EXPECT_EQ(CodeOf(folder.FilePath("circle")), ELOOP);
}

TEST(ReadWholeFile, UnreadableFileIsRefused) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  chmod(folder.path.c_str(), 0755);
  chmod(folder.FilePath("a").c_str(), 0600);
  EXPECT_EXIT(
      {
        if (setuid(65534) != 0) std::_Exit(1);
        std::_Exit(CodeOf(folder.FilePath("a")));
      },
      testing::ExitedWithCode(EACCES), "");
}

// Its size is given as 0.
TEST(ReadWholeFile, FileThatTheSystemMakesUpIsReadToItsEnd) {
  EXPECT_NE(ReadWholeFile("/proc/self/status").bytes.find("Name:"), std::string::npos);
}
#endif

TEST(ReadWholeFile, TriedOneGivesNothingInPlaceOfAReason) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  EXPECT_EQ(TryReadWholeFile(folder.FilePath("a"))->bytes, "text");
  EXPECT_FALSE(TryReadWholeFile(folder.FilePath("b")));
}

TEST(OpenForReading, ReadsRewindsAndReadsAgain) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  const auto file = ZORFoundation::OpenForReading(folder.FilePath("a"));
  char bytes[8];
  EXPECT_EQ(ZORFoundation::ReadSome(file.Get(), bytes, 3, "a"), 3U);
  EXPECT_EQ(ZORFoundation::ReadSome(file.Get(), bytes, 3, "a"), 1U);
  EXPECT_EQ(ZORFoundation::ReadSome(file.Get(), bytes, 3, "a"), 0U);
  ZORFoundation::Rewind(file.Get(), "a");
  EXPECT_EQ(ZORFoundation::ReadToEnd(file.Get(), "a"), "text");
}

TEST(OpenForReading, RefusesWhatIsNoRegularFile) {
  const TemporaryFolder folder;
  EXPECT_THROW(ZORFoundation::OpenForReading(folder.path.string()), FileError);
  EXPECT_THROW(ZORFoundation::OpenForReading("/dev/null"), FileError);
  EXPECT_TRUE(ZORFoundation::OpenForReading("/dev/null", true).IsOpen());
}

TEST(OpenForReading, FailureNamesWhatWasRead) {
  try {
    char bytes[8];
    ZORFoundation::ReadSome(-1, bytes, sizeof bytes, "name");
    FAIL();
  } catch (const FileError& error) {
    EXPECT_STREQ(error.what(), "name: Bad file descriptor");
  }
}
