#include "toolkit/sharding/DetectionShare.h"

#include <algorithm>
#include <filesystem>
#include <utility>

#include "foundation/AtomicFile.h"
#include "foundation/Descriptor.h"
#include "foundation/Hash.h"
#include "foundation/NativePath.h"
#include "foundation/Process.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/TerminationSignals.h"
#include "toolkit/Error.h"
#include "toolkit/detection/DetectionTask.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kFindings[] = "findings.bin", kCheckpoint[] = "findings.part";
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

/// The file to which verdicts are appended as they are found, for a share that is killed. Its first
/// line says of which share of which work; that of any other is not looked at.
class Checkpoint {
 public:
  explicit Checkpoint(const ShareManifest& inManifest)
      : path_(inManifest.folder + "/" + kCheckpoint), title_(TitleOf(inManifest)) {}

  /// What is whole of a run that was killed, and not yet known.
  std::optional<ZORDetection::Findings> Read(const std::vector<int>& inKnown) {
    const auto file = ZORFoundation::TryReadWholeFile(path_);
    if (!file || !file->bytes.starts_with(title_)) return std::nullopt;
    ZORDetection::KeptFindings kept =
        ZORDetection::DecodeRecords(std::string_view(file->bytes).substr(title_.size()));
    const auto isKnown = [&](std::uint32_t inVerdict) {
      return std::ranges::find(inKnown, static_cast<int>(inVerdict)) != inKnown.end();
    };
    // Left where a run was killed after it had written all its findings.
    if (kept.findings.judged.empty() || isKnown(kept.findings.judged.front())) return std::nullopt;
    size_ = title_.size() + kept.size;
    return std::move(kept.findings);
  }

  /// Goes on behind what was read; without any, from the start.
  int Open() {
    file_ = ZORFoundation::OpenCut(path_, size_);
    std::size_t written = 0;
    const int error = size_ > 0 ? 0 : ZORFoundation::WriteAll(file_.Get(), title_, written);
    if (error != 0) throw ZORFoundation::FileError(path_, error);
    return file_.Get();
  }

  void Remove() const { fs::remove(ZORFoundation::NativePath(path_)); }

 private:
  static std::string TitleOf(const ShareManifest& inManifest) {
    ZORFoundation::Hash128 hash;
    hash.AddText(inManifest.version);
    hash.Add(std::uint64_t{inManifest.shard.number});
    hash.Add(std::uint64_t{inManifest.shard.count});
    for (const ShareInput& input : inManifest.inputs) {
      hash.AddText(input.role);
      hash.AddText(input.hash);
    }
    for (const auto& [name, value] : inManifest.options) {
      hash.AddText(name);
      hash.AddText(value);
    }
    return "zorlyra-findings/1 " + ZORFoundation::HexText(hash.Get()) + "\n";
  }

  std::string path_, title_;
  std::size_t size_ = 0;
  ZORFoundation::Descriptor file_;
};

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
  const auto found = inResumes ? FindShare(inManifest, inOptions.warn) : std::nullopt;
  std::vector<int> known;
  if (found && !found->files.empty() && DamagedFiles(*found).empty()) {
    if (found->isComplete) return {found->held.size(), true};
    inOptions.known = {FindingsOf(*found)};
    known = found->held;
  }
  fs::create_directories(ZORFoundation::NativePath(inManifest.folder));
  if (inOptions.known.empty()) WriteShare(inManifest);
  Checkpoint checkpoint(inManifest);
  if (const auto kept = inResumes ? checkpoint.Read(known) : std::nullopt)
    inOptions.known.push_back(Encode(*kept));
  inOptions.kept = checkpoint.Open();
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
  checkpoint.Remove();
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
  WorkSample sample = Detect(inModel, inOptions).work;
  sample.openSeconds += ZORFoundation::ProcessorSeconds();
  return sample;
}

}  // namespace ZORToolkit
