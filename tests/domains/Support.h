#pragma once
// Feeding domains by hand. The process zone is fixed before any test runs,
// since the calendar reads it once.
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <string>

#include "domains/Domain.h"
#include "support/ConsoleCapture.h"
#include "support/Records.h"

namespace bw::test {

inline const bool kProcessZoneSet = [] {
  setenv("TZ", "Europe/Paris", 1);
  tzset();
  return true;
}();

// A record that carries its own wall time.
inline SleepWake wakeAt(std::uint64_t wallTime) { return sleepWake(0, wallTime, SleepWake::kWake); }

inline void feed(Domain& domain, const Record& r, std::uint64_t position, std::uint64_t wallTime = 0,
                 const AbsTime& t = AbsTime{}) {
  domain.addEvent(r, position, t, wallTime);
}

}  // namespace bw::test
