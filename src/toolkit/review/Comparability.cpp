#include "toolkit/review/Comparability.h"

#include <algorithm>
#include <unordered_map>

#include "foundation/Hash.h"

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

}  // namespace

class Comparability::Checks {
 public:
  Checks(const ReviewedResult& inOld, const ReviewedResult& inNew, const DiffOptions& inOptions,
         const ResultMatch& inMatch)
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
    for (const auto check : {&Checks::Products, &Checks::Specification, &Checks::Types,
                             &Checks::Case, &Checks::Clearance}) {
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

Comparability::Comparability(const ReviewedResult& inOld, const ReviewedResult& inNew,
                             const DiffOptions& inOptions, const ResultMatch& inMatch)
    : checks_(std::make_unique<const Checks>(inOld, inNew, inOptions, inMatch)) {}
Comparability::~Comparability() = default;

std::string Comparability::WhyNot(const ReviewRecord& inOld) const {
  return checks_->WhyNot(inOld);
}

}  // namespace ZORToolkit
