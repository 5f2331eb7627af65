#include "domains/BootDomain.h"

namespace bw {

BootDomain::BootDomain(std::optional<Uuid> uuid) : uuid_(uuid) {}

void BootDomain::addEvent(const Record&, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  if (!uuid_) uuid_ = absTime.boot;
  setDomain(absTime.boot == *uuid_, position);
}

}  // namespace bw
