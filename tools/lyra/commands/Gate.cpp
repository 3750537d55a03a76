// lyra rules RESULT --rules FILE -o OUT, lyra gate RESULT --policy FILE
#include "toolkit/review/Gate.h"

#include <cstdio>
#include <memory>

#include "foundation/AtomicFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

// rules

struct RulesOptions {
  std::string file, rules, output, language;
};

int Rules(const RulesOptions& inOptions, Output& ioOutput) {
  ChooseLanguage(inOptions.language);
  const std::vector<AcceptanceRule> rules =
      ReadRules(inOptions.rules, BytesOfInput(inOptions.rules));
  ReviewInput input(inOptions.file);
  const RulesPlan plan = PlanRules(input.result, rules);
  input.Apply(plan.edits);
  WriteReviewed(input, inOptions.output, ioOutput);
  Table table({{"Settled", TableColumn::Align::kRight},
               {"Matched", TableColumn::Align::kRight},
               {"Rule"},
               {""}});
  for (std::size_t i = 0; i < rules.size(); ++i) {
    const RuleOutcome& outcome = plan.outcomes[i];
    table.Add({std::to_string(outcome.settled), std::to_string(outcome.matched), rules[i].name,
               outcome.matched == 0 ? "matched nothing" : ""});
  }
  if (inOptions.output != "-") {
    table.Print(ioOutput);
    return 0;
  }
  Output errors(stderr);
  table.Print(errors);
  errors.Finish();
  return 0;
}

// gate

constexpr int kNothingJudged = 1, kFailed = 3;
constexpr const char* kReportWords[] = {"text", "junit", "sarif"};

struct GateOptions {
  std::string file, policy, baseline;
  std::vector<std::string> reports;
  CompareOptions compare;
};

struct WantedReport {
  std::string (*make)(const GateReport& inReport);
  std::string path;
};

std::vector<WantedReport> WantedReports(const std::vector<std::string>& inTexts) {
  constexpr std::string (*kMakers[])(const GateReport&) = {GateText, GateJUnit, GateSarif};
  std::vector<WantedReport> reports;
  for (const std::string& text : inTexts) {
    const std::size_t equals = text.find('=');
    const std::size_t maker = ChosenWord("--report", text.substr(0, equals), kReportWords);
    const std::string path = equals == std::string::npos ? "" : text.substr(equals + 1);
    if (path.empty()) throw UsageError("--report: a report is such as junit=FILE");
    reports.push_back({kMakers[maker], path});
  }
  return reports;
}

/// Texts of documents must not drive a terminal.
std::string PrintableLines(const std::string& inText) {
  std::string lines;
  for (std::size_t begin = 0; begin < inText.size();) {
    const std::size_t end = std::min(inText.find('\n', begin), inText.size());
    lines += Printable(inText.substr(begin, end - begin)) + "\n";
    begin = end + 1;
  }
  return lines;
}

int Gate(const GateOptions& inOptions, Output& ioOutput) {
  const std::vector<WantedReport> reports = WantedReports(inOptions.reports);
  const DiffOptions compare = inOptions.compare.Get();
  ChooseLanguage(inOptions.compare.language);
  const GatePolicy policy = ReadPolicy(inOptions.policy, BytesOfInput(inOptions.policy));
  if (policy.NeedsBaseline() && inOptions.baseline.empty())
    throw UsageError("gate: the policy compares with an older result: --baseline is missing");
  ClashDocument document(inOptions.file);
  const bool hasBaseline = !inOptions.baseline.empty();
  const ReviewedResult result = ReadForReview(document, {.geometries = hasBaseline});
  std::optional<ResultDiff> diff;
  if (hasBaseline) {
    ClashDocument older(inOptions.baseline);
    diff = Diff(ReadForReview(older, {.geometries = true}), result, compare);
  }
  const ResultDiff* const baseline = diff ? &*diff : nullptr;
  const GateOutcome outcome = Judge(policy, result, baseline);
  const GateReport report{policy, result, outcome, baseline, LYRA_VERSION};
  bool isPrinted = false;
  for (const WantedReport& wanted : reports) {
    if (wanted.path == "-")
      ioOutput.Write(wanted.make(report));
    else
      ZORFoundation::WriteWholeFile(wanted.path, wanted.make(report));
    isPrinted = isPrinted || wanted.path == "-";
  }
  if (!isPrinted) ioOutput.Write(PrintableLines(GateText(report)));
  return outcome.verdict == Verdict::kPassed   ? 0
         : outcome.verdict == Verdict::kFailed ? kFailed
                                               : kNothingJudged;
}

}  // namespace

VerbAction DeclareRules(Arguments& ioArguments) {
  const auto options = std::make_shared<RulesOptions>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  ioArguments.RequiredText("--rules", "FILE", options->rules,
                           "What is accepted by design, in TOML");
  ioArguments.RequiredText("-o,--output", "OUT", options->output,
                           "Where the result is written with what the rules settled");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Rules(*options, ioOutput); };
}

VerbAction DeclareGate(Arguments& ioArguments) {
  const auto options = std::make_shared<GateOptions>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  ioArguments.RequiredText("--policy", "FILE", options->policy, "The limits, in TOML");
  ioArguments.Text("--baseline", "OLD", options->baseline,
                   "An older result, for limits on what is new since");
  ioArguments.Texts("--report", "FORMAT=FILE", options->reports,
                    "Write a report as text, junit or sarif; may be given several times");
  options->compare.Declare(ioArguments);
  return [options](Output& ioOutput) { return Gate(*options, ioOutput); };
}

}  // namespace lyra
