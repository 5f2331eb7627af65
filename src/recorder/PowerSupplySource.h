#pragma once
// The machine's batteries and power adapters, from /sys/class/power_supply.
// A battery is a supply of type "Battery" whose scope is not "Device" (a
// mouse's battery is not the machine's). Charges are in mAh: from charge_*
// (µAh) or, where the gauge gives only energy_* (µWh), divided by the present
// voltage. Current is negative while discharging.
#include <optional>

#include "Records/BatteryChargeLevel.h"
#include "recorder/MachineFiles.h"

namespace bw::recorder {

struct PowerSupplyState {
  // The battery gauge (charges of several batteries added up); none without a battery.
  std::optional<BatteryChargeLevel> battery;
  // True on an online Mains or USB supply; without adapters, a battery that
  // is not discharging counts as external power; none with neither.
  std::optional<bool> external;
};

class PowerSupplySource {
 public:
  explicit PowerSupplySource(const MachineFiles& machine) : machine_(machine) {}
  PowerSupplyState read() const;

 private:
  const MachineFiles& machine_;
};

}  // namespace bw::recorder
