#include "reports/Telemetry.h"

#include <cmath>
#include <limits>

#include "base/Console.h"
#include "base/RangeList.h"
#include "model/Model.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/DeviceSummarizer.h"
#include "summarizers/FanSummarizer.h"
#include "summarizers/MemorySummarizer.h"
#include "summarizers/PowerSummary.h"

namespace bw {
namespace {

struct Group {
  const char* prefix;
  std::vector<std::string> states;
};

double seconds(double milliseconds) { return milliseconds / 1000.0; }

std::vector<Range> rangesOf(const TelemetryReport& report, const std::vector<std::string>& states) {
  return report.model.rangesForSubstates(states, report.ranges).value_or(std::vector<Range>{});
}

double sumOf(const Summary& summary, const std::string& key) {
  const auto it = summary.storage().find(key);
  double sum = 0;
  if (it != summary.storage().end()) {
    for (const Value& v : it->second) sum += v.doubleValue();
  }
  return sum;
}

// On battery (`drain`) the figures are what the battery gave: charge lost
// and power drawn, positive; elsewhere the signed figures as measured.
void addPowerFields(TelemetryMessage& m, const TelemetryReport& report, const Group& group, bool drain) {
  const std::vector<Range> ranges = rangesOf(report, group.states);
  if (ranges.empty()) return;
  const auto summary = report.model.summarize("Power", ranges);
  const auto& power = static_cast<const PowerSummary&>(*summary);
  const double sign = drain ? -1 : 1;
  m.setNumber(group.prefix, "delta_charge", sign * power.deltaCharge());
  m.setNumber(group.prefix, "delta_charge.duration", seconds(static_cast<double>(totalLength(ranges))));
  if (power.avgPowerDenom() > 0) {
    m.setNumber(group.prefix, "avg_power", sign * power.avgPowerNumer() / power.avgPowerDenom());
    m.setNumber(group.prefix, "avg_power.duration", power.avgPowerDenom());
  }
  if (power.minPower() > power.maxPower()) return;  // no discharge measured
  // Draining, the smallest draw is the least negative power.
  const double least = drain ? -power.maxPower() : power.minPower();
  const double leastTime = drain ? power.maxPowerTime() : power.minPowerTime();
  const double most = drain ? -power.minPower() : power.maxPower();
  const double mostTime = drain ? power.minPowerTime() : power.maxPowerTime();
  m.setNumber(group.prefix, "min_power", least);
  m.setNumber(group.prefix, "min_power.duration", leastTime);
  m.setNumber(group.prefix, "max_power", most);
  m.setNumber(group.prefix, "max_power.duration", mostTime);
}

void addDeviceFields(TelemetryMessage& m, const TelemetryReport& report, const std::string& prefix,
                     const std::vector<Range>& ranges) {
  if (const DeviceSummarizer* devices = report.model.devices()) {
    for (std::uint32_t type : devices->typesOfDevicesConnectedInRanges(ranges))
      m.setField(prefix, "device." + DeviceSummarizer::telemetryKeyOfDeviceType(type), "yes");
  }
  for (const auto& [state, name] :
       {std::pair{"Wi-Fi", "device.wi-fi"}, std::pair{"DiscreteGraphics", "device.discretegpu"},
        std::pair{"Bluetooth", "device.bluetooth"}}) {
    if (!report.model.summarizer(state)) continue;
    if (totalLength(report.model.rangesForSubstates({state}, ranges).value_or(std::vector<Range>{})) >= 31)
      m.setField(prefix, name, "yes");
  }
}

void addBrightnessFields(TelemetryMessage& m, const TelemetryReport& report, const Group& group) {
  const std::vector<Range> ranges = rangesOf(report, group.states);
  if (!ranges.empty()) {
    const auto summary = report.model.summarize("Backlight", ranges);
    const double denom = sumOf(*summary, "BrightnessDenom");
    m.setNumber(group.prefix, "display_brightness", sumOf(*summary, "BrightnessNumer") / denom);
    m.setNumber(group.prefix, "display_brightness.duration", denom / 1000.0);
  }
  addDeviceFields(m, report, group.prefix, ranges);
}

void addBatteryHealth(TelemetryMessage& m, const BatteryHealth& battery) {
  if (battery.cycleCount) m.setNumber("battery", "cycle_count", static_cast<double>(*battery.cycleCount));
  if (battery.maxCapacity) m.setNumber("battery", "max_capacity", static_cast<double>(*battery.maxCapacity));
  if (battery.designCapacity) m.setNumber("battery", "design_capacity", static_cast<double>(*battery.designCapacity));
  if (battery.health) m.setField("battery", "health", *battery.health);
}

void addResidencyFields(TelemetryMessage& m, const TelemetryReport& report, const Group& group) {
  const std::vector<Range> ranges = rangesOf(report, group.states);
  const double residency = report.model.averageCStateResidencyForState(group.states, report.ranges);
  if (totalLength(ranges) >= 1000 && !std::isnan(residency)) {
    m.setNumber(group.prefix, "duration", seconds(static_cast<double>(totalLength(ranges))));
    m.setNumber(group.prefix, "residency", residency * 100);
  }
  addDeviceFields(m, report, group.prefix, ranges);
}

void addFanFields(TelemetryMessage& m, const TelemetryReport& report, const std::string& prefix,
                  const std::vector<Range>& ranges) {
  if (ranges.empty()) return;
  const auto summary = report.model.summarize("Fan", ranges);
  const auto& fan = static_cast<const FanSummary&>(*summary);
  m.setNumber(prefix, "samples", static_cast<double>(fan.samples()));
  m.setNumber(prefix, "verylow", static_cast<double>(fan.quiet_or_off_samples()));
  m.setNumber(prefix, "low", static_cast<double>(fan.audible_samples()));
  m.setNumber(prefix, "high", static_cast<double>(fan.annoying_samples()));
  m.setNumber(prefix, "veryhigh", static_cast<double>(fan.veryannoying_samples()));
  if (!prefix.empty()) m.setNumber(prefix, "duration", seconds(static_cast<double>(fan.duration())));
  const auto cpu = report.model.summarize("CPU", ranges);
  const auto& c = static_cast<const CPUSummary&>(*cpu);
  if (c.qosDenom() > 0) m.setNumber(prefix, "bg-qos", c.qosBgTime() / (c.qosDenom() - c.qosIdleTime()) * 100);
}

void addPanelFields(TelemetryMessage& m, const TelemetryReport& report, const std::string& prefix,
                    const std::vector<Range>& ranges) {
  if (ranges.empty()) return;
  const auto summary = report.model.summarize("PanelSelfRefresh", ranges);
  m.setNumber(prefix, "psr", sumOf(*summary, "PSR on") * 100 / sumOf(*summary, "PSR total"));
  // Without a prefix the duration would collide with the header's.
  m.setNumber(prefix, prefix.empty() ? "psr.duration" : "duration", seconds(static_cast<double>(summary->duration())));
}

void addMemoryFields(TelemetryMessage& m, const TelemetryReport& report) {
  const auto summary = report.model.summarize("Memory", report.ranges);
  const auto& memory = static_cast<const MemorySummary&>(*summary);
  m.setNumber("", "swap_is_ssd", memory.swapDeviceIsSSD() ? 1 : 0);
  m.setNumber("", "size", static_cast<double>(memory.memorySize()));
  static const std::vector<std::pair<std::string, std::string>> totals{{"Page Ins", "pageins"},
                                                                       {"Page Outs", "pageouts"},
                                                                       {"Swap Ins", "swapins"},
                                                                       {"Swap Outs", "swapouts"},
                                                                       {"Compressions", "compressions"},
                                                                       {"Decompressions", "decompressions"},
                                                                       {"Faults", "faults"},
                                                                       {"Purges", "purges"}};
  for (const auto& [key, name] : totals) m.setNumber("", name, memory.total(key));
  static const std::vector<std::pair<std::string, std::string>> maxima{{"Wired", "wired_max"},
                                                                       {"Compressed", "compressed_max"},
                                                                       {"Free", "free_max"},
                                                                       {"Graphics Resident", "ioaccel_resident_max"}};
  for (const auto& [key, name] : maxima) m.setNumber("", name, memory.maximum(key));
}

const std::vector<Group> kPowerGroups{{"battery-wake", {"Battery", "Wake"}},
                                      {"battery-active", {"Battery", "Wake", "Active"}},
                                      {"battery-idle", {"Battery", "Wake", "Idle"}},
                                      {"battery-sleep", {"Battery", "Sleep"}},
                                      {"battery-darkwake", {"Battery", "DarkWake"}},
                                      {"ac-wake", {"A/C", "Wake"}},
                                      {"ac-sleep", {"A/C", "Sleep"}},
                                      {"ac-darkwake", {"A/C", "DarkWake"}},
                                      {"wake-active", {"Wake", "Active"}},
                                      {"wake-idle", {"Wake", "Idle"}}};
const std::vector<Group> kBrightnessGroups{{"battery-wake", {"Battery", "Wake"}},
                                           {"battery-active", {"Battery", "Wake", "Active"}},
                                           {"battery-idle", {"Battery", "Wake", "Idle"}},
                                           {"ac-wake", {"A/C", "Wake"}},
                                           {"wake-active", {"Wake", "Active"}},
                                           {"wake-idle", {"Wake", "Idle"}},
                                           {"wake", {"Wake"}}};
const std::vector<Group> kSleepDeviceGroups{{"battery-sleep", {"Battery", "Sleep"}},
                                            {"battery-darkwake", {"Battery", "DarkWake"}},
                                            {"ac-sleep", {"A/C", "Sleep"}},
                                            {"ac-darkwake", {"A/C", "DarkWake"}}};
const std::vector<Group> kResidencyGroups{{"ac-wake", {"Wake", "A/C"}},
                                          {"ac-active", {"Wake", "A/C", "Active"}},
                                          {"ac-idle", {"Wake", "A/C", "Idle"}},
                                          {"battery-wake", {"Wake", "Battery"}},
                                          {"battery-active", {"Wake", "Battery", "Active"}},
                                          {"battery-idle", {"Wake", "Battery", "Idle"}},
                                          {"active", {"Active"}},
                                          {"idle", {"Idle"}}};
const std::vector<Group> kFanGroups{
    {"active", {"Wake", "Active"}}, {"idle", {"Wake", "Idle"}}, {"darkwake", {"DarkWake"}}};
const std::vector<Group> kPanelGroups{{"battery", {"Battery"}},
                                      {"ac", {"A/C"}},
                                      {"idle", {"Idle"}},
                                      {"active", {"Active"}},
                                      {"battery-active", {"Battery", "Active"}},
                                      {"battery-idle", {"Battery", "Idle"}}};

}  // namespace

TelemetryMessage beginMessage(const std::string& domain, const TelemetryReport& report) {
  TelemetryMessage m(domain);
  m.setField("", "domain", domain);
  m.setField("", "reason", report.kind);
  if (report.day) m.setField("", "date", *report.day);
  m.setField("", "os_build", report.model.systemVersion());
  m.setNumber("", "duration", seconds(static_cast<double>(totalLength(report.ranges))));
  return m;
}

void finishMessage(const TelemetryMessage& message, TelemetrySink& sink) {
  if (!gDebug) sink.send(message);
}

void sendTelemetry(const TelemetryReport& report, const std::optional<BatteryHealth>& battery, TelemetrySink& sink) {
  TelemetryMessage m = beginMessage("com.vexil.telemetry.battery.daily", report);
  for (const Group& g : kPowerGroups) addPowerFields(m, report, g, std::string(g.prefix).rfind("ac-", 0) != 0);
  if (battery) addBatteryHealth(m, *battery);
  for (const Group& g : kBrightnessGroups) addBrightnessFields(m, report, g);
  addDeviceFields(m, report, "", report.ranges);
  for (const Group& g : kSleepDeviceGroups) addDeviceFields(m, report, g.prefix, rangesOf(report, g.states));
  finishMessage(m, sink);

  m = beginMessage("com.vexil.telemetry.cstates.daily", report);
  for (const Group& g : kResidencyGroups) addResidencyFields(m, report, g);
  addDeviceFields(m, report, "", report.ranges);
  finishMessage(m, sink);

  m = beginMessage("com.vexil.telemetry.memory.daily", report);
  addMemoryFields(m, report);
  finishMessage(m, sink);

  m = beginMessage("com.vexil.telemetry.fan", report);
  addFanFields(m, report, "", report.ranges);
  for (const Group& g : kFanGroups) addFanFields(m, report, g.prefix, rangesOf(report, g.states));
  finishMessage(m, sink);

  m = beginMessage("com.vexil.telemetry.psr", report);
  addPanelFields(m, report, "", report.ranges);
  for (const Group& g : kPanelGroups) addPanelFields(m, report, g.prefix, rangesOf(report, g.states));
  finishMessage(m, sink);

  m = beginMessage("com.vexil.telemetry.processes.daily", report);
  addProcessFields(m, report);
  finishMessage(m, sink);
}

}  // namespace bw
