// Paths, files and the environment as Windows has them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>

#include "foundation/AtomicFile.h"
#include "foundation/PluginLoader.h"
#include "foundation/Process.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/WindowsCalls.h"
#include "platform/system/ZORDocumentLocation.h"
#include "platform/system/ZORFile.h"
#include "platform/system/ZORGetEnv.h"
#include "platform/system/ZORMsgCatalog.h"
#include "support/FileErrors.h"
#include "support/PlatformFolder.h"

namespace fs = std::filesystem;
using namespace ZORFoundation;
using support::CodeOf;
using support::TemporaryFolder;

namespace {

const std::string kJapaneseAndEmoji = "\u5E72\u6E09\U0001F680";

std::string Read(const std::string& inPath) { return ReadWholeFile(inPath).bytes; }

/// A file that is open as other programs open files.
class OpenElsewhere {
 public:
  OpenElsewhere(const std::string& inPath, DWORD inSharing)
      : file_(CreateFileW(WidePath(inPath).c_str(), GENERIC_READ, inSharing, nullptr, OPEN_EXISTING,
                          0, nullptr)) {
    EXPECT_NE(file_, INVALID_HANDLE_VALUE);
  }
  ~OpenElsewhere() { CloseHandle(file_); }
  OpenElsewhere(const OpenElsewhere&) = delete;
  OpenElsewhere& operator=(const OpenElsewhere&) = delete;

 private:
  HANDLE file_;
};

std::size_t FilesIn(const fs::path& inFolder) {
  return static_cast<std::size_t>(
      std::distance(fs::directory_iterator(inFolder), fs::directory_iterator()));
}

}  // namespace

TEST(WindowsFiles, NameBeyondTheAnsiCodePageIsWrittenAndRead) {
  const TemporaryFolder folder;
  const std::string path = folder.FilePath("a") + kJapaneseAndEmoji + ".xml";
  WriteWholeFile(path, "text");
  EXPECT_EQ(Read(path), "text");
  EXPECT_NE(GetFileAttributesW(WideText(path).c_str()), INVALID_FILE_ATTRIBUTES);
  EXPECT_EQ(ZORFileAccess(path.c_str(), 6), 0);
  int file = -1;
  ASSERT_EQ(ZORFOpen(WideText(path).c_str(), "ab", &file), S_OK);
  EXPECT_EQ(ZORFWrite(file, "\n", 1, nullptr), S_OK);
  EXPECT_EQ(ZORFClose(file), S_OK);
  EXPECT_EQ(Read(path), "text\n");
  EXPECT_EQ(FilesIn(folder.path), 1u);
}

TEST(WindowsFiles, PathLongerThan260CharactersIsWrittenAndRead) {
  const TemporaryFolder folder;
  std::wstring wide = LR"(\\?\)" + folder.path.wstring();
  std::string path = folder.path.string();
  for (int i = 0; i < 3; ++i) {
    wide += L"\\" + std::wstring(100, L'n');
    path += "/" + std::string(100, 'n');
    ASSERT_NE(CreateDirectoryW(wide.c_str(), nullptr), FALSE);
  }
  path += "/a.xml";
  WriteWholeFile(path, "first");
  WriteWholeFile(path, "second");
  EXPECT_EQ(Read(path), "second");
  EXPECT_EQ(ZORFCopy(WideText(path).c_str(), WideText(path + "2").c_str(), 1), S_OK);
  EXPECT_EQ(Read(path + "2"), "second");
  DeleteFileW(WidePath(path).c_str());
  DeleteFileW(WidePath(path + "2").c_str());
  for (int i = 0; i < 3; ++i, wide.resize(wide.size() - 101)) RemoveDirectoryW(wide.c_str());
}

TEST(WindowsFiles, UncAndDriveRelativePathsAreMarkedWhenLong) {
  const std::string tail(300, 'n');
  EXPECT_EQ(WidePath("//server/share/" + tail), LR"(\\?\UNC\server\share\)" + WideText(tail));
  EXPECT_EQ(WidePath("//server/share/a"), LR"(\\server\share\a)");
  EXPECT_EQ(WidePath("c:/" + tail), LR"(\\?\c:\)" + WideText(tail));
  EXPECT_EQ(WidePath(R"(\\?\c:\a)"), LR"(\\?\c:\a)");
  const fs::path here = fs::current_path();
  const std::string drive = here.root_name().string();
  const std::wstring relative = WidePath(drive + tail);
  EXPECT_TRUE(relative.starts_with(LR"(\\?\)")) << Utf8Text(relative.substr(0, 40));
  EXPECT_TRUE(relative.ends_with(L"\\" + WideText(tail)));
}

TEST(WindowsFiles, DriveRelativePathIsInTheCurrentFolder) {
  const TemporaryFolder folder;
  const fs::path before = fs::current_path();
  fs::current_path(folder.path);
  WriteWholeFile(folder.path.root_name().string() + "a.xml", "text");
  fs::current_path(before);
  EXPECT_EQ(Read(folder.FilePath("a.xml")), "text");
  EXPECT_EQ(FilesIn(folder.path), 1u);
}

TEST(WindowsFiles, FileThatAnotherReadsIsReplacedWhereItLetsIt) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "longer than the new text");
  const std::string path = folder.FilePath("a");
  {
    const OpenElsewhere reader(path, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE);
    WriteWholeFile(path, "new");
  }
  EXPECT_EQ(Read(path), "new");
  {
    const OpenElsewhere reader(path, FILE_SHARE_READ | FILE_SHARE_WRITE);
    WriteWholeFile(path, "newest");
  }
  EXPECT_EQ(Read(path), "newest");
  EXPECT_EQ(FilesIn(folder.path), 1u);
}

TEST(WindowsFiles, FileThatAnotherKeepsIsRefusedAndStays) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "old");
  const std::string path = folder.FilePath("a");
  const OpenElsewhere reader(path, FILE_SHARE_READ);
  EXPECT_EQ(CodeOf([&] { WriteWholeFile(path, "new"); }), EACCES);
  EXPECT_EQ(Read(path), "old");
  EXPECT_EQ(FilesIn(folder.path), 1u);
}

TEST(WindowsFiles, ReadOnlyTargetIsRefusedAndStays) {
  const TemporaryFolder folder;
  folder.WriteFile("a", "old");
  const std::string path = folder.FilePath("a");
  ASSERT_NE(SetFileAttributesW(WidePath(path).c_str(), FILE_ATTRIBUTE_READONLY), FALSE);
  EXPECT_EQ(CodeOf([&] { WriteWholeFile(path, "new"); }), EACCES);
  EXPECT_NE(ZORFileAccess(path.c_str(), 2), 0);
  EXPECT_EQ(ZORFileAccess(path.c_str(), 4), 0);
  SetFileAttributesW(WidePath(path).c_str(), FILE_ATTRIBUTE_NORMAL);
  EXPECT_EQ(Read(path), "old");
}

TEST(WindowsFiles, DeviceTakesBytesAndIsNoFileToRead) {
  WriteWholeFile("NUL", "text");
  EXPECT_EQ(CodeOf([] { ReadWholeFile("NUL"); }), ESPIPE);
  EXPECT_EQ(ReadWholeFile("NUL", {.mayBeStream = true}).bytes, "");
  EXPECT_NE(CodeOf([] { ReadWholeFile("COM1"); }), 0);
  EXPECT_NE(CodeOf([] { ReadWholeFile("CON"); }), 0);
}

TEST(WindowsFiles, JoinedPathHasTheSystemsSeparator) {
  char path[260];
  EXPECT_EQ(ZORMakePath("C:\\folder", "a.xml", path), S_OK);
  EXPECT_STREQ(path, "C:\\folder\\a.xml");
  EXPECT_EQ(ZORMakePath("C:/folder/", "a.xml", path), S_OK);
  EXPECT_STREQ(path, "C:/folder/a.xml");
}

TEST(WindowsFiles, EnvironmentIsReadInWideCharacters) {
  SetEnvironmentVariableW(L"ZOR_TEST_VALUE", WideText(kJapaneseAndEmoji).c_str());
  EXPECT_EQ(ZORGetEnv("ZOR_TEST_VALUE"), kJapaneseAndEmoji);
  WriteEnvironment("ZOR_TEST_VALUE", "other");
  EXPECT_STREQ(ZORGetEnv("ZOR_TEST_VALUE"), "other");
  WriteEnvironment("ZOR_TEST_VALUE", nullptr);
  EXPECT_EQ(ZORGetEnv("ZOR_TEST_VALUE"), nullptr);
}

TEST(WindowsFiles, CataloguesAreFoundBesideTheLibraries) {
  const support::ScopedVariable catalogues("ZOR_CATALOGUE_PATH", "");
  const support::ScopedVariable language("ZOR_LANG", "en");
  const ZORUnicodeString text = ZORMsgCatalog::BuildMessage(
      "ZORSiMuXMLServicesV12", "NLSstr_Stylesheet", nullptr, 0, "missing");
  EXPECT_STRNE(text.ConvertToChar(), "missing");
  EXPECT_TRUE(fs::exists(LibraryDirectory() + "\\ZORFoundation.dll"));
}
