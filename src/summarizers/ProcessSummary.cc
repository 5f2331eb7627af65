#include "summarizers/ProcessSummary.h"

#include <algorithm>

namespace bw {
namespace {

double interruptsPerCPUTime(const ProcessSummary& s) { return s.cpuTime() > 0 ? s.interrupts() / s.cpuTime() : 0; }

}  // namespace

int ProcessSummary::compareCPUTime(const ProcessSummary& o) const { return compareWithTolerance(cpuTime_, o.cpuTime_); }
int ProcessSummary::compareInterruptsPerCPUSecond(const ProcessSummary& o) const {
  return compareWithTolerance(interruptsPerCPUTime(*this), interruptsPerCPUTime(o));
}
int ProcessSummary::compareInterrupts(const ProcessSummary& o) const {
  return compareWithTolerance(interrupts_, o.interrupts_);
}
int ProcessSummary::compareSpawns(const ProcessSummary& o) const { return compareWithTolerance(spawns_, o.spawns_); }
int ProcessSummary::compareMaxResidentSize(const ProcessSummary& o) const {
  return compareWithTolerance(maxResidentSize_, o.maxResidentSize_);
}
int ProcessSummary::compareMaxWired(const ProcessSummary& o) const {
  return compareWithTolerance(maxWired_, o.maxWired_);
}
int ProcessSummary::comparePageins(const ProcessSummary& o) const { return compareWithTolerance(pageins_, o.pageins_); }
int ProcessSummary::comparePowerScores(const ProcessSummary& o) const {
  return compareWithTolerance(powerScore(), o.powerScore());
}
int ProcessSummary::compareRuntimes(const ProcessSummary& o) const {
  return compareWithTolerance(runtime_, o.runtime_);
}

std::vector<const ProcessSummary*> ProcessSummary::subprocessesSortedBySelector(Comparison comparison) const {
  std::vector<const ProcessSummary*> sorted;
  sorted.reserve(subprocesses_.size());
  for (const auto& [key, summary] : subprocesses_) sorted.push_back(summary.get());
  // A merge sort: the tolerance makes "equal" not transitive, which a
  // merge sort survives without leaving the array.
  std::stable_sort(sorted.begin(), sorted.end(),
                   [comparison](const ProcessSummary* a, const ProcessSummary* b) { return (a->*comparison)(*b) < 0; });
  std::reverse(sorted.begin(), sorted.end());
  return sorted;
}

}  // namespace bw
