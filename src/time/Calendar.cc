#include "time/Calendar.h"

#include <unicode/gregocal.h>
#include <unicode/timezone.h>

#include <memory>
#include <mutex>

namespace bw {

namespace {

// One shared Gregorian calendar in the process's zone, made once; each
// operation works on a copy so the shared one is never changed.
std::unique_ptr<icu::Calendar> calendarCopy() {
  static std::once_flag once;
  static std::unique_ptr<icu::GregorianCalendar> shared;
  std::call_once(once, [] {
    UErrorCode status = U_ZERO_ERROR;
    shared = std::make_unique<icu::GregorianCalendar>(icu::TimeZone::createDefault(), status);
  });
  return std::unique_ptr<icu::Calendar>(shared->clone());
}

Date addDays(Date date, int days) {
  auto cal = calendarCopy();
  UErrorCode status = U_ZERO_ERROR;
  cal->setTime(date.milliseconds(), status);
  cal->add(UCAL_DATE, days, status);
  return Date::fromMilliseconds(cal->getTime(status));
}

}  // namespace

// The well-known era-based algorithms (eras of 400 years, 146097 days).
std::int64_t daysFromCivil(const YearMonthDay& ymd) {
  const std::int64_t y = ymd.year - (ymd.month <= 2 ? 1 : 0);
  const std::int64_t era = (y >= 0 ? y : y - 399) / 400;
  const std::int64_t yoe = y - era * 400;
  const std::int64_t mp = (ymd.month + 9) % 12;
  const std::int64_t doy = (153 * mp + 2) / 5 + ymd.day - 1;
  const std::int64_t doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + doe - 719468;
}

YearMonthDay civilFromDays(std::int64_t days) {
  const std::int64_t z = days + 719468;
  const std::int64_t era = (z >= 0 ? z : z - 146096) / 146097;
  const std::int64_t doe = z - era * 146097;
  const std::int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
  const std::int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
  const std::int64_t mp = (5 * doy + 2) / 153;
  YearMonthDay ymd;
  ymd.day = static_cast<std::int32_t>(doy - (153 * mp + 2) / 5 + 1);
  ymd.month = static_cast<std::int32_t>(mp < 10 ? mp + 3 : mp - 9);
  ymd.year = static_cast<std::int32_t>(yoe + era * 400 + (ymd.month <= 2 ? 1 : 0));
  return ymd;
}

YearMonthDay yearMonthDayFromDate(Date date) {
  auto cal = calendarCopy();
  UErrorCode status = U_ZERO_ERROR;
  cal->setTime(date.milliseconds(), status);
  YearMonthDay ymd;
  ymd.year = cal->get(UCAL_EXTENDED_YEAR, status);
  ymd.month = cal->get(UCAL_MONTH, status) + 1;
  ymd.day = cal->get(UCAL_DATE, status);
  return ymd;
}

Date dateFromYearMonthDay(const YearMonthDay& ymd) {
  auto cal = calendarCopy();
  UErrorCode status = U_ZERO_ERROR;
  cal->clear();
  cal->set(UCAL_EXTENDED_YEAR, ymd.year);
  cal->set(UCAL_MONTH, ymd.month - 1);
  cal->set(UCAL_DATE, ymd.day);
  return Date::fromMilliseconds(cal->getTime(status));
}

Date dateOneDayLater(Date date) { return addDays(date, 1); }
Date dateOneDayEarlier(Date date) { return addDays(date, -1); }

Date earlierMidnight(Date date) { return dateFromYearMonthDay(yearMonthDayFromDate(date)); }

}  // namespace bw
