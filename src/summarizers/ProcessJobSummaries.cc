// Per-job summaries over absolute ranges.
#include <atomic>
#include <cstdint>
#include <exception>

#include "base/Exception.h"
#include "base/Platform.h"
#include "summarizers/ProcessSummarizer.h"

namespace bw {
namespace {

std::atomic<bool> negativeRangeLogged{false};
std::atomic<bool> exceptionLogged{false};

void logOnce(std::atomic<bool>& logged, const char* message) {
  if (!logged.exchange(true)) platform().systemLog(message);
}

double maxIgnoringNaN(double current, double candidate) { return candidate > current ? candidate : current; }

}  // namespace

void ProcessSummarizer::resetLoggedMessages() {
  negativeRangeLogged = false;
  exceptionLogged = false;
}

void ProcessSummarizer::summarizeProcesses(ProcessSummary& root, bool includingSubjobs,
                                           const std::vector<AbsRange>& ranges) {
  jobs_.enumerateKeysAndObjectsUsingBlock([&](const std::string& key, const std::shared_ptr<Job>& jobPointer, bool&) {
    Job& job = *jobPointer;
    auto s = std::make_unique<ProcessSummary>();
    s->setLabel(job.label());
    s->setDisplayName(job.displayName());
    s->setElapsedTime(static_cast<double>(job.elapsedTime()));
    double uc = 0, ui = 0, uq = 0;
    try {
      for (const AbsRange& r : ranges) {
        if (static_cast<std::int64_t>(r.length()) < 0) {
          logOnce(negativeRangeLogged, kNegativeRangeMessage);
          continue;
        }
        s->setCpuTime(s->cpuTime() + job.aggregateCPUTime().deltaAcrossAbsoluteRange(r));
        s->setIdleWakeups(s->idleWakeups() + job.aggregateIdleWakeups().deltaAcrossAbsoluteRange(r));
        s->setInterrupts(s->interrupts() + job.aggregateInterrupts().deltaAcrossAbsoluteRange(r));
        if (includingSubjobs) {
          uc += job.umbrellaCPUTime().deltaAcrossAbsoluteRange(r);
          ui += job.umbrellaIdleWakeups().deltaAcrossAbsoluteRange(r);
          uq += job.umbrellaInterrupts().deltaAcrossAbsoluteRange(r);
        }
        s->setPageins(s->pageins() + job.aggregatePageins().deltaAcrossAbsoluteRange(r));
        s->setMaxResidentSize(
            maxIgnoringNaN(s->maxResidentSize(), job.aggregateResidentSize().maxValueInAbsoluteRange(r)));
        s->setMaxWired(maxIgnoringNaN(s->maxWired(), job.aggregateWired().maxValueInAbsoluteRange(r)));
        s->setRuntime(s->runtime() + static_cast<double>(job.spawns().timeValueWasGreaterThanZeroOverRange(r)));
        const auto started = static_cast<std::int64_t>(job.spawns().creditsAtAbsoluteTime(r.end()) -
                                                       job.spawns().creditsAtAbsoluteTime(r.start()));
        if (started < 0) throw Exception(kInternalInconsistencyException, "process spawn count < 0");
        s->setSpawns(s->spawns() + static_cast<double>(started));
      }
      if (!ranges.empty()) s->setStillrunning(job.spawns().valueAtAbsoluteTime(ranges.back().end()));
    } catch (const std::exception&) {
      logOnce(exceptionLogged, kExceptionMessage);
      return;
    }
    root.setElapsedTime(root.elapsedTime() + s->elapsedTime());
    root.setCpuTime(root.cpuTime() + s->cpuTime());
    root.setIdleWakeups(root.idleWakeups() + s->idleWakeups());
    root.setInterrupts(root.interrupts() + s->interrupts());
    root.setPageins(root.pageins() + s->pageins());
    root.setSpawns(root.spawns() + s->spawns());
    root.setRuntime(root.runtime() + s->runtime());
    root.setStillrunning(root.stillrunning() + s->stillrunning());
    root.setMaxWired(maxIgnoringNaN(root.maxWired(), s->maxWired()));
    root.setMaxResidentSize(maxIgnoringNaN(root.maxResidentSize(), s->maxResidentSize()));
    // After the root's totals on purpose: the root counts each process
    // once, a job's own line also shows what it owns.
    s->setCpuTime(s->cpuTime() + uc);
    s->setIdleWakeups(s->idleWakeups() + ui);
    s->setInterrupts(s->interrupts() + uq);
    root.subprocesses()[key] = std::move(s);
  });
}

std::unique_ptr<ProcessSummary> ProcessSummarizer::summarizeJobs(bool includingSubjobs,
                                                                 const std::vector<AbsRange>& ranges) {
  auto root = std::make_unique<ProcessSummary>();
  summarizeProcesses(*root, includingSubjobs, ranges);
  return root;
}

}  // namespace bw
