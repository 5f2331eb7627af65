// The processes message: one job, followed through the whole report and the
// report's three top events. The job is the one with the most CPU time over
// the whole report (jobs counted with what they own); "rank" is its place,
// from 1, among the jobs of that stretch ordered by CPU time.
#include <memory>

#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/Telemetry.h"
#include "summarizers/MemorySummarizer.h"
#include "summarizers/ProcessSummary.h"

namespace bw {
namespace {

constexpr bool kIncludingSubjobs = true;

// The job's summary under `key` and its rank; null when the stretch lacks it.
std::pair<const ProcessSummary*, std::size_t> findJob(const ProcessSummary& root, const std::string& key) {
  const auto it = root.subprocesses().find(key);
  if (it == root.subprocesses().end()) return {nullptr, 0};
  const auto sorted = root.subprocessesSortedBySelector(&ProcessSummary::compareCPUTime);
  for (std::size_t i = 0; i < sorted.size(); ++i) {
    if (sorted[i] == it->second.get()) return {sorted[i], i + 1};
  }
  return {nullptr, 0};
}

void addUsageGroup(TelemetryMessage& m, const Model& model, const std::string& prefix, const std::vector<Range>& ranges,
                   const std::string& key) {
  m.setNumber(prefix, "duration", static_cast<double>(totalLength(ranges)) / 1000.0);
  const auto root = model.summarizeProcessesIncludingSubjobs(kIncludingSubjobs, ranges);
  const auto [job, rank] = findJob(*root, key);
  if (!job) return;
  m.setNumber(prefix, "cpu_time", job->cpuTime() / 1e9);
  m.setNumber(prefix, "wakeups", job->idleWakeups());
  m.setNumber(prefix, "interrupts", job->interrupts());
  m.setNumber(prefix, "spawns", job->spawns());
  m.setNumber(prefix, "rank", static_cast<double>(rank));
}

void addSwapGroup(TelemetryMessage& m, const Model& model, const MemorySummary& event, const std::string& key) {
  const std::vector<Range> ranges{event.range()};
  const auto root = model.summarizeProcessesIncludingSubjobs(kIncludingSubjobs, ranges);
  const auto [job, rank] = findJob(*root, key);
  if (!job) return;
  m.setNumber("high_swap", "phys_footprint", job->maxResidentSize());
  m.setNumber("high_swap", "wired", job->maxWired());
  m.setNumber("high_swap", "ioaccel_resident", event.maximum("Graphics Resident"));
  m.setNumber("high_swap", "rank", static_cast<double>(rank));
}

}  // namespace

void addProcessFields(TelemetryMessage& m, const TelemetryReport& report) {
  const Model& model = report.model;
  if (!model.processes()) return;
  const auto total = model.summarizeProcessesIncludingSubjobs(kIncludingSubjobs, report.ranges);
  const auto sorted = total->subprocessesSortedBySelector(&ProcessSummary::compareCPUTime);
  if (sorted.empty()) return;
  std::string key;
  for (const auto& [k, job] : total->subprocesses()) {
    if (job.get() == sorted.front()) key = k;
  }
  const ProcessSummary& top = *sorted.front();
  m.setField("", "label", top.label() ? *top.label() : top.displayName() ? *top.displayName() : key);

  addUsageGroup(m, model, "total", report.ranges, key);
  if (const auto power = model.sortedPowerSummariesInRanges(report.ranges); !power.empty())
    addUsageGroup(m, model, "top_power", {power.front()->range()}, key);
  if (const auto cpu = model.sortedCPUSummariesInRanges(report.ranges); !cpu.empty())
    addUsageGroup(m, model, "low_cstate", {cpu.front()->range()}, key);
  if (const auto memory = model.sortedMemorySummariesInRanges(report.ranges); !memory.empty())
    addSwapGroup(m, model, static_cast<const MemorySummary&>(*memory.front()), key);
}

}  // namespace bw
