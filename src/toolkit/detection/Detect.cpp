#include "toolkit/detection/Detect.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <map>
#include <memory>
#include <stdexcept>
#include <thread>

#include "default_platform/ModelProgram.h"
#include "default_platform/OpenModel.h"
#include "foundation/NativePath.h"
#include "foundation/Vector3.h"
#include "toolkit/Error.h"
#include "toolkit/detection/DetectionTask.h"
#include "toolkit/detection/ProductTree.h"
#include "toolkit/detection/Viewpoints.h"

namespace ZORToolkit {
namespace {

constexpr double kRigid = 1e-6;
constexpr std::size_t kMaxPairPoints = 32;  // of one pair of parts

bool IsRigid(const ZORMathTransformation& inPlacement) {
  std::array<double, 12> m{};
  inPlacement.GetCoefficients(m.data());
  const ZORFoundation::Matrix3<double> linear = {
      {{m[0], m[1], m[2]}, {m[3], m[4], m[5]}, {m[6], m[7], m[8]}}};
  return IsOrthonormal(linear, kRigid) && inPlacement.GetMatrix().Determinant() > 0;
}

ZORDetection::Placement ToPlacement(const ZORMathTransformation& inPlacement) {
  std::array<double, 12> m{};
  inPlacement.GetCoefficients(m.data());
  ZORDetection::Placement placement{};
  for (std::size_t row = 0; row < 3; ++row)
    for (std::size_t column = 0; column < 4; ++column) placement[row][column] = m[3 * column + row];
  return placement;
}

DetectedInterference ToInterference(const ZORDetection::Interference& inFound) {
  DetectedInterference found;
  found.kind = inFound.kind == ZORDetection::Kind::kClash ? DetectedInterference::Kind::kClash
               : inFound.kind == ZORDetection::Kind::kContact
                   ? DetectedInterference::Kind::kContact
                   : DetectedInterference::Kind::kClearance;
  found.value = inFound.value;
  found.points = inFound.points;
  found.curveLength = inFound.curveLength;
  found.isDuplicate = inFound.isDuplicate;
  found.isSheetInSolid = inFound.isSheetInSolid;
  if (inFound.hasMeshPrecision) found.meshPrecision = inFound.precision;
  return found;
}

/// Of the interferences between the parts of two products the worst one counts.
void Merge(DetectedInterference inFound, DetectedInterference& ioBest) {
  const bool isSameKind = inFound.kind == ioBest.kind;
  const bool isWorse = isSameKind ? inFound.value < ioBest.value : inFound.kind < ioBest.kind;
  if (isWorse) std::swap(inFound, ioBest);
  if (isSameKind && ioBest.kind != DetectedInterference::Kind::kClearance) {
    ioBest.curveLength += inFound.curveLength;
    ioBest.curve.insert(ioBest.curve.end(), inFound.curve.begin(), inFound.curve.end());
  }
  ioBest.isDuplicate = ioBest.isDuplicate && inFound.isDuplicate;
  if (inFound.meshPrecision)
    ioBest.meshPrecision = std::max(ioBest.meshPrecision.value_or(0), *inFound.meshPrecision);
}

// Memory for the search besides that for reading, in bytes, where the user sets no limit.
constexpr std::uint64_t kMemory = std::uint64_t{1} << 30, kMemoryPerThread = 64 << 20,
                        kMemoryPerProduct = 16 << 10;

ZORDefault::ModelOptions ModelOptionsOf(const DetectionOptions& inOptions) {
  ZORDefault::ModelOptions options;
  options.maxSeconds = inOptions.maxSeconds;
  options.maxMemory = inOptions.maxMemory;
  options.isStrict = inOptions.isStrict;
  return options;
}

class Detection {
 public:
  Detection(const std::string& inModel, const DetectionOptions& inOptions,
            const ProductTree& inTree)
      : model_(inModel),
        options_(inOptions),
        tree_(inTree),
        selection_(inModel, inOptions, inTree.Units()) {}

  DetectionResult Run() {
    ChooseLeaves();
    result_.model = ZORFoundation::NativePath(model_).filename().string();
    result_.document = tree_.RootAlias();
    result_.tolerance = options_.tolerance;
    result_.contactGap = options_.contactGap;
    result_.clearance = options_.clearance;
    result_.computationCase =
        options_.between ? "Between two selections" : "Between all components";
    for (const Unit& unit : tree_.Units()) result_.products.push_back(unit.product);
    const ZORDetection::Findings findings = FindUnknown();
    AddFindings(findings);
    AddWork(findings);
    AddUnjudged(findings);
    return std::move(result_);
  }

 private:
  void ChooseLeaves() {
    std::vector<bool> isSeen(tree_.Units().size());
    for (const Leaf& leaf : tree_.Leaves()) {
      if (!selection_.IsSelected(leaf.unit)) continue;
      if (!isSeen[leaf.unit]) ++result_.productsChecked;
      isSeen[leaf.unit] = true;
      if (!IsRigid(leaf.rootFromProduct)) {
        result_.unjudged.push_back("the product \"" + tree_.Units()[leaf.unit].product.path +
                                   "\": its placement changes its size");
        continue;
      }
      chosen_.push_back(leaf);
      task_.products.push_back({{leaf.part, ToPlacement(leaf.rootFromProduct)},
                                static_cast<std::uint32_t>(leaf.unit),
                                selection_.IsFirst(leaf.unit),
                                selection_.IsSecond(leaf.unit)});
    }
    if (result_.productsChecked < 2) throw Error(model_, "there are not two products to check");
  }

  /// The known findings, and those of a run for what is missing of the share.
  ZORDetection::Findings FindUnknown() {
    if (options_.known.empty()) return Find();
    ZORDetection::Findings known = Known();
    task_.options.known = known.judged;
    if (known.judged.size() == known.verdicts) return known;
    ZORDetection::Findings found = Find();
    const bool isStopped = found.isStopped;
    TakeInto(known, std::move(found));
    known.isStopped = isStopped;
    return known;
  }

  ZORDetection::Findings Known() const {
    try {
      ZORDetection::Findings known = ZORDetection::DecodeFindings(options_.known.front());
      for (std::size_t i = 1; i < options_.known.size(); ++i)
        TakeInto(known, ZORDetection::DecodeFindings(options_.known[i]));
      const auto isProduct = [&](std::uint32_t inNumber) { return inNumber < chosen_.size(); };
      for (const ZORDetection::Interference& found : known.interferences)
        if (!isProduct(found.first) || !isProduct(found.second) || !isProduct(found.curveProduct) ||
            found.curve >= known.curves.size())
          RefuseKnown();
      return known;
    } catch (const std::runtime_error&) {
      RefuseKnown();
    }
  }

  void TakeInto(ZORDetection::Findings& ioKnown, ZORDetection::Findings&& inFound) const {
    if (!ZORDetection::MergeFindings(std::move(inFound), ioKnown)) RefuseKnown();
  }

  [[noreturn]] void RefuseKnown() const {
    throw Error(model_ + ": the findings that are known are not of this model");
  }

  void AddWork(const ZORDetection::Findings& inFindings) {
    result_.findings = ZORDetection::Encode(inFindings);
    result_.judged.assign(inFindings.judged.begin(), inFindings.judged.end());
    result_.work.costs = inFindings.costs;
    result_.work.openSeconds = inFindings.openSeconds;
    for (std::size_t i = 0; i < inFindings.seconds.size(); ++i)
      result_.work.timed.push_back({inFindings.judged[i], inFindings.seconds[i]});
  }

  ZORDetection::Findings Find() {
    ZORDetection::Options& options = task_.options;
    options.shard = options_.shard.number;
    options.shards = options_.shard.count;
    options.tried = options_.tried;
    options.tolerance = options_.tolerance;
    options.contactGap = options_.contactGap;
    options.clearance = options_.clearance;
    options.sheets = options_.sheets == SheetsMean::kClash     ? ZORDetection::SheetPolicy::kClash
                     : options_.sheets == SheetsMean::kContact ? ZORDetection::SheetPolicy::kContact
                                                               : ZORDetection::SheetPolicy::kIgnore;
    options.threads = options_.threads != 0 ? options_.threads
                                            : std::max(1U, std::thread::hardware_concurrency());
    task_.isKept = options_.kept >= 0;
    ZORDefault::ModelProgram program;
    program.kept = options_.kept;
    program.path = ZORDetection::kInterferenceFinderPath;
    program.task = Encode(task_);
    program.memory =
        kMemory + kMemoryPerThread * options.threads + kMemoryPerProduct * task_.products.size();
    program.tell = [this](std::string_view line) { return Tell(std::string(line)); };
    return ZORDetection::DecodeFindings(
        ZORDefault::RunOnModel(model_, program, ModelOptionsOf(options_)));
  }

  /// @param inLine the number of verdicts that are done, and of all.
  bool Tell(const std::string& inLine) const {
    std::size_t done = 0, all = 0;
    return !options_.progress || std::sscanf(inLine.c_str(), "%zu %zu", &done, &all) != 2 ||
           all == 0 || options_.progress(done, all);
  }

  void AddFindings(const ZORDetection::Findings& inFindings) {
    std::vector<ZORDetection::Product> products;
    for (const ZORDetection::TaskProduct& product : task_.products)
      products.push_back(product.product);
    std::map<std::pair<std::size_t, std::size_t>, DetectedInterference> byUnits;
    for (const ZORDetection::Interference& found : inFindings.interferences) {
      DetectedInterference interference = ToInterference(found);
      interference.curve = PointsAlong(inFindings, found, products, kMaxPairPoints);
      interference.first = chosen_[found.first].unit;
      interference.second = chosen_[found.second].unit;
      const auto [place, isNew] =
          byUnits.try_emplace({interference.first, interference.second}, interference);
      if (!isNew) Merge(interference, place->second);
    }
    for (auto& [units, interference] : byUnits)
      result_.interferences.push_back(std::move(interference));
    result_.pairsNear = inFindings.pairsChecked;
    result_.isStopped = inFindings.isStopped;
  }

  /// A part without a name is called by its first instance.
  std::string NameOfPart(std::uint32_t inPart) const {
    const auto name = tree_.PartNames().find(inPart);
    if (name != tree_.PartNames().end() && !name->second.empty())
      return "the part \"" + name->second + '"';
    const auto leaf = std::ranges::find(chosen_, inPart, &Leaf::part);
    return "the part of \"" +
           (leaf == chosen_.end() ? "" : tree_.Units()[leaf->unit].product.path) + '"';
  }

  void AddUnjudged(const ZORDetection::Findings& inFindings) {
    std::map<std::uint32_t, bool> isWhole;
    for (const ZORDetection::Unjudged& unjudged : inFindings.unjudged) {
      std::string line = NameOfPart(unjudged.part);
      if (unjudged.other) line += " against " + NameOfPart(*unjudged.other);
      result_.unjudged.push_back(line + ": " + unjudged.reason);
      if (unjudged.isWholePart) isWhole[unjudged.part] = true;
    }
    std::size_t judged = 0;
    for (const Leaf& leaf : chosen_) judged += isWhole.contains(leaf.part) ? 0 : 1;
    if (judged < 2) throw Error(model_, std::string("nothing could be checked: ") + FirstReason());
    if (options_.warn)
      for (const std::string& line : result_.unjudged)
        options_.warn(model_ + ": not checked: " + line);
  }

  std::string FirstReason() const {
    return result_.unjudged.empty() ? "no two products have geometry" : result_.unjudged.front();
  }

  const std::string& model_;
  const DetectionOptions& options_;
  const ProductTree& tree_;
  const Selection selection_;
  std::vector<Leaf> chosen_;
  ZORDetection::DetectionTask task_;
  DetectionResult result_;
};

}  // namespace

std::string FindFault(const DetectionOptions& inOptions) {
  const auto isLength = [](double length) { return std::isfinite(length) && length >= 0; };
  if (!isLength(inOptions.tolerance)) return "the tolerance must be a length, 0 or more";
  if (!isLength(inOptions.contactGap)) return "the contact gap must be a length, 0 or more";
  if (!isLength(inOptions.clearance)) return "the clearance must be a length, 0 or more";
  if (inOptions.clearance > 0 && inOptions.contactGap > inOptions.clearance)
    return "the contact gap must not be above the clearance";
  if (inOptions.level && *inOptions.level < 1) return "the level must be 1 or more";
  return "";
}

DetectionResult Detect(const std::string& inModel, const DetectionOptions& inOptions) {
  if (const std::string fault = FindFault(inOptions); !fault.empty()) throw Error(fault);
  ZORDefault::ModelOptions modelOptions = ModelOptionsOf(inOptions);
  modelOptions.progress = inOptions.readingProgress;
  modelOptions.warn = inOptions.warn;
  try {
    const ZORDefault::OpenedModel opened = ZORDefault::OpenModel(inModel, modelOptions);
    const ProductTree tree(opened.root, inOptions);
    DetectionResult result = Detection(inModel, inOptions, tree).Run();
    if (inOptions.hasViewpoints) AddViewpoints(opened.root, result);
    return result;
  } catch (const ZORDefault::ModelError& error) {
    throw Error(error.GetPath(), error.GetReason());
  }
}

}  // namespace ZORToolkit
