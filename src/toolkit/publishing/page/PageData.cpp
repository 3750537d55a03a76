#include "toolkit/publishing/page/PageData.h"

#include <nlohmann/json.hpp>

namespace ZORToolkit {
namespace {

using Json = nlohmann::ordered_json;

/// The groups of what the page shows; empty ones are left out.
Json JsonOf(const GroupList& inGroups, const ReviewedResult& inResult,
            const std::vector<bool>& inIsShown) {
  Json groups = Json::array();
  for (const InterferenceGroup group : inGroups) {
    Json members = Json::array();
    for (const int member : group.Members()) {
      const auto position = static_cast<std::size_t>(member);
      if (inIsShown[position]) members.push_back(inResult.interferences[position].index);
    }
    if (members.empty()) continue;
    Json json = {{"id", group.Id()},
                 {"by", Name(group.By())},
                 {"label", group.Label()},
                 {"members", members},
                 {"groups", JsonOf(group.Groups(), inResult, inIsShown)}};
    if (group.Worst()) json["worst"] = *group.Worst();
    groups.push_back(json);
  }
  return groups;
}

/// The statuses that a review file knows.
bool IsKnown(std::string_view inStatus) {
  return inStatus == "Relevant" || inStatus == "Irrelevant" || inStatus == "Not inspected";
}

}  // namespace

std::string JsonOf(const PageData& inData, const ReviewedResult& inResult,
                   const std::vector<bool>& inIsShown) {
  Json statuses = Json::object();
  for (std::size_t i = 0; i < inResult.interferences.size(); ++i) {
    const ReviewRecord& record = inResult.interferences[i];
    if (inIsShown[i] && IsKnown(record.status))
      statuses[std::to_string(record.index)] = std::string(record.status);
  }
  const Json json = {{"document", inData.document},
                     {"hash", inData.hash},
                     {"sha256", inData.sha256},
                     {"oneFile", inData.isOneFile},
                     {"geometry", inData.hasGeometry},
                     {"statuses", statuses},
                     {"groups", JsonOf(GroupInterferences(inResult), inResult, inIsShown)}};
  std::string text = json.dump(-1, ' ', true, Json::error_handler_t::replace);
  for (std::size_t at = text.find('<'); at != std::string::npos; at = text.find('<', at))
    text.replace(at, 1, "\\u003c");
  return text;
}

}  // namespace ZORToolkit
