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
