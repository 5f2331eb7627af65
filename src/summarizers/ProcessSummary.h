#pragma once
// Process usage over a set of ranges: for one job, or, as the root, the
// totals of all jobs with one summary per job in `subprocesses` (key: the
// job key). CPU time in nanoseconds, sizes in bytes, runtime in
// milliseconds. With including-subjobs a job's CPU time, idle wake-ups and
// interrupts also hold those of the processes it owns, while the root
// counts every process once.
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "framework/Summary.h"

namespace bw {

class ProcessSummary : public Summary {
 public:
  // Orders two summaries by one figure, ascending, equal within the double
  // epsilon: negative, zero or positive.
  using Comparison = int (ProcessSummary::*)(const ProcessSummary& other) const;

  // cpuTime + idleWakeups * 500000: an idle wake-up weighs as much as
  // 0.5 ms of CPU time.
  double powerScore() const { return cpuTime_ + idleWakeups_ * 500000.0; }

  int compareCPUTime(const ProcessSummary& other) const;
  // interrupts / cpuTime, 0 when cpuTime is not above 0.
  int compareInterruptsPerCPUSecond(const ProcessSummary& other) const;
  int compareInterrupts(const ProcessSummary& other) const;
  int compareSpawns(const ProcessSummary& other) const;
  int compareMaxResidentSize(const ProcessSummary& other) const;
  int compareMaxWired(const ProcessSummary& other) const;
  int comparePageins(const ProcessSummary& other) const;
  int comparePowerScores(const ProcessSummary& other) const;
  int compareRuntimes(const ProcessSummary& other) const;

  // The job summaries, largest first by `comparison`; equal ones in no
  // defined order. The pointers live as long as this summary.
  std::vector<const ProcessSummary*> subprocessesSortedBySelector(Comparison comparison) const;

  double elapsedTime() const { return elapsedTime_; }
  void setElapsedTime(double v) { elapsedTime_ = v; }
  double cpuTime() const { return cpuTime_; }
  void setCpuTime(double v) { cpuTime_ = v; }
  double interrupts() const { return interrupts_; }
  void setInterrupts(double v) { interrupts_ = v; }
  double idleWakeups() const { return idleWakeups_; }
  void setIdleWakeups(double v) { idleWakeups_ = v; }
  double spawns() const { return spawns_; }
  void setSpawns(double v) { spawns_ = v; }
  double pageins() const { return pageins_; }
  void setPageins(double v) { pageins_ = v; }
  double maxResidentSize() const { return maxResidentSize_; }
  void setMaxResidentSize(double v) { maxResidentSize_ = v; }
  double maxWired() const { return maxWired_; }
  void setMaxWired(double v) { maxWired_ = v; }
  double runtime() const { return runtime_; }
  void setRuntime(double v) { runtime_ = v; }
  std::uint64_t stillrunning() const { return stillrunning_; }
  void setStillrunning(std::uint64_t v) { stillrunning_ = v; }
  const std::string* label() const { return hasLabel_ ? &label_ : nullptr; }
  void setLabel(const std::string* v) { hasLabel_ = v != nullptr, label_ = v ? *v : std::string(); }
  const std::string* displayName() const { return hasDisplayName_ ? &displayName_ : nullptr; }
  void setDisplayName(const std::string* v) { hasDisplayName_ = v != nullptr, displayName_ = v ? *v : std::string(); }

  std::unordered_map<std::string, std::unique_ptr<ProcessSummary>>& subprocesses() { return subprocesses_; }
  const std::unordered_map<std::string, std::unique_ptr<ProcessSummary>>& subprocesses() const { return subprocesses_; }

 private:
  double elapsedTime_ = 0;
  double cpuTime_ = 0;
  double interrupts_ = 0;
  double idleWakeups_ = 0;
  double spawns_ = 0;
  double pageins_ = 0;
  double maxResidentSize_ = 0;
  double maxWired_ = 0;
  double runtime_ = 0;
  std::uint64_t stillrunning_ = 0;
  bool hasLabel_ = false;
  bool hasDisplayName_ = false;
  std::string label_;
  std::string displayName_;
  std::unordered_map<std::string, std::unique_ptr<ProcessSummary>> subprocesses_;
};

}  // namespace bw
