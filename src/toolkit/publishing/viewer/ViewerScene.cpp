#include "toolkit/publishing/viewer/ViewerScene.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <nlohmann/json.hpp>
#include <tuple>
#include <unordered_map>
#include <utility>

#include "default_platform/OpenModel.h"
#include "foundation/Vector3.h"
#include "toolkit/publishing/page/PageLibrary.h"
#include "toolkit/publishing/viewer/MeshCoding.h"

namespace ZORToolkit {
namespace {

using Json = nlohmann::ordered_json;
constexpr char kGrey[] = "#d2d2d2";       // of parts without a colour
constexpr std::size_t kMaxPoints = 2000;  // of one interference

typedef std::array<double, 12> Coefficients;

struct Instance {
  std::size_t part = 0;  // position in the parts
  Coefficients rootFromPart{};
  std::string colour;
};

/// The instances at and below a product, one after the other.
struct Span {
  std::size_t first = 0, end = 0;
  Coefficients rootFromProduct{};
  std::string ownColour;
};

Coefficients CoefficientsOf(const ZORMathTransformation& inTransformation) {
  Coefficients numbers{};
  inTransformation.GetCoefficients(numbers.data());
  return numbers;
}

/// Seven digits are finer than what positions are rounded to.
double Rounded(double inNumber) {
  if (inNumber == 0 || !std::isfinite(inNumber)) return 0;
  char digits[32];
  std::snprintf(digits, sizeof digits, "%.9g", inNumber);
  return std::strtod(digits, nullptr);
}

template <class Numbers>
Json JsonOf(const Numbers& inNumbers) {
  Json json = Json::array();
  for (const double number : inNumbers) json.push_back(Rounded(number));
  return json;
}

Json JsonOf(const ZORMathVector& inVector) {
  return JsonOf(std::array<double, 3>{inVector.x, inVector.y, inVector.z});
}

Json JsonOf(const PictureCamera& inCamera) {
  return {{"perspective", inCamera.isPerspective},    {"eye", JsonOf(inCamera.eye)},
          {"sight", JsonOf(inCamera.sight)},          {"up", JsonOf(inCamera.up)},
          {"focus", Rounded(inCamera.focusDistance)}, {"angle", Rounded(inCamera.angle)},
          {"height", Rounded(inCamera.height)},       {"near", Rounded(inCamera.nearPlane)},
          {"far", Rounded(inCamera.farPlane)}};
}

Json JsonOf(const CodedMesh& inMesh) {
  Json ranges = Json::array();
  for (const ColourRange& range : inMesh.ranges) ranges.push_back({range.colour, range.triangles});
  return {{"points", inMesh.points},   {"triangles", inMesh.triangles},
          {"lines", inMesh.lines},     {"linePoints", inMesh.linePoints},
          {"low", JsonOf(inMesh.low)}, {"size", JsonOf(inMesh.size)},
          {"ranges", ranges}};
}

}  // namespace

struct ViewerScene::Content {
  std::vector<std::shared_ptr<const PartMesh>> parts;
  std::unordered_map<const PartMesh*, std::size_t> partOfMesh;
  std::vector<Instance> instances;
  std::unordered_map<ZORIProduct*, Span> spans;
  Json pairs = Json::object();
  PictureSize size;

  Span Enter(const ZORIProduct_var& inProduct);
  void Walk(const ZORIProduct_var& inRoot);
  Json ProductOf(const ResolvedProduct& inProduct,
                 const std::optional<ZORDefault::SceneColour>& inImposed) const;
  std::vector<PageBlock> Blocks(double inShare, std::size_t& outSize) const;
};

/// Takes the product itself in. @return how far its span goes so far.
Span ViewerScene::Content::Enter(const ZORIProduct_var& inProduct) {
  Span span;
  span.first = span.end = instances.size();
  ZORDefault::ProductInfo info;
  if (!ZORDefault::GetProductInfo(inProduct.GetInterface(), info)) return span;
  span.rootFromProduct = CoefficientsOf(info.rootFromProduct);
  if (info.colour) span.ownColour = ColourText(*info.colour);
  if (!info.mesh || info.mesh->triangles.empty()) return span;
  if (span.ownColour.empty()) span.ownColour = kGrey;
  const auto [place, isNew] = partOfMesh.try_emplace(info.mesh.get(), parts.size());
  if (isNew) parts.push_back(info.mesh);
  instances.push_back({place->second, span.rootFromProduct, span.ownColour});
  return span;
}

// A deep tree needs no deep stack.
void ViewerScene::Content::Walk(const ZORIProduct_var& inRoot) {
  struct Level {
    ZORIProduct_var product;
    std::unique_ptr<ZORListValZORBaseUnknown_var> children;
    Span span;
    int entered = 0;
  };
  const auto levelOf = [this](const ZORIProduct_var& inProduct) {
    return Level{
        inProduct,
        std::unique_ptr<ZORListValZORBaseUnknown_var>(inProduct->GetChildren("ZORIProduct")),
        Enter(inProduct), 0};
  };
  std::vector<Level> levels;
  levels.push_back(levelOf(inRoot));
  while (!levels.empty()) {
    Level& level = levels.back();
    if (level.children && level.entered < level.children->Size()) {
      const ZORIProduct_var child = (*level.children)[++level.entered];
      levels.push_back(levelOf(child));
      continue;
    }
    level.span.end = instances.size();
    spans.emplace(level.product.GetInterface(), level.span);
    levels.pop_back();
  }
}

Json ViewerScene::Content::ProductOf(
    const ResolvedProduct& inProduct,
    const std::optional<ZORDefault::SceneColour>& inImposed) const {
  if (inProduct.shown.product.IsNull()) return nullptr;
  const auto found = spans.find(inProduct.shown.product.GetInterface());
  if (found == spans.end()) return nullptr;
  const Span& span = found->second;
  Json json = {{"first", span.first}, {"end", span.end}};
  if (inImposed || (!inProduct.colour.empty() && inProduct.colour != span.ownColour))
    json["colour"] = inProduct.colour;
  // Where the result places the product elsewhere than the model does: from where, and to where.
  if (const auto& placement = inProduct.shown.rootFromProduct) {
    const Coefficients there = CoefficientsOf(*placement);
    if (there != span.rootFromProduct) {
      json["from"] = JsonOf(span.rootFromProduct);
      json["to"] = JsonOf(there);
    }
  }
  return json;
}

ViewerScene::ViewerScene(const ZORIProduct_var& inRoot, PictureSize inSize)
    : content_(std::make_unique<Content>()) {
  content_->size = inSize;
  content_->Walk(inRoot);
}

ViewerScene::~ViewerScene() = default;

bool ViewerScene::IsEmpty() const { return content_->pairs.empty(); }

namespace {

/// The curve of an interference, of which a result has but points. It promises no order, though
/// those that follow one another mostly are neighbours: near ones are joined, the nearest first,
/// each with at most two (the greedy tour of J. L. Bentley, "Fast algorithms for geometric
/// traveling salesman problems", 1992), until the curve is as long as the result says.
/// @return pairs of places in inPoints.
std::vector<std::array<std::size_t, 2>> CurveThrough(const std::vector<ZORMathVector>& inPoints,
                                                     double inLength) {
  using ZORFoundation::operator-;
  constexpr double kMaxStep = 2.5;  // of the points' mean distance
  constexpr double kMaxLength = 1.05;
  std::vector<std::array<std::size_t, 2>> curve;
  const std::size_t count = std::min<std::size_t>(inPoints.size(), kMaxPoints);
  const double maxStep = kMaxStep * inLength / static_cast<double>(std::max<std::size_t>(count, 1));
  constexpr double kNext = 0.5;  // what following one another counts
  typedef std::tuple<double, double, std::size_t, std::size_t> Step;  // cost, length, from, to
  std::vector<Step> steps;
  for (std::size_t i = 0; i < count; ++i)
    for (std::size_t k = i + 1; k < count; ++k) {
      const double length = ZORFoundation::Length(inPoints[k] - inPoints[i]);
      if (length > 0 && length <= maxStep)
        steps.emplace_back(k == i + 1 ? kNext * length : length, length, i, k);
    }
  std::ranges::sort(steps);
  std::vector<int> ends(count, 0);
  double sum = 0;
  for (const auto& [cost, length, from, to] : steps) {
    if (ends[from] == 2 || ends[to] == 2 || sum + length > kMaxLength * inLength) continue;
    sum += length;
    ++ends[from];
    ++ends[to];
    curve.push_back({from, to});
  }
  return curve;
}

}  // namespace

void ViewerScene::Add(const std::string& inKey, const ResolvedInterference& inResolved,
                      const PictureCamera& inCamera) {
  Json points = Json::array();
  for (const ZORMathVector& point : inResolved.geometry.points)
    if (points.size() < kMaxPoints) points.push_back(JsonOf(point));
  const bool isDimension = inResolved.geometry.markers == ZORDefault::MarkerKind::kDimension &&
                           inResolved.geometry.points.size() == 2;
  content_->pairs[inKey] = {
      {"camera", JsonOf(inCamera)},
      {"products",
       {content_->ProductOf(inResolved.products[0], std::nullopt),
        content_->ProductOf(inResolved.products[1], inResolved.colours.imposedOnSecond)}},
      {"points", points},
      {"isDimension", isDimension},
      {"curve", CurveThrough(inResolved.geometry.points, inResolved.curveLength)},
      {"markers", ColourText(inResolved.colours.markers)}};
}

std::vector<PageBlock> ViewerScene::Content::Blocks(double inShare, std::size_t& outSize) const {
  const PageLibrary& library = LoadPageLibrary();
  std::vector<PageBlock> blocks(1);
  Json scene = {{"parts", Json::array()}, {"instances", Json::array()}, {"pairs", pairs}};
  double error = 0;
  outSize = 0;
  for (std::size_t i = 0; i < parts.size(); ++i) {
    const CodedMesh mesh = CodeMesh(*parts[i], inShare);
    error = std::max(error, mesh.error);
    scene["parts"].push_back(JsonOf(mesh));
    blocks.push_back(
        {std::string("part-").append(std::to_string(i)), library.gzip(mesh.bytes), true});
  }
  for (const Instance& instance : instances)
    scene["instances"].push_back({instance.part, JsonOf(instance.rootFromPart), instance.colour});
  scene["size"] = {size.width, size.height};
  scene["error"] = error;
  if (inShare < 1) scene["simplified"] = inShare;
  blocks[0] = {"scene", library.gzip(scene.dump()), true};
  for (const PageBlock& block : blocks) outSize += block.bytes.size() * 4 / 3;
  return blocks;
}

std::vector<PageBlock> ViewerScene::Blocks(std::size_t inMaxSize) const {
  constexpr double kLeast = 0.01;
  std::size_t size = 0;
  std::vector<PageBlock> blocks = content_->Blocks(1, size);
  // Lines go with the first simplification, and what small parts have stays.
  for (double share = 0.5; size > inMaxSize && share >= kLeast; share /= 2)
    blocks = content_->Blocks(share, size);
  return blocks;
}

}  // namespace ZORToolkit
