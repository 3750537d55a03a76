#include "toolkit/publishing/page/PublishedComparison.h"

#include <unordered_map>

#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

std::string ShownWord(const std::string& inWord, const std::string& inAsWritten) {
  if (!inWord.empty() && CaseFolded(inWord) != "error") return inWord;
  return inAsWritten.empty() ? "Not stated" : inAsWritten;
}

void TakeChange(const DiffEntry& inEntry, PublishedInterference& outPublished) {
  const bool isComparable = inEntry.itsClass != DiffClass::kNotComparable;
  outPublished.change = isComparable ? Name(inEntry.itsClass) : "not comparable";
  outPublished.reason = inEntry.reason;
  for (const Change& change : inEntry.changes)
    outPublished.changes.push_back({change.what, std::string(change.from), std::string(change.to)});
}

}  // namespace

PublishedInterference PublishedOf(const InterferenceRecord& inRecord) {
  PublishedInterference published;
  published.element = inRecord.element;
  published.number = inRecord.index;
  published.type = ShownWord(inRecord.type, inRecord.typeAsWritten);
  published.status = ShownWord(inRecord.status, inRecord.statusAsWritten);
  for (std::size_t i = 0; i < 2; ++i) published.products[i].element = inRecord.products[i].element;
  return published;
}

std::vector<Before> CompareWithBaseline(const PublicationOptions& inOptions,
                                        const ReviewedResult& inReview,
                                        PublishedResult& ioPublished) {
  ioPublished.baseline = inOptions.baselineName;
  ioPublished.baselineDocument = inOptions.baseline;
  const ReviewedResult old = ReadForReview(*inOptions.baseline);
  const ResultDiff diff = Diff(old, inReview, inOptions.comparison);
  std::unordered_map<int, const DiffEntry*> entryOfNew, entryOfOld;
  for (const DiffEntry& entry : diff.entries)
    (entry.newPosition < 0 ? entryOfOld[entry.oldPosition] : entryOfNew[entry.newPosition]) =
        &entry;
  std::unordered_map<int, std::size_t> shownOfOld;
  for (std::size_t n = 0; n < ioPublished.interferences.size(); ++n) {
    PublishedInterference& published = ioPublished.interferences[n];
    const auto found = entryOfNew.find(published.number - 1);
    if (found == entryOfNew.end()) continue;
    TakeChange(*found->second, published);
    if (found->second->itsClass == DiffClass::kChanged)
      shownOfOld.emplace(found->second->oldPosition, n);
  }
  std::vector<Before> before;
  ForEachInterference(*inOptions.baseline, RecordPart::kAll,
                      [&](const InterferenceRecord& inRecord) {
                        const auto gone = entryOfOld.find(inRecord.index - 1);
                        const auto shown = shownOfOld.find(inRecord.index - 1);
                        if (gone != entryOfOld.end() && inOptions.filter.Accepts(inRecord)) {
                          ioPublished.gone.push_back(PublishedOf(inRecord));
                          TakeChange(*gone->second, ioPublished.gone.back());
                          before.push_back({inRecord, true, ioPublished.gone.size() - 1, {}});
                        } else if (shown != shownOfOld.end()) {
                          before.push_back({inRecord, false, shown->second, {}});
                        }
                      });
  return before;
}

void ResolveBefore(const PublicationOptions& inOptions, const ZORIProduct_var& inRoot,
                   std::vector<Before>& ioBefore) {
  if (ioBefore.empty()) return;
  InterferenceScenes scenes(inOptions.openBaselineModel ? inOptions.openBaselineModel() : inRoot);
  for (Before& before : ioBefore) before.resolved = scenes.Resolve(before.record, inOptions.places);
  std::erase_if(ioBefore, [](const Before& inBefore) { return !inBefore.resolved.HasProduct(); });
}

}  // namespace ZORToolkit
