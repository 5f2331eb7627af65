#include "Records/PackageEnergyStatistics.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(PackageEnergyStatistics, BW_PACKAGE_ENERGY_STATISTICS_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> PackageEnergyStatistics::prettyPrint() const {
  unsigned long long residency = hasPkgCanyResidency() ? pkgCanyResidency() : 0;
  return format("PackageEnergyStatistics\t%llu", residency);
}

}  // namespace bw
