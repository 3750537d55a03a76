#include "toolkit/review/Gate.h"

#include <algorithm>
#include <climits>
#include <cmath>

#include "toolkit/review/TomlFile.h"

namespace ZORToolkit {
namespace {

constexpr char kIrrelevant[] = "Irrelevant";

int CountIn(TomlTable& ioTable, const char* inKey, int inDefault) {
  const std::optional<double> number = ioTable.Number(inKey);
  if (!number) return inDefault;
  if (*number < 0 || *number > INT_MAX || *number != std::floor(*number))
    ioTable.Fail(inKey, "is no whole number from 0");
  return static_cast<int>(*number);
}

GateLimit LimitIn(TomlTable& ioTable) {
  GateLimit limit;
  limit.name = ioTable.RequiredText("name");
  limit.max = CountIn(ioTable, "max", 0);
  const std::string level = ioTable.Text("level").value_or("error");
  limit.isWarning = ioTable.Word("level", level, {"error", "warning"}) == "warning";
  limit.classes = ioTable.Words("class", {"new", "persisting", "changed"});
  limit.condition = ioTable.Condition();
  return limit;
}

/// Counts one limit over all interferences.
class LimitCounter {
 public:
  LimitCounter(const GateLimit& inLimit, const ReviewedResult& inResult)
      : limit_(inLimit), result_(inResult), suppressible_(inLimit.condition) {
    suppressible_.statuses = {kIrrelevant};
    countsIrrelevant_ = std::ranges::count(limit_.condition.statuses, kIrrelevant) > 0;
  }

  void Count(const ReviewRecord& inRecord, LimitOutcome& ioOutcome) const {
    const bool isIrrelevant = inRecord.status == kIrrelevant;
    const int position = inRecord.index - 1;
    if (isIrrelevant && !countsIrrelevant_) {
      if (suppressible_.Holds(result_, inRecord)) ioOutcome.suppressed.push_back(position);
    } else if (limit_.condition.Holds(result_, inRecord)) {
      ioOutcome.counted.push_back(position);
    }
  }

 private:
  const GateLimit& limit_;
  const ReviewedResult& result_;
  InterferenceCondition suppressible_;
  bool countsIrrelevant_ = false;
};

std::vector<const char*> ClassesOf(const ReviewedResult& inResult, const ResultDiff* inBaseline) {
  std::vector<const char*> classes(inResult.interferences.size(), "");
  if (inBaseline == nullptr) return classes;
  for (const DiffEntry& entry : inBaseline->entries)
    if (entry.newPosition >= 0)
      classes[static_cast<std::size_t>(entry.newPosition)] = Name(entry.itsClass);
  return classes;
}

}  // namespace

bool GatePolicy::NeedsBaseline() const {
  return maxNotComparable || std::ranges::any_of(limits, [](const GateLimit& inLimit) {
           return !inLimit.classes.empty();
         });
}

GatePolicy ReadPolicy(const std::string& inName, std::string_view inText) {
  TomlTable file = TomlTable::Parse(inName, inText);
  GatePolicy policy;
  policy.allowsNothingChecked = file.Flag("allow-nothing-checked").value_or(false);
  if (const int max = CountIn(file, "max-not-comparable", -1); max >= 0)
    policy.maxNotComparable = max;
  file.ForEachTable("limit",
                    [&](TomlTable& ioTable) { policy.limits.push_back(LimitIn(ioTable)); });
  file.Finish();
  if (policy.limits.empty()) throw Error(inName, "has no limit; a limit begins with [[limit]]");
  return policy;
}

GateOutcome Judge(const GatePolicy& inPolicy, const ReviewedResult& inResult,
                  const ResultDiff* inBaseline) {
  GateOutcome outcome;
  outcome.limits.resize(inPolicy.limits.size());
  const bool isChecked = !inResult.interferences.empty() || !inResult.specifications.empty();
  if (!isChecked && !inPolicy.allowsNothingChecked) {
    outcome.verdict = Verdict::kNothingJudged;
    outcome.reason =
        "nothing was checked: there are neither interferences nor a specification of what to check";
    return outcome;
  }
  if (inBaseline == nullptr && inPolicy.NeedsBaseline()) {
    outcome.verdict = Verdict::kNothingJudged;
    outcome.reason = "the policy compares with a baseline, and there is none";
    return outcome;
  }
  if (inBaseline != nullptr) outcome.notComparable = inBaseline->Count(DiffClass::kNotComparable);
  const std::vector<const char*> classes = ClassesOf(inResult, inBaseline);
  bool fails = inPolicy.maxNotComparable && *outcome.notComparable > *inPolicy.maxNotComparable;
  for (std::size_t i = 0; i < inPolicy.limits.size(); ++i) {
    const GateLimit& limit = inPolicy.limits[i];
    const LimitCounter counter(limit, inResult);
    LimitOutcome& counts = outcome.limits[i];
    for (std::size_t k = 0; k < classes.size(); ++k)
      if (limit.classes.empty() || std::ranges::count(limit.classes, classes[k]) > 0)
        counter.Count(inResult.interferences[k], counts);
    counts.isExceeded = counts.counted.size() > static_cast<std::size_t>(limit.max);
    fails = fails || (counts.isExceeded && !limit.isWarning);
  }
  if (fails) outcome.verdict = Verdict::kFailed;
  return outcome;
}

}  // namespace ZORToolkit
