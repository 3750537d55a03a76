// The time of what is made from a document; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_DOCUMENT_TIMES_H
#define ZOR_TOOLKIT_EXCHANGE_DOCUMENT_TIMES_H

#include <charconv>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <optional>
#include <string>

#include "platform/system/ZORTime.h"
#include "toolkit/records/DocumentRecords.h"

namespace ZORToolkit {

inline std::optional<int> IntegerIn(const std::string& inText) {
  int number = 0;
  const char* const end = inText.data() + inText.size();
  const auto [stop, error] = std::from_chars(inText.data(), end, number);
  if (error != std::errc() || stop != end) return std::nullopt;
  return number;
}

/// The day of the document, else the time of the environment variable SOURCE_DATE_EPOCH, else the
/// first of 1980. It never depends on the clock.
inline std::time_t EpochOf(const DocumentRecord& inDocument) {
  using namespace std::chrono;
  constexpr std::time_t kFirstDay = 315532800;
  std::optional<int> day, month, year;
  for (const auto& [name, value] : inDocument.date) {
    if (name == "Day") day = IntegerIn(value);
    if (name == "Month") month = IntegerIn(value);
    if (name == "Year") year = IntegerIn(value);
  }
  if (day && month && year && *day > 0 && *month > 0 && *year > 0 && *year < 10000) {
    const year_month_day date(std::chrono::year{*year},
                              std::chrono::month{static_cast<unsigned int>(*month)},
                              std::chrono::day{static_cast<unsigned int>(*day)});
    if (date.ok()) return duration_cast<seconds>(sys_days(date).time_since_epoch()).count();
  }
  const char* const source = std::getenv("SOURCE_DATE_EPOCH");
  const std::optional<int> epoch = IntegerIn(source == nullptr ? "" : source);
  return epoch && *epoch >= 0 ? *epoch : kFirstDay;
}

/// The same as XML has times, such as "2026-11-20T00:00:00Z".
inline std::string TimeOf(const DocumentRecord& inDocument) {
  const ZORTime time(EpochOf(inDocument));
  const int year = time.GetYear(kZORTzUniversal);
  if (year < 1000) return "1980-01-01T00:00:00Z";
  char text[80];
  std::snprintf(text, sizeof text, "%d-%02d-%02dT%02d:%02d:%02dZ", year,
                time.GetMonth(kZORTzUniversal), time.GetDay(kZORTzUniversal),
                time.GetHour(kZORTzUniversal), time.GetMinute(kZORTzUniversal),
                time.GetSecond(kZORTzUniversal));
  return text;
}

}  // namespace ZORToolkit

#endif
