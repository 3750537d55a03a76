#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "foundation/TemporaryFile.h"

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
