#include "toolkit/review/Assignment.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <cmath>
#include <numeric>
#include <random>

namespace {

using namespace ZORToolkit;
using testing::Each;
using testing::ElementsAre;

typedef std::vector<AssignmentPoint> Points;

constexpr AssignmentCosts kCosts{10, 1, 1e6};

Points At(std::initializer_list<double> inX) {
  Points points;
  for (const double x : inX) points.push_back({{x, 0, 0, 0}, 0});
  return points;
}

double Cost(const AssignmentPoint& inA, const AssignmentPoint& inB) {
  double sum = 0;
  for (std::size_t i = 0; i < 4; ++i) sum += (inA.at[i] - inB.at[i]) * (inA.at[i] - inB.at[i]);
  return std::sqrt(sum) + (inA.kind == inB.kind ? 0 : kCosts.otherKind);
}

double CostOf(const Points& inRows, const Points& inColumns,
              const std::vector<int>& inColumnOfRow) {
  double cost = 0;
  for (std::size_t i = 0; i < inRows.size(); ++i)
    cost += inColumnOfRow[i] < 0
                ? kCosts.unassigned
                : Cost(inRows[i], inColumns[static_cast<std::size_t>(inColumnOfRow[i])]);
  return cost;
}

Points RandomPoints(std::mt19937& ioRandom, std::size_t inCount, double inSize) {
  std::uniform_real_distribution<double> coordinate(0, inSize);
  Points points(inCount);
  for (AssignmentPoint& point : points) {
    point.at = {coordinate(ioRandom), coordinate(ioRandom), coordinate(ioRandom), 0};
    point.kind = static_cast<int>(ioRandom() % 2);
  }
  return points;
}

TEST(Assignment, OneBestIsNotTheGreedyOne) {
  // The nearest pair (1 and 0) would leave 3 with 6.
  const Assignment best = BestAssignment(At({0, 3}), At({1.1, -1}), {100, 1, 1e6});
  EXPECT_THAT(best.columnOfRow, ElementsAre(1, 0));
}

TEST(Assignment, WhatIsTooFarStaysAlone) {
  EXPECT_THAT(BestAssignment(At({0, 100}), At({1, 50}), kCosts).columnOfRow, ElementsAre(0, -1));
  EXPECT_THAT(BestAssignment(At({0}), {}, kCosts).columnOfRow, ElementsAre(-1));
  EXPECT_THAT(BestAssignment({}, At({0}), kCosts).columnOfRow, ElementsAre());
}

TEST(Assignment, EqualPointsAreTakenInOrderAndSaidToBeAmbiguous) {
  const Assignment best = BestAssignment(At({5, 5, 5, 8}), At({5, 8, 5, 5}), kCosts);
  EXPECT_THAT(best.columnOfRow, ElementsAre(0, 2, 3, 1));
  EXPECT_THAT(best.isAmbiguous, ElementsAre(1, 1, 1, 0));
}

TEST(Assignment, CostIsThatOfTheBestPermutation) {
  std::mt19937 random(14);
  for (int round = 0; round < 300; ++round) {
    const std::size_t count = 1 + random() % 6;
    const Points rows = RandomPoints(random, count, 4), columns = RandomPoints(random, count, 4);
    std::vector<int> permutation(count);
    std::iota(permutation.begin(), permutation.end(), 0);
    double least = 1e9;
    do {
      least = std::min(least, CostOf(rows, columns, permutation));
    } while (std::next_permutation(permutation.begin(), permutation.end()));
    const Assignment best = BestAssignment(rows, columns, kCosts);
    EXPECT_NEAR(least, CostOf(rows, columns, best.columnOfRow), 1e-9);
  }
}

/// The least cost by the Hungarian method on all pairs (H. W. Kuhn, 1955), where what lies too far
/// costs as much as a row that stays alone.
double LeastCost(const Points& inRows, const Points& inColumns) {
  const std::size_t count = inRows.size() + inColumns.size();  // with room for all to stay alone
  const auto cost = [&](std::size_t inRow, std::size_t inColumn) {
    if (inRow >= inRows.size()) return 0.0;
    if (inColumn >= inColumns.size()) return kCosts.unassigned;
    const auto &a = inRows[inRow].at, &b = inColumns[inColumn].at;
    const bool isFar = std::hypot(a[0] - b[0], a[1] - b[1], a[2] - b[2]) > kCosts.maxDistance;
    return isFar ? kCosts.unassigned : Cost(inRows[inRow], inColumns[inColumn]);
  };
  std::vector<double> ofRow(count + 1), ofColumn(count + 1);
  std::vector<std::size_t> rowOf(count + 1), before(count + 1);
  for (std::size_t row = 1; row <= count; ++row) {
    rowOf[0] = row;
    std::vector<double> least(count + 1, HUGE_VAL);
    std::vector<char> isUsed(count + 1);
    std::size_t at = 0;
    for (; rowOf[at] != 0; at = before[0]) {
      isUsed[at] = 1;
      double delta = HUGE_VAL;
      std::size_t next = 0;
      for (std::size_t column = 1; column <= count; ++column) {
        if (isUsed[column]) continue;
        const double reduced =
            cost(rowOf[at] - 1, column - 1) - ofRow[rowOf[at]] - ofColumn[column];
        if (reduced < least[column]) {
          least[column] = reduced;
          before[column] = at;
        }
        if (least[column] < delta) {
          delta = least[column];
          next = column;
        }
      }
      for (std::size_t column = 0; column <= count; ++column) {
        if (isUsed[column]) {
          ofRow[rowOf[column]] += delta;
          ofColumn[column] -= delta;
        } else {
          least[column] -= delta;
        }
      }
      before[0] = next;
    }
    for (std::size_t column = at; column != 0; column = before[column])
      rowOf[column] = rowOf[before[column]];
  }
  double sum = 0;
  for (std::size_t column = 1; column <= count; ++column)
    sum += cost(rowOf[column] - 1, column - 1);
  return sum;
}

TEST(Assignment, CostIsThatOfTheBestAmongAllPairs) {
  std::mt19937 random(16);
  for (int round = 0; round < 120; ++round) {
    // From crowds, in which all may touch all, to points that mostly stay alone.
    const double size = 5 + 3.0 * round;
    Points rows = RandomPoints(random, 9 + random() % 20, size);
    Points columns = RandomPoints(random, 9 + random() % 20, size);
    for (AssignmentPoint& point : rows) point.at[0] -= size / 2;  // on both sides of zero
    for (AssignmentPoint& point : columns) point.at[0] -= size / 2;
    const Assignment best = BestAssignment(rows, columns, kCosts);
    EXPECT_NEAR(LeastCost(rows, columns), CostOf(rows, columns, best.columnOfRow), 1e-6) << round;
  }
}

double SecondsFor(const Points& inRows, const Points& inColumns, std::size_t& outAssigned) {
  const auto begin = std::chrono::steady_clock::now();
  const Assignment best = BestAssignment(inRows, inColumns, {10, 1, 1e12});
  outAssigned = inRows.size() - static_cast<std::size_t>(std::ranges::count(best.columnOfRow, -1));
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
}

TEST(Assignment, ManyPointsAtOneSpotAreAllAssigned) {
  Points rows(2000), columns(2000);
  for (AssignmentPoint& column : columns) column.at[0] = 1;
  std::size_t assigned = 0;
  SecondsFor(rows, columns, assigned);
  EXPECT_EQ(2000u, assigned);
}

TEST(Assignment, MovedPointsFindTheirOwn) {
  std::mt19937 random(15);
  const Points rows = RandomPoints(random, 5000, 2000);
  Points columns = rows;
  for (AssignmentPoint& column : columns) column.at[1] += 0.01;
  const Assignment best = BestAssignment(rows, columns, kCosts);
  for (std::size_t i = 0; i < rows.size(); ++i) ASSERT_EQ(static_cast<int>(i), best.columnOfRow[i]);
  EXPECT_THAT(best.isAmbiguous, Each(0));
}

}  // namespace
