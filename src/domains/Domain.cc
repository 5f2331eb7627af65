#include "domains/Domain.h"

#include "base/Exception.h"
#include "cli/Options.h"
#include "domains/AllDomain.h"
#include "domains/DateDomain.h"
#include "domains/RelativeTimeDomain.h"
#include "domains/WallTimeDomain.h"

namespace bw {

std::unique_ptr<Domain> Domain::domainWithOptions(const Options& options) {
  switch (options.domain_type()) {
    case kDomainAll:
      return std::make_unique<AllDomain>();
    case kDomainDate: {
      YearMonthDay day{static_cast<std::int32_t>(options.domain_ymd_year()),
                       static_cast<std::int32_t>(options.domain_ymd_month()),
                       static_cast<std::int32_t>(options.domain_ymd_day())};
      return std::make_unique<DateDomain>(day);
    }
    case kDomainWallTime:
      return std::make_unique<WallTimeDomain>(options.domain_start(), options.domain_end());
    case kDomainRelative:
      return std::make_unique<RelativeTimeDomain>(options.domain_start(), options.domain_end());
    default:
      terminateUnsupported("Domain::domainWithOptions: unknown domain type");
  }
}

void Domain::addEvent(const Record&, std::uint64_t, const AbsTime&, std::uint64_t) {
  terminateUnsupported("Domain::addEvent is abstract");
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
