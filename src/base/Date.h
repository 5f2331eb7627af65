#pragma once
// A point in wall-clock time: seconds since 1970-01-01 00:00:00 UTC, with a
// fraction. Used where the system speaks of dates (cutoffs, file times,
// report state); record times stay integer milliseconds.
#include <compare>
#include <string>

namespace bw {

struct Date {
  double secondsSince1970 = 0;

  // The earliest representable date: the start of year 1 (Julian calendar).
  static Date distantPast() { return Date{-62135769600.0}; }
  static Date fromMilliseconds(double ms) { return Date{ms / 1000.0}; }
  double milliseconds() const { return secondsSince1970 * 1000.0; }

  friend auto operator<=>(const Date&, const Date&) = default;
};

// "YYYY-MM-DD HH:MM:SS +0000" in UTC, the form dates take inside messages.
std::string describeDate(Date d);

}  // namespace bw
