#include "toolkit/review/Diff.h"

#include <algorithm>
#include <cmath>
#include <unordered_map>

#include "default_platform/xml/TextStore.h"
#include "foundation/Hash.h"
#include "toolkit/review/ProductMatch.h"

namespace ZORToolkit {
namespace {

constexpr char kBetweenAll[] = "Between all components";

/// A product's own names and those of the assemblies above it.
std::vector<std::string_view> NamesAndParents(std::string_view inId, std::string_view inAlias) {
  std::vector<std::string_view> names;
  for (const std::string_view name : {inId, inAlias}) {
    if (name.empty() || (!names.empty() && name == inId)) continue;
    names.push_back(name);
    for (std::size_t at = name.rfind(kPathSeparator); at != std::string_view::npos && at > 0;
         at = name.rfind(kPathSeparator, at - 1))
      names.push_back(name.substr(0, at));
  }
  return names;
}

/// What a specification asked to check.
class Coverage {
 public:
  explicit Coverage(const std::vector<SpecifiedPair>& inSpecifications) {
    for (const SpecifiedPair& specification : inSpecifications) {
      const auto& [first, second] = specification.products;
      Add(first.alias, second);
      if (first.id != first.alias) Add(first.id, second);
    }
  }

  bool HasProduct(const ReviewProduct& inProduct) const {
    return std::ranges::any_of(NamesAndParents(inProduct.id, inProduct.alias),
                               [&](std::string_view inName) { return products_.contains(inName); });
  }

  bool HasPair(const ReviewProduct& inFirst, const ReviewProduct& inSecond) const {
    const std::vector<std::string_view> seconds = NamesAndParents(inSecond.id, inSecond.alias);
    for (const std::string_view a : NamesAndParents(inFirst.id, inFirst.alias))
      for (const std::string_view b : seconds)
        if (pairs_.contains({a, b})) return true;
    return false;
  }

 private:
  void Add(std::string_view inFirst, const SpecifiedPair::Names& inSecond) {
    products_.insert(inFirst);
    Add(inFirst, inSecond.alias);
    if (inSecond.id != inSecond.alias) Add(inFirst, inSecond.id);
  }
  void Add(std::string_view inFirst, std::string_view inSecond) {
    products_.insert(inSecond);
    pairs_.insert({inFirst, inSecond});
    pairs_.insert({inSecond, inFirst});
  }

  typedef std::pair<std::string_view, std::string_view> Pair;
  struct PairHash {
    std::size_t operator()(const Pair& inPair) const {
      return ZORFoundation::Hash64Of(inPair.first, ZORFoundation::Hash64Of(inPair.second));
    }
  };
  std::unordered_set<std::string_view> products_;
  std::unordered_set<Pair, PairHash> pairs_;
};

/// Says why the new computation did not look for an interference of the old result.
class Comparability {
 public:
  Comparability(const ReviewedResult& inOld, const ReviewedResult& inNew,
                const DiffOptions& inOptions, const ResultMatch& inMatch)
      : old_(inOld),
        new_(inNew),
        options_(inOptions),
        match_(inMatch),
        oldCoverage_(inOld.specifications),
        newCoverage_(inNew.specifications),
        newClearance_(inNew.clearance.value) {
    for (const ReviewRecord& record : new_.interferences) {
      const bool isWanted =
          record.rule.empty() ? !inNew.clearance.value : !clearanceOfRule_.contains(record.rule);
      const std::optional<double> clearance = isWanted ? record.clearance.Value() : std::nullopt;
      if (!clearance) continue;
      if (!record.rule.empty()) clearanceOfRule_.emplace(record.rule, *clearance);
      if (record.rule.empty())
        newClearance_ = std::max(*clearance, newClearance_.value_or(*clearance));
    }
  }

  /// @return empty when it did look for it.
  std::string WhyNot(const ReviewRecord& inOld) const {
    if (new_.kind == DocumentKind::kInterference)
      return "the new document holds a single interference";
    for (const auto check :
         {&Comparability::Products, &Comparability::Specification, &Comparability::Types,
          &Comparability::Case, &Comparability::Clearance}) {
      std::string reason = (this->*check)(inOld);
      if (!reason.empty()) return reason;
    }
    return {};
  }

 private:
  const ReviewProduct* ProductOf(const ReviewRecord& inOld, std::size_t inProduct) const {
    const int product = inOld.products[inProduct];
    return product < 0 ? nullptr : &old_.products[static_cast<std::size_t>(product)];
  }

  /// As the new result calls it, when that has it.
  const ReviewProduct& InNew(const ReviewRecord& inOld, std::size_t inProduct) const {
    const auto old = static_cast<std::size_t>(inOld.products[inProduct]);
    const int partner = match_.productsOfOld[old].position;
    return partner < 0 ? old_.products[old] : new_.products[static_cast<std::size_t>(partner)];
  }

  bool IsInNew(const ReviewRecord& inOld, std::size_t inProduct) const {
    return match_.productsOfOld[static_cast<std::size_t>(inOld.products[inProduct])].position >= 0;
  }

  std::string Products(const ReviewRecord& inOld) const {
    for (std::size_t i = 0; i < 2; ++i) {
      const ReviewProduct* const product = ProductOf(inOld, i);
      if (product == nullptr) continue;
      const std::string name = std::string(1, '"').append(product->Name()).append(1, '"');
      if (options_.productsOfNewModel) {
        const ReviewProduct& now = InNew(inOld, i);
        const auto& model = *options_.productsOfNewModel;
        if (!model.contains(std::string(now.id)) && !model.contains(std::string(now.alias)))
          return name + " is not in the new model";
      }
      const bool wasSpecified = old_.specifications.empty() || oldCoverage_.HasProduct(*product);
      if (!new_.specifications.empty() && wasSpecified && !IsInNew(inOld, i) &&
          !newCoverage_.HasProduct(*product))
        return name + " is not in the new specification";
    }
    return {};
  }

  std::string Specification(const ReviewRecord& inOld) const {
    if (!new_.hasSpecification || ProductOf(inOld, 0) == nullptr || ProductOf(inOld, 1) == nullptr)
      return {};
    if (!oldCoverage_.HasPair(*ProductOf(inOld, 0), *ProductOf(inOld, 1))) return {};
    if (newCoverage_.HasPair(InNew(inOld, 0), InNew(inOld, 1)) ||
        newCoverage_.HasPair(*ProductOf(inOld, 0), *ProductOf(inOld, 1)))
      return {};
    return "the pair is not in the new specification";
  }

  /// "Clearance + Contact + Clash": the words are the result types in some language.
  std::string Types(const ReviewRecord& inOld) const {
    if (new_.computedTypes.empty() || new_.computedTypes == old_.computedTypes) return {};
    if (!newTypes_) newTypes_ = TypesIn(new_.computedTypes);
    if (newTypes_->contains(std::string(inOld.type)) || newTypes_->contains("error")) return {};
    return "the new computation looked for \"" + new_.computedTypes + "\" only";
  }

  static std::unordered_set<std::string> TypesIn(const std::string& inText) {
    std::unordered_set<std::string> types;
    for (std::size_t begin = 0; begin <= inText.size();) {
      const std::size_t end = std::min(inText.find('+', begin), inText.size());
      types.insert(TypeNamed(inText.substr(begin, end - begin)));
      begin = end + 1;
    }
    return types;
  }

  /// As the library's reader understands the word in any language.
  static std::string TypeNamed(const std::string& inWord) {
    std::string escaped;
    for (const char byte : inWord) {
      if (byte == '<')
        escaped += "&lt;";
      else if (byte == '&')
        escaped += "&amp;";
      else if (byte == '"')
        escaped += "&quot;";
      else
        escaped += byte;
    }
    ClashDocument document("word",
                           "<?xml version=\"1.0\" encoding=\"UTF-8\"?><InterferenceElement>"
                           "<Interference ResultType=\"" +
                               escaped + "\"/></InterferenceElement>");
    return std::string(ReadForReview(document).interferences.at(0).type);
  }

  std::string Case(const ReviewRecord& inOld) const {
    const auto nameOf = [](const ReviewedResult& inResult, int inCase) {
      return inCase < 0 ? std::string()
                        : inResult.computationCases[static_cast<std::size_t>(inCase)];
    };
    const std::string was = nameOf(old_, inOld.computationCase);
    if (was.empty()) return {};
    std::string other;
    for (const std::string& name : new_.computationCases) {
      if (name == was || name == kBetweenAll) return {};
      if (!name.empty()) other = name;
    }
    if (other.empty()) return {};
    return "computed as \"" + was + "\" then, as \"" + other + "\" now";
  }

  std::string Clearance(const ReviewRecord& inOld) const {
    if (inOld.type != "Clearance") return {};
    const std::optional<double> was = inOld.clearance.Value();
    if (!was) return {};
    std::optional<double> now = newClearance_;
    if (!inOld.rule.empty()) {
      const auto rule = clearanceOfRule_.find(inOld.rule);
      now = rule == clearanceOfRule_.end() ? std::nullopt : std::optional(rule->second);
    }
    if (!now || *now >= *was - 1e-9) return {};
    return std::string("the clearance was ").append(inOld.clearance.text) + " and is " +
           Number(*now).text + " now";
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  const DiffOptions& options_;
  const ResultMatch& match_;
  Coverage oldCoverage_, newCoverage_;
  std::optional<double> newClearance_;
  std::unordered_map<std::string_view, double> clearanceOfRule_;
  mutable std::optional<std::unordered_set<std::string>> newTypes_;
};

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
    return inA.size() == inB.size() && AreSameBytes(inA.data(), inB.data(), inA.size());
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
