#include "toolkit/publishing/Publication.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <set>

#include "PrintPictures.h"
#include "default_platform/SettingOverride.h"
#include "foundation/Hash.h"
#include "platform/system/ZORSettingRepository.h"
#include "platform/system/ZORSysSettingRepository.h"
#include "toolkit/publishing/DrawingWorkers.h"
#include "toolkit/publishing/PictureStore.h"
#include "toolkit/publishing/PublishedFiles.h"
#include "toolkit/publishing/WorkFolder.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kSettings[] = "ClashPublish", kZoomSetting[] = "PictureZoom";

/// A word that the reader could not understand is shown as the document has it.
std::string ShownWord(const std::string& inWord, const std::string& inAsWritten) {
  if (!inWord.empty() && CaseFolded(inWord) != "error") return inWord;
  return inAsWritten.empty() ? "Not stated" : inAsWritten;
}

PublishedInterference PublishedOf(const InterferenceRecord& inRecord) {
  PublishedInterference published;
  published.element = inRecord.element;
  published.number = inRecord.index;
  published.type = ShownWord(inRecord.type, inRecord.typeAsWritten);
  published.status = ShownWord(inRecord.status, inRecord.statusAsWritten);
  for (std::size_t i = 0; i < 2; ++i) published.products[i].element = inRecord.products[i].element;
  return published;
}

/// "1 product", "2 products".
std::string Counted(std::size_t inCount, const std::string& inThing) {
  return std::to_string(inCount) + " " + inThing + (inCount == 1 ? "" : "s");
}

/// A text of UTF-8 for one line among others.
std::string Shortened(const std::string& inText) {
  constexpr std::size_t kMaxShown = 160;
  if (inText.size() <= kMaxShown) return inText;
  std::size_t end = kMaxShown;
  while (end > 0 && (inText[end] & 0xC0) == 0x80) --end;
  return inText.substr(0, end) + "…";
}

/// Which of a set of texts there are: the first few and how many more.
std::string Listed(const std::set<std::string>& inTexts) {
  constexpr std::size_t kMaxListed = 3;
  std::string list;
  std::size_t listed = 0;
  for (const std::string& text : inTexts) {
    if (++listed > kMaxListed)
      return list + " and " + std::to_string(inTexts.size() - kMaxListed) + " more";
    list += (listed == 1 ? "\"" : ", \"") + Shortened(text) + "\"";
  }
  return list;
}

/// What is shown otherwise than the result has it.
class Deviations {
 public:
  void Add(int inNumber, const InterferenceRecord& inRecord,
           const ResolvedInterference& inResolved) {
    bool isComplete = true;
    for (std::size_t i = 0; i < 2; ++i) {
      const ResolvedProduct& product = inResolved.products[i];
      if (!inRecord.products[i].exists || !product.shown.product.IsNull()) continue;
      missing_.insert(product.path.empty() ? "(no name)" : product.path);
      isComplete = false;
    }
    incomplete_ += isComplete ? 0 : 1;
    const std::string& why = inResolved.whyAsInModel;
    if (inResolved.HasProduct() && !why.empty() && movedBack_++ == 0)
      whyMovedBack_ = std::to_string(inNumber) + ": " + Shortened(why);
  }
  void Report(const PublicationOptions& inOptions) const {
    if (!inOptions.warn) return;
    if (incomplete_ > 0)
      inOptions.warn("the model lacks " + Counted(missing_.size(), "product") + " of " +
                     Counted(incomplete_, "interference") + ": " + Listed(missing_));
    if (movedBack_ > 0)
      inOptions.warn("the products of " + Counted(movedBack_, "interference") +
                     " are drawn where they stand in the model; interference " + whyMovedBack_);
  }

 private:
  std::set<std::string> missing_;
  std::size_t incomplete_ = 0, movedBack_ = 0;
  std::string whyMovedBack_;
};

/// Draws in the folder of unfinished pictures, which is the current one: no text has to carry its path.
class PictureDrawing {
 public:
  PictureDrawing(int inNumber, const ResolvedInterference& inResolved, const PictureStore& inStore,
                 const PublicationOptions& inOptions)
      : number_(inNumber),
        scene_(MakeScene(inResolved)),
        store_(inStore),
        size_(inOptions.size),
        format_(FormatName(inOptions.format)) {}

  void Draw() const {
    for (std::size_t i = 0; i < 2; ++i) DrawPreview(i);
    if (store_.Has(store_.PictureName(number_))) return;
    PrintPictures::PrintListVisuToFile(scene_.products[0], kFound, scene_.products[1], kFound,
                                       scene_.interference, FromUtf8(store_.PictureName(number_)),
                                       format_, size_.width, size_.height, 1, 0);
    store_.Finish(number_);
  }

 private:
  static constexpr char kFound[] = "";  // no path: the products are found already

  void DrawPreview(std::size_t inProduct) const {
    const std::string name = store_.PreviewName(number_, inProduct);
    if (scene_.products[inProduct].IsNull() || store_.Has(name)) return;
    PrintPictures::PrintListVisuToFilePreview(scene_.products[inProduct], kFound, FromUtf8(name),
                                              format_, std::max(1, size_.width / 2),
                                              std::max(1, size_.height / 2), 1, 0);
    store_.FinishPreview(number_, inProduct);
  }

  int number_;
  ZORDefault::InterferenceScene scene_;
  const PictureStore& store_;
  PictureSize size_;
  ZORUnicodeString format_;
};

/// The settings by which pictures differ.
std::string PictureSettings() {
  int zoom = 0, subInterferences = 0;
  if (auto* const settings = ZORSettingRepository::GetRepository(kSettings))
    settings->ReadSetting(kZoomSetting, &zoom, 1);
  if (auto* const settings = ZORSysSettingRepository::GetRepository("Clash"))
    settings->ReadAttr("ModeOfSubInterf", &subInterferences);
  const char* const switchedOn = std::getenv("TRX_VELD_SUBINTERF");
  return std::to_string(zoom) + " " + std::to_string(subInterferences) + " " +
         (switchedOn != nullptr ? switchedOn : "");
}

class Publication {
 public:
  Publication(ClashDocument& ioResult, const PublicationOptions& inOptions)
      : result_(ioResult), options_(inOptions), styleSheet_(inOptions.styleSheet) {
    if (inOptions.zoom) zoom_.emplace(kSettings, kZoomSetting, static_cast<int>(*inOptions.zoom));
    ZORFoundation::Hash64 hash;
    ForEachInterference(ioResult, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      hash.Add(HashOf(inRecord));
      if (inOptions.filter.Accepts(inRecord))
        records_.push_back(inRecord);
      else
        others_.push_back(inRecord.element);
    });
    hash_ = hash.Get();
    for (const InterferenceRecord& record : records_)
      published_.interferences.push_back(PublishedOf(record));
  }

  Published Make(const std::function<ZORIProduct_var()>& inOpenModel) {
    const WorkFolder work(options_.folder);
    Published made;
    if (!options_.model.empty()) made.failures = Draw(inOpenModel());
    EditResult();
    WritePublishedFiles(options_, styleSheet_, result_, published_, work.Path());
    made.page = Utf8(FromUtf8((fs::path(options_.folder) / kPageFile).string()));
    made.interferences = published_.interferences.size();
    for (const PublishedInterference& each : published_.interferences)
      made.pictures += each.picture.empty() ? 0 : 1;
    return made;
  }

 private:
  /// What the pictures are made from.
  std::string Stamp() const {
    const auto time = fs::last_write_time(options_.model).time_since_epoch().count();
    return "result " + ZORFoundation::HexText(hash_) + "\nmodel " +
           fs::canonical(options_.model).string() + " " +
           std::to_string(fs::file_size(options_.model)) + " " + std::to_string(time) +
           "\npictures " + FormatName(options_.format) + " " + std::to_string(options_.size.width) +
           "x" + std::to_string(options_.size.height) +
           (options_.places == ProductPlaces::kModel ? " model " : " result ") + PictureSettings() +
           "\n";
  }

  /// Which products the model has, and where and in which colours they are shown.
  void Resolve(const ZORIProduct_var& inRoot) {
    published_.model = Utf8(FromUtf8(fs::path(options_.model).filename().string()));
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
    deviations.Report(options_);
  }

  /// @return how many interferences got no picture although the model has one of their products.
  std::size_t Draw(const ZORIProduct_var& inRoot) {
    PictureStore store(options_.folder, options_.format == PictureFormat::kPng ? ".png" : ".jpg");
    Resolve(inRoot);
    std::vector<std::size_t> wanted;
    std::set<std::string> numbers;
    for (std::size_t n = 0; n < resolved_.size(); ++n) {
      if (!resolved_[n].HasProduct()) continue;
      wanted.push_back(n);
      numbers.insert(std::to_string(published_.interferences[n].number));
    }
    const std::string stamp = Stamp();
    if (!store.Prepare(stamp, options_.resume, numbers) && options_.warn)
      options_.warn("the pictures that are there show something else: all are drawn");
    if (!wanted.empty()) DrawInProcesses(options_.processes, WorkOn(wanted, store));
    store.Settle(stamp);
    std::size_t failures = 0;
    for (const std::size_t n : wanted) failures += TakeReferences(n, store) ? 0 : 1;
    return failures;
  }

  DrawingWork WorkOn(const std::vector<std::size_t>& inWanted, const PictureStore& inStore) const {
    DrawingWork work;
    work.count = inWanted.size();
    work.draw = [&](std::size_t inWantedIndex) {
      const std::size_t n = inWanted[inWantedIndex];
      try {
        fs::current_path(inStore.DrawingFolder());
        PictureDrawing(published_.interferences[n].number, resolved_[n], inStore, options_).Draw();
      } catch (const std::exception&) {
        // Its picture is not there, which is what is looked for at the end.
      }
    };
    work.isDone = [&](std::size_t inDone) {
      if (options_.drawn) options_.drawn(inDone, inWanted.size());
    };
    return work;
  }

  /// @return whether there is a picture.
  bool TakeReferences(std::size_t inIndex, const PictureStore& inStore) {
    PublishedInterference& published = published_.interferences[inIndex];
    published.picture = inStore.Reference(inStore.PictureName(published.number));
    for (const std::string& name : inStore.ThumbnailNames(published.number))
      published.thumbnails.push_back(inStore.Reference(name));
    for (std::size_t i = 0; i < 2; ++i)
      if (!published.products[i].isMissing)
        published.products[i].preview = inStore.Reference(inStore.PreviewName(published.number, i));
    return !published.picture.empty();
  }

  /// Makes the result what is published.
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
  PageStyleSheet styleSheet_;
  std::optional<ZORDefault::SettingOverride> zoom_;
  std::vector<InterferenceRecord>
      records_;  // those that the filter accepts, until they are resolved
  std::vector<ElementHandle> others_;
  std::uint64_t hash_ = 0;
  std::vector<ResolvedInterference> resolved_;
  PublishedResult published_;
};

}  // namespace

Published Publish(ClashDocument& ioResult, const PublicationOptions& inOptions,
                  const std::function<ZORIProduct_var()>& inOpenModel) {
  ioResult.RequireInterferences();
  Publication publication(ioResult, inOptions);
  try {
    return publication.Make(inOpenModel);
  } catch (const fs::filesystem_error& error) {
    throw Error(error.path1().string() + ": " + error.code().message());
  }
}

}  // namespace ZORToolkit
