// lyra detect MODEL -o RESULT
#include "toolkit/detection/Detect.h"

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cstdlib>
#include <memory>

#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/commands/Shares.h"
#include "lyra/terminal/Progress.h"
#include "toolkit/sharding/DetectionShare.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr const char* kSheetWords[] = {"clash", "contact", "ignore"};
constexpr long long kMaxJobs = 1024;

struct DetectOptions {
  std::string file, result, previous, tolerance = "0.01", contactGap = "0.00001", clearance = "0",
                                      sheets = "clash";
  std::optional<long long> level, jobs;
  std::vector<std::string> only, ignore, between;
  bool resume = false, viewpoints = false;
  ModelReading reading;
  ShareOptions sharing;
};

double LengthOf(const char* inOption, const std::string& inText) {
  double length = 0;
  const char* const end = inText.data() + inText.size();
  const auto [stop, error] = std::from_chars(inText.data(), end, length);
  if (error != std::errc() || stop != end)
    throw UsageError(std::string(inOption) + ": \"" + inText + "\" is no length in millimetres");
  return length;
}

DetectionOptions ToDetection(const DetectOptions& inOptions) {
  DetectionOptions options;
  options.tolerance = LengthOf("--tolerance", inOptions.tolerance);
  options.contactGap = LengthOf("--contact-gap", inOptions.contactGap);
  options.clearance = LengthOf("--clearance", inOptions.clearance);
  constexpr long long kMaxLevel = 1000000;
  if (inOptions.level)
    options.level = static_cast<int>(std::clamp<long long>(*inOptions.level, 0, kMaxLevel));
  if (inOptions.jobs && (*inOptions.jobs < 1 || *inOptions.jobs > kMaxJobs))
    throw UsageError("--jobs: must be 1 to " + std::to_string(kMaxJobs));
  options.threads = static_cast<unsigned>(inOptions.jobs.value_or(0));
  options.only = inOptions.only;
  options.ignore = inOptions.ignore;
  if (!inOptions.between.empty()) options.between = {inOptions.between[0], inOptions.between[1]};
  constexpr SheetsMean kMeanings[] = {SheetsMean::kClash, SheetsMean::kContact,
                                      SheetsMean::kNothing};
  options.sheets = kMeanings[ChosenWord("--sheets", inOptions.sheets, kSheetWords)];
  if (const std::string fault = FindFault(options); !fault.empty()) throw UsageError(fault);
  inOptions.reading.Check();
  const ZORDefault::ModelOptions reading = inOptions.reading.Options();
  options.maxSeconds = reading.maxSeconds;
  options.maxMemory = reading.maxMemory;
  options.isStrict = reading.isStrict;
  options.hasViewpoints = inOptions.viewpoints;
  return options;
}

/// @param inDetect what is found.
template <class Finding>
auto WithProgress(const DetectOptions& inOptions, DetectionOptions inDetection,
                  const Finding& inDetect) {
  const auto reading = std::make_unique<ProgressLine>("reading " + inOptions.file);
  ProgressLine checking("checking " + inOptions.file);
  std::optional<std::chrono::steady_clock::time_point> start;  // of the first verdict
  inDetection.readingProgress = [&](double done) { reading->Show(done); };
  inDetection.warn = [&](const std::string& warning) { checking.Warn(warning); };
  inDetection.progress = [&](std::size_t done, std::size_t all) {
    const auto now = std::chrono::steady_clock::now();
    const double seconds = std::chrono::duration<double>(now - start.value_or(now)).count();
    if (!start) start = now;
    checking.Show(static_cast<double>(done) / static_cast<double>(all),
                  RateText(done, all, seconds));
    return true;
  };
  return inDetect(inOptions.file, inDetection);
}

std::string Counted(std::size_t inCount, const char* inOne, const char* inMany) {
  return std::to_string(inCount) + ' ' + (inCount == 1 ? inOne : inMany);
}

std::string Summary(const DetectionResult& inResult) {
  std::size_t counts[3] = {};
  for (const DetectedInterference& found : inResult.interferences)
    ++counts[static_cast<std::size_t>(found.kind)];
  return Counted(counts[0], "clash", "clashes") + ", " + Counted(counts[1], "contact", "contacts") +
         ", " + Counted(counts[2], "clearance", "clearances") + " between " +
         Counted(inResult.productsChecked, "product", "products") + "\n";
}

/// @param inDetect what is found.
template <class Finding>
int FindAndWrite(const DetectOptions& inOptions, Output& ioOutput, const Finding& inDetect) {
  const DetectionOptions detection = ToDetection(inOptions);
  std::optional<ReviewInput> previous;
  if (!inOptions.previous.empty()) previous.emplace(inOptions.previous);
  { const OutputFile probe(inOptions.result); }  // fails at once where nothing can be written
  const DetectionResult result = WithProgress(inOptions, detection, inDetect);
  OutputFile file(inOptions.result);
  WriteClashResult(result, DateOfWriting(), file.Path());
  if (previous) file.Check(SettleAsBefore(*previous, file.Path()));
  file.Finish(ioOutput);
  if (inOptions.result != "-") ioOutput.Write(Summary(result));
  return 0;
}

/// The share that the options describe, with the files that it is made of.
ShareManifest ShareOf(const DetectOptions& inOptions, const Shard& inShard) {
  ShareManifest share = NewShare("detect", inOptions.result, inShard);
  share.inputs = {ShareInputOf("model", inOptions.file)};
  if (!inOptions.previous.empty())
    share.inputs.push_back(ShareInputOf("previous", inOptions.previous));
  share.options = {{"tolerance", inOptions.tolerance},
                   {"contact-gap", inOptions.contactGap},
                   {"clearance", inOptions.clearance},
                   {"sheets", inOptions.sheets},
                   {"level", inOptions.level ? std::to_string(*inOptions.level) : ""},
                   {"only", ListText(inOptions.only)},
                   {"ignore", ListText(inOptions.ignore)},
                   {"between", ListText(inOptions.between)},
                   {"viewpoints", inOptions.viewpoints ? "yes" : ""},
                   {"strict", inOptions.reading.isStrict ? "yes" : ""}};
  return share;
}

int Run(const DetectOptions& inOptions, Output& ioOutput) {
  const std::optional<Shard> shard = inOptions.sharing.Get();
  if (inOptions.resume && !shard) throw UsageError("--resume: only with --shard");
  if (inOptions.result.empty() && !inOptions.sharing.plan)
    throw UsageError("detect: -o is required");
  if (inOptions.file == "-") throw InputError("-: a model cannot be read from standard input");
  DetectionOptions detection = ToDetection(inOptions);
  if (inOptions.sharing.plan || shard) detection.hasViewpoints = false;  // who gathers adds them
  if (inOptions.sharing.plan)
    return PrintPlan("detect", WithProgress(inOptions, detection, SampleDetection),
                     inOptions.sharing, ioOutput);
  if (!shard) return FindAndWrite(inOptions, ioOutput, Detect);
  const ShareManifest share = ShareOf(inOptions, *shard);
  const auto find = [&](const std::string& inModel, const DetectionOptions& inDetection) {
    return DetectShare(inModel, inDetection, share, inOptions.resume);
  };
  ioOutput.Write(ShareLine(share, WithProgress(inOptions, detection, find)));
  return 0;
}

}  // namespace

int GatherDetect(const std::vector<ShareManifest>& inShares, const GatherOptions& inOptions,
                 Output& ioOutput) {
  const ShareManifest& share = inShares.front();
  DetectOptions options;
  options.file = InputOfShares(share, "model", inOptions.model);
  options.previous = InputOfShares(share, "previous");
  options.result = inOptions.output;
  options.tolerance = share.Option("tolerance");
  options.contactGap = share.Option("contact-gap");
  options.clearance = share.Option("clearance");
  options.sheets = share.Option("sheets");
  if (const std::string level = share.Option("level"); !level.empty())
    options.level = std::atoll(level.c_str());
  options.only = ListFrom(share.Option("only"));
  options.ignore = ListFrom(share.Option("ignore"));
  options.between = ListFrom(share.Option("between"));
  options.viewpoints = !share.Option("viewpoints").empty();
  options.jobs = inOptions.jobs;
  options.reading = inOptions.reading;
  options.reading.isStrict = !share.Option("strict").empty();
  return FindAndWrite(options, ioOutput,
                      [&](const std::string& inModel, const DetectionOptions& inDetection) {
                        return GatherDetection(inModel, inDetection, inShares);
                      });
}

VerbAction DeclareDetect(Arguments& ioArguments) {
  const auto options = std::make_shared<DetectOptions>();
  ioArguments.Positional("MODEL", options->file, "A STEP, IGES, glTF, OBJ or STL file");
  ioArguments.NonEmptyText("-o,--output", "RESULT", options->result, "The clash result to write");
  ioArguments.Text("--tolerance", "MM", options->tolerance,
                   "Products that enter each other deeper than this clash (default: 0.01)");
  ioArguments.Text("--contact-gap", "MM", options->contactGap,
                   "Products at most this far apart touch (default: 0.00001)");
  ioArguments.Text("--clearance", "MM", options->clearance,
                   "Products at most this far apart are too near (default: 0, which is off)");
  ioArguments.Number("--level", "N", options->level,
                     "Products N levels below the root count as one with all below them");
  ioArguments.Texts("--only", "PATTERN", options->only,
                    "Only products whose path or part name, or that of an assembly above, is like "
                    "this, with * and ?; may be given several times");
  ioArguments.Texts("--ignore", "PATTERN", options->ignore,
                    "No products that are like this; may be given several times");
  ioArguments.TwoTexts("--between", "PATTERN", options->between,
                       "Only products like the first against products like the second");
  ioArguments.Text("--sheets", "WORD", options->sheets,
                   "What a surface without an inside means that enters a solid: clash (default), "
                   "contact or ignore");
  ioArguments.Words("--sheets", kSheetWords);
  ioArguments.Flag(
      "--viewpoints", options->viewpoints,
      "Give each interference a viewpoint that shows both products, as its picture has it");
  ioArguments.Text("--previous", "RESULT", options->previous,
                   "An older result: what was decided there holds here too, as lyra carry does");
  ioArguments.Number("--jobs", "N", options->jobs,
                     "Threads to work with (default: one for each processor)");
  options->sharing.Declare(ioArguments);
  ioArguments.Flag("--resume", options->resume,
                   "Go on with a share that was ended early, or do nothing where it is whole");
  options->reading.Declare(ioArguments);
  return [options](Output& ioOutput) { return Run(*options, ioOutput); };
}

}  // namespace lyra
