#include "toolkit/sharding/DetectionShare.h"

#include <filesystem>
#include <utility>

#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/TerminationSignals.h"
#include "toolkit/Error.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kFindings[] = "findings.bin";
constexpr std::size_t kTriedPairs = 24;

std::string HashOfPlan(const DetectionResult& inResult) {
  ZORFoundation::Hash64 hash;
  hash.Add(std::uint64_t{inResult.pairsNear});
  for (const std::uint64_t cost : inResult.work.costs) hash.Add(cost);
  return ZORFoundation::HexText(hash.Get());
}

std::string FindingsOf(const ShareManifest& inShare) {
  return ZORFoundation::ReadWholeFile(inShare.folder + "/" + kFindings).bytes;
}

/// A signal also ends the programs behind a detection, where it goes to a whole group of processes.
DetectionResult DetectUntilStopped(const std::string& inModel, const DetectionOptions& inOptions,
                                   const ZORFoundation::StopRequest& inStop) {
  try {
    return Detect(inModel, inOptions);
  } catch (const Error&) {
    inStop.Check();
    throw;
  }
}

}  // namespace

ShareSize DetectShare(const std::string& inModel, DetectionOptions inOptions,
                      ShareManifest inManifest, bool inResumes) {
  const auto found = inResumes ? FindShare(inManifest) : std::nullopt;
  if (found && !found->files.empty() && DamagedFiles(*found).empty()) {
    if (found->isComplete) return {found->held.size(), true};
    inOptions.known = {FindingsOf(*found)};
  }
  fs::create_directories(inManifest.folder);
  if (inOptions.known.empty()) WriteShare(inManifest);
  const ZORFoundation::StopRequest stop;
  const auto progress = inOptions.progress;
  inOptions.shard = inManifest.shard;
  inOptions.progress = [&](std::size_t inDone, std::size_t inAll) {
    return (!progress || progress(inDone, inAll)) && !stop.IsMade();
  };
  const DetectionResult result = DetectUntilStopped(inModel, inOptions, stop);
  inManifest.plan = HashOfPlan(result);
  inManifest.isComplete = !result.isStopped;
  inManifest.held = result.judged;
  ZORFoundation::WriteWholeFile(inManifest.folder + "/" + kFindings, result.findings);
  inManifest.files = {ShareEntryOf(inManifest.folder, kFindings)};
  WriteShare(inManifest);
  if (result.isStopped) stop.Check();
  return {inManifest.held.size(), false};
}

DetectionResult GatherDetection(const std::string& inModel, DetectionOptions inOptions,
                                const std::vector<ShareManifest>& inShares) {
  for (const ShareManifest& share : inShares) inOptions.known.push_back(FindingsOf(share));
  return Detect(inModel, inOptions);
}

WorkSample SampleDetection(const std::string& inModel, DetectionOptions inOptions) {
  inOptions.tried = kTriedPairs;
  return Detect(inModel, inOptions).work;
}

}  // namespace ZORToolkit
