#include "lyra/commands/Model.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <utility>

#include "default_platform/OpenModel.h"
#include "foundation/Vector3.h"
#include "lyra/Arguments.h"
#include "lyra/CommandErrors.h"
#include "lyra/terminal/Progress.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/scenes/ModelLimits.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

ProductLevel LevelOf(const ZORIProduct_var& inProduct, bool inIsLast) {
  ProductLevel level;
  level.product = inProduct;
  level.children.reset(inProduct->GetChildren("ZORIProduct"));
  level.isLast = inIsLast;
  return level;
}

constexpr double kDegreesPerRadian = 57.29577951308232;
constexpr double kRigid = 1e-6;      // how far from a rotation a matrix may be
constexpr double kNoTurn = 0.00005;  // degrees; not shown

std::string ColourShown(const std::array<std::uint8_t, 4>& inColour) {
  char digits[8];
  std::snprintf(digits, sizeof digits, "#%02x%02x%02x", inColour[0], inColour[1], inColour[2]);
  return digits;
}

/// At most that many decimals, without zeros at the end and without the sign of a zero.
std::string NumberShown(double inNumber, int inDecimals) {
  char digits[400];
  std::snprintf(digits, sizeof digits, "%.*f", inDecimals, inNumber);
  std::string text = digits;
  if (text.find('.') != std::string::npos) text.erase(text.find_last_not_of('0') + 1);
  if (text.ends_with('.')) text.pop_back();
  return text == "-0" ? "0" : text;
}

std::string TripleShown(const double* inNumbers) {
  return NumberShown(inNumbers[0], 3) + ", " + NumberShown(inNumbers[1], 3) + ", " +
         NumberShown(inNumbers[2], 3);
}

ZORFoundation::Vector3d VectorAt(const Placement& inPlacement, std::size_t inFirst) {
  return {inPlacement[inFirst], inPlacement[inFirst + 1], inPlacement[inFirst + 2]};
}

/// A rotation as w and a vector, w not negative; from the largest of the four numbers, so that no
/// small one is divided by (Shepperd's method).
struct Quaternion {
  double w;
  double vector[3];
};

Quaternion QuaternionOf(const double* inColumns) {
  const auto m = [&](int inRow, int inColumn) { return inColumns[3 * inColumn + inRow]; };
  const double trace = m(0, 0) + m(1, 1) + m(2, 2);
  int largest = 0;
  for (int i = 1; i < 3; ++i)
    if (m(i, i) > m(largest, largest)) largest = i;
  const int i = largest, j = (i + 1) % 3, k = (i + 2) % 3;
  Quaternion turn{};
  if (trace >= m(i, i)) {
    turn = {1 + trace, {m(2, 1) - m(1, 2), m(0, 2) - m(2, 0), m(1, 0) - m(0, 1)}};
  } else {
    turn.w = m(k, j) - m(j, k);
    turn.vector[i] = 1 + 2 * m(i, i) - trace;
    turn.vector[j] = m(j, i) + m(i, j);
    turn.vector[k] = m(k, i) + m(i, k);
  }
  if (turn.w < 0) turn = {-turn.w, {-turn.vector[0], -turn.vector[1], -turn.vector[2]}};
  return turn;
}

}  // namespace

void ModelReading::Declare(Arguments& ioArguments) {
  ioArguments.Number("--limit-time", "SECONDS", seconds,
                     "Processor time that reading the model may take (default: by its size)");
  ioArguments.Number("--limit-memory", "MB", megabytes,
                     "Memory that reading the model may take (default: by its size)");
  ioArguments.Flag("--strict", isStrict,
                   "Refuse a model of which something cannot be read, instead of a warning");
}

long long ModelReading::Seconds() const { return ModelLimit("--limit-time", seconds, "LimitTime"); }

long long ModelReading::Megabytes() const {
  return ModelLimit("--limit-memory", megabytes, "LimitMemory");
}

void ModelReading::Check() const {
  Seconds();
  Megabytes();
}

ZORDefault::ModelOptions ModelReading::Options() const {
  ZORDefault::ModelOptions options;
  options.isStrict = isStrict;
  options.maxSeconds = static_cast<double>(Seconds());
  options.maxMemory = static_cast<std::uint64_t>(Megabytes()) << 20;
  return options;
}

ZORDefault::OpenedModel OpenModelFile(const std::string& inPath, const ModelReading& inReading) {
  inReading.Check();
  if (inPath == "-") throw InputError("-: a model cannot be read from standard input");
  ProgressLine progress("reading " + inPath);
  ZORDefault::ModelOptions options = inReading.Options();
  options.progress = [&](double inDone) { progress.Show(inDone); };
  options.warn = [&](const std::string& inWarning) { progress.Warn(inWarning); };
  try {
    return ZORDefault::OpenModel(inPath, options);
  } catch (const ZORDefault::ModelError& error) {
    throw InputError(error.what());
  }
}

void WalkProducts(const ZORIProduct_var& inRoot, std::size_t inDepth, const ProductVisit& inEnter,
                  const ProductVisit& inLeave) {
  ProductLevels levels;
  levels.push_back(LevelOf(inRoot, true));
  inEnter(levels);
  while (!levels.empty()) {
    ProductLevel& level = levels.back();
    const bool descends = levels.size() <= inDepth && level.entered < level.ChildCount();
    if (descends) {
      const ZORIProduct_var child = (*level.children)[++level.entered];
      levels.push_back(LevelOf(child, level.entered == level.ChildCount()));
      inEnter(levels);
    } else {
      if (inLeave) inLeave(levels);
      levels.pop_back();
    }
  }
}

ModelProductRecord ReadModelProduct(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo info;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), info);
  ModelProductRecord record;
  record.alias = Utf8(info.alias);
  record.part = Utf8(info.partName);
  info.rootFromProduct.GetCoefficients(record.placement.data());
  record.triangles = info.triangles;
  if (info.colour) record.colour = ColourShown(*info.colour);
  return record;
}

std::string PositionShown(const Placement& inPlacement) { return TripleShown(&inPlacement[9]); }

std::string TurnShown(const Placement& inPlacement) {
  const ZORFoundation::Matrix3<double> matrix = {
      {VectorAt(inPlacement, 0), VectorAt(inPlacement, 3), VectorAt(inPlacement, 6)}};
  const auto& [x, y, z] = matrix.columns;
  if (!IsOrthonormal(matrix, kRigid)) return "scaled";
  if (Dot(Cross(x, y), z) < 0) return "mirrored";
  const Quaternion turn = QuaternionOf(inPlacement.data());
  const auto& [i, j, k] = turn.vector;
  const double length = std::sqrt(i * i + j * j + k * k);
  const double angle = 2 * std::atan2(length, turn.w) * kDegreesPerRadian;
  if (angle < kNoTurn) return "";
  const double axis[3] = {i / length, j / length, k / length};
  return NumberShown(angle, 3) + "° about " + TripleShown(axis);
}

}  // namespace lyra
