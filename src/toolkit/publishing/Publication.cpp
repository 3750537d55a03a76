#include "toolkit/publishing/Publication.h"

#include <algorithm>
#include <filesystem>
#include <numeric>
#include <set>
#include <utility>

#include "PrintPictures.h"
#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/TemporaryFile.h"
#include "foundation/Vector3.h"
#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "toolkit/publishing/OneFile.h"
#include "toolkit/publishing/folder/Manifest.h"
#include "toolkit/publishing/folder/PublishedFiles.h"
#include "toolkit/publishing/folder/WorkFolder.h"
#include "toolkit/publishing/page/PageData.h"
#include "toolkit/publishing/page/PageLibrary.h"
#include "toolkit/publishing/page/PublishedComparison.h"
#include "toolkit/publishing/page/ReferredPictures.h"
#include "toolkit/publishing/pictures/Deviations.h"
#include "toolkit/publishing/pictures/DrawingWorkers.h"
#include "toolkit/publishing/pictures/PictureCamera.h"
#include "toolkit/publishing/pictures/PictureDrawing.h"
#include "toolkit/publishing/pictures/PictureStore.h"
#include "toolkit/publishing/pictures/SharedDrawing.h"
#include "toolkit/publishing/viewer/GeometryFiles.h"
#include "toolkit/publishing/viewer/ViewerScene.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/review/Carry.h"
#include "toolkit/review/Match.h"

namespace fs = std::filesystem;
using ZORFoundation::NativePath;

namespace ZORToolkit {
namespace {

constexpr int kOverviewNumber = 0;  // its number among the pictures

class Publication {
 public:
  /// @param inFolder where the files are made.
  Publication(ClashDocument& ioResult, const PublicationOptions& inOptions,
              const std::string& inFolder)
      : result_(ioResult),
        options_(inOptions),
        folder_(inFolder),
        styleSheet_(inOptions),
        zoom_(inOptions),
        review_(ReadForReview(ioResult)),
        ids_(StableIds(review_)),
        isShown_(ids_.size()),
        pictures_(inOptions.isOneFile, inOptions.isCompact) {
    ZORFoundation::Hash64 hash;
    ForEachInterference(ioResult, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      hash.Add(HashOf(inRecord));
      const bool isShown = inOptions.filter.Accepts(inRecord);
      isShown_.at(static_cast<std::size_t>(inRecord.index - 1)) = isShown;
      if (isShown)
        records_.push_back(inRecord);
      else
        others_.push_back(inRecord.element);
    });
    hash_ = hash.Get();
    for (const InterferenceRecord& record : records_) {
      published_.interferences.push_back(PublishedOf(record));
      published_.interferences.back().id = ids_[static_cast<std::size_t>(record.index - 1)];
    }
    if (inOptions.baseline != nullptr)
      before_ = CompareWithBaseline(inOptions, review_, published_);
  }

  Published Make(const std::function<ZORIProduct_var()>& inOpenModel) {
    const WorkFolder work(NativePath(folder_));
    if (!options_.isOneFile && MakesPage()) RequireOwnFiles(options_, styleSheet_);
    Published made;
    if (!options_.model.empty()) made.failures = Draw(inOpenModel());
    if (!MakesPage()) return {folder_, published_.interferences.size(), 0, 0};
    published_.data = JsonOf(Data(), review_, isShown_);
    EditResult();
    const std::string manifest = ManifestText();
    const std::string page = MakePageOf(options_, styleSheet_, result_, published_);
    fs::path path = NativePath(options_.folder);
    if (options_.isOneFile) {
      WriteOneFile(page, manifest);
    } else {
      path /= kPageFile;
      WriteGeometry(geometry_, folder_, work.Path());
      WritePublishedFiles(options_, styleSheet_, result_, WithManifest(page, manifest), manifest,
                          work.Path());
    }
    made.page = Utf8(FromUtf8(path.string()));
    made.interferences = published_.interferences.size();
    for (const PublishedInterference& each : published_.interferences)
      made.pictures += each.picture.empty() ? 0 : 1;
    return made;
  }

 private:
  bool MakesPage() const { return options_.sharing == nullptr || options_.sharing->MakesPage(); }

  PageData Data() const {
    PageData data;
    data.document = options_.sourceName;
    data.isOneFile = options_.isOneFile;
    data.hasGeometry = !geometry_.empty();
    if (options_.source.empty()) return data;
    data.hash = DocumentHash(options_.source);
    data.sha256 = HashedBytes({}, options_.source).sha256;
    return data;
  }

  std::string ManifestText() const {
    Manifest manifest = ManifestOf(options_, PictureSettings());
    manifest.files = pictures_.Files();
    for (const PageBlock& block : geometry_)
      manifest.files.push_back(options_.isOneFile
                                   ? HashedBytes(block.name, block.bytes)
                                   : HashedBytes(GeometryPath(block), GeometryScript(block)));
    return JsonOf(manifest);
  }

  /// A page by somebody else's style sheet may be no HTML, and then holds none.
  std::string WithManifest(const std::string& inPage, const std::string& inManifest) const {
    if (!styleSheet_.path.empty() && inPage.find("</body>") == std::string::npos) return inPage;
    return PageWithBlocks(styleSheet_.path, inPage, {}, {}, inManifest);
  }

  void WriteOneFile(const std::string& inPage, const std::string& inManifest) const {
    std::vector<PageBlock> blocks;
    if (!options_.source.empty()) blocks.push_back({kSourceBlock, options_.source});
    blocks.insert(blocks.end(), geometry_.begin(), geometry_.end());
    ZORFoundation::WriteWholeFile(
        options_.folder,
        PageWithBlocks(styleSheet_.path, inPage, pictures_.Pictures(), blocks, inManifest));
  }

  /// What the pictures are made from.
  std::string Stamp() const {
    const auto time = fs::last_write_time(NativePath(options_.model)).time_since_epoch().count();
    return "result " + ZORFoundation::HexText(hash_) + "\nmodel " +
           fs::canonical(NativePath(options_.model)).string() + " " +
           std::to_string(fs::file_size(NativePath(options_.model))) + " " + std::to_string(time) +
           "\npictures " + FormatName(options_.format) + " " + std::to_string(options_.size.width) +
           "x" + std::to_string(options_.size.height) +
           (options_.places == ProductPlaces::kModel ? " model " : " result ") + PictureSettings() +
           "\n";
  }

  /// Which products the model has, and where and in which colours they are shown.
  void Resolve(const ZORIProduct_var& inRoot) {
    published_.model = Utf8(FromUtf8(NativePath(options_.model).filename().string()));
    published_.isAsInModel = options_.places == ProductPlaces::kModel;
    InterferenceScenes scenes(inRoot);
    Deviations deviations;
    for (std::size_t n = 0; n < records_.size(); ++n) {
      const ResolvedInterference resolved = scenes.Resolve(records_[n], options_.places);
      PublishedInterference& published = published_.interferences[n];
      deviations.Add(published.number, records_[n], resolved);
      for (std::size_t i = 0; i < 2; ++i) {
        published.products[i].colour = resolved.products[i].colour;
        published.products[i].isMissing =
            records_[n].products[i].exists && resolved.products[i].shown.product.IsNull();
      }
      if (resolved.HasProduct()) published.whyAsInModel = resolved.whyAsInModel;
      records_[n] = {};  // the geometry is in what was resolved
      resolved_.push_back(resolved);
    }
    deviations.Report(options_.warn);
  }

  /// @return how many interferences got no picture although the model has one of their products.
  std::size_t Draw(const ZORIProduct_var& inRoot) {
    PictureStore store(NativePath(folder_),
                       options_.format == PictureFormat::kPng ? ".png" : ".jpg");
    Resolve(inRoot);
    std::vector<std::size_t> wanted;
    std::set<std::string> numbers;
    for (std::size_t n = 0; n < resolved_.size(); ++n) {
      if (!resolved_[n].HasProduct()) continue;
      wanted.push_back(n);
      numbers.insert(std::to_string(published_.interferences[n].number));
    }
    if (!wanted.empty()) numbers.insert("0");
    ResolveBefore(options_, inRoot, before_);
    for (const Before& before : before_) numbers.insert(std::to_string(-before.record.index));
    overview_ = ShownRep(inRoot);
    const std::vector<std::size_t> chosen = ChooseItems(wanted, inRoot);
    const std::string stamp = Stamp();
    if (!store.Prepare(stamp, options_.resume, numbers) && options_.warn)
      options_.warn("the pictures that are there show something else: all are drawn");
    if (options_.sharing != nullptr) options_.sharing->Begin(store);
    if (!chosen.empty()) DrawInProcesses(options_.processes, WorkOn(wanted, chosen, store));
    store.Settle(stamp);
    if (options_.sharing != nullptr) options_.sharing->Finish(store);
    if (!MakesPage()) return 0;
    if (!wanted.empty()) MakeMap(store);
    for (const Before& before : before_)
      (before.isGone ? published_.gone : published_.interferences)[before.position].before =
          pictures_.Refer(folder_, store.Reference(store.PictureName(-before.record.index)),
                          options_.size);
    std::size_t failures = 0;
    ViewerScene scene(inRoot, options_.size);
    for (const std::size_t n : wanted) {
      const bool isDrawn = TakeReferences(n, store);
      failures += isDrawn ? 0 : 1;
      if (isDrawn && options_.hasGeometry) AddToScene(n, store, scene);
    }
    TakeGeometry(scene);
    return failures;
  }

  /// What there is to draw: the interferences that are wanted, those before them, the overview.
  std::vector<DrawingItem> Items(const std::vector<std::size_t>& inWanted,
                                 const ZORIProduct_var& inRoot) const {
    DrawingCosts costs;
    std::vector<DrawingItem> items;
    for (const std::size_t n : inWanted)
      items.push_back({published_.interferences[n].number, costs.Of(resolved_[n])});
    for (const Before& before : before_)
      items.push_back({-before.record.index, costs.Of(before.resolved)});
    items.push_back({kOverviewNumber, costs.OfAll(inRoot)});
    return items;
  }

  /// @return the positions among the items of those that are drawn here.
  std::vector<std::size_t> ChooseItems(const std::vector<std::size_t>& inWanted,
                                       const ZORIProduct_var& inRoot) const {
    if (inWanted.empty()) return {};
    if (options_.sharing != nullptr) return options_.sharing->Choose(Items(inWanted, inRoot));
    std::vector<std::size_t> all(inWanted.size() + before_.size() + 1);
    std::iota(all.begin(), all.end(), std::size_t{0});
    return all;
  }

  static ZOR3DRep* ShownRep(const ZORIProduct_var& inProduct) {
    const ZORI3DGeoVisu_var visible = inProduct;
    return visible.IsNull() ? nullptr : static_cast<ZOR3DRep*>(visible->GetRep());
  }

  void DrawBefore(const Before& inBefore, const PictureStore& inStore) const {
    try {
      fs::current_path(NativePath(inStore.DrawingFolder()));
      PictureDrawing(-inBefore.record.index, inBefore.resolved, inStore, options_).DrawAlone();
    } catch (const std::exception&) {
      // The page shows no picture of it then.
    }
  }

  void DrawOverview(const PictureStore& inStore) const {
    const std::string name = inStore.PictureName(kOverviewNumber);
    if (overview_ == nullptr || inStore.Has(name)) return;
    try {
      fs::current_path(NativePath(inStore.DrawingFolder()));
      PrintPictures::TakeRepImage(overview_, FromUtf8(name), FormatName(options_.format),
                                  options_.size.width, options_.size.height, 1, 0);
      inStore.Finish(kOverviewNumber);
    } catch (const std::exception&) {
      // The page has no map then.
    }
  }

  /// Where the interferences are in the overview: the middle of their points.
  void MakeMap(const PictureStore& inStore) {
    published_.map = pictures_.Refer(
        folder_, inStore.Reference(inStore.PictureName(kOverviewNumber)), options_.size);
    if (published_.map.empty()) return;
    published_.mapRatio = static_cast<double>(options_.size.height) / options_.size.width;
    const PictureCamera camera = OverviewCamera(*overview_, options_.size);
    for (std::size_t n = 0; n < resolved_.size(); ++n) {
      const std::vector<ZORMathVector>& points = resolved_[n].geometry.points;
      if (points.empty()) continue;
      using ZORFoundation::operator+, ZORFoundation::operator*;
      ZORMathVector sum;
      for (const ZORMathVector& point : points) sum = sum + point;
      published_.interferences[n].mapPlace =
          Seen(camera, options_.size, (1.0 / static_cast<double>(points.size())) * sum);
    }
  }

  void AddToScene(std::size_t inIndex, const PictureStore& inStore, ViewerScene& ioScene) const {
    const int number = published_.interferences[inIndex].number;
    const auto text =
        ZORFoundation::TryReadWholeFile(inStore.DrawingFolder() + "/" + CameraName(number));
    if (!text) return;
    if (const auto camera = CameraFrom(text->bytes))
      ioScene.Add(std::to_string(number), resolved_[inIndex], *camera);
  }

  /// In one file it shares its room with the pictures.
  void TakeGeometry(const ViewerScene& inScene) {
    constexpr std::size_t kMaxPage = 25'000'000, kRoomForText = 3'000'000, kLeast = 1'000'000;
    if (inScene.IsEmpty()) return;
    std::size_t taken = kRoomForText;
    for (const PagePicture& picture : pictures_.Pictures()) taken += picture.bytes.size() * 4 / 3;
    geometry_ = inScene.Blocks(taken + kLeast < kMaxPage ? kMaxPage - taken : kLeast);
  }

  void DrawItem(std::size_t inItem, const std::vector<std::size_t>& inWanted,
                const PictureStore& inStore) const {
    if (inItem == inWanted.size() + before_.size()) return DrawOverview(inStore);
    if (inItem >= inWanted.size()) return DrawBefore(before_[inItem - inWanted.size()], inStore);
    const std::size_t n = inWanted[inItem];
    try {
      fs::current_path(NativePath(inStore.DrawingFolder()));
      PictureDrawing(published_.interferences[n].number, resolved_[n], inStore, options_).Draw();
    } catch (const std::exception&) {
      // Its picture is not there, which is what is looked for at the end.
    }
  }

  DrawingWork WorkOn(const std::vector<std::size_t>& inWanted,
                     const std::vector<std::size_t>& inChosen, const PictureStore& inStore) const {
    const auto all = static_cast<std::size_t>(std::ranges::count_if(
        inChosen, [&](std::size_t inItem) { return inItem < inWanted.size(); }));
    DrawingWork work;
    work.count = inChosen.size();
    work.draw = [&](std::size_t inPlace) { DrawItem(inChosen[inPlace], inWanted, inStore); };
    work.isDone = [this, all](std::size_t inDone, double inSeconds) {
      if (options_.sharing != nullptr) options_.sharing->Drawn(inDone, inSeconds);
      if (options_.drawn) options_.drawn(std::min(inDone, all), all);
    };
    return work;
  }

  /// @return whether there is a picture.
  bool TakeReferences(std::size_t inIndex, const PictureStore& inStore) {
    constexpr PictureSize kThumbnail{72, 50};
    const PictureSize preview{std::max(1, options_.size.width / 2),
                              std::max(1, options_.size.height / 2)};
    PublishedInterference& published = published_.interferences[inIndex];
    const auto refer = [&](const std::string& inName, PictureSize inSize) {
      return pictures_.Refer(folder_, inStore.Reference(inName), inSize);
    };
    published.picture = refer(inStore.PictureName(published.number), options_.size);
    for (const std::string& name : inStore.ThumbnailNames(published.number))
      published.thumbnails.push_back(refer(name, kThumbnail));
    for (std::size_t i = 0; i < 2; ++i)
      if (!published.products[i].isMissing)
        published.products[i].preview = refer(inStore.PreviewName(published.number, i), preview);
    return !published.picture.empty();
  }

  /// Edits the result to what is published.
  void EditResult() {
    ClashDocumentEdit edit(result_);
    for (const ElementHandle& other : others_) edit.Remove(other);
    if (!others_.empty()) edit.RecountInterferences();
    for (const PublishedInterference& published : published_.interferences) {
      edit.SetPicture(published.element, published.picture);
      edit.RemovePreviews(published.element);
      for (const PublishedProduct& product : published.products)
        if (!product.preview.empty()) edit.SetPreview(product.element, product.preview);
    }
  }

  ClashDocument& result_;
  const PublicationOptions& options_;
  std::string folder_;
  PageStyleSheet styleSheet_;
  ZoomOfOptions zoom_;
  ReviewedResult review_;
  std::vector<std::string> ids_;
  std::vector<bool> isShown_;
  ReferredPictures pictures_;
  std::vector<PageBlock> geometry_;
  std::vector<Before> before_;
  ZOR3DRep* overview_ = nullptr;             // the model's
  std::vector<InterferenceRecord> records_;  // that the filter accepts; empty once resolved
  std::vector<ElementHandle> others_;
  std::uint64_t hash_ = 0;
  std::vector<ResolvedInterference> resolved_;
  PublishedResult published_;
};

}  // namespace

Published Publish(ClashDocument& ioResult, const PublicationOptions& inOptions,
                  const std::function<ZORIProduct_var()>& inOpenModel) {
  ioResult.RequireInterferences();
  try {
    std::optional<ZORFoundation::ScratchFolder> scratch;
    if (inOptions.isOneFile || inOptions.folder.empty()) scratch.emplace();
    return Publication(ioResult, inOptions, scratch ? scratch->Path() : inOptions.folder)
        .Make(inOpenModel);
  } catch (const fs::filesystem_error& error) {
    throw Error(error.path1().string(), error.code().message());
  }
}

}  // namespace ZORToolkit
