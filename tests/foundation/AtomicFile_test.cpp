#include "foundation/AtomicFile.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#ifndef _WIN32
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>
#endif

#include <cerrno>
#include <csignal>
#include <filesystem>
#include <functional>
#include <optional>
#include <thread>

#include "support/FileErrors.h"
#include "support/PlatformFolder.h"

namespace fs = std::filesystem;
using support::CodeOf;
using support::ReadFile;
using support::TemporaryFolder;
using ZORFoundation::AtomicFile;
using ZORFoundation::FileError;
using ZORFoundation::TemporaryFile;
using ZORFoundation::WriteWholeFile;

namespace {

#ifndef _WIN32
constexpr uid_t kNobody = 65534;

struct stat StatusOf(const std::string& inPath) {
  struct stat status {};
  EXPECT_EQ(lstat(inPath.c_str(), &status), 0) << inPath;
  return status;
}

unsigned int ModeOf(const std::string& inPath) { return StatusOf(inPath).st_mode & 07777U; }

rlimit FileSizeLimit(rlim_t inBytes) { return {inBytes, inBytes}; }
#endif

std::vector<std::string> NamesIn(const fs::path& inFolder) {
  std::vector<std::string> names;
  for (const auto& entry : fs::directory_iterator(inFolder))
    names.push_back(entry.path().filename().string());
  std::sort(names.begin(), names.end());
  return names;
}

class AtomicFileTest : public testing::Test {
 protected:
  std::string Path(const std::string& inName) const { return folder_.FilePath(inName); }
  void ExpectNames(const std::vector<std::string>& inNames) const {
    EXPECT_EQ(NamesIn(folder_.path), inNames);
  }
  TemporaryFolder folder_;
};

}  // namespace

TEST_F(AtomicFileTest, CommitPutsTheNewFileInItsPlace) {
  AtomicFile file(Path("a"));
  file.Write("first ");
  file.Write("second");
  EXPECT_FALSE(fs::exists(Path("a")));
  file.Commit();
  EXPECT_EQ(ReadFile(Path("a")), "first second");
  ExpectNames({"a"});
}

TEST_F(AtomicFileTest, CommitReplacesTheOldFileAndNotBefore) {
  folder_.WriteFile("a", "old");
  AtomicFile file(Path("a"));
  file.Write("new");
  EXPECT_EQ(ReadFile(Path("a")), "old");
  file.Commit();
  EXPECT_EQ(ReadFile(Path("a")), "new");
}

TEST_F(AtomicFileTest, AbandonedOneLeavesTheOldFileAndNothingElse) {
  folder_.WriteFile("a", "old");
  { AtomicFile(Path("a")).Write("new"); }
  EXPECT_EQ(ReadFile(Path("a")), "old");
  ExpectNames({"a"});
}

TEST_F(AtomicFileTest, EmptyFileIsReplacedByAnEmptyOne) {
  folder_.WriteFile("a", "old");
  WriteWholeFile(Path("a"), "");
  EXPECT_EQ(ReadFile(Path("a")), "");
}

TEST_F(AtomicFileTest, PathWithoutAFolderIsInTheCurrentOne) {
  const fs::path before = fs::current_path();
  fs::current_path(folder_.path);
  WriteWholeFile("a", "text");
  fs::current_path(before);
  EXPECT_EQ(ReadFile(Path("a")), "text");
}

TEST_F(AtomicFileTest, LongestNameIsWritten) {
  const std::string name(255, 'n');
  WriteWholeFile(Path(name), "text");
  ExpectNames({name});
}

TEST_F(AtomicFileTest, TooLongNameIsRefusedAtOnce) {
  EXPECT_EQ(CodeOf([&] { AtomicFile file(Path(std::string(256, 'n'))); }), ENAMETOOLONG);
}

TEST_F(AtomicFileTest, EmptyPathIsRefused) {
  EXPECT_EQ(CodeOf([] { AtomicFile file(""); }), ENOENT);
}

TEST_F(AtomicFileTest, MissingFolderIsRefusedWithPathAndReason) {
  try {
    AtomicFile file(Path("no/a"));
    FAIL();
  } catch (const FileError& error) {
    EXPECT_EQ(error.Code(), ENOENT);
    EXPECT_EQ(error.Path(), Path("no/a"));
    EXPECT_EQ(error.Reason(), "No such file or directory");
    EXPECT_EQ(error.what(), Path("no/a") + ": No such file or directory");
  }
}

TEST_F(AtomicFileTest, FolderInItsPlaceIsRefused) {
  EXPECT_EQ(CodeOf([&] { AtomicFile file(folder_.path.string()); }), EISDIR);
}

TEST_F(AtomicFileTest, ExistingFileIsRefusedWhereItMayNotBeReplaced) {
  folder_.WriteFile("a", "old");
  EXPECT_EQ(CodeOf([&] { WriteWholeFile(Path("a"), "new", {.mayReplace = false}); }), EEXIST);
  EXPECT_EQ(ReadFile(Path("a")), "old");
  WriteWholeFile(Path("b"), "new", {.mayReplace = false});
  EXPECT_EQ(ReadFile(Path("b")), "new");
}

TEST_F(AtomicFileTest, FileThatCameInTheMeantimeIsRefusedWhereItMayNotBeReplaced) {
  AtomicFile file(Path("a"), {.mayReplace = false});
  folder_.WriteFile("a", "quicker");
  EXPECT_EQ(CodeOf([&] { file.Commit(); }), EEXIST);
  EXPECT_EQ(ReadFile(Path("a")), "quicker");
}

TEST_F(AtomicFileTest, WhatWritesByThePathIsTakenUp) {
  AtomicFile file(Path("a"));
  std::ofstream(file.Temporary().Path()) << "by its path";
  file.Commit();
  EXPECT_EQ(ReadFile(Path("a")), "by its path");
}

#ifndef _WIN32
TEST_F(AtomicFileTest, WhatReplacesTheNewFileIsTakenUp) {
  folder_.WriteFile("a", "old");
  chmod(Path("a").c_str(), 0640);
  AtomicFile file(Path("a"));
  folder_.WriteFile("b", "another file");
  fs::rename(Path("b"), file.Temporary().Path());
  file.Commit();
  EXPECT_EQ(ReadFile(Path("a")), "another file");
  EXPECT_EQ(ModeOf(Path("a")), 0640U);
}

TEST_F(AtomicFileTest, PathThatIsNoTextIsWrittenByOneThatIs) {
  fs::create_directory(Path("caf\xE9"));
  AtomicFile file(Path("caf\xE9/a"));
  EXPECT_THAT(file.Temporary().Utf8Path(), testing::StartsWith("/proc/self/fd/"));
  std::ofstream(file.Temporary().Utf8Path()) << "text";
  file.Commit();
  EXPECT_EQ(ReadFile(Path("caf\xE9/a")), "text");
}
#endif

TEST_F(AtomicFileTest, SeveralThreadsEachReplaceItWhole) {
  std::vector<std::thread> threads;
  for (int i = 0; i < 8; ++i)
    threads.emplace_back([&, i] {
      for (int n = 0; n < 20; ++n)
        WriteWholeFile(Path("a"), std::string(10000, static_cast<char>('a' + i)),
                       {.isSynchronised = false});
    });
  for (std::thread& thread : threads) thread.join();
  const std::string bytes = ReadFile(Path("a"));
  EXPECT_EQ(bytes, std::string(10000, bytes.at(0)));
  ExpectNames({"a"});
}

#ifndef _WIN32
TEST_F(AtomicFileTest, LinkStaysAndItsTargetIsReplaced) {
  folder_.WriteFile("real/a", "old");
  fs::create_symlink("real/a", Path("link"));
  fs::create_symlink("link", Path("second"));
  WriteWholeFile(Path("second"), "new");
  EXPECT_TRUE(fs::is_symlink(Path("link")));
  EXPECT_TRUE(fs::is_symlink(Path("second")));
  EXPECT_EQ(ReadFile(Path("real/a")), "new");
  EXPECT_EQ(NamesIn(Path("real")), std::vector<std::string>{"a"});
}

TEST_F(AtomicFileTest, DanglingLinkIsFollowedToItsTarget) {
  fs::create_directory(Path("real"));
  fs::create_symlink("real/a", Path("link"));
  WriteWholeFile(Path("link"), "new");
  EXPECT_TRUE(fs::is_symlink(Path("link")));
  EXPECT_EQ(ReadFile(Path("real/a")), "new");
}

TEST_F(AtomicFileTest, DanglingLinkIntoNoFolderIsRefused) {
  fs::create_symlink("real/a", Path("link"));
  EXPECT_EQ(CodeOf([&] { AtomicFile file(Path("link")); }), ENOENT);
  EXPECT_TRUE(fs::is_symlink(Path("link")));
}

TEST_F(AtomicFileTest, LinkInACircleIsRefusedAndStays) {
  fs::create_symlink("two", Path("one"));
  fs::create_symlink("one", Path("two"));
  EXPECT_EQ(CodeOf([&] { AtomicFile file(Path("one")); }), ELOOP);
  ExpectNames({"one", "two"});
  EXPECT_TRUE(fs::is_symlink(Path("one")));
}
#endif

TEST_F(AtomicFileTest, TemporaryFolderHoldsTheNewFileUntilCommit) {
  fs::create_directory(Path("work"));
  ZORFoundation::AtomicFileOptions options;
  options.temporaryFolder = Path("work");
  AtomicFile file(Path("a"), options);
  file.Write("new");
  EXPECT_EQ(NamesIn(Path("work")).size(), 1u);
  ExpectNames({"work"});
  file.Commit();
  EXPECT_TRUE(fs::is_empty(Path("work")));
  EXPECT_EQ(ReadFile(Path("a")), "new");
}

#ifndef _WIN32
TEST_F(AtomicFileTest, TemporaryFolderIsNotForWhatALinkLeadsTo) {
  for (const char* folder : {"work", "real"}) fs::create_directory(Path(folder));
  fs::create_symlink("real/a", Path("link"));
  ZORFoundation::AtomicFileOptions options;
  options.temporaryFolder = Path("work");
  const AtomicFile file(Path("link"), options);
  EXPECT_EQ(NamesIn(Path("real")).size(), 1u);
  EXPECT_TRUE(fs::is_empty(Path("work")));
}

TEST_F(AtomicFileTest, DeviceIsWrittenIntoAndStays) {
  if (geteuid() != 0) GTEST_SKIP() << "making a device is for root";
  constexpr dev_t kNull = 0x103;  // what /dev/null is
  if (mknod(Path("null").c_str(), S_IFCHR | 0666, kNull) != 0) GTEST_SKIP() << "no devices here";
  WriteWholeFile(Path("null"), "text");
  EXPECT_TRUE(S_ISCHR(StatusOf(Path("null")).st_mode));
  ExpectNames({"null"});
}

TEST_F(AtomicFileTest, FullDeviceFails) {
  EXPECT_EQ(CodeOf([] { WriteWholeFile("/dev/full", "text"); }), ENOSPC);
  EXPECT_TRUE(S_ISCHR(StatusOf("/dev/full").st_mode));
}

TEST_F(AtomicFileTest, PipeGetsAllTheBytesAndStays) {
  ASSERT_EQ(mkfifo(Path("pipe").c_str(), 0600), 0);
  std::string received;
  std::thread reader([&] {
    const int pipe = open(Path("pipe").c_str(), O_RDONLY);
    char part[4096];
    for (ssize_t count = 0; (count = read(pipe, part, sizeof part)) > 0;)
      received.append(part, static_cast<std::size_t>(count));
    close(pipe);
  });
  const std::string much(300000, 'x');
  WriteWholeFile(Path("pipe"), much);
  reader.join();
  EXPECT_EQ(received, much);
  EXPECT_TRUE(S_ISFIFO(StatusOf(Path("pipe")).st_mode));
}

TEST_F(AtomicFileTest, AbandonedStreamGetsNothing) {
  ASSERT_EQ(mkfifo(Path("pipe").c_str(), 0600), 0);
  { AtomicFile(Path("pipe")).Write("text"); }  // would wait for a reader
  ExpectNames({"pipe"});
}

TEST_F(AtomicFileTest, FolderThatIsReadOnlyIsRefusedAtOnce) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  folder_.WriteFile("a", "old");
  chmod(Path("a").c_str(), 0666);
  chmod(folder_.path.c_str(), 0555);
  EXPECT_EXIT(
      {
        if (setuid(kNobody) != 0) std::_Exit(1);
        std::_Exit(CodeOf([&] { AtomicFile file(Path("a")); }));
      },
      testing::ExitedWithCode(EACCES), "");
}

TEST_F(AtomicFileTest, FileThatIsReadOnlyIsRefusedAtOnce) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  folder_.WriteFile("a", "old");
  chmod(Path("a").c_str(), 0644);
  chmod(folder_.path.c_str(), 0777);
  EXPECT_EXIT(
      {
        if (setuid(kNobody) != 0) std::_Exit(1);
        std::_Exit(CodeOf([&] { AtomicFile file(Path("a")); }));
      },
      testing::ExitedWithCode(EACCES), "");
}

TEST_F(AtomicFileTest, WriteBeyondTheFileSizeLimitLeavesTheOldOne) {
  folder_.WriteFile("a", "old");
  EXPECT_EXIT(
      {
        std::signal(SIGXFSZ, SIG_IGN);
        const rlimit limit = FileSizeLimit(100);
        setrlimit(RLIMIT_FSIZE, &limit);
        std::_Exit(CodeOf([&] { WriteWholeFile(Path("a"), std::string(1000, 'x')); }));
      },
      testing::ExitedWithCode(EFBIG), "");
  EXPECT_EQ(ReadFile(Path("a")), "old");
  ExpectNames({"a"});
}
#endif

// ---- what the new file has of the old one

#ifndef _WIN32
TEST_F(AtomicFileTest, CommitKeepsPermissions) {
  for (const unsigned int mode : {0600U, 0640U, 0666U, 0755U, 04755U, 02750U}) {
    folder_.WriteFile("a", "old");
    ASSERT_EQ(chmod(Path("a").c_str(), mode), 0);
    WriteWholeFile(Path("a"), "new");
    EXPECT_EQ(ModeOf(Path("a")), mode);
  }
}

TEST_F(AtomicFileTest, NewFileHasThePermissionsThatTheMaskLeaves) {
  const mode_t before = umask(027);
  WriteWholeFile(Path("a"), "new");
  WriteWholeFile(Path("b"), "new", {.modeOfNew = 0700});
  umask(before);
  EXPECT_EQ(ModeOf(Path("a")), 0640U);
  EXPECT_EQ(ModeOf(Path("b")), 0700U);
}

TEST_F(AtomicFileTest, UnfinishedFileIsReadByNobodyElse) {
  folder_.WriteFile("a", "old");
  chmod(Path("a").c_str(), 0666);
  AtomicFile file(Path("a"));
  EXPECT_EQ(ModeOf(file.Temporary().Path()), 0600U);
}

TEST_F(AtomicFileTest, CommitKeepsOwnerAndGroup) {
  if (geteuid() != 0) GTEST_SKIP() << "giving files away is for root";
  folder_.WriteFile("a", "old");
  ASSERT_EQ(chown(Path("a").c_str(), kNobody, 12345), 0);
  ASSERT_EQ(chmod(Path("a").c_str(), 04750), 0);
  WriteWholeFile(Path("a"), "new");
  const struct stat status = StatusOf(Path("a"));
  EXPECT_EQ(status.st_uid, kNobody);
  EXPECT_EQ(status.st_gid, 12345U);
  EXPECT_EQ(status.st_mode & 07777U, 04750U);
}

TEST_F(AtomicFileTest, FileOfAnotherOwnerStaysTheirs) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  folder_.WriteFile("a", "old and longer");
  chmod(folder_.path.c_str(), 0777);
  ASSERT_EQ(chown(Path("a").c_str(), 1234, 12345), 0);
  ASSERT_EQ(chmod(Path("a").c_str(), 0666), 0);
  EXPECT_EXIT(
      {
        if (setuid(kNobody) != 0) std::_Exit(1);
        std::_Exit(CodeOf([&] { WriteWholeFile(Path("a"), "new"); }));
      },
      testing::ExitedWithCode(0), "");
  const struct stat status = StatusOf(Path("a"));
  EXPECT_EQ(status.st_uid, 1234U);
  EXPECT_EQ(status.st_gid, 12345U);
  EXPECT_EQ(ReadFile(Path("a")), "new");
  ExpectNames({"a"});
}

TEST_F(AtomicFileTest, FileOfAnotherOwnerIsWholeAgainWhenItCannotBeOverwritten) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  folder_.WriteFile("a", "old");
  chmod(folder_.path.c_str(), 0777);
  ASSERT_EQ(chmod(Path("a").c_str(), 0666), 0);
  EXPECT_EXIT(
      {
        if (setuid(kNobody) != 0) std::_Exit(1);
        std::optional<AtomicFile> file(std::in_place, Path("a"));
        file->Write(std::string(100'000, 'n'));
        signal(SIGXFSZ, SIG_IGN);
        rlimit limit{};
        limit.rlim_cur = limit.rlim_max = 5000;
        setrlimit(RLIMIT_FSIZE, &limit);
        const int code = CodeOf([&] { file->Commit(); });
        file.reset();
        std::_Exit(code);
      },
      testing::ExitedWithCode(EFBIG), "");
  EXPECT_EQ(ReadFile(Path("a")), "old");
  EXPECT_EQ(StatusOf(Path("a")).st_uid, 0U);
  ExpectNames({"a"});
}

TEST_F(AtomicFileTest, CommitPassesOnNoRightsOfAnotherOwnersProgram) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can become another user";
  folder_.WriteFile("a", "old");
  chmod(folder_.path.c_str(), 0777);
  ASSERT_EQ(chmod(Path("a").c_str(), 06777), 0);
  EXPECT_EXIT(
      {
        if (setuid(kNobody) != 0) std::_Exit(1);
        WriteWholeFile(Path("a"), "new");
        std::_Exit(0);
      },
      testing::ExitedWithCode(0), "");
  EXPECT_EQ(StatusOf(Path("a")).st_uid, 0U);
  EXPECT_EQ(ModeOf(Path("a")), 0777U);
}

TEST_F(AtomicFileTest, CommitKeepsExtendedAttributes) {
  folder_.WriteFile("a", "old");
  if (setxattr(Path("a").c_str(), "user.origin", "here", 4, 0) != 0)
    GTEST_SKIP() << "no extended attributes here";
  WriteWholeFile(Path("a"), "new");
  char value[8] = {};
  EXPECT_EQ(getxattr(Path("a").c_str(), "user.origin", value, sizeof value), 4);
  EXPECT_STREQ(value, "here");
}

TEST_F(AtomicFileTest, CommitKeepsAccessControlList) {
  folder_.WriteFile("a", "old");
  // Version 2; owner rw, user 1234 r, group r, mask r, others none (linux/posix_acl_xattr.h).
  const unsigned char list[] = {2,  0, 0, 0,                          //
                                1,  0, 6, 0, 0xFF, 0xFF, 0xFF, 0xFF,  //
                                2,  0, 4, 0, 0xD2, 0x04, 0,    0,     //
                                4,  0, 4, 0, 0xFF, 0xFF, 0xFF, 0xFF,  //
                                16, 0, 4, 0, 0xFF, 0xFF, 0xFF, 0xFF,  //
                                32, 0, 0, 0, 0xFF, 0xFF, 0xFF, 0xFF};
  constexpr char kName[] = "system.posix_acl_access";
  if (setxattr(Path("a").c_str(), kName, list, sizeof list, 0) != 0)
    GTEST_SKIP() << "no access control lists here";
  WriteWholeFile(Path("a"), "new");
  unsigned char kept[sizeof list + 1] = {};
  ASSERT_EQ(getxattr(Path("a").c_str(), kName, kept, sizeof kept),
            static_cast<ssize_t>(sizeof list));
  EXPECT_TRUE(std::equal(list, list + sizeof list, kept));
}
#endif

// ---- temporary files

TEST(TemporaryFile, IsRemovedUnlessItIsReleased) {
  const TemporaryFolder folder;
  std::string path;
  {
    TemporaryFile file(folder.path.string(), 0600, "name");
    path = file.Path();
    EXPECT_TRUE(fs::exists(path));
  }
  EXPECT_FALSE(fs::exists(path));
}

TEST(TemporaryFile, NameIsKnownAsOne) {
  const TemporaryFolder folder;
  const TemporaryFile file(folder.path.string(), 0600, "name");
  const std::string name = fs::path(file.Path()).filename().string();
  EXPECT_TRUE(TemporaryFile::IsTemporaryName(name));
  EXPECT_FALSE(TemporaryFile::IsTemporaryName(name + "0"));
  EXPECT_FALSE(TemporaryFile::IsTemporaryName(name.substr(1)));
  EXPECT_FALSE(TemporaryFile::IsTemporaryName(name.substr(0, name.size() - 1) + "g"));
  EXPECT_FALSE(TemporaryFile::IsTemporaryName("report.xml"));
}

TEST(TemporaryFile, ErrorNamesWhatItStandsFor) {
  try {
    const TemporaryFile file("/no/such/folder", 0600, "picture.png");
    FAIL();
  } catch (const FileError& error) {
    EXPECT_STREQ(error.what(), "picture.png: No such file or directory");
  }
}
