// One best assignment between two sets of points; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_ASSIGNMENT_H
#define ZOR_TOOLKIT_REVIEW_ASSIGNMENT_H

#include <array>
#include <limits>
#include <span>
#include <vector>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

inline constexpr double kUnlimited = std::numeric_limits<double>::infinity();
inline constexpr double kExact = 0.01;  ///< what is nearer is called the same place; millimetres
inline constexpr double kAlone = 1e12;  ///< costs more than any assignment

/// What is assigned: three coordinates, a fourth that only adds to the cost, and a kind.
struct AssignmentPoint {
  std::array<double, 4> at{};
  int kind = 0;
};

struct AssignmentCosts {
  double maxDistance = 0;  ///< of the first three coordinates; what lies farther is never assigned
  double otherKind = 0;    ///< added to the four-dimensional distance when the kinds differ
  double unassigned = 0;   ///< for each row that stays alone
};

struct Assignment {
  std::vector<int> columnOfRow;   ///< -1 for a row that stays alone
  std::vector<char> isAmbiguous;  ///< another assignment of this row costs the same
};

/// The assignment of least total cost, where each row may take one of its 64 nearest columns: those
/// sets of rows and columns that cannot touch each other are settled apart, so that n log n is
/// usual. Equal points are assigned in their order. Deterministic.
///
/// Shortest augmenting paths on sparse costs: R. Jonker, A. Volgenant, "A shortest augmenting path
/// algorithm for dense and sparse linear assignment problems", Computing 38 (1987).
ZOR_TOOLKIT_EXPORT Assignment BestAssignment(std::span<const AssignmentPoint> inRows,
                                             std::span<const AssignmentPoint> inColumns,
                                             const AssignmentCosts& inCosts);

}  // namespace ZORToolkit

#endif
