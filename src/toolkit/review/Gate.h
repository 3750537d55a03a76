// Whether a result may pass: limits, and reports for build servers.
#ifndef ZOR_TOOLKIT_REVIEW_GATE_H
#define ZOR_TOOLKIT_REVIEW_GATE_H

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/Rules.h"

namespace ZORToolkit {

struct GateLimit {
  std::string name;
  bool isWarning = false;  ///< exceeding it is reported and fails nothing
  int max = 0;             ///< so many interferences are allowed
  /// Without statuses all but irrelevant ones are counted.
  InterferenceCondition condition;
  /// Only interferences of these classes, "new", "persisting" or "changed" since the baseline.
  std::vector<std::string> classes;
};

struct ZOR_TOOLKIT_EXPORT GatePolicy {
  std::vector<GateLimit> limits;
  bool allowsNothingChecked = false;
  /// So many interferences of the baseline may not have been looked for again.
  std::optional<int> maxNotComparable;

  bool NeedsBaseline() const;
};

/// Reads a policy from TOML, whose keys samples/policy.toml explains. Raises Error with file, line
/// and column for what is no TOML, an unknown key or a value of another kind.
ZOR_TOOLKIT_EXPORT GatePolicy ReadPolicy(const std::string& inName, std::string_view inText);

struct LimitOutcome {
  std::vector<int> counted;     ///< positions in ReviewedResult::interferences
  std::vector<int> suppressed;  ///< irrelevant ones that would count otherwise
  bool isExceeded = false;
};

enum class Verdict { kPassed, kFailed, kNothingJudged };

struct GateOutcome {
  Verdict verdict = Verdict::kPassed;
  std::string reason;                ///< why nothing could be judged
  std::vector<LimitOutcome> limits;  ///< of each of the policy's
  std::optional<int> notComparable;  ///< where a baseline is given
};

/// @param inBaseline what became of the baseline's interferences; null without one, which a policy
///                   that needs one does not allow.
/// Nothing is judged where nothing was checked: the result has neither interferences nor a
/// specification.
ZOR_TOOLKIT_EXPORT GateOutcome Judge(const GatePolicy& inPolicy, const ReviewedResult& inResult,
                                     const ResultDiff* inBaseline);

/// What a report is made of.
struct GateReport {
  const GatePolicy& policy;
  const ReviewedResult& result;
  const GateOutcome& outcome;
  const ResultDiff* baseline = nullptr;
  std::string version;  ///< of the program that judges
};

/// For a person: a line for each limit, and for each interference that exceeds it.
ZOR_TOOLKIT_EXPORT std::string GateText(const GateReport& inReport);
/// JUnit XML as build servers read it: a test case for each limit.
ZOR_TOOLKIT_EXPORT std::string GateJUnit(const GateReport& inReport);
/// SARIF 2.1.0: a result for each interference that exceeds a limit, and for each irrelevant one a
/// suppressed result with its comment as justification. Fingerprints are the stable identifiers of
/// the interference and of its products.
ZOR_TOOLKIT_EXPORT std::string GateSarif(const GateReport& inReport);

}  // namespace ZORToolkit

#endif
