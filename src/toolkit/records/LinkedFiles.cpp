#include "toolkit/records/LinkedFiles.h"

#include <algorithm>
#include <filesystem>
#include <set>

#include "BuildPath.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr const char* kLogicalScheme = "ZORDLN://";

fs::path DirectoryOf(const std::string& inFederator) {
  return inFederator == "-" ? fs::current_path() : fs::absolute(inFederator).parent_path();
}

/// The path without links and dots as far as it exists.
fs::path Canonical(const fs::path& inPath) {
  std::error_code failure;
  const fs::path canonical = fs::weakly_canonical(inPath, failure);
  return failure ? inPath.lexically_normal() : canonical;
}

std::string WithSlashes(std::string inPath) {
  std::replace(inPath.begin(), inPath.end(), '\\', '/');
  return inPath;
}

std::string WhatIsWrongWith(const std::string& inPath) {
  if (inPath.empty()) return "missing: unknown logical name";
  std::error_code error;  // such as a loop of links, which opening the file names
  if (!fs::exists(inPath, error) && !error) return "missing";
  try {
    const ClashDocument document(inPath);
    return document.HasInterferences() ? ""
                                       : std::string("wrong kind: ") + Description(document.Kind());
  } catch (const Error& failure) {
    std::string reason = failure.what();
    if (reason.starts_with(inPath + ":")) reason.erase(0, inPath.size() + 1);
    return "unreadable: " + reason.substr(std::min(reason.size(), reason.find_first_not_of(' ')));
  }
}

}  // namespace

std::string LinkTo(const std::string& inFile, const std::string& inFederator) {
  if (fs::path(inFile).is_absolute()) return inFile;
  return Canonical(fs::absolute(inFile)).lexically_relative(Canonical(DirectoryOf(inFederator)));
}

std::string LinkedPath(const std::string& inLink, const std::string& inFederator) {
  std::string link = inLink;
  if (link.find(kLogicalScheme) != std::string::npos) {
    link = WithSlashes(Utf8(BuildPath::TransformPathnameFromDLName(FromUtf8(link))));
    if (link.empty() || link == "error") return {};
  }
  const fs::path path = DirectoryOf(inFederator) / link;
  std::error_code ignored;
  // Documents from the library's home system separate folders by backslashes.
  if (!fs::exists(path, ignored) && link.find('\\') != std::string::npos)
    return DirectoryOf(inFederator) / WithSlashes(link);
  return path;
}

std::vector<std::string> CheckLinks(const std::vector<LinkRecord>& inLinks,
                                    const std::string& inFederator) {
  std::vector<std::string> problems;
  std::set<fs::path> seen;
  for (const LinkRecord& link : inLinks) {
    const std::string path = LinkedPath(link.link, inFederator);
    std::string problem = link.link.empty() ? "missing: the link is empty" : WhatIsWrongWith(path);
    if (!path.empty() && !seen.insert(Canonical(path)).second)
      problem += problem.empty() ? "listed twice" : ", listed twice";
    problems.push_back(problem);
  }
  return problems;
}

}  // namespace ZORToolkit
