#pragma once
// Calendar arithmetic for the simulated laptop: wall times are milliseconds
// since 1970 (UTC); local days follow a zone with a standard offset and,
// for some, the North American or European daylight-saving rule.
#include <cstdint>
#include <string>
#include <vector>

namespace bw::samplestore {

// The zone in effect at some moment.
struct Zone {
  const char* name;     // abbreviation, as the clock record carries it
  std::int64_t gmtoff;  // seconds east of UTC
};

// A place's zone over the year.
struct ZoneRule {
  enum Saving { kNone, kNorthAmerica, kEurope };
  const char* standard;
  const char* daylight;  // null without saving
  std::int64_t gmtoff;   // standard offset, seconds east of UTC
  Saving saving;
};

// The places a laptop lives in or travels to.
const std::vector<ZoneRule>& zoneTable();
// The zone that `rule` has in effect at `wallMs`.
Zone zoneAt(const ZoneRule& rule, std::uint64_t wallMs);
// The instants in (from, to] at which `rule` switches between standard and
// daylight time, ascending.
std::vector<std::uint64_t> savingSwitches(const ZoneRule& rule, std::uint64_t from, std::uint64_t to);

struct LocalDate {
  int year = 1970;
  int month = 1;    // 1..12
  int day = 1;      // 1..31
  int yday = 0;     // 0-based day of the year
  int weekday = 3;  // 0 = Monday
};

// Days since 1970-01-01 of a proleptic Gregorian date, and back with the
// day of the year and of the week.
std::int64_t daysFromCivil(int year, int month, int day);
LocalDate civilFromDays(std::int64_t days);

// The local day number (days since 1970 in local time) of a wall time.
std::int64_t localDayNumber(std::uint64_t wallMs, const Zone& zone);
// The wall time of `msOfDay` into local day `dayNumber`.
std::uint64_t wallOfLocal(std::int64_t dayNumber, std::int64_t msOfDay, const Zone& zone);
// "YYYY-MM-DD".
std::string dateText(const LocalDate& date);

inline constexpr std::int64_t kMinute = 60'000;
inline constexpr std::int64_t kHour = 60 * kMinute;
inline constexpr std::int64_t kDay = 24 * kHour;

}  // namespace bw::samplestore
