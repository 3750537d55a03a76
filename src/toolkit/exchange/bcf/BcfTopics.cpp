#include "toolkit/exchange/bcf/BcfTopics.h"

#include <algorithm>
#include <cctype>
#include <set>

#include "toolkit/exchange/ExchangeLibrary.h"

namespace ZORToolkit {
namespace {

// Made once at random.
constexpr Uuid kNamespace = {0x6c, 0x79, 0x72, 0x61, 0x8d, 0x1f, 0x4b, 0x52,
                             0x9a, 0x37, 0x5e, 0xc0, 0x44, 0x71, 0x2b, 0xe6};

Uuid UuidNamed(const std::string& inName) {
  static const auto name = FindExchangeFunction<NameUuidFunction>(kNameUuidName);
  Uuid uuid;
  name(kNamespace, inName, uuid);
  return uuid;
}

constexpr char kIfcDigits[] = "0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz_$";
constexpr std::size_t kIfcLength = 22;

bool IsIfcGuid(const std::string& inText) {
  return inText.size() == kIfcLength && inText[0] >= '0' && inText[0] <= '3' &&
         inText.find_first_not_of(kIfcDigits) == std::string::npos;
}

std::string StatusOf(const ReviewRecord& inRecord) {
  const bool isDecided = inRecord.status == "Relevant" || inRecord.status == "Irrelevant";
  return std::string(isDecided ? inRecord.status : "Not inspected");
}

class TopicPlanner {
 public:
  TopicPlanner(const ReviewedResult& inResult, const std::vector<std::string>& inIds)
      : result_(inResult), ids_(inIds) {}

  PlannedTopic OfInterference(int inPosition) const {
    PlannedTopic topic;
    topic.id = ids_[static_cast<std::size_t>(inPosition)];
    topic.guid = GuidNamed("topic " + topic.id);
    topic.members = {inPosition};
    topic.representative = inPosition;
    Describe(topic);
    return topic;
  }

  PlannedTopic OfGroup(const InterferenceGroup& inGroup) const {
    PlannedTopic topic;
    topic.id = inGroup.Id();
    topic.guid = GuidNamed("group " + topic.id);
    topic.groupLabel = inGroup.Label();
    topic.members.assign(inGroup.Members().begin(), inGroup.Members().end());
    topic.representative = inGroup.Representative();
    Describe(topic);
    return topic;
  }

 private:
  const ReviewRecord& Record(int inPosition) const {
    return result_.interferences[static_cast<std::size_t>(inPosition)];
  }

  void Describe(PlannedTopic& ioTopic) const {
    std::set<std::string> statuses, labels, texts;
    for (const int member : ioTopic.members) {
      const ReviewRecord& record = Record(member);
      statuses.insert(StatusOf(record));
      if (!record.rule.empty()) labels.emplace(record.rule);
      if (record.comment.empty() || !texts.emplace(record.comment).second) continue;
      const bool isFirst = ioTopic.comments.empty();
      ioTopic.comments.push_back(
          {GuidNamed("comment " + ioTopic.id +
                     (isFirst ? "" : " " + ids_[static_cast<std::size_t>(member)])),
           std::string(record.comment)});
    }
    ioTopic.hasOneStatus = statuses.size() == 1;
    ioTopic.status = ioTopic.hasOneStatus ? *statuses.begin() : "Not inspected";
    ioTopic.labels.assign(labels.begin(), labels.end());
  }

  const ReviewedResult& result_;
  const std::vector<std::string>& ids_;
};

}  // namespace

std::string GuidNamed(const std::string& inName) {
  constexpr char kDigits[] = "0123456789abcdef";
  const Uuid uuid = UuidNamed(inName);
  std::string text;
  for (std::size_t i = 0; i < uuid.size(); ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += '-';
    text += kDigits[uuid[i] >> 4];
    text += kDigits[uuid[i] & 15];
  }
  return text;
}

// The 128 bits in digits of base 64, the first of which has two bits (buildingSMART, "IFC GUID").
std::string IfcGuidOf(const std::string& inProductId) {
  if (IsIfcGuid(inProductId)) return inProductId;
  const Uuid uuid = UuidNamed("product " + inProductId);
  std::string text(kIfcLength, '0');
  unsigned int bits = 0, count = 0;
  std::size_t digit = kIfcLength;
  for (std::size_t i = uuid.size(); i-- > 0;) {
    bits |= static_cast<unsigned int>(uuid[i]) << count;
    for (count += 8; count >= 6 || (i == 0 && digit > 0); count -= std::min(count, 6U)) {
      text[--digit] = kIfcDigits[bits & 63];
      bits >>= 6;
    }
  }
  return text;
}

std::vector<PlannedTopic> PlanTopics(const ReviewedResult& inResult,
                                     const std::vector<std::string>& inIds,
                                     const GroupOptions* inGrouping) {
  const TopicPlanner planner(inResult, inIds);
  std::vector<PlannedTopic> topics;
  if (inGrouping != nullptr) {
    for (const InterferenceGroup group : GroupInterferences(inResult, *inGrouping))
      topics.push_back(planner.OfGroup(group));
    return topics;
  }
  for (std::size_t i = 0; i < inResult.interferences.size(); ++i)
    topics.push_back(planner.OfInterference(static_cast<int>(i)));
  return topics;
}

}  // namespace ZORToolkit
