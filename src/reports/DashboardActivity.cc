// The sections from the processes down to the connected devices.
#include <cmath>

#include "base/Console.h"
#include "base/Duration.h"
#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/DashboardLines.h"
#include "reports/DashboardSections.h"
#include "reports/ReportText.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/DeviceSummarizer.h"
#include "summarizers/PowerSummary.h"
#include "summarizers/ProcessSummary.h"

namespace bw {
namespace {

const char* labelOf(const ProcessSummary& job) { return job.label() ? job.label()->c_str() : ""; }

// Up to `count` jobs of `root` in the order of `comparison`, each line made
// by `line`, after a heading line; then a blank line.
template <class Line>
void printJobList(const DashboardInputs& in, const ProcessSummary& root, const char* heading,
                  ProcessSummary::Comparison comparison, Line line) {
  printLine(in.o, format(heading, topWord(in.settings.showAll)));
  const auto jobs = root.subprocessesSortedBySelector(comparison);
  for (std::size_t i = 0; i < jobs.size() && i < in.top(10); ++i) printLine(in.o, line(*jobs[i]));
  printBlankLine(in.o);
}

}  // namespace

void printProcessesSection(const DashboardInputs& in) {
  const auto root = in.model.summarizeProcessesIncludingSubjobs(in.settings.includingSubjobs, in.ranges);
  double wake = 0;
  for (const AbsRange& r : in.model.absoluteTimeRangesForRelativeRanges(in.ranges)) {
    wake += static_cast<double>(r.length());
  }
  const double seconds = std::floor(wake / 1000);
  printHeading(in.o, "Processes");
  printLabelLine(in.o, "Wake Time", durationText(static_cast<std::int64_t>(wake)));
  const double cpuMs = root->cpuTime() / 1000000;
  printLabelLine(
      in.o, "CPU Time",
      format("%s (%.1f%%)", durationText(static_cast<std::int64_t>(cpuMs)).c_str(), plainNaN(cpuMs * 100 / wake)));
  printLabelLine(in.o, "Interrupts", format("%.f", root->interrupts()));
  printLabelLine(in.o, "Process Launches", format("%.f", root->spawns()));
  printBlankLine(in.o);

  printJobList(in, *root, "%s CPU Time:", &ProcessSummary::compareCPUTime, [&](const ProcessSummary& job) {
    const double ms = job.cpuTime() / 1000000;
    return format("%s\t%.1f%%\t%s", durationText(static_cast<std::int64_t>(ms)).c_str(), plainNaN(ms * 100 / wake),
                  labelOf(job));
  });
  printJobList(in, *root, "%s Interrupts / Idle Wakeups:", &ProcessSummary::compareInterrupts,
               [&](const ProcessSummary& job) {
                 return format("%7.f (%.1f/sec)\t%7.f wkups (%.1f/sec)\t%s", job.interrupts(),
                               plainNaN(job.interrupts() / seconds), job.idleWakeups(),
                               plainNaN(job.idleWakeups() / seconds), labelOf(job));
               });
  printJobList(in, *root, "%s Process Launches:", &ProcessSummary::compareSpawns,
               [&](const ProcessSummary& job) { return format("%7.f\t%s", job.spawns(), labelOf(job)); });
  printJobList(in, *root, "%s Resident Size:", &ProcessSummary::compareMaxResidentSize,
               [&](const ProcessSummary& job) { return byteText(job.maxResidentSize()) + "\t" + labelOf(job); });
}

void printBatteryUseSection(const DashboardInputs& in) {
  if (!in.showBattery) return;
  printHeading(in.o, format("%s Battery Usage", topWord(in.settings.showAll)));
  const auto sorted = in.model.sortedPowerSummariesInRanges(in.ranges);
  for (std::size_t i = 0; i < sorted.size() && i < in.top(3); ++i) {
    const Range range = sorted[i]->range();
    printLabelLine(in.o, "Time", rangeText(in.model, range));
    printPowerLine(in.o, static_cast<const PowerSummary&>(*sorted[i]));
    printCPULines(in.o, static_cast<const CPUSummary&>(*in.model.summarize("CPU", range)));
    printDisplayLines(in.o, *in.model.summarize("Backlight", range), *in.model.summarize("PanelSelfRefresh", range));
    printProcessLines(in.o, in.model, in.settings.includingSubjobs, range, 5);
    printBlankLine(in.o);
  }
}

void printCPUUseSection(const DashboardInputs& in) {
  printHeading(in.o, format("%s CPU Activity", topWord(in.settings.showAll)));
  const auto sorted = in.model.sortedCPUSummariesInRanges(in.ranges);
  for (std::size_t i = 0; i < sorted.size() && i < in.top(3); ++i) {
    const Range range = sorted[i]->range();
    printLabelLine(in.o, "Time", rangeText(in.model, range));
    const auto power = in.model.summarize("Power", range);
    const auto& powerSummary = static_cast<const PowerSummary&>(*power);
    if (powerSummary.avgPowerDenom() > 0) printPowerLine(in.o, powerSummary);
    printCPULines(in.o, static_cast<const CPUSummary&>(*sorted[i]));
    printProcessLines(in.o, in.model, in.settings.includingSubjobs, range, 5);
    printBlankLine(in.o);
  }
}

void printDevicesSection(const DashboardInputs& in) {
  printHeading(in.o, "Connected Devices");
  const std::pair<const char*, const char*> radios[] = {
      {"Wi-Fi", "Wi-Fi on"}, {"DiscreteGraphics", "Discrete GPU on"}, {"Bluetooth", "Bluetooth on"}};
  for (const auto& [key, label] : radios) {
    const auto on = in.model.rangesForSubstates({key}, in.ranges).value_or(std::vector<Range>{});
    const std::uint64_t length = totalLength(on);
    printLabelLine(in.o, label,
                   format("%s (%.f%% of total)", durationText(static_cast<std::int64_t>(length)).c_str(),
                          static_cast<double>(length) / (static_cast<double>(in.total) / 100.0)));
  }
  const DeviceSummarizer* devices = in.model.devices();
  if (!devices) return;
  for (std::uint32_t type : devices->typesOfDevicesConnectedInRanges(in.ranges)) {
    printLine(in.o, "\n" + DeviceSummarizer::nameOfDeviceType(type) + " Devices");
    // Range by range, as the summarizer answers: a device connected in two
    // of the ranges is listed under each.
    for (const Range& range : in.ranges) {
      devices->enumerateDevicesConnectedInRange(range, type,
                                                [&](const std::string& name, bool&) { printLine(in.o, " - " + name); });
    }
  }
}

}  // namespace bw
