#include "foundation/TemporaryFile.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "foundation/ReadWholeFile.h"

namespace fs = std::filesystem;

TEST(ScratchFolder, GoesWithAllThatItHolds) {
  fs::path path;
  {
    const ZORFoundation::ScratchFolder folder, other;
    path = folder.Path();
    EXPECT_NE(folder.Path(), other.Path());
    EXPECT_TRUE(fs::is_empty(path));
    fs::create_directory(path / "inner");
    std::ofstream(path / "inner/file") << "text";
  }
  EXPECT_FALSE(fs::exists(path));
}

TEST(MemoryFile, GivesBackTheBytesThatItHolds) {
  const std::string bytes("a\0\r\nb", 5);
  const ZORFoundation::Descriptor file = ZORFoundation::NewMemoryFile(bytes);
  const ZORFoundation::Descriptor other = ZORFoundation::NewMemoryFile("other");
  EXPECT_EQ(ZORFoundation::ReadToEnd(file.Get(), "file"), "");
  ZORFoundation::Rewind(file.Get(), "file");
  EXPECT_EQ(ZORFoundation::ReadToEnd(file.Get(), "file"), bytes);
}
