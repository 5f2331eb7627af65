#include "recorder/Clock.h"

#include <time.h>

namespace bw::recorder {

namespace {

std::uint64_t millisecondsOf(clockid_t id) {
  timespec ts{};
  clock_gettime(id, &ts);
  return static_cast<std::uint64_t>(ts.tv_sec) * 1000 + static_cast<std::uint64_t>(ts.tv_nsec) / 1000000;
}

}  // namespace

std::uint64_t SystemClock::absoluteMs() const { return millisecondsOf(CLOCK_MONOTONIC); }

std::uint64_t SystemClock::wallMs() const { return millisecondsOf(CLOCK_REALTIME); }

std::uint64_t SystemClock::asleepMs() const {
  const std::uint64_t boot = millisecondsOf(CLOCK_BOOTTIME);
  const std::uint64_t mono = millisecondsOf(CLOCK_MONOTONIC);
  return boot > mono ? boot - mono : 0;
}

LocalTime SystemClock::local(std::uint64_t wallMs) const {
  tzset();  // a changed /etc/localtime is seen without a restart
  const time_t seconds = static_cast<time_t>(wallMs / 1000);
  tm t{};
  localtime_r(&seconds, &t);
  return {t.tm_gmtoff, t.tm_zone ? t.tm_zone : "", t.tm_yday, t.tm_year + 1900};
}

std::uint64_t nextLocalMidnight(std::uint64_t wallMs) {
  tzset();
  const time_t seconds = static_cast<time_t>(wallMs / 1000);
  tm t{};
  localtime_r(&seconds, &t);
  t.tm_mday += 1;
  t.tm_hour = t.tm_min = t.tm_sec = 0;
  t.tm_isdst = -1;
  return static_cast<std::uint64_t>(mktime(&t)) * 1000;
}

}  // namespace bw::recorder
