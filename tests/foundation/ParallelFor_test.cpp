#include "foundation/ParallelFor.h"

#include <gtest/gtest.h>

#include <stdexcept>

using ZORFoundation::ParallelFor;

TEST(ParallelFor, EachNumberComesOnceWhateverTheThreads) {
  for (const int threads : {1, 2, 7, 300}) {
    std::vector<std::atomic<int>> calls(200);
    ParallelFor(threads, static_cast<int>(calls.size()),
                [&](int inNumber) { ++calls[static_cast<std::size_t>(inNumber)]; });
    for (const std::atomic<int>& count : calls) EXPECT_EQ(count, 1) << threads;
  }
  ParallelFor(3, 0, [](int) { FAIL(); });
}

TEST(ParallelFor, ErrorOfAnyThreadIsRaisedAgain) {
  std::atomic<int> calls{0};
  const auto failAtThree = [&](int inNumber) {
    ++calls;
    if (inNumber == 3) throw std::runtime_error("three");
  };
  EXPECT_THROW(ParallelFor(4, 1000, failAtThree), std::runtime_error);
  calls = 0;
  EXPECT_THROW(ParallelFor(1, 1000, failAtThree), std::runtime_error);
  EXPECT_EQ(calls, 4) << "the loop ends there";
}
