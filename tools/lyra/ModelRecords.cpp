#include "lyra/ModelRecords.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include "default_platform/OpenModel.h"
#include "toolkit/records/DocumentText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

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

double Dot(const double* inA, const double* inB) {
  return inA[0] * inB[0] + inA[1] * inB[1] + inA[2] * inB[2];
}

/// Whether the three columns have length 1 and stand at right angles.
bool IsRigid(const double* inColumns) {
  for (int i = 0; i < 3; ++i)
    for (int j = i; j < 3; ++j)
      if (!(std::abs(Dot(inColumns + 3 * i, inColumns + 3 * j) - (i == j ? 1 : 0)) < kRigid))
        return false;
  return true;
}

double Determinant(const double* inColumns) {
  const double* a = inColumns;
  const double* b = inColumns + 3;
  const double cross[3] = {a[1] * b[2] - a[2] * b[1], a[2] * b[0] - a[0] * b[2],
                           a[0] * b[1] - a[1] * b[0]};
  return Dot(cross, inColumns + 6);
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

ModelProductRecord ReadModelProduct(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo facts;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), facts);
  ModelProductRecord record;
  record.alias = Utf8(facts.alias);
  record.part = Utf8(facts.partName);
  facts.rootFromProduct.GetCoefficients(record.placement.data());
  record.triangles = facts.triangles;
  if (facts.colour) record.colour = ColourShown(*facts.colour);
  return record;
}

std::string PositionShown(const Placement& inPlacement) { return TripleShown(&inPlacement[9]); }

std::string TurnShown(const Placement& inPlacement) {
  const double* columns = inPlacement.data();
  if (!IsRigid(columns)) return "scaled";
  if (Determinant(columns) < 0) return "mirrored";
  const Quaternion turn = QuaternionOf(columns);
  const double length = std::sqrt(Dot(turn.vector, turn.vector));
  const double angle = 2 * std::atan2(length, turn.w) * kDegreesPerRadian;
  if (angle < kNoTurn) return "";
  const double axis[3] = {turn.vector[0] / length, turn.vector[1] / length,
                          turn.vector[2] / length};
  return NumberShown(angle, 3) + "° about " + TripleShown(axis);
}

}  // namespace lyra
