#pragma once
// PackageEnergyStatistics: the processor package's energy and residency
// counters (frequencies in MHz). Every field is optional, `absoluteTime`
// included.
#include "Records/RecordFields.h"

namespace bw {

#define BW_PACKAGE_ENERGY_STATISTICS_FIELDS(F)                                                       \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Optional, "absolute_time")                                \
  F(energyModelMillijoules, EnergyModelMillijoules, 2, UInt64, Optional, "energy_model_millijoules") \
  F(pkgC0Residency, PkgC0Residency, 3, UInt64, Optional, "pkg_c0_residency")                         \
  F(pkgCanyResidency, PkgCanyResidency, 4, UInt64, Optional, "pkg_cany_residency")                   \
  F(pkgCmaxResidency, PkgCmaxResidency, 5, UInt64, Optional, "pkg_cmax_residency")                   \
  F(pkgFreq, PkgFreq, 6, UInt64, Optional, "pkg_freq")                                               \
  F(pkgFreqNominal, PkgFreqNominal, 7, UInt64, Optional, "pkg_freq_nominal")                         \
  F(maxbusdelay, Maxbusdelay, 8, UInt64, Optional, "maxbusdelay")                                    \
  F(qosBgTime, QosBgTime, 9, UInt64, Optional, "qos_bg_time")                                        \
  F(qosIdleTime, QosIdleTime, 10, UInt64, Optional, "qos_idle_time")

class PackageEnergyStatistics final : public Record {
 public:
  BW_RECORD_INTERFACE(PackageEnergyStatistics, BW_PACKAGE_ENERGY_STATISTICS_FIELDS, BW_NO_REPEATED_FIELDS)

  // "PackageEnergyStatistics\t%llu" with pkgCanyResidency, 0 when absent.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_PACKAGE_ENERGY_STATISTICS_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
