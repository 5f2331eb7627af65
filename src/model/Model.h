#pragma once
// Everything known about one system version: the timeline of its boots in
// sequence and one summarizer of each kind, keyed ("A/C", "Sleep", "Power",
// ...). A model is built, fed once with every record in timeline order, and
// then only queried for state ranges and summaries.
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "base/Range.h"
#include "framework/Summarizer.h"
#include "time/Timeline.h"

namespace bw {

class ProcessSummarizer;
class ProcessSummary;
class DeviceSummarizer;
struct RecordStorage;

// The summarizers a feed reaches: every one, or only those under `keys`
// (none when the list is empty). A mode that reads a few summarizers spares
// the others' work and memory.
struct SummarizerFeed {
  std::optional<std::vector<std::string>> keys;

  static SummarizerFeed all() { return {}; }
  static SummarizerFeed only(std::vector<std::string> keys) { return {std::move(keys)}; }
  bool reaches(const std::string& key) const;
};

class Model {
 public:
  Model(std::unique_ptr<Timeline> timeline, std::string systemVersion);
  ~Model();
  Model(const Model&) = delete;
  Model& operator=(const Model&) = delete;

  const std::string& systemVersion() const { return systemVersion_; }
  const Timeline& timeline() const { return *timeline_; }

  // Feeds every record in timeline order to the summarizers that `feed`
  // reaches and then to every domain, then tells every summarizer and
  // domain the last position.
  void processEventsWithDomains(const std::vector<Summarizer*>& domains,
                                const SummarizerFeed& feed = SummarizerFeed::all());

  // The summarizer under `key`, or null.
  Summarizer* summarizer(const std::string& key) const;
  // Adds (or replaces) the summarizer under `key`.
  void setSummarizer(const std::string& key, std::unique_ptr<Summarizer> summarizer);
  std::vector<std::string> summarizerKeys() const;

  // The positions at which all the keyed states held at once, within
  // `ranges` (none: anywhere). None only when `keys` is empty and `ranges`
  // is none. Throws "no such summarizer: KEY" for an unknown key.
  std::optional<std::vector<Range>> rangesForSubstates(const std::vector<std::string>& keys,
                                                       const std::optional<std::vector<Range>>& ranges) const;

  // The summary of the summarizer under `key` over `range` (or `ranges`);
  // like the two below, throws "no such summarizer: KEY" for an unknown key.
  std::unique_ptr<Summary> summarize(const std::string& key, const Range& range) const;
  std::unique_ptr<Summary> summarize(const std::string& key, const std::vector<Range>& ranges) const;
  // One summary per non-empty overlap of `ranges` with the summarizer's
  // state ranges, kept when `filter` accepts it, greatest first.
  std::vector<std::unique_ptr<Summary>> summarizeTop(const std::string& key, const std::vector<Range>& ranges,
                                                     const std::function<bool(const Summary&)>& filter) const;
  std::vector<std::unique_ptr<Summary>> sortedPowerSummariesInRanges(const std::vector<Range>& ranges) const;
  // "CPU" summaries with a residency denominator of at least 60000, lowest
  // residency first (the comparator ranks by residency descending).
  std::vector<std::unique_ptr<Summary>> sortedCPUSummariesInRanges(const std::vector<Range>& ranges) const;
  // "IO" summaries with a non-zero duration, most bytes first.
  std::vector<std::unique_ptr<Summary>> sortedIOSummariesInRanges(const std::vector<Range>& ranges) const;
  // Package C-state residency in percent over `ranges`; NaN when the
  // residency denominator is below 60 (far below the sorted list's 60000).
  double averageCStateResidencyForRanges(const std::vector<Range>& ranges) const;
  // The same over the positions within `ranges` where all `keys` held.
  double averageCStateResidencyForState(const std::vector<std::string>& keys, const std::vector<Range>& ranges) const;

  // The "Processes" summarizer, or null.
  ProcessSummarizer* processes() const;
  // Job summaries into `summary` over one absolute range, over the pieces
  // of one relative range, or into a new summary over the pieces of
  // `ranges`; `includingSubjobs` adds what each job owns to its line.
  void summarizeProcesses(ProcessSummary& summary, bool includingSubjobs, const AbsRange& range) const;
  void summarizeProcesses(ProcessSummary& summary, bool includingSubjobs, const Range& range) const;
  std::unique_ptr<ProcessSummary> summarizeProcessesIncludingSubjobs(bool includingSubjobs,
                                                                     const std::vector<Range>& ranges) const;
  // Memory stretches with a duration, heaviest swapping first.
  std::vector<std::unique_ptr<Summary>> sortedMemorySummariesInRanges(const std::vector<Range>& ranges) const;
  // Fan stretches with a duration and more than 5 annoying or very annoying
  // samples, loudest first.
  std::vector<std::unique_ptr<Summary>> sortedFanSummariesInRanges(const std::vector<Range>& ranges) const;

  // The "Devices" summarizer, or null.
  const DeviceSummarizer* devices() const;

  std::uint64_t wallTimeForRelative(std::uint64_t position) const;
  std::optional<AbsTime> absoluteTimeForRelative(std::uint64_t position) const;
  std::vector<AbsRange> absoluteTimeRangesForRelativeRange(const Range& range) const;
  std::vector<AbsRange> absoluteTimeRangesForRelativeRanges(const std::vector<Range>& ranges) const;

  // Keeps the records the timeline points at alive as long as the model.
  void retainRecords(std::shared_ptr<const RecordStorage> storage) { records_ = std::move(storage); }

 private:
  std::string systemVersion_;
  std::unique_ptr<Timeline> timeline_;
  std::unordered_map<std::string, std::unique_ptr<Summarizer>> summarizers_;
  std::shared_ptr<const RecordStorage> records_;

  Summarizer& summarizerForKey(const std::string& key) const;
};

}  // namespace bw
