// The project speaks of itself alone: who reads it has nothing but it.
#include <algorithm>
#include <cctype>
#include <regex>

#include "house/SourceTree.h"

namespace house {
namespace {
// Each is joined from two pieces, so that this file does not find itself.
const std::vector<std::string>& ForeignWords() {
  static const std::vector<std::string> kWords = [] {
    const std::string pieces[][2] = {
        {"the sp", "ec"},  {"spe", "c.md"},    {"as sp", "ecified"}, {"desi", "gn.md"},
        {"sty", "le.md"},  {"/wor", "k/main"}, {"/wor", "k/shared"}, {"/tm", "p/brief"},
        {"the bri", "ef"}, {"ai ag", "ent"},   {"coding ag", "ent"}, {"a sub", "agent"}};
    std::vector<std::string> words;
    for (const auto& [head, tail] : pieces) words.push_back(head + tail);
    return words;
  }();
  return kWords;
}

bool IsLetterOrDigit(char inByte) { return std::isalnum(static_cast<unsigned char>(inByte)) != 0; }

bool HoldsWord(const std::string& inLine, const std::string& inWord) {
  for (auto at = inLine.find(inWord); at != std::string::npos; at = inLine.find(inWord, at + 1)) {
    const std::size_t end = at + inWord.size();
    if (end == inLine.size() || !IsLetterOrDigit(inLine[end])) return true;
  }
  return false;
}

/// Chapters, numbered requests and home folders; in code only what follows a comment's mark, since
/// products may have such names.
bool HoldsReference(const std::string& inLine, bool inIsPaper) {
  static const std::regex kReference(
      R"((par[t]s? [1-5]\.[1-6]|issu[e] #[0-9]|/(hom[e]|roo[t])/[a-z]))");
  if (inLine.find("part") == std::string::npos && inLine.find('#') == std::string::npos &&
      inLine.find('/') == std::string::npos) {
    return false;  // most lines; the expression is slow
  }
  const std::size_t mark = inIsPaper ? 0 : std::min(inLine.find("//"), inLine.find('#'));
  return mark != std::string::npos && std::regex_search(inLine.substr(mark), kReference);
}

bool IsForeign(std::string inLine, bool inIsPaper) {
  std::ranges::transform(inLine, inLine.begin(),
                         [](unsigned char byte) { return static_cast<char>(std::tolower(byte)); });
  return std::ranges::any_of(ForeignWords(),
                             [&](const std::string& word) { return HoldsWord(inLine, word); }) ||
         HoldsReference(inLine, inIsPaper);
}
}  // namespace

std::vector<std::string> FindForeignWords(const std::vector<SourceFile>& inTree) {
  std::vector<std::string> found;
  for (const SourceFile& file : inTree) {
    const bool isPaper = file.path.ends_with(".md");
    for (std::size_t i = 0; i < file.lines.size(); ++i) {
      if (!IsForeign(file.lines[i], isPaper)) continue;
      found.push_back(file.path + ":" + std::to_string(i + 1) + ": " + file.lines[i]);
    }
  }
  return found;
}
}  // namespace house
