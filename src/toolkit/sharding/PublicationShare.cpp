#include "toolkit/sharding/PublicationShare.h"

#include <algorithm>
#include <filesystem>
#include <set>
#include <sstream>
#include <utility>

#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/NativePath.h"
#include "foundation/Process.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/publishing/pictures/PictureDrawing.h"
#include "toolkit/publishing/pictures/SharedDrawing.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kCameras[] = "cameras.txt", kPictures[] = "pictures/";
constexpr char kNothing[] = "nothing to draw";
constexpr std::size_t kTriedPictures = 24, kNamesAtOnce = 1000;

std::string HashOfPlan(const std::vector<DrawingItem>& inItems) {
  ZORFoundation::Hash64 hash;
  for (const DrawingItem& item : inItems) {
    hash.Add(static_cast<std::uint64_t>(static_cast<std::int64_t>(item.number)));
    hash.Add(item.cost);
  }
  return ZORFoundation::HexText(hash.Get());
}

std::vector<std::uint64_t> CostsOf(const std::vector<DrawingItem>& inItems) {
  std::vector<std::uint64_t> costs;
  costs.reserve(inItems.size());
  for (const DrawingItem& item : inItems) costs.push_back(item.cost);
  return costs;
}

std::string EndingOf(const PublicationOptions& inOptions) {
  return inOptions.format == PictureFormat::kPng ? ".png" : ".jpg";
}

/// What the files of one item begin with: "pictures/interference_12".
std::string StemOf(const std::string& inName) {
  constexpr char kDigits[] = "0123456789";
  const std::size_t number = inName.find_first_of(kDigits);
  return number == std::string::npos ? inName
                                     : inName.substr(0, inName.find_first_not_of(kDigits, number));
}

/// Draws what is in one share, and lists it.
class DrawingOfShare : public SharedDrawing {
 public:
  explicit DrawingOfShare(ShareManifest& ioManifest) : manifest_(ioManifest) {}

  std::vector<std::size_t> Choose(const std::vector<DrawingItem>& inItems) override {
    manifest_.plan = HashOfPlan(inItems);
    const std::vector<std::uint32_t> shares = SharesOf(CostsOf(inItems), manifest_.shard.count);
    std::vector<std::size_t> chosen;
    for (std::size_t i = 0; i < inItems.size(); ++i)
      if (shares[i] == manifest_.shard.number - 1) {
        chosen.push_back(i);
        manifest_.held.push_back(inItems[i].number);
      }
    return chosen;
  }

  void Finish(const PictureStore& inStore) override {
    std::string cameras;
    for (const int number : manifest_.held) {
      for (const std::string& name : inStore.ThumbnailNames(number)) List(inStore, name);
      List(inStore, inStore.PictureName(number));
      for (std::size_t i = 0; i < 2; ++i) List(inStore, inStore.PreviewName(number, i));
      const auto camera =
          ZORFoundation::TryReadWholeFile(inStore.DrawingFolder() + "/" + CameraName(number));
      if (camera) cameras.append(CameraName(number)).append(" ").append(camera->bytes).append("\n");
    }
    ZORFoundation::WriteWholeFile(manifest_.folder + "/" + kCameras, cameras);
    manifest_.files.push_back(ShareEntryOf(manifest_.folder, kCameras));
  }

 private:
  void List(const PictureStore& inStore, const std::string& inName) {
    if (const std::string name = inStore.Reference(inName); !name.empty())
      manifest_.files.push_back(ShareEntryOf(manifest_.folder, name));
  }

  ShareManifest& manifest_;
};

/// Takes pictures and cameras from shares.
class DrawingFromShares : public SharedDrawing {
 public:
  DrawingFromShares(const std::vector<ShareManifest>& inShares, const PublicationOptions& inOptions)
      : shares_(inShares), options_(inOptions) {}

  std::vector<std::size_t> Choose(const std::vector<DrawingItem>& inItems) override {
    if (HashOfPlan(inItems) != shares_.front().plan)
      throw Error(shares_.front().folder + ": the shares were cut otherwise than here");
    hasPictures_ = shares_.front().Option("pictures") == EndingOf(options_);
    if (hasPictures_) return {};
    if (options_.warn)
      options_.warn("the shares have pictures of another format: all are drawn here");
    std::vector<std::size_t> all;
    for (std::size_t i = 0; i < inItems.size(); ++i) all.push_back(i);
    return all;
  }

  void Begin(const PictureStore& inStore) override {
    if (!hasPictures_) return;
    for (const ShareManifest& share : shares_) {
      TakePictures(share, inStore);
      TakeCameras(share, inStore);
    }
  }

  bool MakesPage() const override { return true; }

 private:
  static void TakePictures(const ShareManifest& inShare, const PictureStore& inStore) {
    std::vector<std::string> names;
    for (const ShareEntry& file : inShare.files) {
      if (!file.name.starts_with(kPictures)) continue;
      names.push_back(fs::path(file.name).filename().string());
      fs::copy_file(ZORFoundation::NativePath(inShare.folder) / file.name,
                    ZORFoundation::NativePath(inStore.DrawingFolder()) / names.back(),
                    fs::copy_options::overwrite_existing);
      if (names.size() < kNamesAtOnce) continue;
      inStore.TakeOver(names);
      names.clear();
    }
    inStore.TakeOver(names);
  }

  static void TakeCameras(const ShareManifest& inShare, const PictureStore& inStore) {
    ZORFoundation::AtomicFileOptions written;
    written.isSynchronised = false;
    std::istringstream lines(ZORFoundation::ReadWholeFile(inShare.folder + "/" + kCameras).bytes);
    for (std::string line; std::getline(lines, line);) {
      const std::size_t space = line.find(' ');
      const std::string name = line.substr(0, space);
      if (space == std::string::npos || name.find('/') != std::string::npos) continue;
      ZORFoundation::WriteWholeFile(inStore.DrawingFolder() + "/" + name, line.substr(space + 1),
                                    written);
    }
  }

  const std::vector<ShareManifest>& shares_;
  const PublicationOptions& options_;
  bool hasPictures_ = false;
};

/// Times some of the pictures, drawn one after another.
class DrawingOfSample : public SharedDrawing {
 public:
  std::vector<std::size_t> Choose(const std::vector<DrawingItem>& inItems) override {
    sample.costs = CostsOf(inItems);
    tried_ = ItemsToTry(sample.costs, kTriedPictures);
    return tried_;
  }
  void Begin(const PictureStore&) override {
    sample.openSeconds = ZORFoundation::ProcessorSeconds();
  }
  void Drawn(std::size_t inDone, double inSeconds) override {
    const double each = (inSeconds - std::exchange(seconds_, inSeconds)) /
                        static_cast<double>(std::max<std::size_t>(1, inDone - done_));
    for (; done_ < std::min(inDone, tried_.size()); ++done_)
      sample.timed.push_back({tried_[done_], each});
  }

  WorkSample sample;

 private:
  std::vector<std::size_t> tried_;
  std::size_t done_ = 0;
  double seconds_ = 0;
};

std::string SettingsText(const PublicationOptions& inOptions) {
  const ZoomOfOptions zoom(inOptions);
  return PictureSettings();
}

/// Removes what is damaged of a share. @return whether it is complete and whole.
bool IsWhole(const ShareManifest& inFound) {
  // Pictures of one interference are drawn together, the main one last.
  std::set<std::string> damaged;
  for (const std::string& name : DamagedFiles(inFound)) damaged.insert(StemOf(name));
  for (const ShareEntry& file : inFound.files)
    if (damaged.contains(StemOf(file.name)))
      fs::remove(ZORFoundation::NativePath(inFound.folder) / file.name);
  return inFound.isComplete && damaged.empty();
}

}  // namespace

ShareSize PublishShare(ClashDocument& ioResult, PublicationOptions inOptions,
                       ShareManifest inManifest,
                       const std::function<ZORIProduct_var()>& inOpenModel) {
  inManifest.options["pictures"] = EndingOf(inOptions);
  inManifest.options["settings"] = SettingsText(inOptions);
  if (inOptions.resume) {
    const auto found = FindShare(inManifest, inOptions.warn);
    if (found && IsWhole(*found)) return {found->held.size(), true};
    inOptions.resume = found.has_value();
  }
  fs::create_directories(ZORFoundation::NativePath(inManifest.folder));
  inManifest.plan = kNothing;
  WriteShare(inManifest);
  DrawingOfShare drawing(inManifest);
  inOptions.folder = inManifest.folder;
  inOptions.isOneFile = false;
  inOptions.sharing = &drawing;
  Publish(ioResult, inOptions, inOpenModel);
  inManifest.isComplete = true;
  WriteShare(inManifest);
  return {inManifest.held.size(), false};
}

Published GatherPublication(ClashDocument& ioResult, PublicationOptions inOptions,
                            const std::vector<ShareManifest>& inShares,
                            const std::function<ZORIProduct_var()>& inOpenModel) {
  if (inShares.front().Option("settings") != SettingsText(inOptions))
    throw Error(inShares.front().folder +
                ": the settings of pictures are other than where the shares were made");
  DrawingFromShares drawing(inShares, inOptions);
  inOptions.sharing = &drawing;
  return Publish(ioResult, inOptions, inOpenModel);
}

WorkSample SamplePublication(ClashDocument& ioResult, PublicationOptions inOptions,
                             const std::function<ZORIProduct_var()>& inOpenModel) {
  DrawingOfSample drawing;
  inOptions.folder.clear();
  inOptions.isOneFile = false;
  inOptions.processes = 1;
  inOptions.sharing = &drawing;
  Publish(ioResult, inOptions, inOpenModel);
  return drawing.sample;
}

}  // namespace ZORToolkit
