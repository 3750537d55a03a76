#include "toolkit/exchange/ReviewImport.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <unordered_map>

#include "toolkit/records/RecordFilter.h"
#include "toolkit/review/LanguageWords.h"
#include "toolkit/review/Match.h"

namespace ZORToolkit {

std::optional<std::string> StatusCalled(const std::string& inText) {
  const std::string english = EnglishWord(inText);
  if (english == "Relevant" || english == "Irrelevant" || english == "Not inspected")
    return english;
  static const std::map<std::string, const char*> kWords = {{"not inspected", "Not inspected"},
                                                            {"open", "Not inspected"},
                                                            {"new", "Not inspected"},
                                                            {"reopened", "Not inspected"},
                                                            {"re opened", "Not inspected"},
                                                            {"to do", "Not inspected"},
                                                            {"pending", "Not inspected"},
                                                            {"unresolved", "Not inspected"},
                                                            {"relevant", "Relevant"},
                                                            {"active", "Relevant"},
                                                            {"in progress", "Relevant"},
                                                            {"inprogress", "Relevant"},
                                                            {"assigned", "Relevant"},
                                                            {"confirmed", "Relevant"},
                                                            {"ongoing", "Relevant"},
                                                            {"irrelevant", "Irrelevant"},
                                                            {"closed", "Irrelevant"},
                                                            {"resolved", "Irrelevant"},
                                                            {"solved", "Irrelevant"},
                                                            {"done", "Irrelevant"},
                                                            {"fixed", "Irrelevant"},
                                                            {"approved", "Irrelevant"},
                                                            {"accepted", "Irrelevant"},
                                                            {"rejected", "Irrelevant"},
                                                            {"ignored", "Irrelevant"},
                                                            {"void", "Irrelevant"},
                                                            {"completed", "Irrelevant"},
                                                            {"invalid", "Irrelevant"}};
  const auto word = kWords.find(WordKey(inText));
  if (word == kWords.end()) return std::nullopt;
  return word->second;
}

std::string ReviewFileText(const ImportedReview& inReview, const std::string& inHash) {
  using Json = nlohmann::ordered_json;
  Json entries = Json::array();
  for (const ImportedEntry& entry : inReview.entries) {
    Json json = {{"id", entry.id}, {"index", entry.index}};
    if (entry.baseStatus) json["baseStatus"] = *entry.baseStatus;
    if (entry.status) json["status"] = *entry.status;
    if (entry.comment) json["comment"] = *entry.comment;
    if (!entry.who.empty()) json["who"] = entry.who;
    if (!entry.when.empty()) json["when"] = entry.when;
    if (!entry.assignee.empty()) json["assignee"] = entry.assignee;
    if (!entry.labels.empty()) json["labels"] = entry.labels;
    entries.push_back(std::move(json));
  }
  const Json json = {{"format", "zorlyra-review/1"},
                     {"result", {{"document", inReview.document}, {"hash", inHash}}},
                     {"entries", std::move(entries)}};
  return json.dump(1, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace ZORToolkit
