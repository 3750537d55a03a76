// The date stamp at times that this program chooses: it takes the place of the platform's clock.
#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

#include "BuildPath.h"
#include "platform/system/ZORTime.h"
#include "support/ScopedVariable.h"

namespace {
long long secondsNow = 0;

/// The local time of a date, as seconds.
long long LocalTime(int inYear, int inMonth, int inDay, int inHour, int inMinute, int inSecond) {
  std::tm fields{};
  fields.tm_year = inYear - 1900;
  fields.tm_mon = inMonth - 1;
  fields.tm_mday = inDay;
  fields.tm_hour = inHour;
  fields.tm_min = inMinute;
  fields.tm_sec = inSecond;
  fields.tm_isdst = -1;
  return std::mktime(&fields);
}

std::string StampAt(long long inSeconds) {
  secondsNow = inSeconds;
  return BuildPath::GenerateDateURL().ConvertToChar();
}
}  // namespace

// In the place of the platform's own, for the library too.
ZORTime::ZORTime() : ZORTime(secondsNow) {}

TEST(BuildPathDateStamp, LastSecondOfAYear) {
  EXPECT_EQ(StampAt(LocalTime(2025, 12, 31, 23, 59, 59)), "31_12_2025_23_59_59");
}

TEST(BuildPathDateStamp, NumbersAreNotPadded) {
  EXPECT_EQ(StampAt(LocalTime(2024, 3, 5, 9, 7, 3)), "5_3_2024_9_7_3");
}

TEST(BuildPathDateStamp, MidnightIsZero) {
  EXPECT_EQ(StampAt(LocalTime(2026, 1, 1, 0, 0, 0)), "1_1_2026_0_0_0");
}

TEST(BuildPathDateStamp, TimeIsLocal) {
  const support::ScopedVariable zone("TZ", "XYZ-5:30");  // five and a half hours ahead of UTC
  tzset();
  EXPECT_EQ(StampAt(0), "1_1_1970_5_30_0");
}
