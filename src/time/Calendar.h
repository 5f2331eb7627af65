#pragma once
// Calendar arithmetic: day numbers of the proleptic Gregorian calendar, and
// on dates in the process's time zone whole-day steps that keep the
// wall-clock time across daylight saving changes and the first instant of a
// day.
#include <cstdint>

#include "base/Date.h"

namespace bw {

struct YearMonthDay {
  std::int32_t year = 0;
  std::int32_t month = 0;  // 1-12
  std::int32_t day = 0;    // 1-31
  friend bool operator==(const YearMonthDay&, const YearMonthDay&) = default;
};

// Days since 1970-01-01 of a proleptic Gregorian date, and back; no time
// zone involved.
//   daysFromCivil({1970, 1, 1}) == 0, civilFromDays(-1) == {1969, 12, 31}
std::int64_t daysFromCivil(const YearMonthDay& ymd);
YearMonthDay civilFromDays(std::int64_t days);

// The year, month and day of `date` in the local time zone.
YearMonthDay yearMonthDayFromDate(Date date);
// The first instant of the local day given (lenient: day 0 or 32 roll over).
Date dateFromYearMonthDay(const YearMonthDay& ymd);

// The same wall-clock time one calendar day later / earlier (23, 24 or 25
// hours away).
Date dateOneDayLater(Date date);
Date dateOneDayEarlier(Date date);
// The first instant of the calendar day that holds `date`.
Date earlierMidnight(Date date);

}  // namespace bw
