// The clock.
#ifndef ZOR_PLATFORM_SYSTEM_ZORTIME_H
#define ZOR_PLATFORM_SYSTEM_ZORTIME_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"

/// Time zones of a ZORTime's getters: 0 is the user's local time, 1 is UTC.
enum ZORTz { kZORTzLocal = 0, kZORTzUniversal = 1 };

/// A point in time.
class ZOR_PLATFORM_EXPORT ZORTime {
 public:
  /// Now.
  ZORTime();
  int GetDay(ZORTz inZone) const;     ///< 1 to 31
  int GetMonth(ZORTz inZone) const;   ///< 1 to 12
  int GetYear(ZORTz inZone) const;    ///< such as 2025
  int GetHour(ZORTz inZone) const;    ///< 0 to 23
  int GetMinute(ZORTz inZone) const;  ///< 0 to 59
  int GetSecond(ZORTz inZone) const;  ///< 0 to 60

#if ZOR_PLATFORM_ADDITIONS
  /// @param inSeconds since 1970-01-01 00:00:00 UTC.
  explicit ZORTime(long long inSeconds);
#endif

 private:
  long long seconds_;
};

#endif
