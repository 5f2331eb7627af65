#include "domains/Domain.h"

#include "base/Exception.h"
#include "domains/AllDomain.h"
#include "domains/DateDomain.h"
#include "domains/RelativeTimeDomain.h"
#include "domains/WallTimeDomain.h"

namespace bw {

std::unique_ptr<Domain> Domain::domainWithSpec(const DomainSpec& spec) {
  switch (spec.type) {
    case kDomainAll:
      return std::make_unique<AllDomain>();
    case kDomainDate:
      return std::make_unique<DateDomain>(spec.day);
    case kDomainWallTime:
      return std::make_unique<WallTimeDomain>(spec.start, spec.end);
    case kDomainRelative:
      return std::make_unique<RelativeTimeDomain>(spec.start, spec.end);
    default:
      terminateUnsupported("Domain::domainWithSpec: unknown domain type");
  }
}

void Domain::setDomain(bool inside, std::uint64_t position) {
  if (inside != lastDomain_) {
    if (inside) {
      beginRangeAtPosition(position);
    } else {
      endRangeAtPosition(position);
    }
  }
  lastDomain_ = inside;
}

}  // namespace bw
