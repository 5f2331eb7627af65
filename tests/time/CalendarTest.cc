#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

#include "time/Calendar.h"

namespace bw {
namespace {

// The calendar reads the zone once, on first use: fix it before any test of
// this binary runs.
const bool kZoneSet = [] {
  setenv("TZ", "America/New_York", 1);
  tzset();
  return true;
}();

Date at(double seconds) { return Date{seconds}; }

struct DayStep {
  const char* name;
  double from;      // seconds since 1970
  double later;     // the same wall-clock time a calendar day later
  double hours;     // hours between them
};

// Noon in New York around both 2023 changes and on a plain day.
const DayStep kDaySteps[] = {
    {"spring forward", 1678554000, 1678636800, 23},  // 2023-03-11 12:00 EST -> 03-12 12:00 EDT
    {"fall back", 1699113600, 1699203600, 25},       // 2023-11-04 12:00 EDT -> 11-05 12:00 EST
    {"plain day", 1699203600, 1699290000, 24},       // 2023-11-05 12:00 EST -> 11-06 12:00 EST
};

TEST(Calendar, OneDayLaterAndEarlierKeepTheWallClockTimeAcrossDaylightSaving) {
  ASSERT_TRUE(kZoneSet);
  for (const DayStep& step : kDaySteps) {
    SCOPED_TRACE(step.name);
    EXPECT_EQ(dateOneDayLater(at(step.from)).secondsSince1970, step.later);
    EXPECT_EQ(dateOneDayEarlier(at(step.later)).secondsSince1970, step.from);
    EXPECT_EQ(step.later - step.from, step.hours * 3600);
  }
}

TEST(Calendar, EarlierMidnightIsTheFirstInstantOfTheLocalDay) {
  // 2023-03-12 00:00 EST is 05:00 UTC; 15:30 EDT that day is 19:30 UTC.
  EXPECT_EQ(earlierMidnight(at(1678597200)).secondsSince1970, 1678597200);
  EXPECT_EQ(earlierMidnight(at(1678649400)).secondsSince1970, 1678597200);
  // 2023-11-05 01:30 EDT, before the clocks go back: midnight EDT (04:00 UTC).
  EXPECT_EQ(earlierMidnight(at(1699162200)).secondsSince1970, 1699156800);
  EXPECT_EQ(earlierMidnight(at(1699162200.75)).secondsSince1970, 1699156800);
}

TEST(Calendar, YearMonthDayIsTheLocalDate) {
  // 2023-03-12 03:30 UTC is still the 11th in New York.
  EXPECT_EQ(yearMonthDayFromDate(at(1678591800)), (YearMonthDay{2023, 3, 11}));
  EXPECT_EQ(dateFromYearMonthDay({2023, 3, 12}).secondsSince1970, 1678597200);
  // Day 0 rolls back to the last day of the month before.
  EXPECT_EQ(yearMonthDayFromDate(dateFromYearMonthDay({2024, 3, 0})), (YearMonthDay{2024, 2, 29}));
}

}  // namespace
}  // namespace bw
