#include "toolkit/exchange/bcf/BcfPictures.h"

#include <fstream>

#include "PrintPictures.h"
#include "default_platform/SettingOverride.h"
#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "toolkit/publishing/pictures/DrawingWorkers.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

struct Releaser {
  void operator()(ZORBaseUnknown* inComponent) const { inComponent->Release(); }
};
struct Destroyer {
  void operator()(ZORRep* inRep) const { inRep->Destroy(); }
};

ZORFoundation::Vector3d Vector(const ZORMathVector& inVector) {
  return {inVector.x, inVector.y, inVector.z};
}

/// What a picture without a place frames: the first product that there is.
ZOR3DBoundingSphere SphereOfProducts(const ZORDefault::InterferenceScene& inScene) {
  for (const ZORIProduct_var& product : inScene.products) {
    const ZORI3DGeoVisu_var shown = product;
    const auto* const rep =
        shown.IsNull() ? nullptr : dynamic_cast<const ZOR3DRep*>(shown->GetRep());
    if (rep != nullptr) return rep->GetShowBoundingElement();
  }
  return {};
}

/// As PrintPictures frames an interference.
SnapshotCamera CameraOf(const ZORDefault::InterferenceScene& inScene, const PictureSize& inSize) {
  const std::unique_ptr<ZOR3DViewpoint, Releaser> view(new ZOR3DViewpoint);
  if (inScene.interference->FillViewpoint(view.get()) != 1) {
    const ZORI3DGeoVisu_var place = inScene.interference;
    const std::unique_ptr<ZORRep, Destroyer> made(place.IsNull() ? nullptr : place->GetRep());
    const auto* const rep = dynamic_cast<const ZOR3DRep*>(made.get());
    view->Reframe(static_cast<float>(inSize.width), static_cast<float>(inSize.height), 1, 1,
                  rep != nullptr ? rep->GetShowBoundingElement() : SphereOfProducts(inScene));
  }
  return {view->projection == ZOR3DViewpoint::kConic,
          Vector(view->origin),
          Vector(view->sight),
          Vector(view->up),
          view->focusDistance,
          view->viewAngle,
          view->viewHeight};
}

std::string Colour(const std::string& inColour, const char* inOther) {
  if (inColour.size() != 7) return inOther;
  std::string colour = inColour.substr(1);
  for (char& digit : colour)
    digit = static_cast<char>(std::toupper(static_cast<unsigned char>(digit)));
  return colour;
}

constexpr double kDefaultAspect = 756.0 / 506.0;

}  // namespace

std::optional<PictureSize> SizeOfPng(const std::string& inPath) {
  char begin[24] = {};
  std::ifstream file(ZORFoundation::NativePath(inPath), std::ios::binary);
  if (!file.read(begin, sizeof begin) || std::string_view(begin, 8) != "\x89PNG\r\n\x1a\n")
    return std::nullopt;
  const auto number = [&](std::size_t inFirst) {
    int value = 0;
    for (std::size_t i = 0; i < 4; ++i)
      value = value << 8 | static_cast<unsigned char>(begin[inFirst + i]);
    return value;
  };
  return PictureSize{number(16), number(20)};
}

/// Looks for the frame's header among the segments (ITU T.81, annex B).
std::optional<PictureSize> SizeOfPicture(const std::string& inPath) {
  if (const std::optional<PictureSize> size = SizeOfPng(inPath)) return size;
  std::ifstream file(ZORFoundation::NativePath(inPath), std::ios::binary);
  const auto byte = [&] { return static_cast<int>(static_cast<unsigned char>(file.get())); };
  const auto number = [&] {
    const int high = byte();
    return high << 8 | byte();
  };
  if (!file || number() != 0xFFD8) return std::nullopt;
  while (file && byte() == 0xFF) {
    const int marker = byte();
    const int length = number();
    const bool isFrame =
        marker >= 0xC0 && marker <= 0xCF && marker != 0xC4 && marker != 0xC8 && marker != 0xCC;
    if (isFrame) {
      byte();  // the precision
      const int height = number();
      return PictureSize{number(), height};
    }
    file.seekg(length - 2, std::ios::cur);
  }
  return std::nullopt;
}

std::string WhitePng() {
  static constexpr unsigned char kBytes[] = {
      0x89, 0x50, 0x4e, 0x47, 0x0d, 0x0a, 0x1a, 0x0a, 0x00, 0x00, 0x00, 0x0d, 0x49, 0x48,
      0x44, 0x52, 0x00, 0x00, 0x00, 0x01, 0x00, 0x00, 0x00, 0x01, 0x08, 0x00, 0x00, 0x00,
      0x00, 0x3a, 0x7e, 0x9b, 0x55, 0x00, 0x00, 0x00, 0x0a, 0x49, 0x44, 0x41, 0x54, 0x78,
      0x9c, 0x63, 0xf8, 0x0f, 0x00, 0x01, 0x01, 0x01, 0x00, 0xb1, 0x38, 0xf6, 0x14, 0x00,
      0x00, 0x00, 0x00, 0x49, 0x45, 0x4e, 0x44, 0xae, 0x42, 0x60, 0x82};
  return std::string(reinterpret_cast<const char*>(kBytes), sizeof kBytes);
}

SnapshotMaker::SnapshotMaker(const BcfOptions& inOptions, const std::string& inResultPath)
    : options_(inOptions), resultFolder_(ZORFoundation::NativePath(inResultPath).parent_path()) {}

std::string SnapshotMaker::PagePicture(int inNumber) const {
  for (const char* const ending : {".png", ".jpg"}) {
    const fs::path path = ZORFoundation::NativePath(options_.page) / "pictures" /
                          ("interference_" + std::to_string(inNumber) + ending);
    if (fs::exists(path)) return path.string();
  }
  return {};
}

std::string SnapshotMaker::ReadyPicture(const InterferenceRecord& inRecord, bool inHasModel) const {
  std::string path;
  if (!options_.page.empty())
    path = PagePicture(inRecord.index);
  else if (!inHasModel && !inRecord.picture.empty())
    path = (resultFolder_ / ZORFoundation::NativePath(inRecord.picture)).string();
  if (path.empty()) return {};
  const std::optional<PictureSize> size = SizeOfPicture(path);
  return size && size->width >= 1 && size->height >= 1 ? path : "";
}

std::vector<Snapshot> SnapshotMaker::Make(const std::vector<const InterferenceRecord*>& inRecords,
                                          const std::function<ZORIProduct_var()>& inOpenModel) {
  const bool hasModel = static_cast<bool>(inOpenModel);
  std::vector<Snapshot> snapshots(inRecords.size());
  std::vector<ResolvedInterference> resolved;
  std::vector<std::size_t> wanted;
  InterferenceScenes scenes(hasModel ? inOpenModel() : ZORIProduct_var());
  for (std::size_t i = 0; i < inRecords.size(); ++i) {
    ResolvedInterference shown = scenes.Resolve(*inRecords[i], ProductPlaces::kResult);
    Snapshot& snapshot = snapshots[i];
    snapshot.colours = {Colour(shown.products[0].colour, "46A0DC"),
                        Colour(shown.products[1].colour, "F0961E")};
    snapshot.picture = ReadyPicture(*inRecords[i], hasModel);
    snapshot.showsProducts = !snapshot.picture.empty() || shown.HasProduct();
    snapshot.aspectRatio = kDefaultAspect;
    if (snapshot.picture.empty()) {
      wanted.push_back(i);
      resolved.push_back(std::move(shown));
    } else {
      const PictureSize size = *SizeOfPicture(snapshot.picture);
      snapshot.aspectRatio = static_cast<double>(size.width) / size.height;
      snapshot.camera = CameraOf(MakeScene(shown), size);
    }
  }
  Draw(wanted, resolved, snapshots);
  return snapshots;
}

// Cameras are chosen where pictures are drawn, and come back beside them: choosing one takes as
// long as drawing.
void SnapshotMaker::Draw(const std::vector<std::size_t>& inWanted,
                         const std::vector<ResolvedInterference>& inResolved,
                         std::vector<Snapshot>& ioSnapshots) {
  if (inWanted.empty()) return;
  const ZORFoundation::ScratchFolder& folder = folder_.emplace();
  const ZORDefault::SettingOverride framesTheInterference("ClashPublish", "PictureZoom", 0);
  const auto pathOf = [&](std::size_t inIndex, const char* inEnding) {
    return ZORFoundation::NativePath(folder.Path() + "/" + std::to_string(inIndex) + inEnding);
  };
  DrawingWork work;
  work.count = inWanted.size();
  work.draw = [&](std::size_t inNumber) {
    const std::size_t i = inWanted[inNumber];
    const ZORDefault::InterferenceScene scene = MakeScene(inResolved[inNumber]);
    const SnapshotCamera camera = CameraOf(scene, options_.size);
    std::ofstream(pathOf(i, ".camera"), std::ios::binary)
        .write(reinterpret_cast<const char*>(&camera), sizeof camera);
    PrintPictures::PrintListVisuToFile(scene.products[0], "", scene.products[1], "",
                                       scene.interference, FromUtf8(pathOf(i, ".png").string()),
                                       "PNG", options_.size.width, options_.size.height, 1, 0);
  };
  work.isDone = [&](std::size_t inDone, double) {
    if (options_.drawn) options_.drawn(inDone, inWanted.size());
  };
  DrawInProcesses(options_.processes, work);
  for (const std::size_t i : inWanted) {
    Snapshot& snapshot = ioSnapshots[i];
    std::ifstream file(pathOf(i, ".camera"), std::ios::binary);
    if (!file.read(reinterpret_cast<char*>(&snapshot.camera), sizeof snapshot.camera))
      throw Error("a picture cannot be drawn");
    snapshot.aspectRatio = static_cast<double>(options_.size.width) / options_.size.height;
    snapshot.picture = pathOf(i, ".png").string();
    if (!SizeOfPng(snapshot.picture)) {
      snapshot.picture.clear();
      snapshot.showsProducts = false;
    }
  }
}

}  // namespace ZORToolkit
