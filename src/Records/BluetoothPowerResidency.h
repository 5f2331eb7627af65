#pragma once
// BluetoothPowerResidency: cumulative residency counters of the Bluetooth
// radio's power states.
#include "Records/RecordFields.h"

namespace bw {

#define BW_BLUETOOTH_POWER_RESIDENCY_FIELDS(F)                       \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(timeOff, TimeOff, 2, UInt64, Optional, "timeOff")                \
  F(timeOn, TimeOn, 3, UInt64, Optional, "timeOn")                   \
  F(timeSleep, TimeSleep, 4, UInt64, Optional, "timeSleep")          \
  F(timeIdle, TimeIdle, 5, UInt64, Optional, "timeIdle")

class BluetoothPowerResidency final : public Record {
 public:
  BW_RECORD_INTERFACE(BluetoothPowerResidency, BW_BLUETOOTH_POWER_RESIDENCY_FIELDS, BW_NO_REPEATED_FIELDS)

 private:
  BW_RECORD_STORAGE(BW_BLUETOOTH_POWER_RESIDENCY_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
