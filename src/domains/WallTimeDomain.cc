#include "domains/WallTimeDomain.h"

#include "base/Console.h"
#include "domains/WallTimeText.h"

namespace bw {

WallTimeDomain::WallTimeDomain(std::uint64_t start, std::uint64_t end) : RelativeTimeDomain(Quiet{}, start, end) {
  if (gDebug) {
    err() << format("Selecting events from %s (%llu) to %s (%llu)", formatWallTime(start).c_str(),
                    static_cast<unsigned long long>(start / 1000), formatWallTime(end).c_str(),
                    static_cast<unsigned long long>(end / 1000))
          << '\n';
  }
}

void WallTimeDomain::addEvent(const Record& event, std::uint64_t position, const AbsTime&, std::uint64_t wallTime) {
  const bool inside = start() <= wallTime && wallTime <= end();
  std::uint64_t at = position;
  if (inside != lastDomain() && event.answersWallTime()) {
    // Date the change back to where the clock passed the bound, when that
    // lies after the previous record. A record whose clock is already on
    // the near side of the bound (set back) changes at its own position.
    const std::uint64_t sincePrevious = position - lastTime_;
    const std::uint64_t bound = inside ? start() : end();
    if (wallTime > bound && sincePrevious > wallTime - bound) at = position - (wallTime - bound);
  }
  setDomain(inside, at);
  lastTime_ = position;
}

}  // namespace bw
