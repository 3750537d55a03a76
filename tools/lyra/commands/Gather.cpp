// lyra gather DIR… -o OUT, and what the verbs have in common whose work can be shared.
#include <algorithm>
#include <cmath>
#include <filesystem>
#include <memory>

#include "foundation/NativePath.h"
#include "foundation/Process.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/Shares.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

double Rounded(double inNumber, double inStep) { return std::ceil(inNumber / inStep) * inStep; }

std::string DurationText(double inSeconds) {
  const auto seconds = static_cast<long long>(std::ceil(inSeconds));
  char text[32];
  std::snprintf(text, sizeof text, "%lld:%02lld:%02lld", seconds / 3600, seconds / 60 % 60,
                seconds % 60);
  return text;
}

std::string PlanJson(const char* inVerb, const Plan& inPlan, double inMegabytes) {
  OrderedJson json = JsonHeader("plan");
  json["verb"] = inVerb;
  json["items"] = inPlan.items;
  json["tried"] = inPlan.timed;
  json["openSeconds"] = Rounded(inPlan.openSeconds, 0.001);
  json["workSeconds"] = Rounded(inPlan.workSeconds, 0.001);
  json["megabytes"] = inMegabytes;
  json["shares"] = OrderedJson::array();
  for (std::size_t i = 0; i < inPlan.shares.size(); ++i)
    json["shares"].push_back({{"share", i + 1},
                              {"of", inPlan.shares.size()},
                              {"items", inPlan.shares[i].items},
                              {"seconds", Rounded(inPlan.shares[i].seconds, 0.001)},
                              {"megabytes", inMegabytes}});
  return JsonLine(json) + "\n";
}

int Gather(const GatherOptions& inOptions, Output& ioOutput) {
  inOptions.reading.Check();
  const std::vector<ShareManifest> shares = ReadAllShares(inOptions.folders);
  if (std::filesystem::exists(ZORFoundation::NativePath(inOptions.output) / kShareFile))
    throw InputError(inOptions.output + ": is a share itself");
  const std::string& verb = shares.front().verb;
  if (verb == "publish") return GatherPublish(shares, inOptions, ioOutput);
  if (verb == "detect") return GatherDetect(shares, inOptions, ioOutput);
  throw InputError(shares.front().folder + ": is a share of lyra " + verb +
                   ", which this version cannot gather");
}

}  // namespace

void ShareOptions::Declare(Arguments& ioArguments) {
  ioArguments.Text("--shard", "K/N", shard,
                   "Do share K of N alone, which -o gets as a folder for lyra gather");
  ioArguments.Flag("--plan", plan,
                   "Make nothing; say how long the shares will take and how much memory, from a "
                   "few that are tried");
  ioArguments.Number("--shares", "N", shares,
                     "How many --plan is for (default: as many as take ten minutes each)");
  ioArguments.Flag("--json", json, "Print the plan as one JSON document");
}

std::optional<Shard> ShareOptions::Get() const {
  if (json && !plan) throw UsageError("--json: only with --plan");
  if (shares && !plan) throw UsageError("--shares: only with --plan");
  if (shares && (*shares < 1 || *shares > kMaxShards))
    throw UsageError("--shares: 1 to " + std::to_string(kMaxShards));
  if (shard.empty()) return std::nullopt;
  const std::optional<Shard> read = ShardFrom(shard);
  if (!read)
    throw UsageError("--shard: \"" + shard +
                     "\" is no share; it is K/N, K from 1 to N, such as 2/8");
  return read;
}

int PrintPlan(const char* inVerb, const WorkSample& inSample, const ShareOptions& inOptions,
              Output& ioOutput) {
  const std::optional<Shard> shard = inOptions.Get();
  const auto count = inOptions.shares ? static_cast<std::uint32_t>(*inOptions.shares)
                     : shard          ? shard->count
                                      : 0;
  const Plan plan = PlanOf(inSample, count);
  // Twice what a share shows of it: its pictures are not those that were tried.
  const double megabytes = Rounded(2 * ZORFoundation::MegabytesUsed(), 64);
  if (inOptions.json) {
    ioOutput.Write(PlanJson(inVerb, plan, megabytes));
    return 0;
  }
  std::vector<TableColumn> columns;
  for (const char* const header : {"Share", "Items", "Time", "Memory [MB]"})
    columns.push_back({header, TableColumn::Align::kRight});
  Table table(columns);
  for (std::size_t i = 0; i < plan.shares.size(); ++i)
    table.Add({std::to_string(i + 1) + "/" + std::to_string(plan.shares.size()),
               std::to_string(plan.shares[i].items), DurationText(plan.shares[i].seconds),
               std::to_string(static_cast<long long>(megabytes))});
  table.Print(ioOutput);
  ioOutput.Write("On one core: " + DurationText(plan.openSeconds + plan.workSeconds) + " for " +
                 std::to_string(plan.items) + " items, of which " + std::to_string(plan.timed) +
                 " were tried; opening takes " + DurationText(plan.openSeconds) +
                 " of each share\n");
  return 0;
}

ShareManifest NewShare(const char* inVerb, const std::string& inFolder, const Shard& inShard) {
  ShareManifest manifest;
  manifest.folder = inFolder;
  manifest.verb = inVerb;
  manifest.version = LYRA_VERSION;
  manifest.shard = inShard;
  return manifest;
}

std::string ShareLine(const ShareManifest& inManifest, const ShareSize& inSize) {
  return inManifest.folder + ": share " + std::to_string(inManifest.shard.number) + "/" +
         std::to_string(inManifest.shard.count) + ", " + std::to_string(inSize.items) + " items" +
         (inSize.wasComplete ? ", was there already\n" : "\n");
}

std::string ListText(const std::vector<std::string>& inTexts) {
  return OrderedJson(inTexts).dump();
}

std::vector<std::string> ListFrom(const std::string& inText) {
  const OrderedJson json = OrderedJson::parse(inText, nullptr, false);
  std::vector<std::string> texts;
  for (const OrderedJson& text : json)
    if (text.is_string()) texts.push_back(text.get<std::string>());
  return texts;
}

std::string InputOfShares(const ShareManifest& inShare, const char* inRole,
                          const std::string& inPath) {
  const auto input = std::ranges::find(inShare.inputs, inRole, &ShareInput::role);
  if (input == inShare.inputs.end()) return {};
  const std::string path = inPath.empty() ? input->path : inPath;
  if (ShareInputOf(inRole, path).hash != input->hash)
    throw InputError(path + ": is not the " + inRole + " that the shares were made of");
  return path;
}

VerbAction DeclareGather(Arguments& ioArguments) {
  const auto options = std::make_shared<GatherOptions>();
  ioArguments.Positionals("DIR", options->folders, "All shares of one work, in any order");
  ioArguments.RequiredText("-o,--output", "OUT", options->output,
                           "What the shares are shares of: the folder or .html page of lyra "
                           "publish, or the result of lyra detect");
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
                           "Where the model is now (default: where it was for the first share)");
  ioArguments.NonEmptyText("--result", "RESULT", options->result,
                           "Where the result is now, likewise");
  ioArguments.Number("--jobs", "N", options->jobs,
                     "Processes that draw where the shares have pictures of another format");
  ioArguments.Flag("--resume", options->resume, "Keep the pictures of a run that was ended early");
  options->reading.Declare(ioArguments);
  return [options](Output& ioOutput) { return Gather(*options, ioOutput); };
}

}  // namespace lyra
