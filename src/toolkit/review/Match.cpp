#include "toolkit/review/Match.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <map>
#include <tuple>
#include <unordered_map>
#include <utility>

#include "foundation/Hash.h"
#include "toolkit/review/Assignment.h"
#include "toolkit/review/Frames.h"

namespace ZORToolkit {
namespace {

constexpr double kUnlimited = std::numeric_limits<double>::infinity();
constexpr double kExact = 0.01;       // below it a place is called the same; millimetres
constexpr double kOtherType = 1;      // what another type costs, in millimetres of distance
constexpr double kValueWeight = 0.1;  // what a small difference of values costs, likewise
constexpr double kAlone = 1e12;       // costs more than any assignment

std::string Quoted(const ReviewProduct& inProduct) { return "\"" + inProduct.Name() + "\""; }

std::string Millimetres(double inLength) {
  char digits[32];
  const auto end =
      std::to_chars(digits, digits + sizeof digits, inLength, std::chars_format::general, 3);
  return std::string(digits, end.ptr) + " mm";
}

/// A place in the frame of one of the two products; nothing when either is unknown.
std::optional<Point3> PlaceInFrameOf(const ReviewRecord& inRecord, std::size_t inProduct) {
  if (!inRecord.place || !inRecord.placements[inProduct]) return std::nullopt;
  const std::optional<Frame> productFromWorld = Inverse(FrameOf(*inRecord.placements[inProduct]));
  if (!productFromWorld) return std::nullopt;
  return *productFromWorld * ToPoint(*inRecord.place);
}

std::optional<Point3> PlaceInWorld(const ReviewRecord& inRecord) {
  if (!inRecord.place) return std::nullopt;
  return ToPoint(*inRecord.place);
}

// Identifiers

/// The two products of an interference, by what tells them apart and in the order of that.
struct PairKey {
  std::string first, second;
  std::size_t frame = 0;  // which of the interference's products is the first here
};

PairKey KeyOf(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  const auto key = [&](std::size_t inProduct) {
    const int product = inRecord.products[inProduct];
    return product < 0 ? std::string() : inResult.products[static_cast<std::size_t>(product)].Key();
  };
  PairKey pair{key(0), key(1), 0};
  if (pair.second < pair.first) {
    std::swap(pair.first, pair.second);
    pair.frame = 1;
  }
  return pair;
}

ZORFoundation::Hash64 HashOf(const PairKey& inPair) {
  ZORFoundation::Hash64 hash;
  hash.AddText(inPair.first);
  hash.AddText(inPair.second);
  return hash;
}

// Designed coordinates are round, so cells do not begin at round ones.
std::int64_t Cell(double inCoordinate) {
  constexpr double kOffset = 0.2928932188;
  return static_cast<std::int64_t>(std::floor(std::clamp(inCoordinate, -1e15, 1e15) + kOffset));
}

std::uint64_t HashOfIdentity(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  const PairKey pair = KeyOf(inResult, inRecord);
  ZORFoundation::Hash64 hash = HashOf(pair);
  std::optional<Point3> place = PlaceInFrameOf(inRecord, pair.frame);
  if (!place) place = PlaceInFrameOf(inRecord, 1 - pair.frame);
  if (!place) place = PlaceInWorld(inRecord);
  if (place && ZORFoundation::IsFinite(*place))
    for (const double coordinate : {place->x, place->y, place->z})
      hash.Add(static_cast<std::uint64_t>(Cell(coordinate)));
  return hash.Get();
}

// Products

class ProductMatcher {
 public:
  ProductMatcher(const ReviewedResult& inOld, const ReviewedResult& inNew, ResultMatch& ioMatch)
      : old_(inOld), new_(inNew), match_(ioMatch) {
    match_.productsOfOld.resize(old_.products.size());
    match_.productsOfNew.resize(new_.products.size());
  }

  void Match(double inTolerance) {
    ByKey();
    ByText("same alias and part", kUnlimited,
           [](const ReviewProduct& inProduct) { return TextOf(inProduct.alias, inProduct.part); });
    ByText("same last name and part", kUnlimited, [](const ReviewProduct& inProduct) {
      return TextOf(LastName(inProduct), inProduct.part);
    });
    ByText("same part", 1, [](const ReviewProduct& inProduct) {
      return inProduct.part.empty() || !inProduct.placement ? "" : inProduct.part;
    });
    MarkSwapped(inTolerance);
    ExplainMissing();
  }

 private:
  typedef std::vector<ResultMatch::Partner> Partners;

  static std::string TextOf(const std::string& inName, const std::string& inPart) {
    return inName.empty() ? "" : inName + '\0' + inPart;
  }

  static std::string LastName(const ReviewProduct& inProduct) {
    constexpr std::string_view kSeparator = " --++-- ";
    const std::string& name = inProduct.Name();
    const std::size_t at = name.rfind(kSeparator);
    return at == std::string::npos ? name : name.substr(at + kSeparator.size());
  }

  void Set(int inOld, int inNew, const std::string& inReason) {
    match_.productsOfOld[static_cast<std::size_t>(inOld)] = {inNew, inReason};
    match_.productsOfNew[static_cast<std::size_t>(inNew)] = {inOld, inReason};
  }

  void ByKey() {
    std::unordered_map<std::string, int> newOfKey;
    for (std::size_t i = 0; i < new_.products.size(); ++i)
      newOfKey.emplace(new_.products[i].Key(), static_cast<int>(i));
    for (std::size_t i = 0; i < old_.products.size(); ++i) {
      const ReviewProduct& product = old_.products[i];
      const auto found = newOfKey.find(product.Key());
      if (found != newOfKey.end()) Set(static_cast<int>(i), found->second, "");
    }
  }

  static AssignmentPoint PointOf(const ReviewProduct& inProduct) {
    AssignmentPoint point;
    if (!inProduct.placement) return point;
    const Placement& placement = *inProduct.placement;
    point.at = {placement[9], placement[10], placement[11], 0};
    for (std::size_t i = 0; i < 9; ++i)  // some number that tells rotations apart
      point.at[3] += placement[i] * (0.31 + 0.13 * static_cast<double>(i));
    return point;
  }

  struct Bucket {
    std::vector<int> olds, news;
  };

  /// Matches those left over that have one text in common, the nearest to the nearest.
  template <class Text>
  void ByText(const std::string& inWhy, double inMaxDistance, const Text& inTextOf) {
    std::map<std::string, Bucket> buckets;
    const auto collect = [&](const std::vector<ReviewProduct>& inProducts,
                             const Partners& inPartners, std::vector<int> Bucket::*inSide) {
      for (std::size_t i = 0; i < inProducts.size(); ++i) {
        if (inPartners[i].position >= 0) continue;
        const std::string text = inTextOf(inProducts[i]);
        if (!text.empty()) (buckets[text].*inSide).push_back(static_cast<int>(i));
      }
    };
    collect(old_.products, match_.productsOfOld, &Bucket::olds);
    collect(new_.products, match_.productsOfNew, &Bucket::news);
    for (const auto& [text, bucket] : buckets) MatchBucket(bucket, inWhy, inMaxDistance);
  }

  void MatchBucket(const Bucket& inBucket, const std::string& inWhy, double inMaxDistance) {
    if (inBucket.olds.empty() || inBucket.news.empty()) return;
    std::vector<AssignmentPoint> rows, columns;
    for (const int product : inBucket.olds) rows.push_back(PointOf(Old(product)));
    for (const int product : inBucket.news) columns.push_back(PointOf(New(product)));
    const Assignment best = BestAssignment(rows, columns, {inMaxDistance, 0, kAlone});
    for (std::size_t i = 0; i < rows.size(); ++i) {
      if (best.columnOfRow[i] < 0) continue;
      const int oldProduct = inBucket.olds[i];
      const int newProduct = inBucket.news[static_cast<std::size_t>(best.columnOfRow[i])];
      const double motion = Motion(Old(oldProduct).placement, New(newProduct).placement);
      if (motion > 1 && inMaxDistance < kUnlimited) continue;
      std::string reason =
          Quoted(Old(oldProduct)) + " is " + Quoted(New(newProduct)) + " (" + inWhy;
      reason += motion <= kExact ? ", same placement)"
                                 : ", nearest placement, " + Millimetres(motion) + " away)";
      if (best.isAmbiguous[i]) reason += " or one just like it";
      Set(oldProduct, newProduct, reason);
    }
  }

  /// Equal parts may have changed places under the names that they had.
  void MarkSwapped(double inTolerance) {
    typedef std::tuple<std::string, std::int64_t, std::int64_t, std::int64_t> Spot;
    const auto spotOf = [](const ReviewProduct& inProduct) {
      const Placement& placement = *inProduct.placement;
      return Spot(inProduct.part, Cell(100 * placement[9]), Cell(100 * placement[10]),
                  Cell(100 * placement[11]));
    };
    std::map<Spot, int> oldAt;
    for (std::size_t i = 0; i < match_.productsOfOld.size(); ++i) {
      const int partner = match_.productsOfOld[i].position;
      const ReviewProduct& product = old_.products[i];
      if (partner < 0 || !product.placement || product.part.empty()) continue;
      if (Motion(product.placement, New(partner).placement) > inTolerance)
        oldAt.emplace(spotOf(product), static_cast<int>(i));
    }
    for (const auto& [spot, oldProduct] : oldAt) {
      const int partner = match_.productsOfOld[static_cast<std::size_t>(oldProduct)].position;
      if (!New(partner).placement) continue;
      const auto found = oldAt.find(spotOf(New(partner)));
      if (found == oldAt.end() || found->second == oldProduct) continue;
      std::string reason = match_.productsOfOld[static_cast<std::size_t>(oldProduct)].reason;
      if (!reason.empty()) reason += "; ";
      Set(oldProduct, partner,
          reason + Quoted(New(partner)) + " stands where the equal part " +
              Quoted(Old(found->second)) + " stood: they may have changed places");
    }
  }

  void ExplainMissing() {
    for (std::size_t i = 0; i < old_.products.size(); ++i)
      if (match_.productsOfOld[i].position < 0)
        match_.productsOfOld[i].reason = Quoted(old_.products[i]) + " is in the old result only";
    for (std::size_t i = 0; i < new_.products.size(); ++i)
      if (match_.productsOfNew[i].position < 0)
        match_.productsOfNew[i].reason = Quoted(new_.products[i]) + " is in the new result only";
  }

  const ReviewProduct& Old(int inProduct) const {
    return old_.products[static_cast<std::size_t>(inProduct)];
  }
  const ReviewProduct& New(int inProduct) const {
    return new_.products[static_cast<std::size_t>(inProduct)];
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  ResultMatch& match_;
};

// Interferences

/// An interference of the pair in hand.
struct Item {
  int position;
  std::size_t first;  // which of its products is the pair's first
};
typedef std::vector<Item> Items;

enum class Place { kWorld, kFirst, kSecond };

class PairMatcher {
 public:
  PairMatcher(const ReviewedResult& inOld, const ReviewedResult& inNew,
              const MatchOptions& inOptions, ResultMatch& ioMatch)
      : old_(inOld), new_(inNew), options_(inOptions), match_(ioMatch) {}

  void Match(const Items& inOlds, const Items& inNews) {
    olds_ = inOlds;
    news_ = inNews;
    const ReviewRecord &oldRecord = Old(olds_[0]), &newRecord = New(news_[0]);
    const bool isSwapped = olds_[0].first != news_[0].first;
    motion_ = RelativeMotion(oldRecord, newRecord, isSwapped);
    stands_ = Motion(oldRecord.placements[0], newRecord.placements[isSwapped ? 1 : 0]) <=
                  options_.tolerance &&
              Motion(oldRecord.placements[1], newRecord.placements[isSwapped ? 0 : 1]) <=
                  options_.tolerance;
    if (olds_.size() == 1 && news_.size() == 1)
      MatchOnly();
    else
      MatchSeveral();
    ExplainAlone();
  }

 private:
  const ReviewRecord& Old(const Item& inItem) const {
    return old_.interferences[static_cast<std::size_t>(inItem.position)];
  }
  const ReviewRecord& New(const Item& inItem) const {
    return new_.interferences[static_cast<std::size_t>(inItem.position)];
  }

  static std::optional<Point3> PlaceOf(const ReviewRecord& inRecord, const Item& inItem,
                                       Place inPlace) {
    if (inPlace == Place::kWorld) return PlaceInWorld(inRecord);
    return PlaceInFrameOf(inRecord, inPlace == Place::kFirst ? inItem.first : 1 - inItem.first);
  }

  /// In the frame in which they are nearest; nothing when a place is unknown.
  std::optional<double> Distance(const Item& inOld, const Item& inNew) const {
    std::optional<double> least;
    for (const Place frame : {Place::kWorld, Place::kFirst, Place::kSecond}) {
      const auto from = PlaceOf(Old(inOld), inOld, frame), to = PlaceOf(New(inNew), inNew, frame);
      if (!from || !to) continue;
      const double distance = ZORFoundation::Length(*to - *from);
      least = std::min(distance, least.value_or(distance));
      if (stands_) break;
    }
    return least;
  }

  void MatchOnly() {
    const std::optional<double> distance = Distance(olds_[0], news_[0]);
    if (!distance || *distance <= MaxDistance()) Set(olds_[0], news_[0], false);
  }

  /// Where products move, what is between them may move as far again.
  double MaxDistance() const { return options_.samePlace + 2 * motion_; }

  void MatchSeveral() {
    if (stands_) {
      Assign(Place::kWorld, options_.samePlace);
    } else {
      for (const double distance : {kExact, MaxDistance()})
        for (const Place frame : {Place::kFirst, Place::kSecond, Place::kWorld})
          Assign(frame, distance);
    }
    AssignPlaceless();
  }

  /// One best assignment of those that are still alone and have a place.
  void Assign(Place inPlace, double inMaxDistance) {
    const auto hasPlace = [&](const ReviewRecord& inRecord, const Item& inItem) {
      return PlaceOf(inRecord, inItem, inPlace).has_value();
    };
    Assign(hasPlace, hasPlace, inPlace, inMaxDistance);
  }

  /// By type and value where a place is missing on one side.
  void AssignPlaceless() {
    const auto any = [](const ReviewRecord&, const Item&) { return true; };
    const auto placeless = [](const ReviewRecord& inRecord, const Item&) {
      return !inRecord.place;
    };
    Assign(placeless, placeless, std::nullopt, kUnlimited);
    Assign(placeless, any, std::nullopt, kUnlimited);
    Assign(any, placeless, std::nullopt, kUnlimited);
  }

  template <class OldChoice, class NewChoice>
  void Assign(const OldChoice& inOldChoice, const NewChoice& inNewChoice,
              std::optional<Place> inPlace, double inMaxDistance) {
    Items olds, news;
    for (const Item& item : olds_)
      if (PartnerOf(item).position < 0 && inOldChoice(Old(item), item)) olds.push_back(item);
    for (const Item& item : news_)
      if (PartnerOfNew(item).position < 0 && inNewChoice(New(item), item)) news.push_back(item);
    if (olds.empty() || news.empty()) return;
    std::vector<AssignmentPoint> rows, columns;
    for (const Item& item : olds) rows.push_back(PointOf(Old(item), item, inPlace));
    for (const Item& item : news) columns.push_back(PointOf(New(item), item, inPlace));
    const Assignment best = BestAssignment(rows, columns, {inMaxDistance, kOtherType, kAlone});
    for (std::size_t i = 0; i < olds.size(); ++i)
      if (best.columnOfRow[i] >= 0)
        Set(olds[i], news[static_cast<std::size_t>(best.columnOfRow[i])], best.isAmbiguous[i] != 0);
  }

  AssignmentPoint PointOf(const ReviewRecord& inRecord, const Item& inItem,
                          std::optional<Place> inPlace) {
    AssignmentPoint point;
    if (inPlace) {
      const Point3 place = *PlaceOf(inRecord, inItem, *inPlace);
      point.at = {place.x, place.y, place.z, 0};
    }
    // Large differences cost less than in proportion, so that a place outweighs a value.
    point.at[3] = kValueWeight * std::asinh(inRecord.value.value.value_or(0));
    point.kind = types_.try_emplace(inRecord.type, static_cast<int>(types_.size())).first->second;
    return point;
  }

  ResultMatch::Partner& PartnerOf(const Item& inOld) {
    return match_.interferencesOfOld[static_cast<std::size_t>(inOld.position)];
  }
  ResultMatch::Partner& PartnerOfNew(const Item& inNew) {
    return match_.interferencesOfNew[static_cast<std::size_t>(inNew.position)];
  }

  void Set(const Item& inOld, const Item& inNew, bool inIsAmbiguous) {
    std::string reason = ReasonOfProducts(Old(inOld));
    const std::optional<double> distance = Distance(inOld, inNew);
    const bool isOnly = olds_.size() == 1 && news_.size() == 1;
    if (!distance)
      reason += isOnly ? ", the only one of the pair" : ", no place given, by type and value";
    else if (*distance <= kExact)
      reason += ", same place";
    else
      reason += (isOnly ? ", the only one of the pair, " : ", nearest place, ") +
                Millimetres(*distance) + " away";
    if (inIsAmbiguous) reason += "; several are alike, taken in their order";
    PartnerOf(inOld) = {inNew.position, reason};
    PartnerOfNew(inNew) = {inOld.position, std::move(reason)};
  }

  std::string ReasonOfProducts(const ReviewRecord& inOld) const {
    std::string reason;
    for (const int product : inOld.products) {
      if (product < 0) continue;
      const std::string& why = match_.productsOfOld[static_cast<std::size_t>(product)].reason;
      if (why.empty()) continue;
      if (!reason.empty()) reason += "; ";
      reason += why;
    }
    return reason.empty() ? "same products" : reason;
  }

  void ExplainAlone() {
    for (const Item& item : olds_)
      if (PartnerOf(item).position < 0)
        PartnerOf(item).reason = "the new result has none of the pair at this place";
    for (const Item& item : news_)
      if (PartnerOfNew(item).position < 0)
        PartnerOfNew(item).reason = "the old result has none of the pair at this place";
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  const MatchOptions& options_;
  ResultMatch& match_;
  std::map<std::string, int> types_;
  Items olds_, news_;
  double motion_ = 0;    // of the second product against the first
  bool stands_ = false;  // neither product moved
};

/// An interference among all of its pair; the products' numbers are those of the new result.
struct PairRow {
  int low, high;  // of the two products
  bool isNew;
  Item item;
  auto Order() const { return std::tie(low, high, isNew, item.position); }
};

/// What interferences whose products are in one result only are left without.
std::string ReasonOfMissing(const ReviewRecord& inRecord,
                            const std::vector<ResultMatch::Partner>& inPartners) {
  for (const int product : inRecord.products)
    if (product >= 0 && inPartners[static_cast<std::size_t>(product)].position < 0)
      return inPartners[static_cast<std::size_t>(product)].reason;
  return {};
}

std::vector<PairRow> RowsOf(const ReviewedResult& inOld, const ReviewedResult& inNew,
                            ResultMatch& ioMatch) {
  std::vector<PairRow> rows;
  rows.reserve(inOld.interferences.size() + inNew.interferences.size());
  const auto add = [&](const ReviewRecord& inRecord, bool inIsNew) {
    std::array<int, 2> products = inRecord.products;
    if (!inIsNew)
      for (int& product : products)
        if (product >= 0)
          product = ioMatch.productsOfOld[static_cast<std::size_t>(product)].position;
    const std::size_t first = products[1] < products[0] ? 1 : 0;
    rows.push_back({products[first], products[1 - first], inIsNew, {inRecord.index - 1, first}});
  };
  const auto addAll = [&](const ReviewedResult& inResult, bool inIsNew,
                          const std::vector<ResultMatch::Partner>& inProducts,
                          std::vector<ResultMatch::Partner>& outPartners) {
    outPartners.resize(inResult.interferences.size());
    for (std::size_t i = 0; i < inResult.interferences.size(); ++i) {
      outPartners[i].reason = ReasonOfMissing(inResult.interferences[i], inProducts);
      if (outPartners[i].reason.empty()) add(inResult.interferences[i], inIsNew);
    }
  };
  addAll(inOld, false, ioMatch.productsOfOld, ioMatch.interferencesOfOld);
  addAll(inNew, true, ioMatch.productsOfNew, ioMatch.interferencesOfNew);
  std::ranges::sort(
      rows, [](const PairRow& inA, const PairRow& inB) { return inA.Order() < inB.Order(); });
  return rows;
}

}  // namespace

std::vector<std::string> StableIds(const ReviewedResult& inResult) {
  const std::vector<ReviewRecord>& records = inResult.interferences;
  std::vector<std::pair<std::uint64_t, std::size_t>> hashes;
  for (std::size_t i = 0; i < records.size(); ++i)
    hashes.emplace_back(HashOfIdentity(inResult, records[i]), i);
  std::ranges::sort(hashes, [&](const auto& inA, const auto& inB) {
    const auto order = [&](const auto& inHash) {
      const ReviewRecord& record = records[inHash.second];
      return std::tie(inHash.first, record.type, record.value.text, inHash.second);
    };
    return order(inA) < order(inB);
  });
  std::vector<std::string> ids(records.size());
  std::uint64_t number = 0;
  for (std::size_t i = 0; i < hashes.size(); ++i) {
    number = i > 0 && hashes[i - 1].first == hashes[i].first ? number + 1 : 0;
    ZORFoundation::Hash64 hash;
    hash.Add(hashes[i].first);
    hash.Add(number);
    ids[hashes[i].second] = ZORFoundation::HexText(number == 0 ? hashes[i].first : hash.Get());
  }
  return ids;
}

std::string PairId(const ReviewedResult& inResult, const ReviewRecord& inRecord) {
  return ZORFoundation::HexText(HashOf(KeyOf(inResult, inRecord)).Get());
}

ResultMatch MatchResults(const ReviewedResult& inOld, const ReviewedResult& inNew,
                         const MatchOptions& inOptions) {
  ResultMatch match;
  ProductMatcher(inOld, inNew, match).Match(inOptions.tolerance);
  const std::vector<PairRow> rows = RowsOf(inOld, inNew, match);
  PairMatcher matcher(inOld, inNew, inOptions, match);
  for (std::size_t begin = 0, end = 0; begin < rows.size(); begin = end) {
    Items olds, news;
    for (; end < rows.size() && rows[end].low == rows[begin].low &&
           rows[end].high == rows[begin].high;
         ++end)
      (rows[end].isNew ? news : olds).push_back(rows[end].item);
    if (!olds.empty() && !news.empty()) {
      matcher.Match(olds, news);
      continue;
    }
    for (const Item& item : olds)
      match.interferencesOfOld[static_cast<std::size_t>(item.position)].reason =
          "the new result has none of the pair";
    for (const Item& item : news)
      match.interferencesOfNew[static_cast<std::size_t>(item.position)].reason =
          "the old result has none of the pair";
  }
  return match;
}

double Motion(const std::optional<Placement>& inOld, const std::optional<Placement>& inNew) {
  if (!inOld || !inNew || *inOld == *inNew) return 0;
  return FrameDistance(FrameOf(*inOld), FrameOf(*inNew));
}

double RelativeMotion(const ReviewRecord& inOld, const ReviewRecord& inNew, bool inIsSwapped) {
  const auto& [oldFirst, oldSecond] = inOld.placements;
  const auto& newFirst = inNew.placements[inIsSwapped ? 1 : 0];
  const auto& newSecond = inNew.placements[inIsSwapped ? 0 : 1];
  if (!oldFirst || !oldSecond || !newFirst || !newSecond) return 0;
  if (*oldFirst == *newFirst && *oldSecond == *newSecond) return 0;
  const std::optional<Frame> oldFirstFromWorld = Inverse(FrameOf(*oldFirst));
  const std::optional<Frame> newFirstFromWorld = Inverse(FrameOf(*newFirst));
  if (!oldFirstFromWorld || !newFirstFromWorld) return 0;
  return FrameDistance(*oldFirstFromWorld * FrameOf(*oldSecond),
                       *newFirstFromWorld * FrameOf(*newSecond));
}

}  // namespace ZORToolkit
