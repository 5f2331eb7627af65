#pragma once
// DeviceChange: a device was connected (`nowConnected` non-zero) or
// disconnected.
#include "Records/RecordFields.h"

namespace bw {

#define BW_DEVICE_CHANGE_FIELDS(F)                                   \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(deviceType, DeviceType, 2, UInt32, Optional, "deviceType")       \
  F(deviceName, DeviceName, 3, String, Optional, "deviceName")       \
  F(deviceId, DeviceId, 4, String, Optional, "deviceId")             \
  F(nowConnected, NowConnected, 5, UInt32, Optional, "nowConnected") \
  F(registryEntryId, RegistryEntryId, 6, UInt64, Optional, "registryEntryId")

class DeviceChange final : public Record {
 public:
  BW_RECORD_INTERFACE(DeviceChange, BW_DEVICE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The `deviceType` codes the summarizers follow.
  static constexpr std::uint32_t kWiFi = 5;
  static constexpr std::uint32_t kBluetooth = 6;
  static constexpr std::uint32_t kDiscreteGraphics = 9;

  // "DeviceChange\t%u\t %@ (@%@)\t%sconnected": deviceType, deviceName,
  // deviceId, then "dis" when nowConnected is 0. Absent strings print empty.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_DEVICE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
