#pragma once
// Feeding domains by hand, and a capture of standard
// error with the debug flag set. The process zone is fixed before any test
// runs, since the calendar reads it once.
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <sstream>
#include <string>

#include "base/Console.h"
#include "domains/Domain.h"
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
