#pragma once
// Devices whose presence or power the records follow, as DeviceChange types:
// USB devices (1 storage, 2 input, 3 audio, 8 camera, 10 other, by their
// interfaces' class; root hubs left out), the Wi-Fi (5) and Bluetooth (6)
// radios from rfkill (on = not blocked), external displays from DRM
// connectors (4; built-in panels eDP, LVDS and DSI left out; on = connected)
// and a discrete GPU's runtime power state (9: a display controller that is
// not the boot VGA device; on = "active").
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "recorder/MachineFiles.h"

namespace bw::recorder {

struct DeviceState {
  std::uint32_t type = 0;
  std::string id;  // stable while the device stays: "usb:1-2:046d:c52b", "rfkill:phy0"
  std::string name;
  bool on = false;
};

class DeviceSource {
 public:
  static constexpr std::uint32_t kStorage = 1, kInput = 2, kAudio = 3, kDisplay = 4, kWiFi = 5, kBluetooth = 6,
                                 kCamera = 8, kDiscreteGpu = 9, kOther = 10;

  explicit DeviceSource(const MachineFiles& machine) : machine_(machine) {}
  // Every device present now.
  std::vector<DeviceState> read() const;

 private:
  void usb(std::vector<DeviceState>& out) const;
  void radios(std::vector<DeviceState>& out) const;
  void displays(std::vector<DeviceState>& out) const;
  void gpus(std::vector<DeviceState>& out) const;

  const MachineFiles& machine_;
};

// Fans and the panel's brightness, from hwmon and backlight.
class PanelAndFanSource {
 public:
  explicit PanelAndFanSource(const MachineFiles& machine) : machine_(machine) {}
  // The first backlight's brightness in percent of its maximum; none without one.
  std::optional<std::uint64_t> brightnessPercent() const;
  // The highest fan speed of any hwmon fan input; none without fans.
  std::optional<std::uint64_t> highestFanRpm() const;

 private:
  const MachineFiles& machine_;
};

}  // namespace bw::recorder
