#include "toolkit/review/Group.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <numeric>
#include <tuple>
#include <unordered_map>

#include "foundation/Hash.h"
#include "toolkit/review/Frames.h"

namespace ZORToolkit {
namespace {

constexpr std::string_view kSeparator = " --++-- ";

std::string LastName(const std::string& inPath) {
  const std::size_t at = inPath.rfind(kSeparator);
  return at == std::string::npos ? inPath : inPath.substr(at + kSeparator.size());
}

std::string PartOf(const ReviewProduct& inProduct) {
  return inProduct.part.empty() ? LastName(inProduct.Name()) : inProduct.part;
}

std::string AssemblyOf(const ReviewProduct& inProduct) {
  const std::string& path =
      inProduct.id.find(kSeparator) == std::string::npos ? inProduct.Name() : inProduct.id;
  const std::size_t at = path.rfind(kSeparator);
  return at == std::string::npos ? "(top)" : path.substr(0, at);
}

/// Joins what belongs together (B. A. Galler, M. J. Fischer, "An improved equivalence algorithm",
/// 1964), with path halving.
class DisjointSets {
 public:
  explicit DisjointSets(std::size_t inCount) : parents_(inCount) {
    std::iota(parents_.begin(), parents_.end(), std::size_t{0});
  }
  std::size_t Find(std::size_t inItem) {
    while (parents_[inItem] != inItem) {
      parents_[inItem] = parents_[parents_[inItem]];
      inItem = parents_[inItem];
    }
    return inItem;
  }
  void Join(std::size_t inA, std::size_t inB) {
    inA = Find(inA);
    inB = Find(inB);
    parents_[std::max(inA, inB)] = std::min(inA, inB);
  }

 private:
  std::vector<std::size_t> parents_;
};

/// Clusters of points by single linkage. Points of one cell are always within the distance; cells
/// are joined when a point of one is near a point of the other.
class PlaceClusters {
 public:
  PlaceClusters(const std::vector<Point3>& inPoints, double inDistance)
      : points_(inPoints), distance_(inDistance), sets_(inPoints.size()) {
    const double edge = std::max(inDistance, 1e-6) / std::sqrt(3.0);
    for (std::size_t i = 0; i < inPoints.size(); ++i) {
      const auto cell = [&](double inCoordinate) {
        return static_cast<std::int64_t>(std::floor(std::clamp(inCoordinate / edge, -4e18, 4e18)));
      };
      const Cell at{cell(inPoints[i].x), cell(inPoints[i].y), cell(inPoints[i].z)};
      std::vector<std::size_t>& inside = cells_[at];
      if (!inside.empty()) sets_.Join(inside.front(), i);
      inside.push_back(i);
    }
    for (const auto& [cell, inside] : cells_) JoinNeighbours(cell, inside);
  }
  std::size_t ClusterOf(std::size_t inPoint) { return sets_.Find(inPoint); }

 private:
  typedef std::array<std::int64_t, 3> Cell;
  struct CellHash {
    std::size_t operator()(const Cell& inCell) const {
      ZORFoundation::Hash64 hash;
      for (const std::int64_t number : inCell) hash.Add(static_cast<std::uint64_t>(number));
      return hash.Get();
    }
  };

  void JoinNeighbours(const Cell& inCell, const std::vector<std::size_t>& inInside) {
    for (std::int64_t x = 0; x <= 2; ++x)
      for (std::int64_t y = -2; y <= 2; ++y)
        for (std::int64_t z = -2; z <= 2; ++z) {
          // Half of the neighbours: the others meet this cell from their side.
          if (std::tuple(x, y, z) <= std::tuple(0, 0, 0)) continue;
          const auto other = cells_.find({inCell[0] + x, inCell[1] + y, inCell[2] + z});
          if (other != cells_.end()) JoinIfNear(inInside, other->second);
        }
  }

  void JoinIfNear(const std::vector<std::size_t>& inA, const std::vector<std::size_t>& inB) {
    if (sets_.Find(inA.front()) == sets_.Find(inB.front())) return;
    for (const std::size_t a : inA)
      for (const std::size_t b : inB) {
        if (ZORFoundation::Length(points_[a] - points_[b]) > distance_) continue;
        sets_.Join(a, b);
        return;
      }
  }

  const std::vector<Point3>& points_;
  double distance_;
  DisjointSets sets_;
  std::unordered_map<Cell, std::vector<std::size_t>, CellHash> cells_;
};

class Grouper {
 public:
  Grouper(const ReviewedResult& inResult, const std::vector<std::string>& inIds,
          const GroupOptions& inOptions)
      : result_(inResult), ids_(inIds), options_(inOptions), counts_(inResult.products.size()) {
    for (const ReviewRecord& record : result_.interferences)
      for (const int product : record.products)
        if (product >= 0) ++counts_[static_cast<std::size_t>(product)];
  }

  std::vector<InterferenceGroup> Run() const {
    std::vector<int> all(result_.interferences.size());
    std::iota(all.begin(), all.end(), 0);
    return Split(all, 0, "");
  }

 private:
  typedef std::map<std::string, std::vector<int>> Buckets;

  std::vector<InterferenceGroup> Split(const std::vector<int>& inMembers, std::size_t inLevel,
                                       const std::string& inParentId) const {
    if (inLevel == options_.by.size()) return {};
    const GroupBy by = options_.by[inLevel];
    std::vector<InterferenceGroup> groups;
    for (auto& [label, members] :
         by == GroupBy::kPlace ? ByPlace(inMembers) : ByLabel(by, inMembers)) {
      InterferenceGroup group;
      group.by = by;
      group.label = label;
      group.members = members;
      Describe(group, inParentId);
      group.groups = Split(group.members, inLevel + 1, group.id);
      groups.push_back(std::move(group));
    }
    std::ranges::sort(groups, [](const InterferenceGroup& inA, const InterferenceGroup& inB) {
      const auto order = [](const InterferenceGroup& inGroup) {
        return std::tuple(-static_cast<std::ptrdiff_t>(inGroup.members.size()),
                          inGroup.worst.value_or(HUGE_VAL), inGroup.members.front());
      };
      return order(inA) < order(inB);
    });
    return groups;
  }

  const ReviewRecord& Record(int inPosition) const {
    return result_.interferences[static_cast<std::size_t>(inPosition)];
  }

  Buckets ByLabel(GroupBy inBy, const std::vector<int>& inMembers) const {
    Buckets buckets;
    for (const int member : inMembers) buckets[LabelOf(inBy, Record(member))].push_back(member);
    return buckets;
  }

  std::string LabelOf(GroupBy inBy, const ReviewRecord& inRecord) const {
    std::string texts[2];
    int counts[2] = {-1, -1};
    for (std::size_t i = 0; i < 2; ++i) {
      if (inRecord.products[i] < 0) continue;
      const auto product = static_cast<std::size_t>(inRecord.products[i]);
      const ReviewProduct& record = result_.products[product];
      texts[i] = inBy == GroupBy::kParts        ? PartOf(record)
                 : inBy == GroupBy::kAssemblies ? AssemblyOf(record)
                                                : record.Name();
      counts[i] = counts_[product];
    }
    if (inBy == GroupBy::kProduct)
      return std::pair(-counts[0], texts[0]) < std::pair(-counts[1], texts[1]) ? texts[0]
                                                                               : texts[1];
    if (texts[1] < texts[0]) std::swap(texts[0], texts[1]);
    return texts[0] + " x " + texts[1];
  }

  Buckets ByPlace(const std::vector<int>& inMembers) const {
    std::vector<Point3> points;
    std::vector<int> placed;
    Buckets buckets;
    for (const int member : inMembers) {
      if (!Record(member).place) {
        buckets["no place"].push_back(member);
        continue;
      }
      points.push_back(ToPoint(*Record(member).place));
      placed.push_back(member);
    }
    PlaceClusters clusters(points, options_.distance);
    std::map<std::size_t, std::string> labels;
    for (std::size_t i = 0; i < placed.size(); ++i) {
      // A cluster is known by its first point.
      std::string& label = labels[clusters.ClusterOf(i)];
      if (label.empty()) label = PlaceLabel(points[i], labels.size());
      buckets[label].push_back(placed[i]);
    }
    return buckets;
  }

  static std::string PlaceLabel(const Point3& inPoint, std::size_t inNumber) {
    const auto rounded = [](double inCoordinate) {
      return Number(std::round(inCoordinate) + 0.0).text;
    };
    return "place " + std::to_string(inNumber) + ", near " + rounded(inPoint.x) + " " +
           rounded(inPoint.y) + " " + rounded(inPoint.z);
  }

  void Describe(InterferenceGroup& ioGroup, const std::string& inParentId) const {
    const std::string* leastId = nullptr;
    for (const int member : ioGroup.members) {
      const std::optional<double>& value = Record(member).value.value;
      if (ioGroup.representative < 0 || (value && (!ioGroup.worst || *value < *ioGroup.worst)))
        ioGroup.representative = member;
      if (value) ioGroup.worst = std::min(*value, ioGroup.worst.value_or(*value));
      const std::string& id = ids_[static_cast<std::size_t>(member)];
      if (leastId == nullptr || id < *leastId) leastId = &id;
    }
    ZORFoundation::Hash64 hash;
    hash.AddText(inParentId);
    hash.AddText(Name(ioGroup.by));
    hash.AddText(ioGroup.by == GroupBy::kPlace ? *leastId : ioGroup.label);
    ioGroup.id = ZORFoundation::HexText(hash.Get());
  }

  const ReviewedResult& result_;
  const std::vector<std::string>& ids_;
  const GroupOptions& options_;
  std::vector<int> counts_;  // of the interferences of each product
};

}  // namespace

const char* Name(GroupBy inBy) {
  constexpr const char* kNames[] = {"parts", "assemblies", "place", "product"};
  return kNames[static_cast<std::size_t>(inBy)];
}

std::vector<InterferenceGroup> GroupInterferences(const ReviewedResult& inResult,
                                                  const std::vector<std::string>& inIds,
                                                  const GroupOptions& inOptions) {
  return Grouper(inResult, inIds, inOptions).Run();
}

const InterferenceGroup* FindGroup(const std::vector<InterferenceGroup>& inGroups,
                                   const std::string& inId) {
  for (const InterferenceGroup& group : inGroups) {
    if (group.id == inId) return &group;
    if (const InterferenceGroup* const inner = FindGroup(group.groups, inId)) return inner;
  }
  return nullptr;
}

}  // namespace ZORToolkit
