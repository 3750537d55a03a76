// Who may include whom: the library sees the public headers and the platform's declarations, the
// default platform sees those declarations and the libraries it stands on, and nothing else.
#include <algorithm>
#include <map>
#include <regex>
#include <set>

#include "house/SourceTree.h"

namespace house {
namespace {
enum class Side { kPublic, kPlatform, kLibrary, kDefaultPlatform, kTool, kFree };
enum class Seen {
  kStandard,
  kPlatform,
  kPlatformExport,
  kLyraExport,
  kPublic,
  kOwnGroup,
  kOtherGroup,
  kSharedLibrary,
  kDefaultPlatform,
  kFrontOfDefaultPlatform,
  kWindows,
  kWindowsTypes,
  kThirdParty
};

/// The first inCount folders of a path, with a trailing slash.
std::string Folders(const std::string& inPath, int inCount) {
  std::size_t end = 0;
  for (int i = 0; i < inCount; ++i) {
    end = inPath.find('/', end);
    if (end == std::string::npos) return {};
    ++end;
  }
  return inPath.substr(0, end);
}

Side SideOf(const std::string& inPath) {
  if (inPath.starts_with("include/")) return Side::kPublic;
  if (inPath.starts_with("src/platform/")) return Side::kPlatform;
  if (inPath.starts_with("src/default_platform/")) return Side::kDefaultPlatform;
  if (inPath.starts_with("src/")) return Side::kLibrary;
  if (inPath.starts_with("tools/")) return Side::kTool;
  return Side::kFree;
}

Seen SeenInSource(const std::string& inName, const std::string& inFile) {
  if (inName.starts_with("platform/")) return Seen::kPlatform;
  if (inName.starts_with("default_platform/")) {
    return Folders(inName, 2).empty() ? Seen::kFrontOfDefaultPlatform : Seen::kDefaultPlatform;
  }
  const std::string group = Folders(inName, 1);
  if (group.empty()) return Seen::kSharedLibrary;
  return "src/" + group == Folders(inFile, 2) ? Seen::kOwnGroup : Seen::kOtherGroup;
}

Seen WhatIsSeen(bool inAngled, const std::string& inName, const std::string& inFile,
                const std::set<std::string>& inPaths) {
  if (inName == "ZORPlatformExport.h") return Seen::kPlatformExport;
  if (inName == "ZORLyraExport.h") return Seen::kLyraExport;
  if (inName == "windows.h") return Seen::kWindows;
  if (inName == "guiddef.h") return Seen::kWindowsTypes;
  if (inAngled) {
    const bool isStandard = inName.find_first_of("./") == std::string::npos;
    return isStandard ? Seen::kStandard : Seen::kThirdParty;
  }
  const std::string beside = inFile.substr(0, inFile.rfind('/') + 1) + inName;
  if (inPaths.contains("include/" + inName)) return Seen::kPublic;
  if (inPaths.contains("src/" + inName)) return SeenInSource(inName, inFile);
  if (inPaths.contains(beside) || inPaths.contains("tools/" + inName)) return Seen::kOwnGroup;
  return Seen::kThirdParty;
}

bool MaySee(Side inSide, Seen inSeen) {
  static const std::map<Side, std::set<Seen>> kAllowed = {
      // Types that Windows has itself must be Windows' own there.
      {Side::kPlatform,
       {Seen::kPlatform, Seen::kPlatformExport, Seen::kOwnGroup, Seen::kWindowsTypes}},
      {Side::kPublic, {Seen::kPlatform, Seen::kPublic, Seen::kLyraExport}},
      {Side::kLibrary,
       {Seen::kPlatform, Seen::kPublic, Seen::kOwnGroup, Seen::kSharedLibrary, Seen::kLyraExport}},
      {Side::kDefaultPlatform,
       {Seen::kPlatform, Seen::kPlatformExport, Seen::kOwnGroup, Seen::kDefaultPlatform,
        Seen::kFrontOfDefaultPlatform, Seen::kWindows, Seen::kThirdParty}},
      {Side::kTool,
       {Seen::kPlatform, Seen::kPublic, Seen::kOwnGroup, Seen::kFrontOfDefaultPlatform,
        Seen::kThirdParty}},
  };
  return inSide == Side::kFree || inSeen == Seen::kStandard || kAllowed.at(inSide).contains(inSeen);
}
}  // namespace

std::vector<std::string> FindWrongIncludes(const std::vector<SourceFile>& inTree) {
  static const std::regex kInclude(R"re(^\s*#\s*include\s*([<"])([^>"]+)[>"])re");
  std::set<std::string> paths;
  for (const SourceFile& file : inTree) paths.insert(file.path);

  std::vector<std::string> wrong;
  for (const SourceFile& file : inTree) {
    if (SideOf(file.path) == Side::kFree) continue;
    const bool isEntryPoint = file.path.starts_with("src/windows/");
    for (std::size_t i = 0; i < file.lines.size(); ++i) {
      std::smatch match;
      if (!std::regex_search(file.lines[i], match, kInclude)) continue;
      const Seen seen = WhatIsSeen(match[1] == "<", match[2], file.path, paths);
      if (MaySee(SideOf(file.path), seen) || (isEntryPoint && seen == Seen::kWindows)) continue;
      wrong.push_back(file.path + ":" + std::to_string(i + 1) + ": must not include " +
                      match[2].str());
    }
  }
  return wrong;
}
}  // namespace house
