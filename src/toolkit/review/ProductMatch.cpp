#include "toolkit/review/ProductMatch.h"

#include <algorithm>
#include <charconv>
#include <map>
#include <tuple>

#include "toolkit/review/Assignment.h"
#include "toolkit/review/Frames.h"

namespace ZORToolkit {
namespace {

std::string Quoted(const ReviewProduct& inProduct) {
  return std::string(1, '"').append(inProduct.Name()).append(1, '"');
}

class ProductMatcher {
 public:
  ProductMatcher(const ReviewedResult& inOld, const ReviewedResult& inNew, ResultMatch& ioMatch)
      : old_(inOld), new_(inNew), motions_(inOld, inNew), match_(ioMatch) {
    match_.productsOfOld.resize(old_.products.size());
    match_.productsOfNew.resize(new_.products.size());
  }

  void Match(double inTolerance) {
    ByKey();
    ByText("same alias and part", kUnlimited,
           [](const ReviewProduct& inProduct) { return TextOf(inProduct.alias, inProduct.part); });
    ByText("same last name and part", kUnlimited, [](const ReviewProduct& inProduct) {
      return TextOf(LastName(inProduct.Name()), inProduct.part);
    });
    ByText("same part", 1, [&](const ReviewProduct& inProduct) {
      return std::string(inProduct.part);  // those without a placement are far from all others
    });
    MarkSwapped(inTolerance);
    ExplainMissing();
  }

 private:
  typedef std::vector<ResultMatch::Partner> Partners;

  static std::string TextOf(std::string_view inName, std::string_view inPart) {
    if (inName.empty()) return {};
    return std::string(inName).append(1, '\0').append(inPart);
  }

  void Set(int inOld, int inNew, std::string_view inReason) {
    const bool isUnmoved = old_.WrittenPlacementOf(inOld) == new_.WrittenPlacementOf(inNew);
    match_.productsOfOld[static_cast<std::size_t>(inOld)] = {inNew, isUnmoved, inReason};
    match_.productsOfNew[static_cast<std::size_t>(inNew)] = {inOld, isUnmoved, inReason};
  }

  void ByKey() {
    int found = -1;  // the next one is likely to be the next one there too
    for (int i = 0; i < static_cast<int>(old_.products.size()); ++i) {
      const int guess = found + 1;
      const int partner = new_.FindProduct(old_, i, guess);
      if (partner < 0) continue;
      found = partner;
      Set(i, partner, "");
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

  /// Matches those left over that have one text in common, the nearest to the nearest.
  /// @param inMaxDistance between placements; where it is limited, both must have one.
  template <class Text>
  void ByText(const char* inWhy, double inMaxDistance, const Text& inTextOf) {
    std::map<std::string, Bucket> buckets;
    const auto collect = [&](const ReviewedResult& inResult, const Partners& inPartners,
                             std::vector<int> Bucket::*inSide) {
      for (std::size_t i = 0; i < inResult.products.size(); ++i) {
        const ReviewProduct& product = inResult.products[i];
        if (inPartners[i].position >= 0) continue;
        if (inMaxDistance < kUnlimited && !inResult.PlacementOf(product.element)) continue;
        const std::string text = inTextOf(product);
        if (!text.empty()) (buckets[text].*inSide).push_back(static_cast<int>(i));
      }
    };
    collect(old_, match_.productsOfOld, &Bucket::olds);
    if (buckets.empty()) return;
    collect(new_, match_.productsOfNew, &Bucket::news);
    for (const auto& [text, bucket] : buckets) MatchBucket(bucket, inWhy, inMaxDistance);
  }

  void MatchBucket(const Bucket& inBucket, const char* inWhy, double inMaxDistance) {
    if (inBucket.olds.empty() || inBucket.news.empty()) return;
    std::vector<AssignmentPoint> rows, columns;
    rows.reserve(inBucket.olds.size());
    columns.reserve(inBucket.news.size());
    for (const int product : inBucket.olds)
      rows.push_back(PointOf(old_.PlacementOf(Old(product).element)));
    for (const int product : inBucket.news)
      columns.push_back(PointOf(new_.PlacementOf(New(product).element)));
    const Assignment best = BestAssignment(rows, columns, {inMaxDistance, 0, kAlone});
    for (std::size_t i = 0; i < rows.size(); ++i) {
      if (best.columnOfRow[i] < 0) continue;
      const int oldProduct = inBucket.olds[i];
      const int newProduct = inBucket.news[static_cast<std::size_t>(best.columnOfRow[i])];
      const double motion = motions_.OfProduct(oldProduct, newProduct);
      if (motion > 1 && inMaxDistance < kUnlimited) continue;
      std::string reason = Quoted(Old(oldProduct)).append(" is ").append(Quoted(New(newProduct)));
      reason.append(" (").append(inWhy);
      reason += motion <= kExact
                    ? std::string(", same placement)")
                    : std::string(", nearest placement, ") + Millimetres(motion) + " away)";
      if (best.isAmbiguous[i]) reason += " or one just like it";
      Set(oldProduct, newProduct, match_.Keep(std::move(reason)));
    }
  }

  /// Equal parts may have changed places under the names that they had.
  void MarkSwapped(double inTolerance) {
    typedef std::tuple<std::string_view, std::int64_t, std::int64_t, std::int64_t> Spot;
    const auto spotOf = [](const ReviewProduct& inProduct, const Placement& inPlacement) {
      return Spot(inProduct.part, Cell(100 * inPlacement[9]), Cell(100 * inPlacement[10]),
                  Cell(100 * inPlacement[11]));
    };
    std::map<Spot, int> oldAt;
    for (std::size_t i = 0; i < match_.productsOfOld.size(); ++i) {
      const int partner = match_.productsOfOld[i].position;
      const ReviewProduct& product = old_.products[i];
      if (partner < 0 || match_.productsOfOld[i].isUnmoved || product.part.empty()) continue;
      if (motions_.OfProduct(static_cast<int>(i), partner) <= inTolerance) continue;
      oldAt.emplace(spotOf(product, *old_.PlacementOf(product.element)), static_cast<int>(i));
    }
    for (const auto& [spot, oldProduct] : oldAt) {
      const int partner = match_.productsOfOld[static_cast<std::size_t>(oldProduct)].position;
      const std::optional<Placement> now = new_.PlacementOf(New(partner).element);
      const auto found = oldAt.find(spotOf(New(partner), *now));
      if (found == oldAt.end() || found->second == oldProduct) continue;
      std::string reason(match_.productsOfOld[static_cast<std::size_t>(oldProduct)].reason);
      if (!reason.empty()) reason += "; ";
      reason.append(Quoted(New(partner))).append(" stands where the equal part ");
      reason.append(Quoted(Old(found->second))).append(" stood: they may have changed places");
      Set(oldProduct, partner, match_.Keep(std::move(reason)));
    }
  }

  void ExplainMissing() {
    const auto explain = [&](const ReviewedResult& inResult, const char* inWhere,
                             Partners& ioPartners) {
      for (std::size_t i = 0; i < ioPartners.size(); ++i)
        if (ioPartners[i].position < 0)
          ioPartners[i].reason = match_.Keep(Quoted(inResult.products[i]) + inWhere);
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
  Motions motions_;
  ResultMatch& match_;
};

}  // namespace

void MatchProducts(const ReviewedResult& inOld, const ReviewedResult& inNew, double inTolerance,
                   ResultMatch& ioMatch) {
  ProductMatcher(inOld, inNew, ioMatch).Match(inTolerance);
}

std::string Millimetres(double inLength) {
  char digits[32];
  const auto end =
      std::to_chars(digits, digits + sizeof digits, inLength, std::chars_format::general, 3);
  return std::string(digits, end.ptr) + " mm";
}

double Motions::Of(ElementNumber inOld, ElementNumber inNew) const {
  if (old_.WrittenPlacement(inOld) == new_.WrittenPlacement(inNew)) return 0;
  const std::optional<Placement> was = old_.PlacementOf(inOld), is = new_.PlacementOf(inNew);
  if (!was || !is || *was == *is) return 0;
  return FrameDistance(FrameOf(*was), FrameOf(*is));
}

double Motions::OfProduct(int inOld, int inNew) const {
  return Of(old_.products[static_cast<std::size_t>(inOld)].element,
            new_.products[static_cast<std::size_t>(inNew)].element);
}

double Motions::Of(const ReviewRecord& inOld, std::size_t inOldProduct, const ReviewRecord& inNew,
                   std::size_t inNewProduct) const {
  return Of(inOld.productElements[inOldProduct], inNew.productElements[inNewProduct]);
}

double Motions::Relative(const ReviewRecord& inOld, const ReviewRecord& inNew,
                         bool inIsSwapped) const {
  const std::size_t first = inIsSwapped ? 1 : 0;
  const WrittenGeometry was = old_.GeometryOf(inOld), is = new_.GeometryOf(inNew);
  if (was.placements[0] == is.placements[first] && was.placements[1] == is.placements[1 - first])
    return 0;
  const auto oldFirst = old_.PlacementOf(inOld.productElements[0]);
  const auto oldSecond = old_.PlacementOf(inOld.productElements[1]);
  const auto newFirst = new_.PlacementOf(inNew.productElements[first]);
  const auto newSecond = new_.PlacementOf(inNew.productElements[1 - first]);
  if (!oldFirst || !oldSecond || !newFirst || !newSecond) return 0;
  if (*oldFirst == *newFirst && *oldSecond == *newSecond) return 0;
  const std::optional<Frame> oldFirstFromWorld = Inverse(FrameOf(*oldFirst));
  const std::optional<Frame> newFirstFromWorld = Inverse(FrameOf(*newFirst));
  if (!oldFirstFromWorld || !newFirstFromWorld) return 0;
  return FrameDistance(*oldFirstFromWorld * FrameOf(*oldSecond),
                       *newFirstFromWorld * FrameOf(*newSecond));
}

}  // namespace ZORToolkit
