// The files of a source tree, as the house's checks look at them.
#ifndef ZOR_TESTS_HOUSE_SOURCE_TREE_H
#define ZOR_TESTS_HOUSE_SOURCE_TREE_H

#include <filesystem>
#include <string>
#include <vector>

namespace house {
struct SourceFile {
  std::string path;  ///< from the root, with slashes
  std::vector<std::string> lines;
};

/// All text files below the root, sorted, without hidden folders, build folders and samples.
std::vector<SourceFile> ReadTree(const std::filesystem::path& inRoot);

/// The lines that include what their file must not see, as "path:line: reason".
std::vector<std::string> FindWrongIncludes(const std::vector<SourceFile>& inTree);

/// The lines below inFolder that hold a match of a regular expression, as "path:line: text".
std::vector<std::string> FindLines(const std::vector<SourceFile>& inTree,
                                   const std::string& inFolder, const std::string& inPattern);
}  // namespace house

#endif
