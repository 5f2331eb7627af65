#pragma once
// Which jobs used the power. Rebuilds every process of every boot from the
// ProcessUsage records, groups them into jobs by cleaned name at the end of
// input, decides which job owns each process, and then, for any set of
// absolute ranges, fills one ProcessSummary per job under a root summary.
//
// Feeding (addEvent), in timeline order:
//  - a new boot ends every process of the previous boot at that boot's last
//    record time + 1, overwriting exit times already known;
//  - a first record with exitStatus -2 makes a process that is then
//    dropped (never part of a job); -3 leaves the Mach-O UUID out;
//  - a record after the process's known exit is ignored (with --debug:
//    "Funny data - ...");
//  - `wired` only ever holds its initial 0: the records carry no wired size
//    for it.
// It keeps no state ranges of its own.
//
// For a report of the top jobs (e.g. "TopJobs"): summarizeJobs over the
// absolute ranges, then subprocessesSortedBySelector on the result.
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "accum/HashFactory.h"
#include "framework/Summarizer.h"
#include "summarizers/Job.h"
#include "summarizers/JobName.h"
#include "summarizers/ProcessBootContext.h"
#include "summarizers/ProcessSummary.h"

namespace bw {

class ProcessUsage;

class ProcessSummarizer : public Summarizer {
 public:
  using Jobs = HashFactory<std::string, Job>;
  using Boots = HashFactory<Uuid, ProcessBootContext>;

  // The two internal-error lines for the system log, each written once per
  // run.
  static constexpr const char* kNegativeRangeMessage =
      "*** A range had negative length. This shouldn't happen. Please file a Pellum against Brindlewick, attach a "
      "crateshot, and mention Pellum #13514961";
  static constexpr const char* kExceptionMessage =
      "*** An exception was thrown from deltaAcrossAbsoluteRange. Please file a Pellum against Brindlewick, attach a "
      "crateshot, and mention Pellum #13519461.";

  ProcessSummarizer();

  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  // End of input: builds the jobs and the ownership.
  void setLastPosition(std::uint64_t position) override;
  // Jobs from every boot's processes, then every boot's ownership.
  void createJobsFromProcesses();

  // Adds one summary per job over `ranges` (absolute ranges in time order)
  // to `root`, and the jobs' totals to the root's. A range of negative
  // length is skipped; a job whose figures throw (a falling curve, a
  // negative spawn count) is left out. Both are logged once per run. With
  // `includingSubjobs`, each job's line (not the root) also counts the CPU
  // time, idle wake-ups and interrupts of the processes it owns.
  void summarizeProcesses(ProcessSummary& root, bool includingSubjobs, const std::vector<AbsRange>& ranges);
  // The same into a new root summary.
  std::unique_ptr<ProcessSummary> summarizeJobs(bool includingSubjobs, const std::vector<AbsRange>& ranges);

  const std::optional<Uuid>& lastBootUUID() const { return lastBootUUID_; }
  std::uint64_t lastAbstime() const { return lastAbstime_; }
  Jobs& jobs() { return jobs_; }
  std::set<std::string>& misfitjobs() { return misfitjobs_; }
  Boots& boots() { return boots_; }

  // Lets each once-per-run message be written again (tests).
  static void resetLoggedMessages();

 private:
  void addProcessUsage(const ProcessUsage& record, ProcessBootContext& context, const AbsTime& absTime);

  std::optional<Uuid> lastBootUUID_;
  std::uint64_t lastAbstime_ = 0;
  Jobs jobs_;
  std::set<std::string> misfitjobs_;
  Boots boots_;
  JobNames names_;
};

}  // namespace bw
