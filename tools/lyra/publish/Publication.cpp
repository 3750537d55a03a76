#include "lyra/publish/Publication.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <set>

#include "PrintPictures.h"
#include "lyra/RecordsJson.h"
#include "lyra/SafeText.h"
#include "lyra/publish/DrawingProgress.h"
#include "lyra/publish/DrawingWorkers.h"
#include "lyra/publish/ZoomSetting.h"
#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/records/InterferenceRecord.h"

namespace fs = std::filesystem;

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr char kNoPath[] = "";  // the products are found already

/// The 64-bit hash of Fowler, Noll and Vo (FNV-1a), continued.
std::uint64_t Hashed(std::uint64_t inHash, const std::string& inText) {
  for (const char byte : inText) {
    inHash ^= static_cast<unsigned char>(byte);
    inHash *= 0x100000001b3;
  }
  return inHash;
}

void Warn(const std::string& inText) {
  std::fprintf(stderr, "lyra: warning: %s\n", Printable(inText).c_str());
}

/// A word that the reader could not understand is shown as the document has it.
std::string ShownWord(const std::string& inWord, const std::string& inAsWritten) {
  if (!inWord.empty() && CaseFolded(inWord) != "error") return inWord;
  return inAsWritten.empty() ? "Not stated" : inAsWritten;
}

Entry MakeEntry(const InterferenceRecord& inRecord) {
  Entry entry;
  entry.record = inRecord;
  entry.facts.number = inRecord.index;
  entry.facts.type = ShownWord(inRecord.type, inRecord.typeAsWritten);
  entry.facts.status = ShownWord(inRecord.status, inRecord.statusAsWritten);
  return entry;
}

/// "1 product", "2 products".
std::string Counted(std::size_t inCount, const std::string& inThing) {
  return std::to_string(inCount) + " " + inThing + (inCount == 1 ? "" : "s");
}

std::string NameOf(const std::string& inPath) { return inPath.empty() ? "(no name)" : inPath; }

/// A text of UTF-8 for one line among others.
std::string Shortened(const std::string& inText) {
  constexpr std::size_t kMost = 160;
  if (inText.size() <= kMost) return inText;
  std::size_t end = kMost;
  while (end > 0 && (inText[end] & 0xC0) == 0x80) --end;
  return inText.substr(0, end) + "…";
}

/// Which of a set of texts there are: the first few and how many more.
std::string Listed(const std::set<std::string>& inTexts) {
  constexpr std::size_t kShown = 3;
  std::string list;
  std::size_t shown = 0;
  for (const std::string& text : inTexts) {
    if (++shown > kShown) return list + " and " + std::to_string(inTexts.size() - kShown) + " more";
    list += (shown == 1 ? "\"" : ", \"") + Shortened(text) + "\"";
  }
  return list;
}

/// Draws in the folder of the pictures, which is the current one: no text has to carry its path.
class EntryDrawing {
 public:
  EntryDrawing(const Entry& inEntry, const PictureStore& inStore, const PictureStyle& inStyle)
      : scene_(MakeScene(inEntry.record, inEntry.resolved)),
        number_(inEntry.facts.number),
        store_(inStore),
        style_(inStyle),
        format_(inStyle.format == PictureFormat::kPng ? "PNG" : "JPEG") {}

  void Draw() {
    for (std::size_t i = 0; i < 2; ++i) DrawPreview(i);
    if (store_.Has(store_.PictureName(number_))) return;
    const auto& [first, second] = scene_.products;
    if (first.IsNull() && second.IsNull()) return;
    PrintPictures::PrintListVisuToFile(first, kNoPath, second, kNoPath, scene_.interference,
                                       FromUtf8(store_.UnfinishedName(number_)), format_,
                                       style_.size.width, style_.size.height, 1, 0);
    store_.Finish(number_);
  }

 private:
  void DrawPreview(std::size_t inProduct) {
    const std::string name = store_.PreviewName(number_, inProduct);
    if (scene_.products[inProduct].IsNull() || store_.Has(name)) return;
    PrintPictures::PrintListVisuToFilePreview(scene_.products[inProduct], kNoPath, FromUtf8(name),
                                              format_, std::max(1, style_.size.width / 2),
                                              std::max(1, style_.size.height / 2), 1, 0);
  }

  ZORDefault::InterferenceScene scene_;
  int number_;
  const PictureStore& store_;
  const PictureStyle& style_;
  ZORUnicodeString format_;
};

}  // namespace

Publication::Publication(ClashDocument& ioResult, const ListFilter& inFilter)
    : hash_(0xcbf29ce484222325) {
  ForEachInterference(ioResult, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
    hash_ = Hashed(hash_, JsonText(inRecord));
    if (inFilter.Accepts(inRecord))
      entries_.push_back(MakeEntry(inRecord));
    else
      others_.push_back(inRecord.element);
  });
}

std::string Publication::Fingerprint() const {
  char text[17];
  std::snprintf(text, sizeof text, "%016llx", static_cast<unsigned long long>(hash_));
  return text;
}

void Publication::LookUp(const ZORIProduct_var& inRoot, ProductPlaces inPlaces) {
  InterferenceScenes scenes(inRoot);
  std::set<std::string> missing;
  std::size_t incomplete = 0, movedBack = 0;
  std::string whyMovedBack;
  for (Entry& entry : entries_) {
    entry.resolved = scenes.Resolve(entry.record, inPlaces);
    bool isComplete = true;
    for (std::size_t i = 0; i < 2; ++i) {
      if (!entry.record.products[i].exists) continue;
      const ResolvedProduct& product = entry.resolved.products[i];
      PublishedProduct& facts = entry.facts.products[i];
      facts.colour = product.colour;
      facts.isMissing = product.shown.product.IsNull();
      if (facts.isMissing) missing.insert(NameOf(product.path));
      isComplete = isComplete && !facts.isMissing;
    }
    incomplete += isComplete ? 0 : 1;
    if (!entry.resolved.HasProduct()) continue;
    const std::string& why = entry.resolved.whyAsInModel;
    entry.facts.whyAsInModel = why;
    if (!why.empty() && movedBack++ == 0)
      whyMovedBack = std::to_string(entry.facts.number) + ": " + Shortened(why);
  }
  if (incomplete > 0)
    Warn("the model lacks " + Counted(missing.size(), "product") + " of " +
         Counted(incomplete, "interference") + ": " + Listed(missing));
  if (movedBack > 0)
    Warn("the products of " + Counted(movedBack, "interference") +
         " are drawn where they stand in the model; interference " + whyMovedBack);
}

std::size_t Publication::TakeReferences(const PictureStore& inStore) {
  std::size_t lacking = 0;
  for (Entry& entry : entries_) {
    PublishedInterference& facts = entry.facts;
    if (!entry.resolved.HasProduct()) continue;
    facts.picture = inStore.Reference(inStore.PictureName(facts.number));
    if (facts.picture.empty()) ++lacking;
    for (const std::string& name : inStore.ThumbnailNames(facts.number))
      facts.thumbnails.push_back(inStore.Reference(name));
    for (std::size_t i = 0; i < 2; ++i)
      if (!facts.products[i].isMissing)
        facts.products[i].preview = inStore.Reference(inStore.PreviewName(facts.number, i));
  }
  return lacking;
}

std::size_t Publication::Draw(const PictureStore& inStore, const PictureStyle& inStyle,
                              int inProcesses) {
  std::vector<const Entry*> wanted;
  for (const Entry& entry : entries_)
    if (entry.resolved.HasProduct()) wanted.push_back(&entry);
  if (!wanted.empty()) {
    const ZoomSetting zoom(inStyle.zoom);
    DrawingProgress progress(wanted.size());
    DrawingWork work;
    work.count = wanted.size();
    work.begin = [&] {
      fs::current_path(inStore.Folder());
      zoom.Apply();
    };
    work.draw = [&](std::size_t inWanted) {
      try {
        EntryDrawing(*wanted[inWanted], inStore, inStyle).Draw();
      } catch (const std::exception&) {
        // Its picture is not there, which is what is looked for at the end.
      }
    };
    work.isDone = [&](std::size_t inDone) { progress.Show(inDone); };
    DrawInProcesses(inProcesses, work);
  }
  return TakeReferences(inStore);
}

void Publication::Finish(ClashDocument& ioResult) {
  ClashDocumentEdit edit(ioResult);
  for (const ElementHandle& other : others_) edit.Remove(other);
  if (!others_.empty()) edit.RecountInterferences();
  for (const Entry& entry : entries_) {
    edit.SetPicture(entry.record.element, entry.facts.picture);
    edit.RemovePreviews(entry.record.element);
    for (std::size_t i = 0; i < 2; ++i)
      if (const ProductRecord& product = entry.record.products[i];
          product.exists && !entry.facts.products[i].preview.empty())
        edit.SetPreview(product.element, entry.facts.products[i].preview);
  }
}

}  // namespace lyra
