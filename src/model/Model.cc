#include "model/Model.h"

#include <algorithm>

#include "Records/RecordDecoder.h"
#include "base/Exception.h"
#include "base/RangeList.h"
#include "store/RecordReader.h"
#include "summarizers/DeviceSummarizer.h"
#include "summarizers/FanSummarizer.h"
#include "summarizers/ModelSummarizers.h"
#include "summarizers/PowerSummary.h"
#include "summarizers/ProcessSummarizer.h"

namespace bw {

Model::Model(std::unique_ptr<Timeline> timeline, std::string systemVersion)
    : systemVersion_(std::move(systemVersion)), timeline_(std::move(timeline)) {
  for (auto& [key, summarizer] : makeModelSummarizers()) summarizers_[key] = std::move(summarizer);
}

Model::~Model() = default;

bool SummarizerFeed::reaches(const std::string& key) const {
  return !keys || std::find(keys->begin(), keys->end(), key) != keys->end();
}

void Model::processEventsWithDomains(const std::vector<Summarizer*>& domains, const SummarizerFeed& feed) {
  std::vector<Summarizer*> all;
  for (auto& [key, summarizer] : summarizers_) {
    if (feed.reaches(key)) all.push_back(summarizer.get());
  }
  const std::size_t summarizerCount = all.size();
  all.insert(all.end(), domains.begin(), domains.end());

  RecordClassSet read;
  for (Summarizer* s : all) read |= s->classesRead();
  std::uint64_t last = 0;
  WalkDecoder decode;
  timeline_->enumerateRecordsUsingBlock(
      [&](const RecordRef& record, std::uint64_t position, std::uint64_t wallTime, const AbsTime& absTime, bool&) {
        const RecordClass c = record.recordClass();
        const Record& event = read.test(static_cast<std::size_t>(c)) ? decode(record) : blankRecord(c);
        for (Summarizer* s : all) s->addEvent(event, position, absTime, wallTime);
        last = position;
      });
  for (auto& [key, summarizer] : summarizers_) summarizer->setLastPosition(last);
  for (std::size_t i = summarizerCount; i < all.size(); ++i) all[i]->setLastPosition(last);
}

Summarizer* Model::summarizer(const std::string& key) const {
  auto it = summarizers_.find(key);
  return it == summarizers_.end() ? nullptr : it->second.get();
}

void Model::setSummarizer(const std::string& key, std::unique_ptr<Summarizer> summarizer) {
  summarizers_[key] = std::move(summarizer);
}

std::vector<std::string> Model::summarizerKeys() const {
  std::vector<std::string> keys;
  for (const auto& [key, s] : summarizers_) keys.push_back(key);
  std::sort(keys.begin(), keys.end());
  return keys;
}

Summarizer& Model::summarizerForKey(const std::string& key) const {
  Summarizer* s = summarizer(key);
  if (!s) throw Exception(kInvalidArgumentException, "no such summarizer: " + key);
  return *s;
}

std::optional<std::vector<Range>> Model::rangesForSubstates(const std::vector<std::string>& keys,
                                                            const std::optional<std::vector<Range>>& ranges) const {
  std::optional<std::vector<Range>> result = ranges;
  for (const std::string& key : keys) {
    const Summarizer& s = summarizerForKey(key);
    result = result ? intersectRangeLists(*result, s.ranges()) : s.ranges();
  }
  return result;
}

std::unique_ptr<Summary> Model::summarize(const std::string& key, const Range& range) const {
  Summarizer* s = &summarizerForKey(key);
  std::unique_ptr<Summary> summary = s->newSummary();
  s->summarize(*summary, range, *timeline_);
  return summary;
}

std::unique_ptr<Summary> Model::summarize(const std::string& key, const std::vector<Range>& ranges) const {
  Summarizer* s = &summarizerForKey(key);
  std::unique_ptr<Summary> summary = s->newSummary();
  for (const Range& r : ranges) s->summarize(*summary, r, *timeline_);
  return summary;
}

std::vector<std::unique_ptr<Summary>> Model::summarizeTop(const std::string& key, const std::vector<Range>& ranges,
                                                          const std::function<bool(const Summary&)>& filter) const {
  Summarizer* s = &summarizerForKey(key);
  const SummaryComparator compare = s->comparator();
  std::vector<std::unique_ptr<Summary>> result;
  for (const Range& r : ranges) {
    for (const Range& state : s->ranges()) {
      const Range overlap = intersectionRange(r, state);
      if (overlap.length == 0) continue;
      std::unique_ptr<Summary> summary = s->newSummary();
      s->summarize(*summary, overlap, *timeline_);
      if (!filter(*summary)) continue;
      // Binary-search insertion under the reversed comparator: greatest first,
      // at an equal element's position when there is one.
      std::size_t low = 0, high = result.size();
      while (low < high) {
        const std::size_t mid = (low + high) / 2;
        const int order = compare ? -compare(*result[mid], *summary) : 0;
        if (order == 0) {
          low = high = mid;
        } else if (order < 0) {
          low = mid + 1;
        } else {
          high = mid;
        }
      }
      result.insert(result.begin() + static_cast<std::ptrdiff_t>(low), std::move(summary));
    }
  }
  return result;
}

std::vector<std::unique_ptr<Summary>> Model::sortedPowerSummariesInRanges(const std::vector<Range>& ranges) const {
  return summarizeTop("Power", ranges,
                      [](const Summary& s) { return static_cast<const PowerSummary&>(s).avgPowerDenom() > 0.0; });
}

ProcessSummarizer* Model::processes() const { return dynamic_cast<ProcessSummarizer*>(summarizer("Processes")); }

void Model::summarizeProcesses(ProcessSummary& summary, bool includingSubjobs, const AbsRange& range) const {
  processes()->summarizeProcesses(summary, includingSubjobs, {range});
}

void Model::summarizeProcesses(ProcessSummary& summary, bool includingSubjobs, const Range& range) const {
  processes()->summarizeProcesses(summary, includingSubjobs, timeline_->absoluteRangesForRelativeRanges({range}));
}

std::unique_ptr<ProcessSummary> Model::summarizeProcessesIncludingSubjobs(bool includingSubjobs,
                                                                          const std::vector<Range>& ranges) const {
  return processes()->summarizeJobs(includingSubjobs, absoluteTimeRangesForRelativeRanges(ranges));
}
std::vector<std::unique_ptr<Summary>> Model::sortedMemorySummariesInRanges(const std::vector<Range>& ranges) const {
  return summarizeTop("Memory", ranges, [](const Summary& s) { return s.duration() != 0; });
}

std::vector<std::unique_ptr<Summary>> Model::sortedFanSummariesInRanges(const std::vector<Range>& ranges) const {
  return summarizeTop("Fan", ranges, [](const Summary& s) {
    const auto& fan = static_cast<const FanSummary&>(s);
    return fan.duration() != 0 && fan.annoying_samples() + fan.veryannoying_samples() > 5;
  });
}

const DeviceSummarizer* Model::devices() const { return dynamic_cast<const DeviceSummarizer*>(summarizer("Devices")); }

std::uint64_t Model::wallTimeForRelative(std::uint64_t position) const {
  return timeline_->wallTimeForRelative(position);
}

std::optional<AbsTime> Model::absoluteTimeForRelative(std::uint64_t position) const {
  return timeline_->absoluteTimeForRelative(position);
}

std::vector<AbsRange> Model::absoluteTimeRangesForRelativeRange(const Range& range) const {
  return timeline_->absoluteRangesForRelativeRange(range);
}

std::vector<AbsRange> Model::absoluteTimeRangesForRelativeRanges(const std::vector<Range>& ranges) const {
  return timeline_->absoluteRangesForRelativeRanges(ranges);
}

}  // namespace bw
