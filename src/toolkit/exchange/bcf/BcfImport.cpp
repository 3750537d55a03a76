#include <algorithm>
#include <unordered_map>

#include "toolkit/exchange/ReviewImport.h"
#include "toolkit/exchange/bcf/BcfTopics.h"
#include "toolkit/exchange/sheets/SheetBase.h"
#include "toolkit/review/Match.h"

namespace ZORToolkit {
namespace {

std::string Lower(std::string inText) {
  std::ranges::transform(inText, inText.begin(), [](unsigned char inByte) {
    return inByte >= 'A' && inByte <= 'Z' ? static_cast<char>(inByte + 32)
                                          : static_cast<char>(inByte);
  });
  return inText;
}

bool HasLine(const std::string& inText, const std::string& inLine) {
  return Collapsed(inText).find(Collapsed(inLine)) != std::string::npos;
}

std::string Signed(const BcfComment& inComment) {
  const std::string& author =
      inComment.modifiedAuthor.empty() ? inComment.author : inComment.modifiedAuthor;
  const std::string& date =
      inComment.modifiedDate.empty() ? inComment.date : inComment.modifiedDate;
  std::string text = inComment.text;
  while (!text.empty() && (text.back() == '\n' || text.back() == ' ')) text.pop_back();
  if (author.empty() && date.empty()) return text;
  const std::string day = date.substr(0, 10);
  return text + " (" + author + (author.empty() || day.empty() ? "" : ", ") + day + ")";
}

/// What a topic says that it did not say when it was written.
struct TopicChange {
  std::optional<std::string> status;
  std::optional<std::string> editedComment;  // of a topic with one comment of ours
  std::vector<std::string> newLines;
  std::string who, when, assignee;
  std::vector<std::string> labels;

  bool IsEmpty() const { return !status && !editedComment && newLines.empty(); }
};

class BcfImporter {
 public:
  BcfImporter(const ReviewedResult& inResult, const GroupOptions& inGrouping)
      : result_(inResult), ids_(StableIds(inResult)), grouping_(inGrouping) {
    for (std::size_t i = 0; i < ids_.size(); ++i) positions_.emplace(ids_[i], i);
    review_.document = inResult.name;
  }

  ImportedReview Import(const BcfProject& inBcf, const ReviewedResult& inBase) {
    const std::vector<std::string> baseIds = StableIds(inBase);
    std::vector<PlannedTopic> planned = PlanTopics(inBase, baseIds, nullptr);
    for (PlannedTopic& group : PlanTopics(inBase, baseIds, &grouping_))
      planned.push_back(std::move(group));
    std::unordered_map<std::string, const PlannedTopic*> byGuid;
    for (const PlannedTopic& topic : planned) byGuid.emplace(topic.guid, &topic);
    for (const BcfTopic& topic : inBcf.topics) {
      const auto known = byGuid.find(Lower(topic.guid));
      if (known == byGuid.end()) {
        review_.notes.push_back("the topic \"" + topic.title +
                                "\" is of no interference of this result: " + topic.guid);
        continue;
      }
      ++review_.seen;
      const TopicChange change = ChangeOf(topic, *known->second);
      if (change.IsEmpty()) continue;
      for (const int member : known->second->members)
        Add(change, inBase.interferences[static_cast<std::size_t>(member)],
            baseIds[static_cast<std::size_t>(member)]);
    }
    for (auto& [number, entry] : entries_) review_.entries.push_back(std::move(entry));
    return std::move(review_);
  }

 private:
  TopicChange ChangeOf(const BcfTopic& inTopic, const PlannedTopic& inPlanned) {
    TopicChange change;
    if (!inTopic.status.empty()) {
      const std::optional<std::string> status = StatusCalled(inTopic.status);
      if (!status)
        review_.notes.push_back("the status \"" + inTopic.status + "\" of the topic \"" +
                                inTopic.title + "\" is none that we know");
      else if (*status != inPlanned.status)
        change.status = status;
    }
    for (const BcfComment& comment : inTopic.comments) ReadComment(comment, inPlanned, change);
    change.assignee = inTopic.assignedTo;
    if (!inTopic.assignedTo.empty()) change.newLines.push_back("Assigned to " + inTopic.assignedTo);
    std::string labels;
    for (const std::string& label : inTopic.labels) {
      if (std::ranges::find(inPlanned.labels, label) != inPlanned.labels.end()) continue;
      change.labels.push_back(label);
      labels.append(labels.empty() ? "Labels: " : ", ").append(label);
    }
    if (!labels.empty()) change.newLines.push_back(labels);
    if (!inTopic.modifiedAuthor.empty()) change.who = inTopic.modifiedAuthor;
    if (!inTopic.modifiedDate.empty()) change.when = inTopic.modifiedDate;
    return change;
  }

  static void ReadComment(const BcfComment& inComment, const PlannedTopic& inPlanned,
                          TopicChange& ioChange) {
    const std::string text = Collapsed(inComment.text);
    if (text.empty()) return;
    const auto ours =
        std::ranges::find(inPlanned.comments, Lower(inComment.guid), &PlannedComment::guid);
    if (ours != inPlanned.comments.end() && Collapsed(ours->text) == text) return;
    if (ours != inPlanned.comments.end() && inPlanned.members.size() == 1)
      ioChange.editedComment = inComment.text;
    else
      ioChange.newLines.push_back(Signed(inComment));
    ioChange.who = inComment.modifiedAuthor.empty() ? inComment.author : inComment.modifiedAuthor;
    ioChange.when = inComment.modifiedDate.empty() ? inComment.date : inComment.modifiedDate;
  }

  void Add(const TopicChange& inChange, const ReviewRecord& inBase, const std::string& inId) {
    const auto found = positions_.find(inId);
    const ReviewRecord* const record =
        found == positions_.end() ? nullptr : &result_.interferences[found->second];
    std::string comment(record == nullptr ? inBase.comment : record->comment);
    const std::string before = comment;
    if (inChange.editedComment && comment == inBase.comment)
      comment = *inChange.editedComment;
    else if (inChange.editedComment && !HasLine(comment, *inChange.editedComment))
      comment += "\n" + *inChange.editedComment;
    for (const std::string& line : inChange.newLines)
      if (!HasLine(comment, line)) comment.append(comment.empty() ? "" : "\n").append(line);
    if (!inChange.status && comment == before) return;
    ImportedEntry& entry = entries_[{record == nullptr ? 0 : record->index, inId}];
    entry.id = inId;
    entry.index = record == nullptr ? 0 : record->index;
    if (inChange.status) {
      entry.baseStatus = StatusCalled(std::string(inBase.status));
      entry.status = inChange.status;
    }
    if (comment != before) entry.comment = comment;
    entry.who = inChange.who;
    entry.when = inChange.when;
    entry.assignee = inChange.assignee;
    entry.labels = inChange.labels;
  }

  const ReviewedResult& result_;
  std::vector<std::string> ids_;
  const GroupOptions& grouping_;
  std::unordered_map<std::string, std::size_t> positions_;
  std::map<std::pair<int, std::string>, ImportedEntry> entries_;
  ImportedReview review_;
};

}  // namespace

ImportedReview ImportBcf(const ReviewedResult& inResult, const BcfProject& inBcf,
                         const GroupOptions& inGrouping) {
  BcfImporter importer(inResult, inGrouping);
  if (inBcf.attachedResult.empty()) return importer.Import(inBcf, inResult);
  ClashDocument attached(std::string("the attached result"), inBcf.attachedResult);
  return importer.Import(inBcf, ReadForReview(attached));
}

}  // namespace ZORToolkit
