#pragma once
// A job: all processes of one cleaned name (or one plug-in display name),
// across every boot. It sums its processes' curves per boot, counts their
// starts and exits, and, through the ownership search, also sums the usage
// of the processes it owns (its "umbrella").
//
// `cpuTime` and `elapsedTime` change only by `mergeJob`, so they stay 0
// for a job that was never merged.
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "accum/AbsoluteLedger.h"
#include "accum/AggregateInterpolator.h"
#include "base/Uuid.h"
#include "summarizers/JobName.h"
#include "time/AbsRange.h"

namespace bw {

class Process;

class Job {
 public:
  static constexpr const char* kClassName = "Job";
  using Name = JobNames::Name;

  Job() = default;
  Job(const Job&) = delete;
  Job& operator=(const Job&) = delete;

  // Makes `process` one of this job's: sets its job, counts its start (and
  // exit, when known) in `spawns`, and adds its six curves to the
  // aggregates for `boot`.
  void addProcess(const std::shared_ptr<Process>& process, const Uuid& boot);
  // Makes this job the owner of `process` and adds its CPU time, idle
  // wake-ups and interrupts to the umbrella curves for `boot`. With
  // --debug: "JOB[PID] has owner OWNER".
  void addOwnedProcessToUmbrella(const std::shared_ptr<Process>& process, const Uuid& boot);

  // Takes in every curve, aggregate entry and ledger of `other` (shared),
  // its label and display name where this job has none, and adds its
  // `cpuTime` and `elapsedTime`. Call finalizeMerges before queries.
  void mergeJob(const Job& other);
  void finalizeMerges();

  // The job's CPU use over `range` as text: 101 columns (one per hundredth
  // of the range, at least 1 ms each), twelve rows from "100.00%" down to
  // "0.0003%" with "*" where the column's value exceeds the row's
  // threshold, and the axis row " avg %cpu |". Each row ends in "\n".
  std::string graphOverRange(const AbsRange& range) const;

  AggregateInterpolator& aggregateCPUTime() { return aggregateCPUTime_; }
  AggregateInterpolator& aggregateIdleWakeups() { return aggregateIdleWakeups_; }
  AggregateInterpolator& aggregateInterrupts() { return aggregateInterrupts_; }
  AggregateInterpolator& aggregateResidentSize() { return aggregateResidentSize_; }
  AggregateInterpolator& aggregateWired() { return aggregateWired_; }
  AggregateInterpolator& aggregatePageins() { return aggregatePageins_; }
  // Live processes: a credit at each start, a debit at each exit.
  AbsoluteLedger& spawns() { return spawns_; }
  AggregateInterpolator& umbrellaCPUTime() { return umbrellaCPUTime_; }
  AggregateInterpolator& umbrellaIdleWakeups() { return umbrellaIdleWakeups_; }
  AggregateInterpolator& umbrellaInterrupts() { return umbrellaInterrupts_; }

  // Further aggregates by key; null when absent.
  std::shared_ptr<AggregateInterpolator> objectForKeyedSubscript(const std::string& key) const;
  std::map<std::string, std::shared_ptr<AggregateInterpolator>>& aggregate() { return aggregate_; }

  // Null when unknown.
  const std::string* label() const { return label_.get(); }
  const Name& sharedLabel() const { return label_; }
  // Stores `label` cleaned; an already clean label stays shared.
  void setLabel(Name label);
  const std::string* displayName() const { return displayName_.get(); }
  const Name& sharedDisplayName() const { return displayName_; }
  void setDisplayName(Name name) { displayName_ = std::move(name); }
  const std::optional<Uuid>& uuid() const { return uuid_; }
  void setUuid(const std::optional<Uuid>& uuid) { uuid_ = uuid; }

  std::uint64_t cpuTime() const { return cpuTime_; }
  void setCpuTime(std::uint64_t v) { cpuTime_ = v; }
  std::uint64_t elapsedTime() const { return elapsedTime_; }
  void setElapsedTime(std::uint64_t v) { elapsedTime_ = v; }

 private:
  AggregateInterpolator aggregateCPUTime_;
  AggregateInterpolator aggregateIdleWakeups_;
  AggregateInterpolator aggregateInterrupts_;
  AggregateInterpolator aggregateResidentSize_;
  AggregateInterpolator aggregateWired_;
  AggregateInterpolator aggregatePageins_;
  AbsoluteLedger spawns_;
  AggregateInterpolator umbrellaCPUTime_;
  AggregateInterpolator umbrellaIdleWakeups_;
  AggregateInterpolator umbrellaInterrupts_;
  std::map<std::string, std::shared_ptr<AggregateInterpolator>> aggregate_;
  Name label_;
  Name displayName_;
  std::optional<Uuid> uuid_;
  std::uint64_t cpuTime_ = 0;
  std::uint64_t elapsedTime_ = 0;
};

// "(null)" for an absent text, as debug lines print it.
inline const char* textOrNull(const std::string* text) { return text ? text->c_str() : "(null)"; }

}  // namespace bw
