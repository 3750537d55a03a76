#include "platform/system/ZORTime.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

#include "support/ScopedVariable.h"

using support::ScopedVariable;

namespace {

constexpr long long kLastSecondOf2025 = 1767225599;  // 2025-12-31 23:59:59 UTC

}  // namespace

TEST(ZORTime, GivesTheFieldsOfUniversalTime) {
  const ZORTime time(kLastSecondOf2025);
  EXPECT_EQ(time.GetDay(kZORTzUniversal), 31);
  EXPECT_EQ(time.GetMonth(kZORTzUniversal), 12);
  EXPECT_EQ(time.GetYear(kZORTzUniversal), 2025);
  EXPECT_EQ(time.GetHour(kZORTzUniversal), 23);
  EXPECT_EQ(time.GetMinute(kZORTzUniversal), 59);
  EXPECT_EQ(time.GetSecond(kZORTzUniversal), 59);
}

TEST(ZORTime, SelectorZeroIsLocalTime) {
  const ScopedVariable zone("TZ", "XYZ-2:30");  // two and a half hours ahead
  const ZORTime time(kLastSecondOf2025);
  const ZORTz local = static_cast<ZORTz>(0);
  EXPECT_EQ(time.GetDay(local), 1);
  EXPECT_EQ(time.GetMonth(local), 1);
  EXPECT_EQ(time.GetYear(local), 2026);
  EXPECT_EQ(time.GetHour(local), 2);
  EXPECT_EQ(time.GetMinute(local), 29);
  EXPECT_EQ(time.GetSecond(local), 59);
}

TEST(ZORTime, LocalTimeFollowsTheZone) {
  const ZORTime time(0);
  {
    const ScopedVariable zone("TZ", "XYZ-1");
    EXPECT_EQ(time.GetHour(kZORTzLocal), 1);
  }
  const ScopedVariable zone("TZ", "XYZ-3");
  EXPECT_EQ(time.GetHour(kZORTzLocal), 3);
}

TEST(ZORTime, DefaultIsNow) {
  const std::time_t before = std::time(nullptr);
  const ZORTime now;
  const std::time_t after = std::time(nullptr);
  const int seconds = now.GetHour(kZORTzUniversal) * 3600 + now.GetMinute(kZORTzUniversal) * 60 +
                      now.GetSecond(kZORTzUniversal);
  EXPECT_TRUE(seconds == before % 86400 || seconds == after % 86400);
}

TEST(ZORTime, BeforeTheEpoch) {
  EXPECT_EQ(ZORTime(-1).GetYear(kZORTzUniversal), 1969);
  EXPECT_EQ(ZORTime(-1).GetSecond(kZORTzUniversal), 59);
}
