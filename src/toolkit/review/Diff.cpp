#include "toolkit/review/Diff.h"

#include <algorithm>
#include <cmath>

#include "foundation/Bytes.h"
#include "foundation/Hash.h"
#include "toolkit/review/Comparability.h"
#include "toolkit/review/ProductMatch.h"

namespace ZORToolkit {
namespace {

std::string PlacementText(const ReviewProduct& inProduct, const Placement& inPlacement) {
  std::string text = std::string(inProduct.Name()) + " at";
  for (std::size_t i = 9; i < 12; ++i) text.append(1, ' ').append(Number(inPlacement[i]).text);
  constexpr Placement kUnturned{1, 0, 0, 0, 1, 0, 0, 0, 1};
  if (std::equal(inPlacement.begin(), inPlacement.begin() + 9, kUnturned.begin())) return text;
  text += ", turned";
  for (std::size_t i = 0; i < 9; ++i) text.append(1, ' ').append(Number(inPlacement[i]).text);
  return text;
}

class Differ {
 public:
  Differ(const ReviewedResult& inOld, const ReviewedResult& inNew, const DiffOptions& inOptions)
      : old_(inOld), new_(inNew), motions_(inOld, inNew), options_(inOptions) {}

  ResultDiff Run() {
    diff_.match = MatchResults(motions_, options_);
    diff_.sources = {old_.source, new_.source};
    diff_.entries.reserve(new_.interferences.size() + static_cast<std::size_t>(std::ranges::count(
                                                          diff_.match.interferencesOfOld, -1,
                                                          &ResultMatch::Partner::position)));
    for (std::size_t i = 0; i < new_.interferences.size(); ++i) AddNew(i);
    std::optional<Comparability> comparability;
    for (std::size_t i = 0; i < old_.interferences.size(); ++i) {
      const ResultMatch::Partner& partner = diff_.match.interferencesOfOld[i];
      if (partner.position >= 0) continue;
      if (!comparability) comparability.emplace(old_, new_, options_, diff_.match);
      std::string whyNot = comparability->WhyNot(old_.interferences[i]);
      const bool isResolved = whyNot.empty();
      Add({isResolved ? DiffClass::kResolved : DiffClass::kNotComparable,
           static_cast<int>(i),
           -1,
           isResolved ? diff_.match.Reason(partner) : Keep(std::move(whyNot)),
           {}});
    }
    return std::move(diff_);
  }

 private:
  void Add(const DiffEntry& inEntry) {
    ++diff_.counts[static_cast<std::size_t>(inEntry.itsClass)];
    diff_.entries.push_back(inEntry);
  }

  void AddNew(std::size_t inPosition) {
    const ResultMatch::Partner& partner = diff_.match.interferencesOfNew[inPosition];
    DiffEntry entry{DiffClass::kNew,
                    partner.position,
                    static_cast<int>(inPosition),
                    diff_.match.Reason(partner),
                    {}};
    if (partner.position >= 0) {
      entry.changes = ChangesOf(old_.interferences[static_cast<std::size_t>(partner.position)],
                                new_.interferences[inPosition], partner.isUnmoved != 0);
      entry.itsClass = entry.changes.empty() ? DiffClass::kPersisting : DiffClass::kChanged;
    }
    Add(entry);
  }

  static bool IsSame(std::string_view inA, std::string_view inB) {
    return inA.size() == inB.size() &&
           ZORFoundation::AreSameBytes(inA.data(), inB.data(), inA.size());
  }

  /// @return what is added to the changes of all entries.
  std::span<const Change> ChangesOf(const ReviewRecord& inOld, const ReviewRecord& inNew,
                                    bool inIsUnmoved) {
    std::size_t count = 0;
    const auto add = [&](const Change& inChange) { RoomForChanges()[count++] = inChange; };
    const auto compare = [&](const char* inWhat, std::string_view inFrom, std::string_view inTo,
                             bool inIsSubstantial) {
      if (!IsSame(inFrom, inTo)) add({inWhat, inFrom, inTo, inIsSubstantial});
    };
    compare("type", inOld.type, inNew.type, true);
    if (!IsSameValue(inOld.value, inNew.value))
      compare("value", inOld.value.text, inNew.value.text, true);
    if (!inIsUnmoved) ComparePlacements(inOld, inNew, add);
    compare("rule", inOld.rule, inNew.rule, true);
    compare("status", inOld.status, inNew.status, false);
    compare("comment", inOld.comment, inNew.comment, false);
    if (count == 0) return {};
    const std::span<const Change> changes(RoomForChanges(), count);
    freeChanges_ += count;
    leftChanges_ -= count;
    return changes;
  }

  /// For those of one entry; they stay where they are.
  Change* RoomForChanges() {
    constexpr std::size_t kMostOfEntry = 7, kBlock = 1024;
    if (leftChanges_ < kMostOfEntry) {
      freeChanges_ = diff_.changes.emplace_back(new Change[kBlock]).get();
      leftChanges_ = kBlock;
    }
    return freeChanges_;
  }

  std::string_view Keep(std::string inText) {
    diff_.match.Keep(std::move(inText));
    return diff_.match.reasons.back();
  }

  bool IsSameValue(const WrittenNumber& inOld, const WrittenNumber& inNew) const {
    if (IsSame(inOld.text, inNew.text)) return true;
    const std::optional<double> was = inOld.Value(), is = inNew.Value();
    if (!was || !is) return false;
    constexpr double kRounding = 1e-9;
    return std::abs(*was - *is) <= options_.tolerance + kRounding;
  }

  template <class AddChange>
  void ComparePlacements(const ReviewRecord& inOld, const ReviewRecord& inNew,
                         const AddChange& inAdd) {
    const bool isSwapped = IsSwapped(inOld, inNew);
    bool isSubstantial = false, isKnown = false;
    for (std::size_t i = 0; i < 2; ++i) {
      const std::size_t j = isSwapped ? 1 - i : i;
      if (motions_.Of(inOld, i, inNew, j) <= options_.tolerance) continue;
      if (!isKnown) isSubstantial = motions_.Relative(inOld, inNew, isSwapped) > options_.tolerance;
      isKnown = true;
      inAdd({"placement",
             Keep(PlacementText(ProductOf(old_, inOld.products[i]),
                                *motions_.OldPlacementOf(inOld.productElements[i]))),
             Keep(PlacementText(ProductOf(new_, inNew.products[j]),
                                *motions_.NewPlacementOf(inNew.productElements[j]))),
             isSubstantial});
    }
  }

  /// Whether the old first product is the new second one.
  bool IsSwapped(const ReviewRecord& inOld, const ReviewRecord& inNew) const {
    const int first = inOld.products[0];
    const int partner =
        first < 0 ? -1 : diff_.match.productsOfOld[static_cast<std::size_t>(first)].position;
    return partner != inNew.products[0];
  }

  static const ReviewProduct& ProductOf(const ReviewedResult& inResult, int inProduct) {
    return inResult.products[static_cast<std::size_t>(inProduct)];
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  Motions motions_;
  const DiffOptions& options_;
  ResultDiff diff_;
  Change* freeChanges_ = nullptr;  // where the next one is written
  std::size_t leftChanges_ = 0;
};

}  // namespace

const char* Name(DiffClass inClass) {
  constexpr const char* kNames[] = {"new", "persisting", "changed", "resolved", "notComparable"};
  return kNames[static_cast<std::size_t>(inClass)];
}

bool DiffEntry::IsReopened() const { return std::ranges::any_of(changes, &Change::isSubstantial); }

bool ResultDiff::HasDifferences() const {
  return Count(DiffClass::kPersisting) != static_cast<int>(entries.size());
}

ResultDiff Diff(const ReviewedResult& inOld, const ReviewedResult& inNew,
                const DiffOptions& inOptions) {
  return Differ(inOld, inNew, inOptions).Run();
}

std::vector<std::string> EntryIds(const ResultDiff& inDiff, const ReviewedResult& inOld,
                                  const ReviewedResult& inNew) {
  std::vector<int> gone;
  for (const DiffEntry& entry : inDiff.entries)
    if (entry.newPosition < 0) gone.push_back(entry.oldPosition);
  const std::vector<std::uint64_t> newIds = StableIdNumbers(inNew);
  const std::vector<std::uint64_t> goneIds = StableIdNumbers(inOld, gone);
  std::vector<std::string> ids;
  ids.reserve(inDiff.entries.size());
  std::size_t nextGone = 0;
  for (const DiffEntry& entry : inDiff.entries)
    ids.push_back(ZORFoundation::HexText(
        entry.newPosition < 0 ? goneIds[nextGone++]
                              : newIds[static_cast<std::size_t>(entry.newPosition)]));
  return ids;
}

}  // namespace ZORToolkit
