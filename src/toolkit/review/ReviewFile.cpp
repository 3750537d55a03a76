#include <algorithm>
#include <initializer_list>
#include <limits>
#include <nlohmann/json.hpp>

#include "foundation/Hash.h"
#include "toolkit/review/Carry.h"
#include "toolkit/review/LanguageWords.h"

namespace ZORToolkit {
namespace {

constexpr char kFormat[] = "zorlyra-review/1";
using Json = nlohmann::json;

/// Reads the members of one object.
class Members {
 public:
  Members(const Json& inObject, std::string inFile, std::string inPart = {})
      : object_(inObject), file_(std::move(inFile)), part_(std::move(inPart)) {
    if (!object_.is_object()) Fail("is no object");
  }

  [[noreturn]] void Fail(const std::string& inReason) const {
    throw Error(file_, part_ + inReason);
  }

  const Json* Find(const char* inName) {
    const auto found = object_.find(inName);
    return found == object_.end() || found->is_null() ? nullptr : &*found;
  }
  std::optional<std::string> Text(const char* inName) {
    const Json* const value = Find(inName);
    if (value == nullptr) return std::nullopt;
    if (!value->is_string()) Fail(std::string("\"") + inName + "\" is no text");
    return value->get<std::string>();
  }
  int Index(const char* inName) {
    const Json* const value = Find(inName);
    if (value == nullptr) return 0;
    if (!value->is_number_integer()) Fail(std::string("\"") + inName + "\" is no number");
    constexpr int kMost = std::numeric_limits<int>::max();
    const bool fits = value->is_number_unsigned() && value->get<std::uint64_t>() <= kMost;
    if (!fits) Fail(std::string("\"") + inName + "\" is no index: " + value->dump());
    return value->get<int>();
  }
  /// A misspelt name would lose what stands behind it.
  void RefuseAllBut(std::initializer_list<std::string_view> inNames) const {
    for (const auto& [name, value] : object_.items())
      if (std::ranges::find(inNames, name) == inNames.end()) Fail("unknown key \"" + name + "\"");
  }

 private:
  const Json& object_;
  std::string file_, part_;  // part: what of the file, before a reason
};

std::optional<std::string> StatusIn(Members& ioMembers, const char* inName) {
  std::optional<std::string> text = ioMembers.Text(inName);
  if (!text || text->empty()) return std::nullopt;
  const std::string given = *text;
  std::string english = EnglishWord(given);
  if (english.empty()) {
    std::ranges::transform(*text, text->begin(), [](unsigned char inByte) {
      return inByte == '-' ? ' ' : static_cast<char>(std::tolower(inByte));
    });
    (*text)[0] = static_cast<char>(std::toupper(static_cast<unsigned char>((*text)[0])));
    english = EnglishWord(*text);
  }
  if (english.empty() || english == "Old" || english == "New")
    ioMembers.Fail(std::string("\"") + inName + "\": unknown status \"" + given +
                   "\"; known are Relevant, Irrelevant, Not inspected");
  return english;
}

ReviewEntry EntryIn(const Json& inEntry, const std::string& inFile, std::size_t inNumber) {
  Members members(inEntry, inFile, "entry " + std::to_string(inNumber) + ": ");
  members.RefuseAllBut(
      {"id", "index", "baseStatus", "status", "comment", "who", "when", "assignee", "labels"});
  ReviewEntry entry;
  entry.id = members.Text("id").value_or("");
  if (entry.id.empty()) members.Fail("has no \"id\"");
  entry.index = members.Index("index");
  entry.baseStatus = StatusIn(members, "baseStatus");
  entry.status = StatusIn(members, "status");
  entry.comment = members.Text("comment");
  entry.who = members.Text("who").value_or("");
  entry.when = members.Text("when").value_or("");
  return entry;
}

FilePlace PlaceOfByte(std::string_view inBytes, std::size_t inByte) {
  const std::string_view before = inBytes.substr(0, inByte == 0 ? 0 : inByte - 1);
  const std::size_t begin = before.rfind('\n');
  const std::size_t column = before.size() - (begin == std::string_view::npos ? 0 : begin + 1) + 1;
  return {1 + static_cast<std::size_t>(std::ranges::count(before, '\n')), column};
}

}  // namespace

ReviewFile ReadReviewFile(const std::string& inName, std::string_view inBytes) {
  Json json;
  try {
    json = Json::parse(inBytes);
  } catch (const Json::parse_error& error) {
    throw Error(inName, "is no JSON", PlaceOfByte(inBytes, error.byte));
  } catch (const Json::out_of_range&) {
    throw Error(inName, "holds a number that is too large");
  }
  Members members(json, inName);
  const std::string format = members.Text("format").value_or("");
  if (format != kFormat)
    throw Error(inName, std::string("is no review file: its format is \"") + format + "\", not \"" +
                            kFormat + "\"");
  ReviewFile file;
  if (const Json* const result = members.Find("result")) {
    Members of(*result, inName, "\"result\": ");
    file.document = of.Text("document").value_or("");
    file.hash = of.Text("hash").value_or("");
  }
  const Json* const entries = members.Find("entries");
  if (entries == nullptr || !entries->is_array()) throw Error(inName, "\"entries\" is no array");
  for (const Json& entry : *entries)
    file.entries.push_back(EntryIn(entry, inName, file.entries.size() + 1));
  return file;
}

std::string DocumentHash(std::string_view inBytes) {
  return ZORFoundation::HexText(ZORFoundation::Hash128Of(inBytes));
}

}  // namespace ZORToolkit
