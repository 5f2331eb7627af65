#pragma once
// Records and boots for feeding domains by hand, and a capture of standard
// error with the debug flag set. The process zone is fixed before any test
// runs, since the calendar reads it once.
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <sstream>
#include <string>

#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "base/Console.h"
#include "base/Uuid.h"
#include "domains/Domain.h"

namespace bw::test {

inline const bool kProcessZoneSet = [] {
  setenv("TZ", "Europe/Paris", 1);
  tzset();
  return true;
}();

inline Uuid bootNamed(std::uint8_t n) {
  Uuid::Bytes bytes{};
  bytes.fill(n);
  return Uuid(bytes);
}

// A record that carries its own wall time.
inline SleepWake wakeAt(std::uint64_t wallTime) {
  SleepWake r;
  r.setWallTime(wallTime);
  r.setReason(1);
  return r;
}

// A record without a wall time of its own.
inline UserIdle idle() {
  UserIdle r;
  r.setChange(1);
  return r;
}

inline TimeChange zoneChange(const std::string& zoneName, std::int64_t gmtoff) {
  TimeChange r;
  r.setZoneName(zoneName);
  r.setGmtoff(gmtoff);
  return r;
}

inline void feed(Domain& domain, const Record& r, std::uint64_t position, std::uint64_t wallTime = 0,
                 const AbsTime& t = AbsTime{}) {
  domain.addEvent(r, position, t, wallTime);
}

// Sets the debug flag and collects standard error while alive.
class DebugCapture {
 public:
  DebugCapture() {
    gDebug = 1;
    setConsole(nullptr, &err_);
  }
  ~DebugCapture() {
    gDebug = 0;
    setConsole(nullptr, nullptr);
  }
  std::string text() const { return err_.str(); }

 private:
  std::ostringstream err_;
};

}  // namespace bw::test
