#pragma once
// Which stretch of time a run covers: the kind of domain and its bounds. The
// command line fills it from its options.
#include <cstdint>

#include "time/Calendar.h"

namespace bw {

// The sample-range kinds (`domain_type`).
enum DomainType : std::uint32_t {
  kDomainAll = 0,
  kDomainDate = 1,
  kDomainWallTime = 2,  // bounds are wall-clock milliseconds since 1970
  kDomainRelative = 3,  // bounds are timeline positions in milliseconds
};

struct DomainChoice {
  std::uint32_t type = kDomainAll;  // a DomainType
  std::uint64_t start = 0;
  std::uint64_t end = ~std::uint64_t{0};
  YearMonthDay day;  // for kDomainDate
};

}  // namespace bw
