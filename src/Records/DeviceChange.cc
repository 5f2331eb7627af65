#include "Records/DeviceChange.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(DeviceChange, BW_DEVICE_CHANGE_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> DeviceChange::prettyPrint() const {
  return format("DeviceChange\t%u\t ", static_cast<unsigned>(deviceType())) + deviceName() + " (@" + deviceId() +
         ")\t" + (nowConnected() != 0 ? "" : "dis") + "connected";
}

}  // namespace bw
