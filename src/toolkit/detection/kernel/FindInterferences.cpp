#include "toolkit/detection/kernel/FindInterferences.h"

#include <Standard_Failure.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS_Shape.hxx>
#include <atomic>
#include <map>
#include <memory>
#include <mutex>
#include <numeric>
#include <set>
#include <unordered_map>

#include "foundation/ParallelFor.h"
#include "foundation/Process.h"
#include "toolkit/detection/kernel/BodyPair.h"
#include "toolkit/detection/kernel/TaskTable.h"
#include "toolkit/sharding/Shard.h"

namespace ZORDetection {
namespace {

gp_Trsf ToMotion(const Placement& inPlacement) {
  gp_Trsf motion;
  const auto& [x, y, z] = inPlacement;
  motion.SetValues(x[0], x[1], x[2], x[3], y[0], y[1], y[2], y[3], z[0], z[1], z[2], z[3]);
  return motion;
}

Point ToPoint(const gp_XYZ& inPoint) { return {inPoint.X(), inPoint.Y(), inPoint.Z()}; }

std::vector<Point> ToPoints(const std::vector<gp_XYZ>& inPoints) {
  std::vector<Point> points;
  points.reserve(inPoints.size());
  for (const gp_XYZ& point : inPoints) points.push_back(ToPoint(point));
  return points;
}

/// The probes of one thread, made on first use.
class ProbeCache {
 public:
  BodyProbe& ProbeOf(const Body& inBody) {
    auto& probe = probes_[&inBody];
    if (!probe) probe = std::make_unique<BodyProbe>(inBody);
    return *probe;
  }

 private:
  std::unordered_map<const Body*, std::unique_ptr<BodyProbe>> probes_;
};

/// A deeper clash before a less deep one, any clash before a contact, a contact before a clearance.
bool Outweighs(const Verdict& inFirst, const Verdict& inSecond) {
  if (inFirst.kind != inSecond.kind) return inFirst.kind < inSecond.kind;
  return inFirst.kind == Kind::kClash ? inFirst.depth > inSecond.depth
                                      : inFirst.distance < inSecond.distance;
}

void Merge(Verdict&& inVerdict, std::optional<Verdict>& ioBest) {
  if (!ioBest) {
    ioBest = std::move(inVerdict);
    return;
  }
  const bool isSameKind = inVerdict.kind == ioBest->kind;
  const bool isMesh = inVerdict.hasMeshPrecision || ioBest->hasMeshPrecision;
  const double precision = std::max(inVerdict.precision, ioBest->precision);
  Verdict other = std::move(inVerdict);
  if (Outweighs(other, *ioBest)) std::swap(other, *ioBest);
  if (isSameKind && ioBest->kind != Kind::kClearance) {
    ioBest->curveLength += other.curveLength;
    ioBest->curve.insert(ioBest->curve.end(), other.curve.begin(), other.curve.end());
  }
  ioBest->hasMeshPrecision = isMesh;
  ioBest->precision = precision;
}

/// Whether two parts share a face or an edge, and with it the triangulation that the kernel stores
/// there.
bool SharesTopology(const std::vector<Part>& inParts) {
  std::unordered_map<const Standard_Transient*, const Part*> owners;
  for (const Part& part : inParts) {
    if (part.shape == nullptr || part.shape->IsNull()) continue;
    for (const TopAbs_ShapeEnum kind : {TopAbs_FACE, TopAbs_EDGE})
      for (TopExp_Explorer shapes(*part.shape, kind); shapes.More(); shapes.Next())
        if (owners.try_emplace(shapes.Current().TShape().get(), &part).first->second != &part)
          return true;
  }
  return false;
}

constexpr double kCostOfVerdict = 64;  // triangles

/// The share of a box that another takes, by its longest sides: a flat box has no volume.
double CommonShare(const Box& inBox, const Box& inOther) {
  double share = 1;
  for (int i = 1; i <= 3; ++i) {
    const double length = inBox.high.Coord(i) - inBox.low.Coord(i);
    const double common = std::min(inBox.high.Coord(i), inOther.high.Coord(i)) -
                          std::max(inBox.low.Coord(i), inOther.low.Coord(i));
    if (length > 0) share *= std::clamp(common / length, 0.0, 1.0);
  }
  return std::sqrt(share);
}

class Search {
 public:
  Search(const std::vector<Part>& inParts, const std::vector<Product>& inProducts,
         const Options& inOptions)
      : products_(inProducts), options_(inOptions) {
    geometries_.resize(inParts.size());
    const int threads = SharesTopology(inParts) ? 1 : ThreadCount();
    ZORFoundation::ParallelFor(threads, static_cast<int>(inParts.size()), [&](int inPart) {
      const auto i = static_cast<std::size_t>(inPart);
      geometries_[i] = GeometryOf(inParts[i], inOptions.meshSize);
    });
    for (std::size_t i = 0; i < geometries_.size(); ++i)
      for (Unjudged& problem : geometries_[i].problems) {
        problem.part = static_cast<std::uint32_t>(i);
        findings_.unjudged.push_back(std::move(problem));
      }
  }

  Findings Run() {
    CollectPairs();
    findings_.pairsChecked = pairs_.size();
    findings_.verdicts = tasks_.Tasks().size();
    JudgeTasks();
    findings_.interferences.reserve(static_cast<std::size_t>(std::ranges::count_if(
        pairs_, [this](const PairOfProducts& pair) { return verdicts_[pair.task].has_value(); })));
    for (const PairOfProducts& pair : pairs_)
      if (verdicts_[pair.task]) AddInterference(pair, *verdicts_[pair.task]);
    return std::move(findings_);
  }

 private:
  int ThreadCount() const { return static_cast<int>(std::max(1U, options_.threads)); }

  /// Bodies farther apart than this have no interference.
  double Reach() const { return std::max(options_.contactGap, options_.clearance) + 2 * kRounding; }

  const PartGeometry& GeometryOfProduct(std::uint32_t inProduct) const {
    return geometries_[products_[inProduct].part];
  }

  void CollectPairs() {
    std::vector<Box> boxes;
    std::vector<std::uint32_t> owners;
    const double reach = Reach() / 2;
    for (std::uint32_t i = 0; i < products_.size(); ++i) {
      motions_.push_back(ToMotion(products_[i].rootFromProduct));
      const PartGeometry& part = GeometryOfProduct(i);
      if (part.box.IsEmpty()) continue;
      boxes.push_back(part.box.Moved(motions_.back()).Grown(reach + part.pointPrecision));
      owners.push_back(i);
    }
    TriangleTree tree;
    tree.Build(boxes);
    std::vector<std::uint32_t> partners, stack;
    for (std::uint32_t i = 0; i < boxes.size(); ++i) {
      partners.clear();
      if (!tree.IsEmpty()) stack.assign(1, 0);
      while (!stack.empty()) {
        const std::uint32_t position = stack.back();
        stack.pop_back();
        const TriangleTree::Node& node = tree.Nodes()[position];
        if (node.box.SquareDistance(boxes[i]) > 0) continue;
        if (node.IsLeaf()) {
          for (const std::uint32_t j : tree.Items(node))
            if (j > i && boxes[j].SquareDistance(boxes[i]) <= 0) partners.push_back(j);
        } else {
          stack.push_back(node.first);
          stack.push_back(position + 1);
        }
      }
      std::ranges::sort(partners);
      for (const std::uint32_t j : partners) AddPair(owners[i], owners[j]);
    }
  }

  void AddPair(std::uint32_t inFirst, std::uint32_t inSecond) {
    if (options_.isWanted && !options_.isWanted(inFirst, inSecond)) return;
    PairOfProducts pair{inFirst, inSecond, 0, products_[inSecond].part < products_[inFirst].part};
    const std::uint32_t a = pair.isSwapped ? inSecond : inFirst;
    const std::uint32_t b = pair.isSwapped ? inFirst : inSecond;
    const double size = std::max(GeometryOfProduct(b).box.Diagonal(), 1.0);
    pair.task = tasks_.TaskFor(products_[a].part, products_[b].part,
                               motions_[a].Inverted() * motions_[b], size);
    pairs_.push_back(pair);
  }

  /// The verdicts that this run is to find, ascending.
  std::vector<std::size_t> ChooseTasks() {
    for (const Task& task : tasks_.Tasks()) findings_.costs.push_back(CostOf(task));
    const std::vector<std::uint32_t> shares =
        ZORToolkit::SharesOf(findings_.costs, options_.shards);
    const std::set<std::uint32_t> known(options_.known.begin(), options_.known.end());
    std::vector<std::size_t> chosen;
    for (std::size_t i = 0; i < shares.size(); ++i)
      if (shares[i] + 1 == options_.shard && !known.contains(static_cast<std::uint32_t>(i)))
        chosen.push_back(i);
    if (options_.tried == 0) return chosen;
    return ZORToolkit::ItemsToTry(findings_.costs, options_.tried);
  }

  /// The expected cost of a verdict, in triangles: those of the bodies that come near each other,
  /// by the share of their boxes that overlaps, and a constant.
  std::uint64_t CostOf(const Task& inTask) const {
    const PartGeometry &first = geometries_[inTask.firstPart],
                       &second = geometries_[inTask.secondPart];
    const double reach = Reach() + first.pointPrecision + second.pointPrecision;
    double cost = kCostOfVerdict;
    for (const Body& b : second.bodies) {
      const Box box = b.box.Moved(inTask.firstFromSecond).Grown(reach);
      for (const Body& a : first.bodies)
        if (a.box.SquareDistance(box) <= 0)
          cost += static_cast<double>(a.triangles.size()) * CommonShare(a.box, box) +
                  static_cast<double>(b.triangles.size()) * CommonShare(box, a.box);
    }
    return static_cast<std::uint64_t>(std::llround(cost));
  }

  void JudgeTasks() {
    const std::vector<std::size_t> chosen = ChooseTasks();
    verdicts_.resize(tasks_.Tasks().size());
    std::atomic<bool> isStopped{false};
    std::mutex progressMutex;
    findings_.openSeconds = ZORFoundation::ProcessorSeconds();
    if (options_.keep) {
      GroupPairs();
      options_.keep(findings_);
    }
    const int threads = options_.tried > 0 ? 1 : ThreadCount();
    std::atomic<std::size_t> next{0};
    ZORFoundation::ParallelFor(threads, threads, [&](int /*inThread*/) {
      ProbeCache probes;
      while (!isStopped) {
        const std::size_t place = next++;
        if (place >= chosen.size()) return;
        const double start = ZORFoundation::ProcessorSeconds();
        JudgeTask(chosen[place], probes, progressMutex);
        const std::lock_guard lock(progressMutex);
        findings_.judged.push_back(static_cast<std::uint32_t>(chosen[place]));
        if (options_.tried > 0)
          findings_.seconds.push_back(ZORFoundation::ProcessorSeconds() - start);
        if (options_.keep) options_.keep(FindingsOf(chosen[place]));
        if (options_.progress && !options_.progress(findings_.judged.size(), chosen.size()))
          isStopped = true;
      }
    });
    findings_.isStopped = isStopped;
    std::ranges::sort(failures_, {}, &std::pair<std::size_t, std::string>::first);
    for (const auto& [task, reason] : failures_)
      findings_.unjudged.push_back(UnjudgedOf(task, reason));
  }

  Unjudged UnjudgedOf(std::size_t inTask, const std::string& inReason) const {
    const Task& task = tasks_.Tasks()[inTask];
    return {task.firstPart, task.secondPart, false, inReason, static_cast<std::uint32_t>(inTask)};
  }

  /// Sorts the numbers of the pairs by their verdicts.
  void GroupPairs() {
    pairsByTask_.resize(pairs_.size());
    std::iota(pairsByTask_.begin(), pairsByTask_.end(), 0U);
    std::ranges::stable_sort(pairsByTask_, {},
                             [this](std::uint32_t inPair) { return pairs_[inPair].task; });
  }

  /// The findings of one verdict, for all pairs in this relative placement.
  Findings FindingsOf(std::size_t inTask) const {
    Findings findings;
    findings.pairsChecked = findings_.pairsChecked;
    findings.verdicts = findings_.verdicts;
    findings.judged = {static_cast<std::uint32_t>(inTask)};
    for (const auto& [task, reason] : failures_)
      if (task == inTask) findings.unjudged.push_back(UnjudgedOf(task, reason));
    if (!verdicts_[inTask]) return findings;
    const Verdict& verdict = *verdicts_[inTask];
    if (!verdict.curve.empty()) findings.curves.push_back(ToPoints(verdict.curve));
    const auto curve = static_cast<std::uint32_t>(findings.curves.size() - 1);
    const auto taskOf = [this](std::uint32_t inPair) { return pairs_[inPair].task; };
    for (auto pair = std::ranges::lower_bound(pairsByTask_, inTask, {}, taskOf);
         pair != pairsByTask_.end() && taskOf(*pair) == inTask; ++pair)
      findings.interferences.push_back(InterferenceOf(pairs_[*pair], verdict, curve));
    return findings;
  }

  void JudgeTask(std::size_t inTask, ProbeCache& ioProbes, std::mutex& ioMutex) {
    std::string reason;
    try {
      verdicts_[inTask] = VerdictOf(tasks_.Tasks()[inTask], ioProbes);
      return;
    } catch (const Standard_Failure& failure) {
      reason = failure.GetMessageString();
    } catch (const std::exception& error) {
      reason = error.what();
    }
    const std::lock_guard lock(ioMutex);
    failures_.emplace_back(inTask, reason);
  }

  std::optional<Verdict> VerdictOf(const Task& inTask, ProbeCache& ioProbes) const {
    const PartGeometry &first = geometries_[inTask.firstPart],
                       &second = geometries_[inTask.secondPart];
    const double reach = Reach();
    const double precision = first.pointPrecision + second.pointPrecision;
    std::vector<Box> boxes;
    for (const Body& body : second.bodies)
      boxes.push_back(body.box.Moved(inTask.firstFromSecond).Grown(reach + precision));
    std::optional<Verdict> best;
    for (const Body& a : first.bodies)
      for (std::size_t i = 0; i < second.bodies.size(); ++i) {
        const Body& b = second.bodies[i];
        if (a.box.SquareDistance(boxes[i]) > 0) continue;
        const bool isMixed = a.isSolid != b.isSolid;
        if (options_.sheets == SheetPolicy::kIgnore && (!a.isSolid || !b.isSolid)) continue;
        BodyPair pair(ioProbes.ProbeOf(a), ioProbes.ProbeOf(b), inTask.firstFromSecond, precision,
                      options_);
        std::optional<Verdict> verdict = pair.Judge();
        if (!verdict) continue;
        if (isMixed && verdict->kind == Kind::kClash && options_.sheets == SheetPolicy::kContact)
          verdict->kind = Kind::kContact;
        Merge(std::move(*verdict), best);
      }
    return best;
  }

  void AddInterference(const PairOfProducts& inPair, const Verdict& inVerdict) {
    findings_.interferences.push_back(
        InterferenceOf(inPair, inVerdict, CurveOf(inPair.task, inVerdict)));
  }

  /// @param inCurve the position of its curve in the findings.
  Interference InterferenceOf(const PairOfProducts& inPair, const Verdict& inVerdict,
                              std::uint32_t inCurve) const {
    const gp_Trsf& rootFromCommon = motions_[inPair.isSwapped ? inPair.second : inPair.first];
    Interference found;
    found.first = inPair.first;
    found.second = inPair.second;
    found.kind = inVerdict.kind;
    if (found.kind == Kind::kClash) found.value = inVerdict.depth > 0 ? -inVerdict.depth : 0.0;
    if (found.kind == Kind::kClearance) found.value = inVerdict.distance;
    std::array<gp_XYZ, 2> points = inVerdict.points;
    if (inPair.isSwapped && found.kind == Kind::kClearance) std::swap(points[0], points[1]);
    for (std::size_t i = 0; i < 2; ++i) found.points[i] = ToPoint(Moved(rootFromCommon, points[i]));
    found.curveLength = inVerdict.curveLength;
    found.curve = inCurve;
    found.curveProduct = inPair.isSwapped ? inPair.second : inPair.first;
    found.isDuplicate = inVerdict.isDuplicate;
    found.isSheetInSolid = inVerdict.isSheetInSolid;
    found.hasMeshPrecision = inVerdict.hasMeshPrecision;
    found.precision = inVerdict.precision;
    return found;
  }

  /// @return its position in the findings, which have each verdict's curve once.
  std::uint32_t CurveOf(std::size_t inTask, const Verdict& inVerdict) {
    if (inVerdict.curve.empty()) return 0;
    curves_.resize(verdicts_.size());
    if (curves_[inTask] == 0) {
      curves_[inTask] = static_cast<std::uint32_t>(findings_.curves.size());
      findings_.curves.push_back(ToPoints(inVerdict.curve));
    }
    return curves_[inTask];
  }

  const std::vector<Product>& products_;
  const Options& options_;
  std::vector<PartGeometry> geometries_;
  std::vector<gp_Trsf> motions_;
  TaskTable tasks_;
  std::vector<PairOfProducts> pairs_;
  std::vector<std::uint32_t> pairsByTask_;  ///< only where verdicts are kept
  std::vector<std::optional<Verdict>> verdicts_;
  std::vector<std::uint32_t> curves_;  ///< of the verdicts, in the findings; 0: none yet
  std::vector<std::pair<std::size_t, std::string>> failures_;
  Findings findings_;
};

}  // namespace

Findings FindInterferences(const std::vector<Part>& inParts, const std::vector<Product>& inProducts,
                           const Options& inOptions) {
  return Search(inParts, inProducts, inOptions).Run();
}

}  // namespace ZORDetection
