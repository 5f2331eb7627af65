#pragma once
// Calendar arithmetic on dates in the process's time zone, on the Gregorian
// calendar: whole-day steps that keep the wall-clock time across daylight
// saving changes, and the first instant of a day.
#include <cstdint>

#include "base/Date.h"

namespace bw {

struct YearMonthDay {
  std::int32_t year = 0;
  std::int32_t month = 0;  // 1-12
  std::int32_t day = 0;    // 1-31
  friend bool operator==(const YearMonthDay&, const YearMonthDay&) = default;
};

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
