#include "WallClock.h"

#include <cstdio>
#include <utility>

#include "time/Calendar.h"

namespace bw::samplestore {

const std::vector<ZoneRule>& zoneTable() {
  static const std::vector<ZoneRule> zones = {
      {"PST", "PDT", -8 * 3600, ZoneRule::kNorthAmerica},
      {"MST", "MDT", -7 * 3600, ZoneRule::kNorthAmerica},
      {"CST", "CDT", -6 * 3600, ZoneRule::kNorthAmerica},
      {"EST", "EDT", -5 * 3600, ZoneRule::kNorthAmerica},
      {"GMT", "BST", 0, ZoneRule::kEurope},
      {"CET", "CEST", 3600, ZoneRule::kEurope},
      {"IST", nullptr, 19800, ZoneRule::kNone},
      {"SGT", nullptr, 8 * 3600, ZoneRule::kNone},
      {"JST", nullptr, 9 * 3600, ZoneRule::kNone},
  };
  return zones;
}

namespace {

// The day number of the n-th (1-based) Sunday of a month, or of the last
// one when n is 0.
std::int64_t sundayOf(int year, int month, int n) {
  if (n == 0) {
    const std::int64_t last = daysFromCivil(month == 12 ? year + 1 : year, month == 12 ? 1 : month + 1, 1) - 1;
    return last - (civilFromDays(last).weekday + 1) % 7;
  }
  const std::int64_t first = daysFromCivil(year, month, 1);
  return first + (6 - civilFromDays(first).weekday + 7) % 7 + 7 * (n - 1);
}

// The daylight period of `year` as [start, end) wall instants.
std::pair<std::uint64_t, std::uint64_t> daylightPeriod(const ZoneRule& rule, int year) {
  const Zone standard{rule.standard, rule.gmtoff};
  const Zone daylight{rule.daylight, rule.gmtoff + 3600};
  if (rule.saving == ZoneRule::kNorthAmerica) {
    return {wallOfLocal(sundayOf(year, 3, 2), 2 * kHour, standard),
            wallOfLocal(sundayOf(year, 11, 1), 2 * kHour, daylight)};
  }
  const Zone utc{"UTC", 0};
  return {wallOfLocal(sundayOf(year, 3, 0), kHour, utc), wallOfLocal(sundayOf(year, 10, 0), kHour, utc)};
}

int yearOf(std::uint64_t wallMs) { return civilFromDays(static_cast<std::int64_t>(wallMs) / kDay).year; }

}  // namespace

Zone zoneAt(const ZoneRule& rule, std::uint64_t wallMs) {
  if (rule.saving != ZoneRule::kNone) {
    auto [start, end] = daylightPeriod(rule, yearOf(wallMs));
    if (wallMs >= start && wallMs < end) return Zone{rule.daylight, rule.gmtoff + 3600};
  }
  return Zone{rule.standard, rule.gmtoff};
}

std::vector<std::uint64_t> savingSwitches(const ZoneRule& rule, std::uint64_t from, std::uint64_t to) {
  std::vector<std::uint64_t> result;
  if (rule.saving == ZoneRule::kNone) return result;
  for (int year = yearOf(from); year <= yearOf(to); ++year) {
    auto [start, end] = daylightPeriod(rule, year);
    for (std::uint64_t t : {start, end}) {
      if (t > from && t <= to) result.push_back(t);
    }
  }
  return result;
}

std::int64_t daysFromCivil(int year, int month, int day) { return bw::daysFromCivil(YearMonthDay{year, month, day}); }

LocalDate civilFromDays(std::int64_t days) {
  const YearMonthDay ymd = bw::civilFromDays(days);
  LocalDate d;
  d.year = ymd.year;
  d.month = ymd.month;
  d.day = ymd.day;
  d.yday = static_cast<int>(days - daysFromCivil(d.year, 1, 1));
  // 1970-01-01 was a Thursday (weekday 3 counting from Monday).
  d.weekday = static_cast<int>(((days % 7) + 7 + 3) % 7);
  return d;
}

std::int64_t localDayNumber(std::uint64_t wallMs, const Zone& zone) {
  const std::int64_t local = static_cast<std::int64_t>(wallMs) + zone.gmtoff * 1000;
  return local >= 0 ? local / kDay : (local - kDay + 1) / kDay;
}

std::uint64_t wallOfLocal(std::int64_t dayNumber, std::int64_t msOfDay, const Zone& zone) {
  return static_cast<std::uint64_t>(dayNumber * kDay + msOfDay - zone.gmtoff * 1000);
}

std::string dateText(const LocalDate& date) {
  char text[16];
  std::snprintf(text, sizeof text, "%04d-%02d-%02d", date.year % 10000, date.month % 100, date.day % 100);
  return text;
}

}  // namespace bw::samplestore
