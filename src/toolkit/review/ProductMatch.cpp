#include "toolkit/review/ProductMatch.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <map>
#include <tuple>

#include "foundation/Bytes.h"
#include "toolkit/review/Assignment.h"
#include "toolkit/review/Frames.h"
#include "toolkit/review/ReviewSource.h"

namespace ZORToolkit {
namespace {

std::string Quoted(const ReviewProduct& inProduct) {
  return std::string(1, '"').append(inProduct.Name()).append(1, '"');
}

class ProductMatcher {
 public:
  ProductMatcher(const Motions& inMotions, ResultMatch& ioMatch)
      : old_(inMotions.Old()), new_(inMotions.New()), motions_(inMotions), match_(ioMatch) {
    match_.productsOfOld.resize(old_.products.size());
    match_.productsOfNew.resize(new_.products.size());
  }

  void Match(double inTolerance) {
    ByKey();
    ByText("same alias and part", kUnlimited, [](const ReviewProduct& inProduct) {
      return Texts{inProduct.alias, inProduct.part};
    });
    ByText("same last name and part", kUnlimited, [](const ReviewProduct& inProduct) {
      return Texts{LastName(inProduct.Name()), inProduct.part};
    });
    // Those without a placement are far from all others.
    ByText("same part", 1, [](const ReviewProduct& inProduct) {
      return Texts{inProduct.part, {}};
    });
    MarkSwapped(inTolerance);
    ExplainMissing();
  }

 private:
  typedef std::vector<ResultMatch::Partner> Partners;

  void Set(int inOld, int inNew, std::uint32_t inReason) {
    const bool isUnmoved = old_.WrittenPlacementOf(inOld) == new_.WrittenPlacementOf(inNew);
    match_.productsOfOld[static_cast<std::size_t>(inOld)] = {inNew, isUnmoved,
                                                             inReason & ResultMatch::kReasonBits};
    match_.productsOfNew[static_cast<std::size_t>(inNew)] = {inOld, isUnmoved,
                                                             inReason & ResultMatch::kReasonBits};
  }

  void ByKey() {
    constexpr int kAhead = 12;
    int found = -1;  // the next one is likely to be the next one there too
    for (int i = 0; i < static_cast<int>(old_.products.size()); ++i) {
      const int guess = found + 1;
      old_.source->ExpectText(i + kAhead);
      new_.source->ExpectText(guess + kAhead);
      const int partner = new_.FindProduct(old_, i, guess);
      if (partner < 0) continue;
      found = partner;
      Set(i, partner, 0);
    }
  }

  static AssignmentPoint PointOf(const std::optional<Placement>& inPlacement) {
    AssignmentPoint point;
    if (!inPlacement) return point;
    const Placement& placement = *inPlacement;
    point.at = {placement[9], placement[10], placement[11], 0};
    for (std::size_t i = 0; i < 9; ++i)  // some number that tells rotations apart
      point.at[3] += placement[i] * (0.31 + 0.13 * static_cast<double>(i));
    return point;
  }

  struct Bucket {
    std::vector<int> olds, news;
  };
  /// Texts that products of both results may have in common.
  struct Texts {
    std::string_view name, part;
    bool operator==(const Texts&) const = default;
  };
  struct LeftOver {
    std::uint64_t hash;  // of the texts, which mostly decides
    Texts texts;
    bool isNew;
    int product;
    bool operator<(const LeftOver& inOther) const {
      const auto order = [](const LeftOver& inOne) {
        return std::tie(inOne.hash, inOne.texts.name, inOne.texts.part, inOne.isNew, inOne.product);
      };
      return order(*this) < order(inOther);
    }
  };

  /// Matches those left over that have their texts in common, the nearest to the nearest.
  /// @param inMaxDistance between placements; where it is limited, both must have one.
  /// @param inTextsOf without a name for a product that is passed over.
  template <class TextsOf>
  void ByText(const char* inWhy, double inMaxDistance, const TextsOf& inTextsOf) {
    const auto isAlone = [](const ResultMatch::Partner& inOne) { return inOne.position < 0; };
    if (std::ranges::none_of(match_.productsOfOld, isAlone) ||
        std::ranges::none_of(match_.productsOfNew, isAlone))
      return;
    std::vector<LeftOver> leftOver;
    const auto collect = [&](const ReviewedResult& inResult, const Partners& inPartners,
                             bool inIsNew) {
      for (std::size_t i = 0; i < inPartners.size(); ++i) {
        if (inPartners[i].position >= 0) continue;
        const ReviewProduct& product = inResult.products[i];
        const Texts texts = inTextsOf(product);
        if (texts.name.empty()) continue;
        if (inMaxDistance < kUnlimited && !inResult.PlacementOf(product.element)) continue;
        const std::uint64_t hash =
            Mix(ZORFoundation::HashOfBytes(texts.name.data(), texts.name.size()),
                ZORFoundation::HashOfBytes(texts.part.data(), texts.part.size()));
        leftOver.push_back({hash, texts, inIsNew, static_cast<int>(i)});
      }
    };
    collect(old_, match_.productsOfOld, false);
    collect(new_, match_.productsOfNew, true);
    std::sort(leftOver.begin(), leftOver.end());
    Bucket bucket;
    for (std::size_t at = 0; at < leftOver.size();) {
      bucket.olds.clear();
      bucket.news.clear();
      const Texts texts = leftOver[at].texts;
      for (; at < leftOver.size() && leftOver[at].texts == texts; ++at)
        (leftOver[at].isNew ? bucket.news : bucket.olds).push_back(leftOver[at].product);
      MatchBucket(bucket, inWhy, inMaxDistance);
    }
  }

  void MatchBucket(const Bucket& inBucket, const char* inWhy, double inMaxDistance) {
    if (inBucket.olds.empty() || inBucket.news.empty()) return;
    if (inBucket.olds.size() == 1 && inBucket.news.size() == 1 && inMaxDistance == kUnlimited)
      return SetByText(inBucket.olds[0], inBucket.news[0], inWhy, false);
    std::vector<AssignmentPoint> rows, columns;
    rows.reserve(inBucket.olds.size());
    columns.reserve(inBucket.news.size());
    for (const int product : inBucket.olds)
      rows.push_back(PointOf(motions_.OldPlacementOf(Old(product).element)));
    for (const int product : inBucket.news)
      columns.push_back(PointOf(motions_.NewPlacementOf(New(product).element)));
    const Assignment best = BestAssignment(rows, columns, {inMaxDistance, 0, kAlone});
    for (std::size_t i = 0; i < rows.size(); ++i) {
      if (best.columnOfRow[i] < 0) continue;
      const int oldProduct = inBucket.olds[i];
      const int newProduct = inBucket.news[static_cast<std::size_t>(best.columnOfRow[i])];
      if (inMaxDistance < kUnlimited && motions_.OfProduct(oldProduct, newProduct) > 1) continue;
      SetByText(oldProduct, newProduct, inWhy, best.isAmbiguous[i] != 0);
    }
  }

  void SetByText(int inOld, int inNew, const char* inWhy, bool inIsAmbiguous) {
    const double motion = motions_.OfProduct(inOld, inNew);
    std::string reason = Quoted(Old(inOld)).append(" is ").append(Quoted(New(inNew)));
    reason.append(" (").append(inWhy);
    reason += motion <= kExact
                  ? std::string(", same placement)")
                  : std::string(", nearest placement, ") + Millimetres(motion) + " away)";
    if (inIsAmbiguous) reason += " or one just like it";
    Set(inOld, inNew, match_.Keep(std::move(reason)));
  }

  /// Equal parts may have changed places under the names that they had.
  void MarkSwapped(double inTolerance) {
    typedef std::tuple<std::string_view, std::int64_t, std::int64_t, std::int64_t> Spot;
    const auto spotOf = [](const ReviewProduct& inProduct, const Placement& inPlacement) {
      return Spot(inProduct.part, Cell(100 * inPlacement[9]), Cell(100 * inPlacement[10]),
                  Cell(100 * inPlacement[11]));
    };
    struct Moved {
      int product = 0;
      Spot now;
    };
    std::map<Spot, Moved> oldAt;
    for (std::size_t i = 0; i < match_.productsOfOld.size(); ++i) {
      const int partner = match_.productsOfOld[i].position;
      const ReviewProduct& product = old_.products[i];
      if (partner < 0 || match_.productsOfOld[i].isUnmoved || product.part.empty()) continue;
      if (motions_.OfProduct(static_cast<int>(i), partner) <= inTolerance) continue;
      const ReviewProduct& now = New(partner);
      oldAt.emplace(spotOf(product, *motions_.OldPlacementOf(product.element)),
                    Moved{static_cast<int>(i), spotOf(now, *motions_.NewPlacementOf(now.element))});
    }
    for (const auto& [spot, moved] : oldAt) {
      const auto found = oldAt.find(moved.now);
      if (found == oldAt.end() || found->second.product == moved.product) continue;
      const ResultMatch::Partner was =
          match_.productsOfOld[static_cast<std::size_t>(moved.product)];
      std::string reason(match_.Reason(was));
      if (!reason.empty()) reason += "; ";
      reason.append(Quoted(New(was.position))).append(" stands where the equal part ");
      reason.append(Quoted(Old(found->second.product)))
          .append(" stood: they may have changed places");
      Set(moved.product, was.position, match_.Keep(std::move(reason)));
    }
  }

  void ExplainMissing() {
    const auto explain = [&](const ReviewedResult& inResult, const char* inWhere,
                             Partners& ioPartners) {
      for (std::size_t i = 0; i < ioPartners.size(); ++i)
        if (ioPartners[i].position < 0)
          ioPartners[i].reason =
              match_.Keep(Quoted(inResult.products[i]) + inWhere) & ResultMatch::kReasonBits;
    };
    explain(old_, " is in the old result only", match_.productsOfOld);
    explain(new_, " is in the new result only", match_.productsOfNew);
  }

  const ReviewProduct& Old(int inProduct) const {
    return old_.products[static_cast<std::size_t>(inProduct)];
  }
  const ReviewProduct& New(int inProduct) const {
    return new_.products[static_cast<std::size_t>(inProduct)];
  }

  const ReviewedResult& old_;
  const ReviewedResult& new_;
  const Motions& motions_;
  ResultMatch& match_;
};

}  // namespace

void MatchProducts(const Motions& inMotions, double inTolerance, ResultMatch& ioMatch) {
  ProductMatcher(inMotions, ioMatch).Match(inTolerance);
}

std::string Millimetres(double inLength) {
  char digits[32];
  const auto end =
      std::to_chars(digits, digits + sizeof digits, inLength, std::chars_format::general, 3);
  return std::string(digits, end.ptr) + " mm";
}

Motions::RecentPlacements::RecentPlacements(const ReviewedResult& inResult)
    : result_(inResult),
      known_(std::bit_ceil(std::max<std::size_t>(inResult.products.size() / 32, 16))) {}

const std::optional<Placement>& Motions::RecentPlacements::Of(ElementNumber inProduct) const {
  const std::uint64_t hash = (inProduct * 0x9E3779B97F4A7C15u) >> 32;
  Known& known = known_[hash & (known_.size() - 1)];
  if (known.product != inProduct) known = {inProduct, result_.PlacementOf(inProduct)};
  return known.placement;
}

double Motions::Of(ElementNumber inOld, ElementNumber inNew) const {
  const auto &was = placementsOfOld_.Of(inOld), &is = placementsOfNew_.Of(inNew);
  if (!was || !is || *was == *is) return 0;
  return FrameDistance(FrameOf(*was), FrameOf(*is));
}

double Motions::OfProduct(int inOld, int inNew) const {
  if (old_.WrittenPlacementOf(inOld) == new_.WrittenPlacementOf(inNew)) return 0;
  return Of(old_.products[static_cast<std::size_t>(inOld)].element,
            new_.products[static_cast<std::size_t>(inNew)].element);
}

double Motions::Of(const ReviewRecord& inOld, std::size_t inOldProduct, const ReviewRecord& inNew,
                   std::size_t inNewProduct) const {
  if (old_.GeometryOf(inOld).placements[inOldProduct] ==
      new_.GeometryOf(inNew).placements[inNewProduct])
    return 0;
  return Of(inOld.productElements[inOldProduct], inNew.productElements[inNewProduct]);
}

double Motions::Relative(const ReviewRecord& inOld, const ReviewRecord& inNew,
                         bool inIsSwapped) const {
  const std::size_t first = inIsSwapped ? 1 : 0;
  const WrittenGeometry was = old_.GeometryOf(inOld), is = new_.GeometryOf(inNew);
  if (was.placements[0] == is.placements[first] && was.placements[1] == is.placements[1 - first])
    return 0;
  const auto oldFirst = OldPlacementOf(inOld.productElements[0]);
  const auto oldSecond = OldPlacementOf(inOld.productElements[1]);
  const auto newFirst = NewPlacementOf(inNew.productElements[first]);
  const auto newSecond = NewPlacementOf(inNew.productElements[1 - first]);
  if (!oldFirst || !oldSecond || !newFirst || !newSecond) return 0;
  if (*oldFirst == *newFirst && *oldSecond == *newSecond) return 0;
  const std::optional<Frame> oldFirstFromWorld = Inverse(FrameOf(*oldFirst));
  const std::optional<Frame> newFirstFromWorld = Inverse(FrameOf(*newFirst));
  if (!oldFirstFromWorld || !newFirstFromWorld) return 0;
  return FrameDistance(*oldFirstFromWorld * FrameOf(*oldSecond),
                       *newFirstFromWorld * FrameOf(*newSecond));
}

}  // namespace ZORToolkit
