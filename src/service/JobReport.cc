#include "service/JobReport.h"

#include <cmath>
#include <limits>
#include <memory>

#include "base/Exception.h"
#include "base/Platform.h"
#include "domains/Domain.h"
#include "model/Model.h"
#include "service/StoreModels.h"
#include "summarizers/ProcessSummary.h"
#include "time/AbsRange.h"

namespace bw {

namespace {

constexpr std::uint64_t kDefaultCount = 10;

// Whole units of a non-negative double; 0 for NaN or less, saturated above.
std::uint64_t truncated(double v) {
  if (!(v > 0)) return 0;
  if (v >= 18446744073709551615.0) return std::numeric_limits<std::uint64_t>::max();
  return static_cast<std::uint64_t>(v);
}

// `a - b`, or 0 where b exceeds a.
std::uint64_t minusOrZero(std::uint64_t a, std::uint64_t b) { return a > b ? a - b : 0; }

// seconds × factor, saturated (a period longer than the clock covers all).
std::uint64_t scaled(std::uint64_t seconds, std::uint64_t factor) {
  return seconds > std::numeric_limits<std::uint64_t>::max() / factor ? std::numeric_limits<std::uint64_t>::max()
                                                                      : seconds * factor;
}

struct ModelRanges {
  std::unique_ptr<Model> model;
  std::vector<Range> ranges;
};

// The per-model runner over fresh options: the one model of the current
// boot whose domain has ranges.
ModelRanges modelInDomain(const StoreQuery& query, const DomainChoice& choice) {
  ModelRanges found;
  for (std::unique_ptr<Model>& model : loadStoreModels(query)) {
    std::unique_ptr<Domain> domain = Domain::domainWithChoice(choice);
    model->processEventsWithDomains({domain.get()});
    if (domain->ranges().empty()) continue;
    if (found.model) throw Exception(kInternalInconsistencyException, "multiple system versions detected");
    found.ranges = domain->ranges();
    found.model = std::move(model);
  }
  return found;
}

}  // namespace

MessageDictionary jobReport(const MessageDictionary& request, const std::optional<std::string>& fromPath,
                            const SampleProcesses& sampleProcesses) {
  const std::uint64_t since = uint64ForKey(request, "since_seconds_ago");
  const bool skipSleep = boolForKey(request, "skip_sleep");
  const std::uint64_t requested = uint64ForKey(request, "count");
  const std::uint64_t count = requested != 0 ? requested : kDefaultCount;
  const std::uint64_t powerscoreGreaterThan = uint64ForKey(request, "powerscore_greater_than");
  const std::uint64_t instancesStillRunning = uint64ForKey(request, "instances_still_running");

  StoreQuery query;
  query.fromPath = fromPath;
  query.onlyBoot = platform().currentBootUuid();
  query.onlySystemVersion = platform().currentSystemVersion();
  DomainChoice choice;
  if (since != 0) {
    choice.type = kDomainWallTime;
    choice.end = static_cast<std::uint64_t>(platform().nowMicroseconds() / 1000);
    choice.start = minusOrZero(choice.end, scaled(since, 1000));
  }

  if (sampleProcesses) sampleProcesses();
  ModelRanges found = modelInDomain(query, choice);

  std::unique_ptr<ProcessSummary> summary;
  std::uint64_t duration = 0;
  if (skipSleep && since != 0) {
    const std::uint64_t end = platform().absoluteMilliseconds();
    const std::uint64_t start = minusOrZero(end, scaled(since, 1000));
    summary = std::make_unique<ProcessSummary>();
    if (found.model && query.onlyBoot)
      found.model->summarizeProcesses(*summary, true, AbsRange::rangeWithBoot(*query.onlyBoot, start, end));
    duration = end - start;
  } else if (found.model) {
    for (const AbsRange& r : found.model->absoluteTimeRangesForRelativeRanges(found.ranges)) duration += r.length();
    summary = found.model->summarizeProcessesIncludingSubjobs(true, found.ranges);
  }

  std::vector<std::uint64_t> powerscore, stillRunning, runtime;
  std::vector<std::string> labels;
  OptionalStrings displayNames;
  if (summary) {
    std::vector<const ProcessSummary*> sorted =
        summary->subprocessesSortedBySelector(&ProcessSummary::comparePowerScores);
    if (sorted.size() > count) sorted.resize(count);
    for (const ProcessSummary* job : sorted) {
      if (!(job->powerScore() > static_cast<double>(powerscoreGreaterThan))) continue;
      if (job->stillrunning() < instancesStillRunning) continue;
      powerscore.push_back(truncated(job->powerScore()));
      labels.push_back(job->label() ? *job->label() : std::string());
      displayNames.push_back(job->displayName() ? std::optional<std::string>(*job->displayName()) : std::nullopt);
      stillRunning.push_back(job->stillrunning());
      runtime.push_back(truncated(job->runtime() / 1000));
    }
  }

  return MessageDictionary{
      {"report_duration", std::uint64_t{duration / 1000}},
      {"launchd_jobs",
       MessageDictionary{
           {"powerscore", std::move(powerscore)},
           {"labels", std::move(labels)},
           {"display_names", std::move(displayNames)},
           {"instances_still_running", std::move(stillRunning)},
           {"runtime", std::move(runtime)},
       }},
  };
}

}  // namespace bw
