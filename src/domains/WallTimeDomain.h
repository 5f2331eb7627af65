#pragma once
// A wall-clock interval: `start` and `end` are milliseconds since 1970 UTC
// and a record is inside when start <= wall time <= end.
//
// Records are sparse, so a change is dated back to where the clock crossed
// the bound when the record carries a wall time of its own and that
// crossing lies after the previous record: entering at wall time W with
// start 1000 and the previous record 60 s earlier, the range opens at
// position P - (W - 1000) rather than at P. Other records change at P.
#include <cstdint>

#include "domains/RelativeTimeDomain.h"

namespace bw {

class WallTimeDomain : public RelativeTimeDomain {
 public:
  // With the debug flag: "Selecting events from DATE (SECONDS) to DATE
  // (SECONDS)" on standard error, dates as formatWallTime prints them.
  WallTimeDomain(std::uint64_t start, std::uint64_t end);

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;

  // The position of the previous record this rule saw (0 before any).
  std::uint64_t lastTime() const { return lastTime_; }
  void setLastTime(std::uint64_t v) { lastTime_ = v; }

 protected:
  WallTimeDomain(Quiet q, std::uint64_t start, std::uint64_t end) : RelativeTimeDomain(q, start, end) {}

 private:
  std::uint64_t lastTime_ = 0;
};

}  // namespace bw
