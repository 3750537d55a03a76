#include "platform/system/ZORTime.h"

#include <time.h>

namespace {

/// After this many seconds the calendar repeats itself.
constexpr long long k400Years = 146'097LL * 86'400;

// The calendar's fields; those of an empty tm where the year does not fit an int.
tm FieldsOf(long long inSeconds, ZORTz inZone) {
  const time_t seconds = static_cast<time_t>(inSeconds);
  tm fields{};
  if (inZone != kZORTzUniversal)
    tzset();  // the zone is read afresh: localtime_r alone would keep the first one
  const tm* const done =
      inZone == kZORTzUniversal ? gmtime_r(&seconds, &fields) : localtime_r(&seconds, &fields);
  if (done != nullptr) return fields;
  if (inSeconds >= 0 || inSeconds < -k400Years) return tm{};
  // The C library of Windows knows no time before 1970.
  fields = FieldsOf(inSeconds + k400Years, inZone);
  fields.tm_year -= 400;
  return fields;
}

}  // namespace

ZORTime::ZORTime() : seconds_(time(nullptr)) {}
ZORTime::ZORTime(long long inSeconds) : seconds_(inSeconds) {}

int ZORTime::GetDay(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_mday; }
int ZORTime::GetMonth(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_mon + 1; }
int ZORTime::GetYear(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_year + 1900; }
int ZORTime::GetHour(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_hour; }
int ZORTime::GetMinute(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_min; }
int ZORTime::GetSecond(ZORTz inZone) const { return FieldsOf(seconds_, inZone).tm_sec; }
