#include "platform/system/ZORFile.h"

#include <gtest/gtest.h>
#ifndef _WIN32
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>
#endif

#include <csignal>
#include <filesystem>
#include <string>

#include "platform/system/ZORUnicodeString.h"
#include "support/PlatformFolder.h"

using support::ReadFile;
using support::TemporaryFolder;
namespace fs = std::filesystem;

namespace {

const std::string kSeparator(1, static_cast<char>(fs::path::preferred_separator));

std::wstring Wide(const std::string& inPath) {
  std::wstring wide(inPath.size() + 1, L'?');
  ZORUnicodeString(inPath.c_str()).ConvertToWChar(wide.data());
  return wide;
}

HRESULT Copy(const std::string& inSource, const std::string& inTarget, int inFlags = 0) {
  return ZORFCopy(Wide(inSource).c_str(), Wide(inTarget).c_str(), inFlags);
}

HRESULT Open(const std::string& inPath, const char* inMode, int& outDescriptor) {
  return ZORFOpen(Wide(inPath).c_str(), inMode, &outDescriptor);
}

int FilesIn(const TemporaryFolder& inFolder) {
  const fs::directory_iterator begin(inFolder.path);
  return static_cast<int>(std::distance(begin, fs::directory_iterator()));
}

#ifndef _WIN32
// The process may write files of so many bytes only, for as long as a scope lasts.
class SizeLimit {
 public:
  explicit SizeLimit(rlim_t inBytes) : handler_(std::signal(SIGXFSZ, SIG_IGN)) {
    getrlimit(RLIMIT_FSIZE, &before_);
    const rlimit limit = {inBytes, before_.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);
  }
  ~SizeLimit() {
    setrlimit(RLIMIT_FSIZE, &before_);
    std::signal(SIGXFSZ, handler_);
  }

 private:
  void (*handler_)(int);
  rlimit before_{};
};
#endif

}  // namespace

TEST(ZORFileAccess, ReportsWhatExists) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "x");
  EXPECT_EQ(ZORFileAccess(folder.FilePath("a").c_str(), 0), 0);
  EXPECT_EQ(ZORFileAccess(folder.FilePath("a").c_str(), 2), 0);
  EXPECT_EQ(ZORFileAccess(folder.FilePath("a").c_str(), 4), 0);
  EXPECT_EQ(ZORFileAccess(folder.FilePath("a").c_str(), 6), 0);
}

TEST(ZORFileAccess, MissingFileOrPathIsRefused) {
  const TemporaryFolder folder;
  EXPECT_NE(ZORFileAccess(folder.FilePath("a").c_str(), 0), 0);
  EXPECT_NE(ZORFileAccess("", 0), 0);
  EXPECT_NE(ZORFileAccess(nullptr, 0), 0);
}

TEST(ZORFileAccess, UnknownModeIsRefused) {
  EXPECT_NE(ZORFileAccess("/", 1), 0);
  EXPECT_NE(ZORFileAccess("/", 8), 0);
}

#ifndef _WIN32
TEST(ZORFileAccess, ForbiddenFileIsRefused) {
  if (geteuid() == 0) GTEST_SKIP() << "nothing is forbidden to root";
  const TemporaryFolder folder;
  folder.WriteFile("a", "x");
  chmod(folder.FilePath("a").c_str(), 0);
  EXPECT_EQ(ZORFileAccess(folder.FilePath("a").c_str(), 0), 0);
  EXPECT_NE(ZORFileAccess(folder.FilePath("a").c_str(), 4), 0);
  EXPECT_NE(ZORFileAccess(folder.FilePath("a").c_str(), 2), 0);
}
#endif

TEST(ZORFOpen, MakesEmptiesAndAppends) {
  const TemporaryFolder folder;
  const std::string path = folder.FilePath("\xE5\xB9\xB2 \xC3\xA9.xml");
  std::size_t written = 0;
  int descriptor = -1;
  ASSERT_EQ(Open(path, "wb", descriptor), S_OK);
  EXPECT_EQ(ZORFWrite(descriptor, "long text", 9, &written), S_OK);
  EXPECT_EQ(written, 9u);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
  EXPECT_EQ(ReadFile(path), "long text");
  ASSERT_EQ(Open(path, "wb", descriptor), S_OK);
  EXPECT_EQ(ZORFWrite(descriptor, "a", 1, &written), S_OK);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
  ASSERT_EQ(Open(path, "ab", descriptor), S_OK);
  EXPECT_EQ(ZORFWrite(descriptor, "b", 1, &written), S_OK);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
  EXPECT_EQ(ReadFile(path), "ab");
}

TEST(ZORFOpen, ReadingAMissingFileFails) {
  const TemporaryFolder folder;
  int descriptor = -7;
  EXPECT_EQ(Open(folder.FilePath("a"), "rb", descriptor), kZORFileNotFound);
  EXPECT_EQ(Open(folder.FilePath("no/a"), "wb", descriptor), kZORFileNotFound);
  EXPECT_EQ(descriptor, -7);
}

TEST(ZORFOpen, DirectoriesAreRefused) {
  const TemporaryFolder folder;
  int descriptor = -7;
  EXPECT_EQ(Open(folder.path.string(), "rb", descriptor), kZORFileIsDirectory);
  EXPECT_EQ(Open(folder.path.string(), "wb", descriptor), kZORFileIsDirectory);
  EXPECT_EQ(descriptor, -7);
}

TEST(ZORFOpen, PathsThatCannotBeAreRefused) {
  const TemporaryFolder folder;
  folder.WriteFile("file", "x");
  int descriptor = -7;
  EXPECT_EQ(Open(folder.FilePath("file/below"), "wb", descriptor), kZORFileBadPath);
  EXPECT_EQ(Open(folder.FilePath(std::string(300, 'a')), "wb", descriptor), kZORFileBadPath);
  EXPECT_EQ(ZORFOpen(L"", "wb", &descriptor), kZORFileBadPath);
  const wchar_t surrogate[] = {static_cast<wchar_t>(0xD800), 0};
  EXPECT_EQ(ZORFOpen(surrogate, "wb", &descriptor), kZORFileBadPath);
  EXPECT_EQ(descriptor, -7);
}

TEST(ZORFOpen, UnknownModesAndNullAreRefused) {
  int descriptor = -7;
  EXPECT_EQ(ZORFOpen(L"/tmp", "w", &descriptor), E_INVALIDARG);
  EXPECT_EQ(ZORFOpen(L"/tmp", "r+b", &descriptor), E_INVALIDARG);
  EXPECT_EQ(ZORFOpen(nullptr, "rb", &descriptor), E_INVALIDARG);
  EXPECT_EQ(ZORFOpen(L"/tmp", nullptr, &descriptor), E_INVALIDARG);
  EXPECT_EQ(ZORFOpen(L"/tmp", "rb", nullptr), E_INVALIDARG);
  EXPECT_EQ(descriptor, -7);
}

TEST(ZORFWrite, WritesNothingAndMuch) {
  const TemporaryFolder folder;
  const std::string much(5'000'000, 'm');
  int descriptor = -1;
  std::size_t written = 99;
  ASSERT_EQ(Open(folder.FilePath("a"), "wb", descriptor), S_OK);
  EXPECT_EQ(ZORFWrite(descriptor, nullptr, 0, &written), S_OK);
  EXPECT_EQ(written, 0u);
  EXPECT_EQ(ZORFWrite(descriptor, much.data(), much.size(), &written), S_OK);
  EXPECT_EQ(written, much.size());
  EXPECT_EQ(ZORFWrite(descriptor, nullptr, 1, &written), E_INVALIDARG);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
  EXPECT_EQ(ReadFile(folder.FilePath("a")), much);
}

#ifndef _WIN32
TEST(ZORFWrite, FullDiskIsReported) {
  int descriptor = -1;
  std::size_t written = 99;
  ASSERT_EQ(Open("/dev/full", "wb", descriptor), S_OK);
  EXPECT_EQ(ZORFWrite(descriptor, "abc", 3, &written), kZORFileDiskFull);
  EXPECT_EQ(written, 0u);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
}

TEST(ZORFWrite, PartThatFittedIsReported) {
  const TemporaryFolder folder;
  int descriptor = -1;
  std::size_t written = 99;
  ASSERT_EQ(Open(folder.FilePath("a"), "wb", descriptor), S_OK);
  {
    const SizeLimit limit(1000);
    const std::string much(3000, 'm');
    EXPECT_EQ(ZORFWrite(descriptor, much.data(), much.size(), &written), kZORFileDiskFull);
  }
  EXPECT_EQ(written, 1000u);
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
}
#endif

TEST(ZORFWrite, ClosedDescriptorFails) {
  std::size_t written = 99;
  EXPECT_EQ(ZORFWrite(-1, "a", 1, &written), E_FAIL);
  EXPECT_EQ(written, 0u);
  EXPECT_EQ(ZORFClose(-1), E_FAIL);
}

TEST(ZORFWrite, DescriptorForReadingFails) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "x");
  int descriptor = -1;
  ASSERT_EQ(Open(folder.FilePath("a"), "rb", descriptor), S_OK);
  std::size_t written = 99;
  EXPECT_TRUE(FAILED(ZORFWrite(descriptor, "b", 1, &written)));
  EXPECT_EQ(ZORFClose(descriptor), S_OK);
  EXPECT_EQ(ReadFile(folder.FilePath("a")), "x");
}

TEST(ZORFCopy, CopiesOntoANewAndAnOldFile) {
  const TemporaryFolder folder;
  const std::string content(700'000, 'c');
  folder.WriteFile("source", content);
  folder.WriteFile("old", "old text");
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("new")), S_OK);
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("old")), S_OK);
  EXPECT_EQ(ReadFile(folder.FilePath("new")), content);
  EXPECT_EQ(ReadFile(folder.FilePath("old")), content);
  EXPECT_EQ(FilesIn(folder), 3) << "something was left beside the files";
}

TEST(ZORFCopy, CopiesAnEmptyFile) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "");
  folder.WriteFile("target", "old");
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("target")), S_OK);
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "");
}

TEST(ZORFCopy, OntoItselfLeavesTheFileWhole) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "text");
  fs::create_hard_link(folder.FilePath("a"), folder.FilePath("b"));
  EXPECT_EQ(Copy(folder.FilePath("a"), folder.FilePath("a")), S_OK);
  EXPECT_EQ(Copy(folder.FilePath("a"), folder.FilePath("b")), S_OK);
#ifndef _WIN32
  fs::create_symlink("a", folder.FilePath("c"));
  EXPECT_EQ(Copy(folder.FilePath("a"), folder.FilePath("c")), S_OK);
#endif
  EXPECT_EQ(ReadFile(folder.FilePath("a")), "text");
}

#ifndef _WIN32
TEST(ZORFCopy, OntoALinkChangesTheFileThatItLeadsTo) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "new");
  folder.WriteFile("target", "old");
  fs::create_symlink("target", folder.FilePath("link"));
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("link")), S_OK);
  EXPECT_TRUE(fs::is_symlink(folder.FilePath("link")));
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "new");
}

TEST(ZORFCopy, FailureLeavesTheOldTargetWhole) {
  const TemporaryFolder folder;
  folder.WriteFile("source", std::string(3000, 'm'));
  folder.WriteFile("target", "old text");
  {
    const SizeLimit limit(1000);
    EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("target")), kZORFileDiskFull);
    EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("new")), kZORFileDiskFull);
  }
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "old text");
  EXPECT_EQ(FilesIn(folder), 2) << "something was left beside the files";
}

TEST(ZORFCopy, DeviceIsWrittenIntoNotReplaced) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  EXPECT_EQ(Copy(folder.FilePath("source"), "/dev/full"), kZORFileDiskFull);
  EXPECT_EQ(Copy(folder.FilePath("source"), "/dev/null"), S_OK);
  EXPECT_TRUE(fs::is_character_file("/dev/full"));
  EXPECT_TRUE(fs::is_character_file("/dev/null"));
}
#endif

TEST(ZORFCopy, MissingSourceOrDirectoryIsReported) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  folder.WriteFile("target", "old");
  EXPECT_EQ(Copy(folder.FilePath("no"), folder.FilePath("target")), kZORFileNotFound);
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("no/target")), kZORFileNotFound);
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "old");
}

TEST(ZORFCopy, DirectoriesAreRefused) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  EXPECT_EQ(Copy(folder.path.string(), folder.FilePath("target")), kZORFileIsDirectory);
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.path.string()), kZORFileIsDirectory);
}

TEST(ZORFCopy, ExistingTargetIsRefusedOnDemand) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  folder.WriteFile("target", "old");
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("target"), 1), kZORFileExists);
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "old");
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("new"), 1), S_OK);
  EXPECT_EQ(ReadFile(folder.FilePath("new")), "text");
}

#ifndef _WIN32
TEST(ZORFCopy, OldTargetKeepsItsPermissions) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  folder.WriteFile("target", "old");
  chmod(folder.FilePath("target").c_str(), 0666);
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("target")), S_OK);
  struct stat status;
  ASSERT_EQ(stat(folder.FilePath("target").c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777, 0666u);
}

TEST(ZORFCopy, OntoADanglingLinkMakesTheFileThatItLeadsTo) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "new");
  fs::create_symlink("target", folder.FilePath("link"));
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("link")), S_OK);
  EXPECT_TRUE(fs::is_symlink(folder.FilePath("link")));
  EXPECT_EQ(ReadFile(folder.FilePath("target")), "new");
}

TEST(ZORFCopy, NewTargetHasThePermissionsOfTheSource) {
  const TemporaryFolder folder;
  folder.WriteFile("source", "text");
  fs::permissions(folder.FilePath("source"), fs::perms(0700));
  EXPECT_EQ(Copy(folder.FilePath("source"), folder.FilePath("new")), S_OK);
  EXPECT_EQ(fs::status(folder.FilePath("new")).permissions(), fs::perms(0700));
}
#endif

TEST(ZORFCopy, UnknownFlagsAndNullAreRefused) {
  EXPECT_EQ(ZORFCopy(nullptr, L"a", 0), E_INVALIDARG);
  EXPECT_EQ(ZORFCopy(L"a", nullptr, 0), E_INVALIDARG);
  EXPECT_EQ(ZORFCopy(L"a", L"b", 2), E_INVALIDARG);
  EXPECT_EQ(ZORFCopy(L"", L"b", 0), kZORFileBadPath);
}

TEST(ZORMakePath, JoinsWithOneSeparator) {
  char path[260];
  EXPECT_EQ(ZORMakePath("/srv", "a.xml", path), S_OK);
  EXPECT_EQ(path, "/srv" + kSeparator + "a.xml");
  EXPECT_EQ(ZORMakePath("/srv/", "a.xml", path), S_OK);
  EXPECT_STREQ(path, "/srv/a.xml");
  EXPECT_EQ(ZORMakePath("", "a.xml", path), S_OK);
  EXPECT_STREQ(path, "a.xml");
  EXPECT_EQ(ZORMakePath("/srv", "", path), S_OK);
  EXPECT_EQ(path, "/srv" + kSeparator);
}

TEST(ZORMakePath, LongestPathFits) {
  char path[260];
  const std::string name(254, 'n');
  EXPECT_EQ(ZORMakePath("/srv", name.c_str(), path), S_OK);
  EXPECT_EQ(path, "/srv" + kSeparator + name);
}

TEST(ZORMakePath, LongerPathIsRefused) {
  char path[260] = "before";
  EXPECT_EQ(ZORMakePath("/srv", std::string(255, 'n').c_str(), path), E_INVALIDARG);
  EXPECT_STREQ(path, "");
}

TEST(ZORMakePath, NullIsRefused) {
  char path[260] = "before";
  EXPECT_EQ(ZORMakePath(nullptr, "a", path), E_INVALIDARG);
  EXPECT_STREQ(path, "");
  EXPECT_EQ(ZORMakePath("a", nullptr, path), E_INVALIDARG);
  EXPECT_EQ(ZORMakePath("a", "b", nullptr), E_INVALIDARG);
}
