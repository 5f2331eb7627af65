#include "domains/DateDomain.h"

#include <unicode/gregocal.h>
#include <unicode/timezone.h>

#include <cmath>
#include <ctime>

#include "Records/TimeChange.h"
#include "base/Console.h"
#include "domains/ZoneAbbreviations.h"

namespace bw {

namespace {

std::uint64_t millisecondsFromUDate(UDate date) {
  return static_cast<std::uint64_t>(static_cast<std::int64_t>(std::llround(date)));
}

// The first instant of the day in the named zone.
std::uint64_t firstInstantOfDay(const YearMonthDay& day, std::string_view zoneName) {
  UErrorCode status = U_ZERO_ERROR;
  icu::GregorianCalendar calendar(icu::TimeZone::createTimeZone(icu::UnicodeString::fromUTF8(
                                      icu::StringPiece(zoneName.data(), static_cast<std::int32_t>(zoneName.size())))),
                                  status);
  calendar.clear();
  calendar.set(UCAL_EXTENDED_YEAR, day.year);
  calendar.set(UCAL_MONTH, day.month - 1);
  calendar.set(UCAL_DATE, day.day);
  return millisecondsFromUDate(calendar.getTime(status));
}

// The same wall-clock time one calendar day later, stepped by the process's
// own calendar (its zone, not the day's), as the day's end always has been.
std::uint64_t oneCalendarDayLater(std::uint64_t ms) {
  UErrorCode status = U_ZERO_ERROR;
  icu::GregorianCalendar calendar(icu::TimeZone::createDefault(), status);
  calendar.setTime(static_cast<UDate>(static_cast<std::int64_t>(ms)), status);
  calendar.add(UCAL_DATE, 1, status);
  return millisecondsFromUDate(calendar.getTime(status));
}

// Midnight UTC of year/month/day (the day may run past the month's end).
std::int64_t utcMidnight(const YearMonthDay& day, int dayOffset) {
  std::tm broken{};
  broken.tm_year = day.year - 1900;
  broken.tm_mon = day.month - 1;
  broken.tm_mday = day.day + dayOffset;
  broken.tm_isdst = -1;
  return static_cast<std::int64_t>(timegm(&broken));
}

}  // namespace

DateDomain::DateDomain(const YearMonthDay& components) : WallTimeDomain(Quiet{}, 0, 0), components_(components) {
  if (gDebug) {
    err() << format("Selecting events from %04ld-%02ld-%02ld", static_cast<long>(components.year),
                    static_cast<long>(components.month), static_cast<long>(components.day))
          << '\n';
  }
}

void DateDomain::addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) {
  if (event.recordClass() == RecordClass::TimeChange) {
    applyTimeChange(static_cast<const TimeChange&>(event));
    tzSet_ = true;
  }
  // Until a zone is known the day's bounds are not, and nothing is inside.
  if (tzSet_) WallTimeDomain::addEvent(event, position, absTime, wallTime);
}

void DateDomain::applyTimeChange(const TimeChange& change) {
  if (std::optional<std::string_view> zone = zoneNameForAbbreviation(change.zoneName())) {
    if (tzName_ == *zone) return;
    tzName_ = std::string(*zone);
    setStart(firstInstantOfDay(components_, *zone));
    setEnd(oneCalendarDayLater(start()));
    if (gDebug) {
      err() << format("Time zone change! Now zone is %s. Adjusting start/end to %llu-%llu", tzName_->c_str(),
                      static_cast<unsigned long long>(start()), static_cast<unsigned long long>(end()))
            << '\n';
    }
    return;
  }
  if (change.gmtoff() == gmtoff_) return;
  gmtoff_ = change.gmtoff();
  setStart(static_cast<std::uint64_t>((utcMidnight(components_, 0) - gmtoff_) * 1000));
  setEnd(static_cast<std::uint64_t>((utcMidnight(components_, 1) - gmtoff_) * 1000));
  if (gDebug) {
    err() << format("Time zone change! Now offset is %lld. Adjusting start/end to %llu-%llu",
                    static_cast<long long>(gmtoff_), static_cast<unsigned long long>(start()),
                    static_cast<unsigned long long>(end()))
          << '\n';
  }
}

}  // namespace bw
