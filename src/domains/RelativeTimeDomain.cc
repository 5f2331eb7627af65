#include "domains/RelativeTimeDomain.h"

#include "base/Console.h"

namespace bw {

RelativeTimeDomain::RelativeTimeDomain(std::uint64_t start, std::uint64_t end) : start_(start), end_(end) {
  if (gDebug) {
    err() << format("Selecting events from %llu to %llu", static_cast<unsigned long long>(start),
                    static_cast<unsigned long long>(end))
          << '\n';
  }
}

void RelativeTimeDomain::addEvent(const Record&, std::uint64_t position, const AbsTime&, std::uint64_t) {
  setDomain(start_ <= position && position <= end_, position);
}

}  // namespace bw
