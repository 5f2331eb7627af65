#pragma once
// BatteryChargeLevel: one battery gauge sample (charges in mAh, voltage in
// mV, wattage in mW). Unusually, `absoluteTime` is optional here while the
// three gauge values are required.
#include "Records/RecordFields.h"

namespace bw {

#define BW_BATTERY_CHARGE_LEVEL_FIELDS(F)                                                          \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Optional, "absoluteTime")                               \
  F(charge, Charge, 2, SInt64, Required, "charge")                                                 \
  F(maxCharge, MaxCharge, 3, SInt64, Required, "maxCharge")                                        \
  F(cycleCount, CycleCount, 4, SInt64, Required, "cycleCount")                                     \
  F(instantAmperage, InstantAmperage, 5, SInt64, Optional, "instantAmperage")                      \
  F(instantVoltage, InstantVoltage, 6, SInt64, Optional, "instantVoltage")                         \
  F(timeSinceLastCharge, TimeSinceLastCharge, 7, SInt64, Optional, "timeSinceLastCharge")          \
  F(lastMinuteWattage, LastMinuteWattage, 8, SInt64, Optional, "lastMinuteWattage")                \
  F(estimatedTimeRemaining, EstimatedTimeRemaining, 9, SInt64, Optional, "estimatedTimeRemaining") \
  F(smoothedEstimatedTimeRemaining, SmoothedEstimatedTimeRemaining, 10, SInt64, Optional,          \
    "smoothedEstimatedTimeRemaining")                                                              \
  F(isFullyCharged, IsFullyCharged, 11, Bool, Optional, "isFullyCharged")

class BatteryChargeLevel final : public Record {
 public:
  BW_RECORD_INTERFACE(BatteryChargeLevel, BW_BATTERY_CHARGE_LEVEL_FIELDS, BW_NO_REPEATED_FIELDS)

  // "BatteryChargeLevel\t%.03g\t%lld\t%lld\t%lld\t": charge × 100 / maxCharge
  // in floating point (a maxCharge of 0 prints inf or nan), then charge,
  // maxCharge and cycleCount. The trailing tab belongs to the text.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_BATTERY_CHARGE_LEVEL_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
