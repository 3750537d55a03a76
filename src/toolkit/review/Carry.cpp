#include "toolkit/review/Carry.h"

#include <unordered_map>

#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/review/LanguageWords.h"

namespace ZORToolkit {
namespace {

constexpr char kNotInspected[] = "Not inspected";

bool IsSettled(const ReviewRecord& inRecord) { return inRecord.status != kNotInspected; }
bool IsDecided(const ReviewRecord& inRecord) {
  return IsSettled(inRecord) || !inRecord.comment.empty();
}

const ReviewRecord& RecordAt(const ReviewedResult& inResult, int inPosition) {
  return inResult.interferences[static_cast<std::size_t>(inPosition)];
}

std::string WithLine(std::string_view inText, const std::string& inLine) {
  return inText.empty() ? inLine : std::string(inText) + "\n" + inLine;
}

/// "Reopened, was Relevant: value -2 -> -3.5".
std::string ReopenedLine(std::string_view inStatus, std::span<const Change> inChanges) {
  std::string line = std::string("Reopened, was ").append(inStatus);
  const char* separator = ": ";
  for (const Change& change : inChanges) {
    if (!change.isSubstantial) continue;
    line.append(separator).append(change.what).append(1, ' ').append(change.from);
    line.append(" -> ").append(change.to);
    separator = "; ";
  }
  return line;
}

class CarryPlanner {
 public:
  CarryPlanner(const ReviewedResult& inOld, const ReviewedResult& inNew, bool inKeepChanged)
      : old_(inOld), new_(inNew), keepChanged_(inKeepChanged) {}

  CarryPlan Plan(const ResultDiff& inDiff) {
    plan_.edits.reserve(new_.interferences.size());  // memory that is not used costs nothing
    for (const DiffEntry& entry : inDiff.entries) {
      if (entry.newPosition < 0) {
        plan_.left += IsDecided(RecordAt(old_, entry.oldPosition));
        continue;
      }
      ReviewEdit edit;
      edit.position = entry.newPosition;
      edit.retrieve = entry.oldPosition < 0 ? "New" : "Old";
      if (entry.oldPosition >= 0) Carry(entry, edit);
      const ReviewRecord& is = RecordAt(new_, entry.newPosition);
      if (edit.retrieve != is.retrieve || (edit.status && *edit.status != is.status) ||
          (edit.comment && *edit.comment != is.comment))
        plan_.edits.push_back(std::move(edit));
    }
    return std::move(plan_);
  }

 private:
  void Carry(const DiffEntry& inEntry, ReviewEdit& ioEdit) {
    const ReviewRecord& was = RecordAt(old_, inEntry.oldPosition);
    const ReviewRecord& is = RecordAt(new_, inEntry.newPosition);
    if (!IsDecided(was)) return;
    if (!was.comment.empty()) ioEdit.comment = std::string(was.comment);
    if (!IsSettled(was)) {
      ++plan_.carried;
    } else if (inEntry.IsReopened() && !keepChanged_) {
      ++plan_.reopened;
      ioEdit.status = kNotInspected;
      ioEdit.comment = WithLine(was.comment, ReopenedLine(was.status, inEntry.changes));
    } else {
      ++plan_.carried;
      ioEdit.status = std::string(was.status);
    }
    const bool isOtherStatus = ioEdit.status && IsSettled(is) && is.status != *ioEdit.status;
    const bool isOtherComment =
        ioEdit.comment && !is.comment.empty() && is.comment != *ioEdit.comment;
    plan_.replaced += isOtherStatus || isOtherComment;
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  bool keepChanged_;
  CarryPlan plan_;
};

class MergePlanner {
 public:
  MergePlanner(const ReviewedResult& inBase, const ReviewedResult& inMine,
               const ReviewedResult& inTheirs, Preference inPreference)
      : base_(inBase), mine_(inMine), theirs_(inTheirs), preference_(inPreference) {}

  MergePlan Plan() {
    const ResultMatch toBase = MatchResults(base_, mine_);
    const ResultMatch toTheirs = MatchResults(theirs_, mine_);
    for (std::size_t i = 0; i < mine_.interferences.size(); ++i) {
      const int theirs = toTheirs.interferencesOfNew[i].position;
      if (theirs < 0) continue;
      const int base = toBase.interferencesOfNew[i].position;
      Merge(static_cast<int>(i), base < 0 ? nullptr : &RecordAt(base_, base),
            RecordAt(theirs_, theirs));
    }
    for (std::size_t i = 0; i < theirs_.interferences.size(); ++i)
      plan_.missing +=
          toTheirs.interferencesOfOld[i].position < 0 && IsDecided(theirs_.interferences[i]);
    return std::move(plan_);
  }

 private:
  void Merge(int inPosition, const ReviewRecord* inBase, const ReviewRecord& inTheirs) {
    const ReviewRecord& mine = RecordAt(mine_, inPosition);
    ReviewEdit edit;
    edit.position = inPosition;
    edit.status =
        Merged(inPosition, "status", inBase ? inBase->status : std::string_view(kNotInspected),
               mine.status, inTheirs.status);
    edit.comment = Merged(inPosition, "comment", inBase ? inBase->comment : std::string_view(),
                          mine.comment, inTheirs.comment);
    if (edit.status || edit.comment) plan_.edits.push_back(std::move(edit));
  }

  /// @return theirs where it is to be taken.
  std::optional<std::string> Merged(int inPosition, const char* inWhat, std::string_view inBase,
                                    std::string_view inMine, std::string_view inTheirs) {
    if (inMine == inTheirs || inTheirs == inBase) return std::nullopt;
    if (inMine == inBase) return std::string(inTheirs);
    if (ids_.empty()) ids_ = StableIds(mine_);
    plan_.conflicts.push_back({inPosition, ids_[static_cast<std::size_t>(inPosition)], inWhat,
                               std::string(inBase), std::string(inMine), std::string(inTheirs)});
    if (preference_ == Preference::kTheirs) return std::string(inTheirs);
    return std::nullopt;
  }

  const ReviewedResult& base_;
  const ReviewedResult& mine_;
  const ReviewedResult& theirs_;
  Preference preference_;
  std::vector<std::string> ids_;
  MergePlan plan_;
};

}  // namespace

int ApplyReviewEdits(ClashDocument& ioDocument, const ReviewedResult& inResult,
                     std::span<const ReviewEdit> inEdits) {
  const DocumentLanguage language(inResult.words);
  ClashDocumentEdit edit(ioDocument);
  int count = 0;
  for (const ReviewEdit& wanted : inEdits) {
    const ReviewRecord& record = RecordAt(inResult, wanted.position);
    const bool hasStatus = wanted.status && *wanted.status != record.status;
    const bool hasComment = wanted.comment && *wanted.comment != record.comment;
    const bool hasRetrieve = wanted.retrieve && *wanted.retrieve != record.retrieve;
    if (!hasStatus && !hasComment && !hasRetrieve) continue;
    const ElementHandle element = inResult.ElementOf(record);
    if (hasStatus) edit.SetStatusAsWritten(element, language.Translate(*wanted.status));
    if (hasRetrieve)
      edit.SetRetrieveAsWritten(element, language.Translate(std::string(*wanted.retrieve)));
    if (hasComment) edit.SetComment(element, *wanted.comment);
    ++count;
  }
  return count;
}

CarryPlan PlanCarry(const ReviewedResult& inOld, const ReviewedResult& inNew,
                    const ResultDiff& inDiff, bool inKeepChanged) {
  return CarryPlanner(inOld, inNew, inKeepChanged).Plan(inDiff);
}

MergePlan PlanMerge(const ReviewedResult& inBase, const ReviewedResult& inMine,
                    const ReviewedResult& inTheirs, Preference inPreference) {
  return MergePlanner(inBase, inMine, inTheirs, inPreference).Plan();
}

ApplyPlan PlanApply(const ReviewedResult& inResult, const ReviewFile& inReview,
                    Preference inPreference) {
  std::unordered_map<std::string, int> positionOfId;
  const std::vector<std::string> ids = StableIds(inResult);
  for (std::size_t i = 0; i < ids.size(); ++i) positionOfId.emplace(ids[i], static_cast<int>(i));
  ApplyPlan plan;
  for (const ReviewEntry& entry : inReview.entries) {
    const auto found = positionOfId.find(entry.id);
    if (found == positionOfId.end()) {
      plan.unknown.push_back(entry);
      continue;
    }
    const ReviewRecord& record = RecordAt(inResult, found->second);
    ReviewEdit edit;
    edit.position = found->second;
    edit.comment = entry.comment;
    edit.status = entry.status;
    const bool isStale = entry.status && entry.baseStatus && *entry.baseStatus != record.status &&
                         *entry.status != record.status;
    if (isStale)
      plan.conflicts.push_back({found->second, entry.id, "status", *entry.baseStatus,
                                std::string(record.status), *entry.status});
    if (!isStale || inPreference == Preference::kTheirs) plan.edits.push_back(std::move(edit));
  }
  return plan;
}

}  // namespace ZORToolkit
