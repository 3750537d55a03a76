#include "toolkit/review/Rules.h"

#include <algorithm>

#include "toolkit/records/Glob.h"
#include "toolkit/review/TomlFile.h"

namespace ZORToolkit {
namespace {

bool HoldsFor(const ReviewProduct& inProduct, const std::vector<std::string>& inProducts,
              const std::vector<std::string>& inParts) {
  if (!inParts.empty() && !MatchesAnyGlob(inParts, inProduct.part)) return false;
  if (inProducts.empty()) return true;
  for (const std::string_view name : {inProduct.id, inProduct.alias})
    if (MatchesAnyGlob(inProducts, name) || MatchesAnyGlob(inProducts, LastName(name))) return true;
  return false;
}

bool IsAmong(const std::vector<std::string>& inWords, std::string_view inWord) {
  return inWords.empty() || std::ranges::find(inWords, inWord) != inWords.end();
}

}  // namespace

bool InterferenceCondition::Holds(const ReviewedResult& inResult,
                                  const ReviewRecord& inRecord) const {
  if (!IsAmong(types, inRecord.type) || !IsAmong(statuses, inRecord.status)) return false;
  if (!rules.empty() && !MatchesAnyGlob(rules, inRecord.rule)) return false;
  if (minValue || maxValue) {
    const std::optional<double> value = inRecord.value.Value();
    if (minValue && !(value && *value >= *minValue)) return false;
    if (maxValue && !(value && *value <= *maxValue)) return false;
  }
  if (products.empty() && otherProducts.empty() && parts.empty() && otherParts.empty()) return true;
  static const ReviewProduct kNone;
  const auto product = [&](std::size_t inProduct) -> const ReviewProduct& {
    const int position = inRecord.products[inProduct];
    return position < 0 ? kNone : inResult.products[static_cast<std::size_t>(position)];
  };
  for (const std::size_t one : {0u, 1u})
    if (HoldsFor(product(one), products, parts) &&
        HoldsFor(product(1 - one), otherProducts, otherParts))
      return true;
  return false;
}

std::vector<AcceptanceRule> ReadRules(const std::string& inName, std::string_view inText) {
  TomlTable file = TomlTable::Parse(inName, inText);
  std::vector<AcceptanceRule> rules;
  file.ForEachTable("accept", [&](TomlTable& ioTable) {
    AcceptanceRule rule;
    rule.name = ioTable.RequiredText("name");
    rule.reason = ioTable.RequiredText("reason");
    if (const std::optional<std::string> status = ioTable.Text("set-status"))
      rule.status = ioTable.Word("set-status", *status, {"Relevant", "Irrelevant"});
    rule.condition = ioTable.Condition();
    rules.push_back(std::move(rule));
  });
  file.Finish();
  if (rules.empty()) throw Error(inName, "has no rule; a rule begins with [[accept]]");
  return rules;
}

RulesPlan PlanRules(const ReviewedResult& inResult, const std::vector<AcceptanceRule>& inRules) {
  RulesPlan plan;
  plan.outcomes.resize(inRules.size());
  for (const ReviewRecord& record : inResult.interferences) {
    const auto rule = std::ranges::find_if(inRules, [&](const AcceptanceRule& inRule) {
      return inRule.condition.Holds(inResult, record);
    });
    if (rule == inRules.end()) continue;
    RuleOutcome& outcome = plan.outcomes[static_cast<std::size_t>(rule - inRules.begin())];
    ++outcome.matched;
    if (record.status != "Not inspected") continue;
    ++outcome.settled;
    ReviewEdit edit;
    edit.position = record.index - 1;
    edit.status = rule->status;
    edit.comment = rule->reason;
    if (!record.comment.empty()) edit.comment = std::string(record.comment) + "\n" + rule->reason;
    plan.edits.push_back(std::move(edit));
  }
  return plan;
}

}  // namespace ZORToolkit
