#include "domains/Domain.h"

#include "base/Exception.h"
#include "domains/AllDomain.h"
#include "domains/DateDomain.h"
#include "domains/RelativeTimeDomain.h"
#include "domains/WallTimeDomain.h"

namespace bw {

std::unique_ptr<Domain> Domain::domainWithChoice(const DomainChoice& choice) {
  switch (choice.type) {
    case kDomainAll:
      return std::make_unique<AllDomain>();
    case kDomainDate:
      return std::make_unique<DateDomain>(choice.day);
    case kDomainWallTime:
      return std::make_unique<WallTimeDomain>(choice.start, choice.end);
    case kDomainRelative:
      return std::make_unique<RelativeTimeDomain>(choice.start, choice.end);
    default:
      terminateUnsupported("Domain::domainWithChoice: unknown domain type");
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
