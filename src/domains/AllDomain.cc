#include "domains/AllDomain.h"

namespace bw {

AllDomain::AllDomain() { setDomain(true, 0); }

void AllDomain::addEvent(const Record&, std::uint64_t, const AbsTime&, std::uint64_t) {}

void AllDomain::setLastPosition(std::uint64_t position) { endRangeAtPosition(position); }

}  // namespace bw
