#include "summarizers/Job.h"

#include "base/Console.h"
#include "summarizers/Process.h"

namespace bw {

void Job::addProcess(const std::shared_ptr<Process>& p, const Uuid& boot) {
  p->setJob(this);
  spawns_.addCreditAtAbsoluteTime(p->start_time());
  if (const std::optional<AbsTime> exit = p->exit_time()) spawns_.addDebitAtAbsoluteTime(*exit);
  aggregateCPUTime_.addInterpolator(Process::share(p, Process::kCpuTime), boot);
  aggregateIdleWakeups_.addInterpolator(Process::share(p, Process::kIdleWakeups), boot);
  aggregateInterrupts_.addInterpolator(Process::share(p, Process::kInterrupts), boot);
  aggregatePageins_.addInterpolator(Process::share(p, Process::kPageins), boot);
  aggregateResidentSize_.addInterpolator(Process::share(p, Process::kResidentSize), boot);
  aggregateWired_.addInterpolator(Process::share(p, Process::kWired), boot);
}

void Job::addOwnedProcessToUmbrella(const std::shared_ptr<Process>& p, const Uuid& boot) {
  p->setOwner(this);
  if (gDebug) {
    const std::string* jobLabel = p->job() ? p->job()->label() : nullptr;
    err() << format("%s[%u] has owner %s", textOrNull(jobLabel), p->pid(), textOrNull(label())) << "\n";
  }
  umbrellaCPUTime_.addInterpolator(Process::share(p, Process::kCpuTime), boot);
  umbrellaIdleWakeups_.addInterpolator(Process::share(p, Process::kIdleWakeups), boot);
  umbrellaInterrupts_.addInterpolator(Process::share(p, Process::kInterrupts), boot);
}

void Job::mergeJob(const Job& other) {
  if (&other == this) return;
  aggregateCPUTime_.merge(other.aggregateCPUTime_);
  aggregateIdleWakeups_.merge(other.aggregateIdleWakeups_);
  aggregateInterrupts_.merge(other.aggregateInterrupts_);
  aggregateResidentSize_.merge(other.aggregateResidentSize_);
  aggregateWired_.merge(other.aggregateWired_);
  aggregatePageins_.merge(other.aggregatePageins_);
  // An entry this job lacks is made here rather than dropped.
  for (const auto& [key, theirs] : other.aggregate_) {
    std::shared_ptr<AggregateInterpolator>& mine = aggregate_[key];
    if (!mine) mine = std::make_shared<AggregateInterpolator>();
    mine->merge(*theirs);
  }
  umbrellaCPUTime_.merge(other.umbrellaCPUTime_);
  umbrellaIdleWakeups_.merge(other.umbrellaIdleWakeups_);
  umbrellaInterrupts_.merge(other.umbrellaInterrupts_);
  spawns_.merge(other.spawns_);
  if (!label_) label_ = other.label_;
  if (!displayName_) displayName_ = other.displayName_;
  cpuTime_ += other.cpuTime_;
  elapsedTime_ += other.elapsedTime_;
}

void Job::finalizeMerges() {
  aggregateCPUTime_.finalizeMerges();
  aggregateIdleWakeups_.finalizeMerges();
  aggregateInterrupts_.finalizeMerges();
  aggregateResidentSize_.finalizeMerges();
  aggregateWired_.finalizeMerges();
  aggregatePageins_.finalizeMerges();
  for (auto& [key, aggregate] : aggregate_) aggregate->finalizeMerges();
  umbrellaCPUTime_.finalizeMerges();
  umbrellaIdleWakeups_.finalizeMerges();
  umbrellaInterrupts_.finalizeMerges();
  // Merged ledgers answer only once sorted again.
  spawns_.finalizeMerges();
}

std::shared_ptr<AggregateInterpolator> Job::objectForKeyedSubscript(const std::string& key) const {
  auto it = aggregate_.find(key);
  return it == aggregate_.end() ? nullptr : it->second;
}

void Job::setLabel(Name label) {
  if (label) {
    std::string cleaned = stringByRemovingTrailingUUIDsAndLaunchServicesStuff(*label);
    if (cleaned != *label) label = std::make_shared<const std::string>(std::move(cleaned));
  }
  label_ = std::move(label);
}

}  // namespace bw
