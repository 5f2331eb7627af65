#include "domains/PostInstallDomain.h"

#include "Records/LogStartsV1.h"

namespace bw {

namespace {

// A log start written by a system other than the one before it. An absent
// previous version counts as different.
bool startsNewSystem(const Record& event) {
  const auto* start = recordCast<LogStartsV1>(&event);
  if (start == nullptr) return false;
  if (!start->hasLastSystemVersion() || !start->hasSystemVersion()) return true;
  return start->lastSystemVersion() != start->systemVersion();
}

}  // namespace

void PostInstallDomain::addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  if (!lastDomain()) {
    // Only the first update counts: startAbsTime stays set for good.
    if (!startAbsTime_ && startsNewSystem(event)) {
      startAbsTime_ = absTime;
      setDomain(true, position);
    }
    return;
  }
  const bool inside = absTime.boot == startAbsTime_->boot && absTime.time <= startAbsTime_->time + kPostInstallSpan;
  setDomain(inside, position);
}

}  // namespace bw
