#include <nlohmann/json.hpp>

#include "toolkit/records/DocumentText.h"
#include "toolkit/review/Gate.h"

namespace ZORToolkit {
namespace {

using Json = nlohmann::ordered_json;

const ReviewRecord& RecordAt(const GateReport& inReport, int inPosition) {
  return inReport.result.interferences[static_cast<std::size_t>(inPosition)];
}

std::string ProductName(const GateReport& inReport, int inProduct) {
  if (inProduct < 0) return "(none)";
  return std::string(inReport.result.products[static_cast<std::size_t>(inProduct)].Name());
}

/// "3 Clash -1.5: bolt / plate".
std::string LineOf(const GateReport& inReport, int inPosition) {
  const ReviewRecord& record = RecordAt(inReport, inPosition);
  std::string line = std::to_string(record.index).append(1, ' ').append(record.type);
  if (!record.value.text.empty()) line.append(1, ' ').append(record.value.text);
  return line + ": " + ProductName(inReport, record.products[0]) + " / " +
         ProductName(inReport, record.products[1]);
}

std::string CountText(const GateReport& inReport, std::size_t inLimit) {
  const std::size_t count = inReport.outcome.limits[inLimit].counted.size();
  return std::to_string(count) + " found, at most " +
         std::to_string(inReport.policy.limits[inLimit].max) + " allowed";
}

std::string NotComparableText(const GateReport& inReport) {
  return std::to_string(*inReport.outcome.notComparable) + " found, at most " +
         std::to_string(*inReport.policy.maxNotComparable) + " allowed";
}

bool IsNotComparableExceeded(const GateReport& inReport) {
  return inReport.policy.maxNotComparable && inReport.outcome.notComparable &&
         *inReport.outcome.notComparable > *inReport.policy.maxNotComparable;
}

// JUnit

/// Markup escaped; what XML cannot carry becomes U+FFFD.
std::string Xml(const std::string& inText) {
  std::string escaped;
  for (const char byte : Utf8(FromUtf8(inText))) {
    switch (byte) {
      case '&':
        escaped += "&amp;";
        break;
      case '<':
        escaped += "&lt;";
        break;
      case '>':
        escaped += "&gt;";
        break;
      case '"':
        escaped += "&quot;";
        break;
      case '\n':
        escaped += "&#10;";
        break;
      case '\t':
        escaped += "&#9;";
        break;
      default:
        if (static_cast<unsigned char>(byte) < ' ')
          escaped += "\xEF\xBF\xBD";
        else
          escaped += byte;
    }
  }
  return escaped;
}

std::string CaseBegin(const std::string& inName) {
  return "    <testcase classname=\"lyra gate\" name=\"" + Xml(inName) + "\" time=\"0\"";
}

std::string CaseOf(const GateReport& inReport, std::size_t inLimit) {
  const GateLimit& limit = inReport.policy.limits[inLimit];
  const LimitOutcome& outcome = inReport.outcome.limits[inLimit];
  if (!outcome.isExceeded) return CaseBegin(limit.name) + "/>\n";
  std::string lines;
  for (const int position : outcome.counted) lines += Xml(LineOf(inReport, position)) + "\n";
  const std::string count = CountText(inReport, inLimit);
  const std::string body =
      limit.isWarning
          ? "      <system-out>warning: " + count + "\n" + lines + "</system-out>\n"
          : "      <failure message=\"" + count + "\" type=\"limit\">" + lines + "</failure>\n";
  return CaseBegin(limit.name) + ">\n" + body + "    </testcase>\n";
}

// SARIF

/// A path as the reference of a URI (RFC 3986).
std::string UriOf(const std::string& inPath) {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string uri;
  for (const char byte : inPath) {
    const bool isPlain = (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') ||
                         (byte >= '0' && byte <= '9') ||
                         std::string_view("-._~/").find(byte) != std::string_view::npos;
    if (isPlain) {
      uri += byte;
      continue;
    }
    const auto number = static_cast<unsigned char>(byte);
    uri += {'%', kDigits[number >> 4], kDigits[number & 15]};
  }
  return uri;
}

class SarifWriter {
 public:
  explicit SarifWriter(const GateReport& inReport)
      : report_(inReport), ids_(StableIds(inReport.result)) {
    states_.resize(ids_.size());
    if (report_.baseline == nullptr) return;
    for (const DiffEntry& entry : report_.baseline->entries) {
      if (entry.newPosition < 0) continue;
      const char* const state = entry.itsClass == DiffClass::kNew       ? "new"
                                : entry.itsClass == DiffClass::kChanged ? "updated"
                                                                        : "unchanged";
      states_[static_cast<std::size_t>(entry.newPosition)] = state;
    }
  }

  std::string Write() const {
    const bool isJudged = report_.outcome.verdict != Verdict::kNothingJudged;
    Json invocation = {{"executionSuccessful", isJudged}};
    Json notifications = Json::array();
    if (!isJudged) notifications.push_back(Notification(report_.outcome.reason));
    if (IsNotComparableExceeded(report_))
      notifications.push_back(
          Notification("not comparable with the baseline: " + NotComparableText(report_)));
    if (!notifications.empty()) invocation["toolExecutionNotifications"] = notifications;
    const Json driver = {{"name", "lyra"}, {"version", report_.version}, {"rules", Rules()}};
    const Json run = {{"tool", {{"driver", driver}}},
                      {"invocations", Json::array({invocation})},
                      {"artifacts", Json::array({{{"location", {{"uri", Uri()}}}}})},
                      {"columnKind", "utf16CodeUnits"},
                      {"results", Results()}};
    const Json sarif = {{"$schema", "https://json.schemastore.org/sarif-2.1.0.json"},
                        {"version", "2.1.0"},
                        {"runs", Json::array({run})}};
    return sarif.dump(1, ' ', false, Json::error_handler_t::replace) + "\n";
  }

 private:
  std::string Uri() const {
    return UriOf(report_.result.name == "-" ? "stdin" : report_.result.name);
  }

  static Json Notification(const std::string& inText) {
    return {{"level", "error"}, {"message", {{"text", inText}}}};
  }

  const char* LevelOf(std::size_t inLimit) const {
    return report_.policy.limits[inLimit].isWarning ? "warning" : "error";
  }

  Json Rules() const {
    Json rules = Json::array();
    for (std::size_t i = 0; i < report_.policy.limits.size(); ++i)
      rules.push_back({{"id", report_.policy.limits[i].name},
                       {"shortDescription", {{"text", report_.policy.limits[i].name}}},
                       {"defaultConfiguration", {{"level", LevelOf(i)}}}});
    return rules;
  }

  Json Results() const {
    Json results = Json::array();
    for (std::size_t i = 0; i < report_.outcome.limits.size(); ++i) {
      const LimitOutcome& outcome = report_.outcome.limits[i];
      if (outcome.isExceeded)
        for (const int position : outcome.counted) results.push_back(Result(i, position));
      for (const int position : outcome.suppressed) {
        Json result = Result(i, position);
        const std::string_view comment = RecordAt(report_, position).comment;
        result["suppressions"] = Json::array(
            {{{"kind", "external"},
              {"status", "accepted"},
              {"justification",
               comment.empty() ? std::string_view("reviewed as irrelevant") : comment}}});
        results.push_back(std::move(result));
      }
    }
    return results;
  }

  Json Result(std::size_t inLimit, int inPosition) const {
    const ReviewRecord& record = RecordAt(report_, inPosition);
    const auto position = static_cast<std::size_t>(inPosition);
    Json products = Json::array();
    for (const int product : record.products)
      if (product >= 0)
        products.push_back(
            {{"fullyQualifiedName", ProductName(report_, product)}, {"kind", "object"}});
    Json result = {
        {"ruleId", report_.policy.limits[inLimit].name},
        {"ruleIndex", inLimit},
        {"level", LevelOf(inLimit)},
        {"message", {{"text", LineOf(report_, inPosition)}}},
        {"locations",
         Json::array({{{"physicalLocation", {{"artifactLocation", {{"uri", Uri()}, {"index", 0}}}}},
                       {"logicalLocations", products}}})},
        {"partialFingerprints",
         {{"interference/v1", ids_[position]}, {"products/v1", PairId(report_.result, record)}}}};
    if (states_[position] != nullptr) result["baselineState"] = states_[position];
    result["properties"] = {{"index", record.index},
                            {"type", record.type},
                            {"value", record.value.text},
                            {"status", record.status},
                            {"rule", record.rule}};
    return result;
  }

  const GateReport& report_;
  std::vector<std::string> ids_;
  std::vector<const char*> states_;  // null without a baseline
};

}  // namespace

std::string GateText(const GateReport& inReport) {
  if (inReport.outcome.verdict == Verdict::kNothingJudged)
    return "FAILED  " + inReport.outcome.reason + "\n";
  std::string text;
  if (inReport.policy.maxNotComparable)
    text += std::string(IsNotComparableExceeded(inReport) ? "FAILED" : "passed") +
            "  not comparable with the baseline: " + NotComparableText(inReport) + "\n";
  for (std::size_t i = 0; i < inReport.policy.limits.size(); ++i) {
    const GateLimit& limit = inReport.policy.limits[i];
    const LimitOutcome& outcome = inReport.outcome.limits[i];
    const char* const word = !outcome.isExceeded ? "passed" : limit.isWarning ? "warned" : "FAILED";
    text += std::string(word) + "  " + limit.name + ": " + CountText(inReport, i);
    if (!outcome.suppressed.empty())
      text += " (" + std::to_string(outcome.suppressed.size()) + " irrelevant)";
    text += "\n";
    if (!outcome.isExceeded) continue;
    for (const int position : outcome.counted)
      text += "        " + LineOf(inReport, position) + "\n";
  }
  return text;
}

std::string GateJUnit(const GateReport& inReport) {
  std::string cases;
  int tests = 0, failures = 0, errors = 0;
  const bool isJudged = inReport.outcome.verdict != Verdict::kNothingJudged;
  if (!isJudged) {
    tests = errors = 1;
    cases += CaseBegin("something was checked") + ">\n      <error message=\"" +
             Xml(inReport.outcome.reason) + "\" type=\"nothing-judged\"/>\n    </testcase>\n";
  }
  if (isJudged && inReport.policy.maxNotComparable) {
    ++tests;
    const bool isExceeded = IsNotComparableExceeded(inReport);
    failures += isExceeded;
    cases += CaseBegin("not comparable with the baseline") +
             (isExceeded ? ">\n      <failure message=\"" + NotComparableText(inReport) +
                               "\" type=\"limit\"/>\n    </testcase>\n"
                         : "/>\n");
  }
  for (std::size_t i = 0; isJudged && i < inReport.policy.limits.size(); ++i) {
    ++tests;
    failures += inReport.outcome.limits[i].isExceeded && !inReport.policy.limits[i].isWarning;
    cases += CaseOf(inReport, i);
  }
  const std::string counts = " tests=\"" + std::to_string(tests) + "\" failures=\"" +
                             std::to_string(failures) + "\" errors=\"" + std::to_string(errors) +
                             "\" time=\"0\">\n";
  return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<testsuites name=\"lyra gate\"" + counts +
         "  <testsuite name=\"" + Xml(inReport.result.name) + "\"" + counts + cases +
         "  </testsuite>\n</testsuites>\n";
}

std::string GateSarif(const GateReport& inReport) { return SarifWriter(inReport).Write(); }

}  // namespace ZORToolkit
