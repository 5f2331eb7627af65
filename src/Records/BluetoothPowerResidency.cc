#include "Records/BluetoothPowerResidency.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(BluetoothPowerResidency, BW_BLUETOOTH_POWER_RESIDENCY_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
