#include "Records/BatteryChargeLevel.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(BatteryChargeLevel, BW_BATTERY_CHARGE_LEVEL_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> BatteryChargeLevel::prettyPrint() const {
  double percent = static_cast<double>(charge()) * 100 / static_cast<double>(maxCharge());
  return format("BatteryChargeLevel\t%.03g\t%lld\t%lld\t%lld\t", percent, static_cast<long long>(charge()),
                static_cast<long long>(maxCharge()), static_cast<long long>(cycleCount()));
}

}  // namespace bw
