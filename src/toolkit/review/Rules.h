// What is accepted by design.
#ifndef ZOR_TOOLKIT_REVIEW_RULES_H
#define ZOR_TOOLKIT_REVIEW_RULES_H

#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/Carry.h"

namespace ZORToolkit {

/// Conditions on an interference. An empty list, and an absent limit, always holds.
struct ZOR_TOOLKIT_EXPORT InterferenceCondition {
  /// Patterns: "*" stands for any text, "?" for one character. A product is met by its identifier,
  /// its alias, or the last name of one of them.
  std::vector<std::string> products, otherProducts;  ///< of one of the two, and of the other
  std::vector<std::string> parts, otherParts;        ///< likewise
  std::vector<std::string> types, statuses, rules;   ///< any of several; rules are patterns
  std::optional<double> minValue, maxValue;          ///< inclusive; needs a value

  bool Holds(const ReviewedResult& inResult, const ReviewRecord& inRecord) const;
};

struct AcceptanceRule {
  std::string name, reason;
  std::string status = "Irrelevant";
  InterferenceCondition condition;
};

/// Reads rules from TOML, whose keys samples/rules.toml explains. Raises Error with file, line and
/// column for what is no TOML, an unknown key or a value of another kind.
ZOR_TOOLKIT_EXPORT std::vector<AcceptanceRule> ReadRules(const std::string& inName,
                                                         std::string_view inText);

struct RuleOutcome {
  int matched = 0;  ///< interferences whose first matching rule it is
  int settled = 0;  ///< those of them that were not inspected
};

struct RulesPlan {
  std::vector<ReviewEdit> edits;
  std::vector<RuleOutcome> outcomes;  ///< of each rule
};

/// Settles what is not inspected by the first rule that holds; its reason becomes the comment, or
/// the last line of one that is there. Decisions stay as they are.
ZOR_TOOLKIT_EXPORT RulesPlan PlanRules(const ReviewedResult& inResult,
                                       const std::vector<AcceptanceRule>& inRules);

}  // namespace ZORToolkit

#endif
