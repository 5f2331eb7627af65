#include "reports/DashboardLines.h"

#include <algorithm>
#include <cmath>

#include "base/Console.h"
#include "base/Duration.h"
#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/ReportText.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/IOSummary.h"
#include "summarizers/PowerSummary.h"
#include "summarizers/ProcessSummary.h"

namespace bw {
namespace {

double sumOf(const Summary& summary, const std::string& key) {
  const auto it = summary.storage().find(key);
  double sum = 0;
  if (it == summary.storage().end()) return sum;
  for (const Value& v : it->second) {
    if (const double* d = v.getIf<double>()) sum += *d;
  }
  return sum;
}

// Percent of battery capacity used per hour over `lengthMs`.
double percentPerHour(const PowerSummary& power, double lengthMs) {
  return plainNaN(power.deltaCharge() / power.maxCharge() * 100 / (lengthMs / 3600000));
}

std::string labelText(const ProcessSummary& job) { return job.label() ? *job.label() : std::string(); }

}  // namespace

void printCPULines(std::ostream& o, const CPUSummary& cpu) {
  const double ghz = averagePkgFrequencyGHz(cpu);
  if (ghz > 0) printLabelLine(o, "Avg. Frequency", format("%.3f GHz", ghz));
  const double hz = interruptRateHz(cpu);
  if (hz > 0) printLabelLine(o, "Interrupt Rate", format("%.f Hz", hz));
  if (cpu.avgCStateResidencyDenom() > 0) {
    std::string value = format("%.1f%%", cStateResidencyPercent(cpu));
    if (const auto& breakdown = cpu.avgCStateResidencyBreakdown()) {
      for (const auto& [level, numer] : *breakdown) {
        value += format("   C%lu %.f%%", static_cast<unsigned long>(level), cStateLevelPercent(cpu, level));
      }
    }
    printLabelLine(o, "C-State Res", value);
  }
  const double qos = backgroundQoSRatioPercent(cpu);
  if (cpu.qosDenom() > 0 && !std::isnan(qos)) printLabelLine(o, "BG QoS Ratio", format("%.1f %%", qos));
}

void printPowerLine(std::ostream& o, const PowerSummary& power) {
  printLabelLine(o, "Power",
                 format("%.f mW (%.01f %%/hr)", plainNaN(power.avgPowerNumer() / power.avgPowerDenom()),
                        percentPerHour(power, static_cast<double>(power.range().length))));
}

void printBatteryUsageLine(std::ostream& o, const Model& model, const std::string& label,
                           const std::vector<std::string>& states, const std::vector<Range>& ranges) {
  const std::vector<Range> inStates = model.rangesForSubstates(states, ranges).value_or(std::vector<Range>{});
  const auto summary = model.summarize("Power", inStates);
  const auto& power = static_cast<const PowerSummary&>(*summary);
  const double average = power.avgPowerDenom() > 0 ? power.avgPowerNumer() / power.avgPowerDenom() : 0;
  printLine(o, format("%s\t%.01f %%/hr\t% 5.f mAh\t%.f mW", label.c_str(),
                      percentPerHour(power, static_cast<double>(totalLength(inStates))), power.deltaCharge(), average));
}

void printCStateResidencyLine(std::ostream& o, const Model& model, const std::string& label,
                              const std::vector<std::string>& states, const std::vector<Range>& ranges) {
  const double residency = model.averageCStateResidencyForState(states, ranges);
  if (!std::isnan(residency)) printLabelLine(o, label, format("%.1f%%", residency));
}

void printDisplayLines(std::ostream& o, const Summary& backlight, const Summary& panel) {
  const double brightness = sumOf(backlight, "BrightnessNumer") / sumOf(backlight, "BrightnessDenom");
  if (!std::isnan(brightness)) printLabelLine(o, "Display Brightness", format("%.1f%%", brightness));
  const double psrOn = sumOf(panel, "PSR on");
  if (panel.duration() != 0 && psrOn > 0) {
    const double share = psrOn * 100 / sumOf(panel, "PSR total");
    if (!std::isnan(share)) printLabelLine(o, "PSR on", format("%2.1f%%", share));
  }
}

void printIOLines(std::ostream& o, const IOSummary& io) {
  const double seconds = static_cast<double>(io.duration() / 1000);
  auto count = [&](const char* key) { printLabelLine(o, key, format("% 10.f", io.total(key))); };
  auto bytes = [&](const char* key) {
    const double total = io.total(key);
    printLabelLine(o, key, byteText(total) + " (" + byteText(total / seconds) + "/s)");
  };
  count("Disk Reads");
  count("Disk Writes");
  bytes("Bytes Read");
  bytes("Bytes Written");
  printBlankLine(o);
  count("Packets Sent");
  count("Packets Received");
  bytes("Bytes Sent");
  bytes("Bytes Received");
}

void printProcessLines(std::ostream& o, const Model& model, bool includingSubjobs, const Range& range,
                       std::size_t count) {
  ProcessSummary summary;
  model.summarizeProcesses(summary, includingSubjobs, range);
  const double length = static_cast<double>(range.length);
  printLabelLine(o, "Process Intrpts.", format("%.f", summary.interrupts()));
  const double cpuMs = summary.cpuTime() / 1000000;
  printLabelLine(o, "CPU Time",
                 format("%s (%.1f%%)", durationText(static_cast<std::int64_t>(cpuMs)).c_str(), cpuMs * 100 / length));
  // Within one range the busiest jobs come first: by CPU time, largest
  // first; equal times by label, so that the lines repeat from run to run.
  auto jobs = summary.subprocessesSortedBySelector(&ProcessSummary::compareCPUTime);
  std::stable_sort(jobs.begin(), jobs.end(), [](const ProcessSummary* a, const ProcessSummary* b) {
    const int byTime = a->compareCPUTime(*b);
    if (byTime != 0) return byTime > 0;
    return labelText(*a) < labelText(*b);
  });
  for (std::size_t i = 0; i < jobs.size() && i < count; ++i) {
    const ProcessSummary& job = *jobs[i];
    const double jobMs = job.cpuTime() / 1000000;
    printLine(
        o, format("                  \t%s (%.1f%%)  \t%.f\t%s", durationText(static_cast<std::int64_t>(jobMs)).c_str(),
                  jobMs * 100 / length, job.interrupts(), labelText(job).c_str()));
  }
}

}  // namespace bw
