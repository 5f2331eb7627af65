#pragma once
// Devices and resources: Wi-Fi, Bluetooth, the discrete GPU and peripherals
// coming and going (the power daemon's log), the display's brightness, and
// the periodic disk, network, memory, panel self-refresh and Bluetooth radio
// counters (cumulative within a boot).
#include <cstddef>
#include <cstdint>

#include "MachinePlan.h"
#include "Random.h"
#include "RecordSink.h"

namespace bw::samplestore {

class DeviceEvents {
 public:
  explicit DeviceEvents(const MachinePlan& plan);
  void boot(std::size_t index, RecordSink& sink);

 private:
  void deviceChanges(const Boot& boot, RecordSink& sink);
  void peripherals(const Run& run, std::uint64_t first, RecordSink& sink);
  void brightness(const Boot& boot, RecordSink& sink);
  void counters(const Boot& boot, RecordSink& sink);

  const MachinePlan& plan_;
  Random rng_;
  std::uint64_t memoryBytes_;
  std::uint64_t pageSize_;
  int preferredBrightness_;
};

}  // namespace bw::samplestore
