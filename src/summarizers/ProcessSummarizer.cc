#include "summarizers/ProcessSummarizer.h"

#include "Records/ProcessUsage.h"
#include "base/Console.h"

namespace bw {
namespace {

// The two exit statuses that mean the process still ran when sampled.
constexpr std::int64_t kStillRunning = -1;
constexpr std::int64_t kSnapshot = -3;
// A process gone before it could be looked at: never part of a job.
constexpr std::int64_t kGone = -2;

}  // namespace

ProcessSummarizer::ProcessSummarizer() : jobs_(Jobs::withClass()), boots_(Boots::withClass()) {}

void ProcessSummarizer::addEvent(const Record& event, std::uint64_t, const AbsTime& absTime, std::uint64_t) {
  bool created = false;
  ProcessBootContext& context = boots_.objectForKey(absTime.boot, &created);
  if (created) {
    context.setUuid(absTime.boot);
    if (lastBootUUID_) {
      if (auto previous = boots_.objectForKeyedSubscript(*lastBootUUID_)) {
        const AbsTime end{*lastBootUUID_, lastAbstime_ + 1};
        previous->processes().enumerateKeysAndObjectsUsingBlock(
            [&end](std::uint64_t, const std::shared_ptr<Process>& p, bool&) { p->setExit_time(end); });
      }
    }
    lastBootUUID_ = absTime.boot;
  }
  lastAbstime_ = absTime.time;
  if (event.recordClass() == RecordClass::ProcessUsage)
    addProcessUsage(static_cast<const ProcessUsage&>(event), context, absTime);
}

void ProcessSummarizer::addProcessUsage(const ProcessUsage& record, ProcessBootContext& context,
                                        const AbsTime& absTime) {
  const std::uint64_t t = absTime.time;
  const std::int64_t status = record.exitStatus();
  bool created = false;
  context.processes().objectForKey(record.uniqueid(), &created);
  // Held here so that a dropped process lives to the end of this record.
  const std::shared_ptr<Process> p = context.processes().objectForKeyedSubscript(record.uniqueid());
  if (created) {
    p->setPid(static_cast<std::uint32_t>(record.pid()));
    p->setUniqueid(record.uniqueid());
    p->setParent_uniqueid(record.parentUniqueid());
    p->setResponsible_uniqueid(record.responsibleUniqueid());
    if (record.hasName()) p->setCleanedLabel(names_.cleanedLabel(record.name()));
    if (record.hasDisplayName()) p->setDisplayName(names_.shared(record.displayName()));
    p->setStart_time(AbsTime{absTime.boot, record.procStartAbstime()});
    p->addSamples(record.procStartAbstime(), (1u << ProcessSamples::kCurves) - 1, Process::Row{});
    if (status == kGone) context.processes().removeObjectForKey(record.uniqueid());
  }
  if (const std::optional<Uuid> uuid = record.UUID(); uuid && status != kSnapshot) p->setMacho_uuid(*uuid);

  if (const std::optional<AbsTime> exit = p->exit_time(); exit && exit->time < t) {
    if (gDebug) {
      err() << format("Funny data - got a record about PID %llu [%s] at %llu after it died",
                      static_cast<unsigned long long>(record.pid()),
                      record.hasName() ? record.name().c_str() : "(null)", static_cast<unsigned long long>(t))
            << "\n";
    }
    return;
  }
  Process::Row row{};
  unsigned present = 0;
  const auto take = [&](Process::CurveIndex c, bool has, std::uint64_t value) {
    if (!has) return;
    row[c] = static_cast<double>(value);
    present |= 1u << c;
  };
  take(Process::kCpuTime, record.hasUserTime() || record.hasSystemTime(), record.userTime() + record.systemTime());
  take(Process::kInterrupts, record.hasInterruptWkups(), record.interruptWkups());
  take(Process::kIdleWakeups, record.hasPkgIdleWkups(), record.pkgIdleWkups());
  take(Process::kPageins, record.hasPageins(), record.pageins());
  take(Process::kResidentSize, record.residentSize() != 0, record.residentSize());
  // `wired` keeps only its initial 0 on purpose.
  p->addSamples(t, present, row);

  if (status != kStillRunning && status != kSnapshot) p->setExit_time(AbsTime{absTime.boot, record.procExitAbstime()});
}

void ProcessSummarizer::setLastPosition(std::uint64_t) { createJobsFromProcesses(); }

void ProcessSummarizer::createJobsFromProcesses() {
  // No sample comes after this: the curves keep only what they hold.
  boots_.enumerateKeysAndObjectsUsingBlock([](const Uuid&, const std::shared_ptr<ProcessBootContext>& boot, bool&) {
    boot->processes().enumerateKeysAndObjectsUsingBlock(
        [](std::uint64_t, const std::shared_ptr<Process>& p, bool&) { p->shrinkToFit(); });
  });
  boots_.enumerateKeysAndObjectsUsingBlock(
      [this](const Uuid&, const std::shared_ptr<ProcessBootContext>& boot, bool&) { boot->createJobs(jobs_); });
  boots_.enumerateKeysAndObjectsUsingBlock(
      [](const Uuid&, const std::shared_ptr<ProcessBootContext>& boot, bool&) { boot->connectProcessesToOwners(); });
}

}  // namespace bw
