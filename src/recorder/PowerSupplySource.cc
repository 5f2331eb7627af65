#include "recorder/PowerSupplySource.h"

namespace bw::recorder {

namespace {

constexpr const char* kSupplies = "/sys/class/power_supply/";

}  // namespace

PowerSupplyState PowerSupplySource::read() const {
  PowerSupplyState state;
  bool sawAdapter = false;
  bool adapterOnline = false;
  std::optional<bool> batteryDischarging;
  for (const auto& name : machine_.list(kSupplies)) {
    const std::string dir = kSupplies + name + "/";
    const std::string type = machine_.line(dir + "type").value_or("");
    if (type == "Mains" || type == "USB") {
      sawAdapter = true;
      if (machine_.number(dir + "online").value_or(0) == 1) adapterOnline = true;
      continue;
    }
    if (type != "Battery" || machine_.line(dir + "scope").value_or("") == "Device") continue;
    if (machine_.number(dir + "present").value_or(1) == 0) continue;

    const std::string status = machine_.line(dir + "status").value_or("");
    const auto microVolts = machine_.number(dir + "voltage_now");
    // µAh directly, or µWh over µV (Wh/V = Ah).
    const auto milliAmpHours = [&](const char* charge, const char* energy) -> std::optional<std::int64_t> {
      if (const auto c = machine_.number(dir + charge)) return static_cast<std::int64_t>(*c / 1000);
      const auto e = machine_.number(dir + energy);
      if (!e || !microVolts || *microVolts == 0) return std::nullopt;
      return static_cast<std::int64_t>(static_cast<double>(*e) / static_cast<double>(*microVolts) * 1000.0);
    };
    const auto charge = milliAmpHours("charge_now", "energy_now");
    const auto full = milliAmpHours("charge_full", "energy_full");
    if (!charge || !full) continue;

    if (!state.battery) {
      BatteryChargeLevel level;
      level.setCharge(0);
      level.setMaxCharge(0);
      level.setCycleCount(static_cast<std::int64_t>(machine_.number(dir + "cycle_count").value_or(0)));
      if (microVolts) level.setInstantVoltage(static_cast<std::int64_t>(*microVolts / 1000));
      std::optional<std::int64_t> milliAmps;
      if (const auto current = machine_.signedNumber(dir + "current_now")) {
        milliAmps = *current / 1000;
      } else if (const auto power = machine_.number(dir + "power_now"); power && microVolts && *microVolts) {
        milliAmps = static_cast<std::int64_t>(static_cast<double>(*power) / static_cast<double>(*microVolts) * 1000.0);
      }
      if (milliAmps) {
        // Gauges differ in sign; the record's current is negative while draining.
        const std::int64_t magnitude = *milliAmps < 0 ? -*milliAmps : *milliAmps;
        level.setInstantAmperage(status == "Discharging" ? -magnitude : magnitude);
      }
      level.setIsFullyCharged(status == "Full");
      state.battery = level;
      batteryDischarging = status == "Discharging";
    }
    state.battery->setCharge(state.battery->charge() + *charge);
    state.battery->setMaxCharge(state.battery->maxCharge() + *full);
  }
  if (sawAdapter) {
    state.external = adapterOnline;
  } else if (batteryDischarging) {
    state.external = !*batteryDischarging;
  }
  return state;
}

}  // namespace bw::recorder
