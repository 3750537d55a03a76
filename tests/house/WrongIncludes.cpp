// Who may include whom.
#include <array>
#include <regex>
#include <set>

#include "house/SourceTree.h"

namespace house {
namespace {
struct Part {
  std::regex files;
  std::regex sees;  ///< besides the standard library and the files of the same part
};

std::regex Pattern(const char* inText) { return std::regex(inText, std::regex::optimize); }

/// The first that matches a file holds; a file that none matches may include anything. What is not
/// in the tree has a name without a folder, as below; "src/<own>/" is the file's own folder there.
const Part* PartOf(const std::string& inPath) {
  static const std::array kParts = {
      Part{Pattern("include/.*"), Pattern("src/platform/.*|ZORLyraExport")},
      // Types that Windows has itself must be Windows' own there.
      Part{Pattern("src/platform/.*"), Pattern("ZORPlatformExport|windows-types")},
      Part{Pattern("src/foundation/WindowsCalls\\.h"), Pattern("ZORFoundationExport|windows")},
      Part{Pattern("src/foundation/.*\\.h"), Pattern("ZORFoundationExport")},
      Part{Pattern("src/foundation/.*"), Pattern("ZORFoundationExport|third-party")},
      Part{Pattern("src/default_platform/[^/]*\\.h"),
           Pattern("src/(platform|foundation)/.*|ZORPlatformExport")},
      Part{Pattern("src/default_platform/.*"),
           Pattern("src/(platform|foundation)/.*|ZORPlatformExport|third-party")},
      Part{Pattern("src/toolkit/(?!detection/kernel/).*\\.h"),
           Pattern("include/.*|src/(platform|foundation)/.*|src/default_platform/[^/]*|"
                   "ZORToolkitExport")},
      Part{Pattern("src/toolkit/.*"),
           Pattern("include/.*|src/(platform|foundation)/.*|src/default_platform/[^/]*|"
                   "ZORToolkitExport|third-party")},
      Part{Pattern("src/windows/.*"), Pattern("include/.*|src/platform/.*|windows")},
      Part{Pattern("src/.*"), Pattern("include/.*|src/platform/.*|src/[^/]*|ZORLyraExport")},
      // Documents are read and changed through the toolkit, by the command and by the Python module.
      Part{Pattern("(tools|python)/.*"),
           Pattern(
               "include/(?!ZORClashParsing).*|src/platform/(?!xml/).*|src/(foundation|toolkit)/.*|"
               "src/default_platform/[^/]*|third-party")},
  };
  for (const Part& part : kParts) {
    if (std::regex_match(inPath, part.files)) return &part;
  }
  return nullptr;
}

/// The folder whose files see each other: `src/<name>/`, or the uppermost one elsewhere.
std::string OwnFolder(const std::string& inPath) {
  const std::size_t start = inPath.starts_with("src/") ? 4 : 0;
  const std::size_t end = inPath.find('/', start);
  return end == std::string::npos ? inPath : inPath.substr(0, end + 1);
}

/// The path of what is included, or a name for what is not in the tree; empty for the standard
/// library.
std::string Included(const std::string& inName, bool inIsAngled, const std::string& inFile,
                     const std::set<std::string>& inPaths) {
  if (inName == "windows.h") return "windows";
  if (inName == "guiddef.h") return "windows-types";
  if (inName.ends_with("Export.h")) return inName.substr(0, inName.size() - 2);
  if (inIsAngled) return inName.find_first_of("./") == std::string::npos ? "" : "third-party";
  for (const char* folder : {"include/", "src/", "tools/"}) {
    if (inPaths.contains(folder + inName)) return folder + inName;
  }
  const std::string beside = inFile.substr(0, inFile.rfind('/') + 1) + inName;
  return inPaths.contains(beside) ? beside : "third-party";
}
}  // namespace

std::vector<std::string> FindWrongIncludes(const std::vector<SourceFile>& inTree) {
  static const std::regex kInclude(R"re(^\s*#\s*include\s*([<"])([^>"]+)[>"])re");
  std::set<std::string> paths;
  for (const SourceFile& file : inTree) paths.insert(file.path);

  std::vector<std::string> wrong;
  for (const SourceFile& file : inTree) {
    const Part* part = PartOf(file.path);
    for (std::size_t i = 0; part != nullptr && i < file.lines.size(); ++i) {
      std::smatch match;
      if (!std::regex_search(file.lines[i], match, kInclude)) continue;
      const std::string seen = Included(match[2], match[1] == "<", file.path, paths);
      if (seen.empty() || seen.starts_with(OwnFolder(file.path)) ||
          std::regex_match(seen, part->sees)) {
        continue;
      }
      wrong.push_back(file.path + ":" + std::to_string(i + 1) + ": must not include " +
                      match[2].str());
    }
  }
  return wrong;
}

std::vector<std::string> FindLines(const std::vector<SourceFile>& inTree,
                                   const std::string& inFolder, const std::string& inPattern) {
  const std::regex pattern(inPattern, std::regex::optimize);
  std::vector<std::string> found;
  for (const SourceFile& file : inTree) {
    if (!file.path.starts_with(inFolder)) continue;
    for (std::size_t i = 0; i < file.lines.size(); ++i) {
      if (!std::regex_search(file.lines[i], pattern)) continue;
      found.push_back(file.path + ":" + std::to_string(i + 1) + ": " + file.lines[i]);
    }
  }
  return found;
}
}  // namespace house
