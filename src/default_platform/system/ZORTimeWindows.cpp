#include <time.h>

#include "platform/system/ZORTime.h"

namespace {

// The calendar's fields; those of an empty tm where the year does not fit an int.
tm FieldsOf(long long inSeconds, ZORTz inZone) {
  const __time64_t seconds = inSeconds;
  tm fields{};
  if (inZone == kZORTzUniversal) {
    if (_gmtime64_s(&fields, &seconds) != 0) return tm{};
  } else {
    _tzset();  // the zone is read afresh
    if (_localtime64_s(&fields, &seconds) != 0) return tm{};
  }
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
