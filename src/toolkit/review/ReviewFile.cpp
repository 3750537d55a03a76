#include <algorithm>
#include <nlohmann/json.hpp>

#include "foundation/Hash.h"
#include "toolkit/review/Carry.h"
#include "toolkit/review/LanguageWords.h"

namespace ZORToolkit {
namespace {

constexpr char kFormat[] = "zorlyra-review/1";
using Json = nlohmann::json;

/// Reads the members of one object and refuses what it does not know.
class Members {
 public:
  Members(const Json& inObject, std::string inPlace) : object_(inObject), place_(inPlace) {
    if (!object_.is_object()) throw Error(place_ + ": is no object");
  }

  const Json* Find(const char* inName) {
    const auto found = object_.find(inName);
    return found == object_.end() || found->is_null() ? nullptr : &*found;
  }
  std::optional<std::string> Text(const char* inName) {
    const Json* const value = Find(inName);
    if (value == nullptr) return std::nullopt;
    if (!value->is_string()) throw Error(place_ + ": \"" + inName + "\" is no text");
    return value->get<std::string>();
  }
  int Index(const char* inName) {
    const Json* const value = Find(inName);
    if (value == nullptr) return 0;
    if (!value->is_number_integer()) throw Error(place_ + ": \"" + inName + "\" is no number");
    return value->get<int>();
  }

 private:
  const Json& object_;
  std::string place_;
};

std::optional<std::string> StatusIn(Members& ioMembers, const char* inName,
                                    const std::string& inPlace) {
  std::optional<std::string> text = ioMembers.Text(inName);
  if (!text || text->empty()) return std::nullopt;
  std::string english = EnglishWord(*text);
  if (english.empty()) {
    std::ranges::transform(*text, text->begin(), [](unsigned char inByte) {
      return inByte == '-' ? ' ' : static_cast<char>(std::tolower(inByte));
    });
    (*text)[0] = static_cast<char>(std::toupper(static_cast<unsigned char>((*text)[0])));
    english = EnglishWord(*text);
  }
  if (english.empty() || english == "Old" || english == "New")
    throw Error(inPlace + ": \"" + inName + "\": unknown status \"" + *text +
                "\"; known are Relevant, Irrelevant, Not inspected");
  return english;
}

ReviewEntry EntryIn(const Json& inEntry, const std::string& inPlace) {
  Members members(inEntry, inPlace);
  ReviewEntry entry;
  entry.id = members.Text("id").value_or("");
  if (entry.id.empty()) throw Error(inPlace + ": has no \"id\"");
  entry.index = members.Index("index");
  entry.baseStatus = StatusIn(members, "baseStatus", inPlace);
  entry.status = StatusIn(members, "status", inPlace);
  entry.comment = members.Text("comment");
  entry.who = members.Text("who").value_or("");
  entry.when = members.Text("when").value_or("");
  return entry;
}

/// "2:17" for a byte of a text.
std::string PlaceOfByte(std::string_view inBytes, std::size_t inByte) {
  const std::string_view before = inBytes.substr(0, inByte == 0 ? 0 : inByte - 1);
  const auto line = 1 + std::ranges::count(before, '\n');
  const std::size_t begin = before.rfind('\n');
  const std::size_t column = before.size() - (begin == std::string_view::npos ? 0 : begin + 1) + 1;
  return std::to_string(line) + ":" + std::to_string(column);
}

}  // namespace

ReviewFile ReadReviewFile(const std::string& inName, std::string_view inBytes) {
  Json json;
  try {
    json = Json::parse(inBytes);
  } catch (const Json::parse_error& error) {
    throw Error(inName + ":" + PlaceOfByte(inBytes, error.byte) + ": is no JSON");
  } catch (const Json::out_of_range&) {
    throw Error(inName + ": holds a number that is too large");
  }
  Members members(json, inName);
  const std::string format = members.Text("format").value_or("");
  if (format != kFormat)
    throw Error(inName + ": is no review file: its format is \"" + format + "\", not \"" + kFormat +
                "\"");
  ReviewFile file;
  if (const Json* const result = members.Find("result")) {
    Members of(*result, inName + ": \"result\"");
    file.document = of.Text("document").value_or("");
    file.hash = of.Text("hash").value_or("");
  }
  const Json* const entries = members.Find("entries");
  if (entries == nullptr || !entries->is_array()) throw Error(inName + ": \"entries\" is no array");
  for (const Json& entry : *entries)
    file.entries.push_back(
        EntryIn(entry, inName + ": entry " + std::to_string(file.entries.size() + 1)));
  return file;
}

std::string DocumentHash(std::string_view inBytes) {
  return ZORFoundation::HexText(ZORFoundation::Hash128Of(inBytes));
}

}  // namespace ZORToolkit
