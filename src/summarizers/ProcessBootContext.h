#pragma once
// The processes of one boot, keyed by unique id, and the unique ids that
// count as launchd (0 and 1 always; the per-user launchds once found).
// At the end of input it groups its processes into jobs and decides which
// job owns each process.
#include <cstdint>
#include <memory>
#include <string>
#include <unordered_set>

#include "accum/HashFactory.h"
#include "base/Uuid.h"
#include "summarizers/Job.h"
#include "summarizers/Process.h"

namespace bw {

class ProcessBootContext {
 public:
  static constexpr const char* kClassName = "ProcessBootContext";
  using Processes = HashFactory<std::uint64_t, Process>;
  using Jobs = HashFactory<std::string, Job>;

  ProcessBootContext() : processes_(Processes::withClass()) {}

  // Adds every process with a label to its job in `jobs`, keyed by the
  // label, or "<LABEL> (DISPLAY NAME)" for "PluginProcess"; a new job takes
  // the process's Mach-O UUID, label and display name. A process without a
  // label is left out (with --debug: "Incomplete data: ...").
  void createJobs(Jobs& jobs);

  // Sets every process's owner: first the launchds and the processes
  // responsible for themselves own themselves, then findOwnerForProcess
  // for each.
  void connectProcessesToOwners();

  // The job that owns `process`, following responsible (else parent)
  // unique ids up to a launchd; sets the owner of every process on the way
  // and adds each to its owner's umbrella. A process whose chain breaks
  // (an unknown unique id, or a cycle of ids in damaged data) is owned by
  // itself and also counted in its own umbrella. Iterative: any chain
  // length is safe. Null only for a process that has no job.
  Job* findOwnerForProcess(const std::shared_ptr<Process>& process);

  const Uuid& uuid() const { return uuid_; }
  void setUuid(const Uuid& uuid) { uuid_ = uuid; }
  Processes& processes() { return processes_; }
  const Processes& processes() const { return processes_; }
  std::unordered_set<std::uint64_t>& launchds() { return launchds_; }

 private:
  Uuid uuid_;
  Processes processes_;
  std::unordered_set<std::uint64_t> launchds_{0, 1};
};

}  // namespace bw
