#include "house/SourceTree.h"

#include <algorithm>
#include <fstream>
#include <set>

namespace fs = std::filesystem;

namespace house {
namespace {
bool IsOutside(const fs::path& inFolder) {
  const std::string name = inFolder.filename().string();
  return (name.starts_with(".") && name != ".ci") || name == "build" || name == "samples";
}

std::vector<std::string> ReadLines(const fs::path& inFile) {
  std::vector<std::string> lines;
  std::ifstream stream(inFile, std::ios::binary);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}
}  // namespace

std::vector<SourceFile> ReadTree(const fs::path& inRoot) {
  std::vector<SourceFile> tree;
  for (fs::recursive_directory_iterator entry(inRoot), end; entry != end; ++entry) {
    if (entry->is_directory() && IsOutside(entry->path())) {
      entry.disable_recursion_pending();
    } else if (entry->is_regular_file()) {
      tree.push_back(
          {entry->path().lexically_relative(inRoot).generic_string(), ReadLines(entry->path())});
    }
  }
  std::ranges::sort(tree, {}, &SourceFile::path);
  return tree;
}
}  // namespace house
