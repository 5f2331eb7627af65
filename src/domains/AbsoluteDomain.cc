#include "domains/AbsoluteDomain.h"

#include "base/Console.h"

namespace bw {

AbsoluteDomain::AbsoluteDomain(const AbsRange& range) : range_(range) {
  if (gDebug) {
    err() << format("Selecting events from %llu to %llu in %s", static_cast<unsigned long long>(range.location()),
                    static_cast<unsigned long long>(range.location() + range.length()), range.boot().string().c_str())
          << '\n';
  }
}

void AbsoluteDomain::addEvent(const Record&, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  const bool inside = absTime.boot == range_.boot() && range_.location() <= absTime.time &&
                      absTime.time < range_.location() + range_.length();
  setDomain(inside, position);
}

}  // namespace bw
