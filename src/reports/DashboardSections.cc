// The sections from the summary down to memory.
#include "reports/DashboardSections.h"

#include <cmath>

#include "base/Console.h"
#include "base/Duration.h"
#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/DashboardLines.h"
#include "reports/ReportText.h"
#include "summarizers/BatterySummarizer.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/FanSummarizer.h"
#include "summarizers/IOSummary.h"
#include "summarizers/MemorySummarizer.h"
#include "summarizers/ProcessSummary.h"

namespace bw {
namespace {

std::string stateTime(const DashboardInputs& in, const std::vector<std::string>& states) {
  const auto ranges = in.model.rangesForSubstates(states, in.ranges).value_or(std::vector<Range>{});
  return durationText(static_cast<std::int64_t>(totalLength(ranges)));
}

// Each key of a memory summary: counters as counts, levels as bytes (a
// level without samples has no number and is left out).
void printMemoryLines(std::ostream& o, const MemorySummary& memory) {
  for (const std::string& key : MemorySummary::counterKeys()) printLabelLine(o, key, format("%.f", memory.total(key)));
  for (const std::string& key : MemorySummary::levelKeys()) {
    const double level = memory.maximum(key);
    if (!std::isnan(level)) printLabelLine(o, key, byteText(level));
  }
}

}  // namespace

std::size_t DashboardInputs::top(std::size_t count) const { return topCount(settings.showAll, count); }

void printSummarySection(const DashboardInputs& in) {
  printHeading(in.o, "Summary");
  printLabelLine(in.o, "System Version", in.model.systemVersion());
  printLabelLine(in.o, "Total Time", durationText(static_cast<std::int64_t>(in.total)));
}

void printUsageSection(const DashboardInputs& in) {
  printHeading(in.o, "Usage");
  if (in.showBattery) {
    printLabelLine(in.o, "Time on A/C", stateTime(in, {"A/C"}));
    printLabelLine(in.o, "Time on Battery", stateTime(in, {"Battery"}));
  }
  printLabelLine(in.o, "Wake Time", stateTime(in, {"Wake"}));
  printLabelLine(in.o, "User Active", stateTime(in, {"Wake", "Active"}));
  printLabelLine(in.o, "User Idle", stateTime(in, {"Wake", "Idle"}));
  printLabelLine(in.o, "Dark Wake Time", stateTime(in, {"DarkWake"}));
  printLabelLine(in.o, "Sleep Time", stateTime(in, {"Sleep"}));
  printLabelLine(in.o, "Standby Time", stateTime(in, {"Standby"}));
  printBlankLine(in.o);
}

void printBatterySection(const DashboardInputs& in) {
  if (!in.showBattery) return;
  printHeading(in.o, "Battery");
  printBatteryUsageLine(in.o, in.model, "Time on Battery", {"Battery"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "Wake", {"Battery", "Wake"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "User Active", {"Battery", "Wake", "Active"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "User Idle", {"Battery", "Wake", "Idle"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "Dark Wake", {"Battery", "DarkWake"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "Sleep", {"Battery", "Sleep"}, in.ranges);
  printBatteryUsageLine(in.o, in.model, "Standby", {"Battery", "Standby"}, in.ranges);
  if (gDebug) {
    const auto* battery = dynamic_cast<const BatterySummarizer*>(in.model.summarizer("Power"));
    const unsigned long last = battery ? battery->last_fully_charged_time() : 0;
    printLine(in.o, format("Relative time of last full charge: %lu", last));
  }
  printBlankLine(in.o);
}

void printCPUSection(const DashboardInputs& in) {
  printHeading(in.o, "CPU Summary");
  printCPULines(in.o, static_cast<const CPUSummary&>(*in.model.summarize("CPU", in.ranges)));
  if (in.showBattery) printCStateResidencyLine(in.o, in.model, "A/C", {"Wake", "A/C"}, in.ranges);
  printCStateResidencyLine(in.o, in.model, "User Active", {"Wake", "A/C", "Active"}, in.ranges);
  printCStateResidencyLine(in.o, in.model, "User Idle", {"Wake", "A/C", "Idle"}, in.ranges);
  if (in.showBattery) {
    printCStateResidencyLine(in.o, in.model, "Battery", {"Wake", "Battery"}, in.ranges);
    printCStateResidencyLine(in.o, in.model, "User Active", {"Wake", "Battery", "Active"}, in.ranges);
    printCStateResidencyLine(in.o, in.model, "User Idle", {"Wake", "Battery", "Idle"}, in.ranges);
  }
  printBlankLine(in.o);
}

void printIOSection(const DashboardInputs& in) {
  const auto summary = in.model.summarize("IO", in.ranges);
  if (summary->duration() == 0) return;
  printHeading(in.o, "I/O Summary");
  printIOLines(in.o, static_cast<const IOSummary&>(*summary));
  printHeading(in.o, format("%s I/O Activity", topWord(in.settings.showAll)));
  const auto sorted = in.model.sortedIOSummariesInRanges(in.ranges);
  for (std::size_t i = 0; i < sorted.size() && i < in.top(3); ++i) {
    printLabelLine(in.o, "Time", rangeText(in.model, sorted[i]->range()));
    printIOLines(in.o, static_cast<const IOSummary&>(*sorted[i]));
    printBlankLine(in.o);
  }
}

void printFanSection(const DashboardInputs& in) {
  const auto sorted = in.model.sortedFanSummariesInRanges(in.ranges);
  if (sorted.empty()) return;
  printHeading(in.o, "Top Fan Activity");
  // Every entry shows the CPU over the whole sample range, not its own.
  const auto cpu = in.model.summarize("CPU", in.ranges);
  for (std::size_t i = 0; i < sorted.size() && i < in.top(3); ++i) {
    const auto& fan = static_cast<const FanSummary&>(*sorted[i]);
    printLabelLine(in.o, "Time", rangeText(in.model, fan.range()));
    printLabelLine(in.o, "Total samples", format("%llu", static_cast<unsigned long long>(fan.samples())));
    printLabelLine(in.o, "High samples", format("%llu", static_cast<unsigned long long>(fan.annoying_samples())));
    printLabelLine(in.o, "Very high samples",
                   format("%llu", static_cast<unsigned long long>(fan.veryannoying_samples())));
    printCPULines(in.o, static_cast<const CPUSummary&>(*cpu));
    printProcessLines(in.o, in.model, in.settings.includingSubjobs, fan.range(), 5);
    printBlankLine(in.o);
  }
}

void printMemorySection(const DashboardInputs& in) {
  const auto summary = in.model.summarize("Memory", in.ranges);
  const auto& memory = static_cast<const MemorySummary&>(*summary);
  if (memory.memorySize() == 0) return;
  printHeading(in.o, "Memory Summary");
  printLabelLine(in.o, "Swap Dev is SSD", memory.swapDeviceIsSSD() ? "Yes" : "No");
  printLabelLine(in.o, "Total", byteText(static_cast<double>(memory.memorySize())));
  printMemoryLines(in.o, memory);
  printHeading(in.o, format("%sMemory Activity", in.settings.showAll ? "" : "Top "));
  const auto sorted = in.model.sortedMemorySummariesInRanges(in.ranges);
  for (std::size_t i = 0; i < sorted.size() && i < in.top(3); ++i) {
    const auto& entry = static_cast<const MemorySummary&>(*sorted[i]);
    printLabelLine(in.o, "Time", rangeText(in.model, entry.range()));
    printMemoryLines(in.o, entry);
    ProcessSummary processes;
    in.model.summarizeProcesses(processes, true, entry.range());
    printLabelLine(in.o, "Processes", "");
    const auto bySize = processes.subprocessesSortedBySelector(&ProcessSummary::compareMaxResidentSize);
    for (std::size_t k = 0; k < bySize.size() && k < in.top(10); ++k) {
      const ProcessSummary& job = *bySize[k];
      printLabelLine(in.o, "Resident", byteText(job.maxResidentSize()) + "\t " + (job.label() ? *job.label() : ""));
    }
    printBlankLine(in.o);
  }
}

}  // namespace bw
