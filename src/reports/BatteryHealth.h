#pragma once
// The internal battery's health as the kernel reports it: the first entry
// of the power-supply class directory of type "Battery" whose scope is not
// "Device" (a mouse's or keyboard's battery). Capacities in mAh, or mWh
// where the kernel counts energy.
#include <cstdint>
#include <optional>
#include <string>

namespace bw {

struct BatteryHealth {
  std::optional<std::int64_t> cycleCount;
  std::optional<std::int64_t> maxCapacity;     // charge_full, else energy_full
  std::optional<std::int64_t> designCapacity;  // charge_full_design, else energy_full_design
  std::optional<std::string> health;           // only when the kernel gives one
};

// None when no such battery is found (entries are tried in name order).
std::optional<BatteryHealth> readBatteryHealth(const std::string& powerSupplyDir = "/sys/class/power_supply");

}  // namespace bw
