#pragma once
// A summarizer watches the records of one timeline in order and keeps the
// ranges of positions in which its state held, plus per-boot accumulators
// ("contexts"); asked about a range afterwards, it fills a Summary.
//
// Calling order: addEvent for every record in timeline order, then
// setLastPosition once, then any number of ranges / newSummary / summarize.
//
// Simple summarizers are pure configuration: flags, the record classes they
// accept and an event handler whose answer is 0 (the state ends here), -1
// (no change) or anything else (the state holds from here). The others
// override addEvent and the summary operations.
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Records/Record.h"
#include "accum/HashFactory.h"
#include "base/Range.h"
#include "base/Uuid.h"
#include "framework/SummarizerContext.h"
#include "framework/Summary.h"
#include "time/AbsRange.h"
#include "time/AbsTime.h"

namespace bw {

class Timeline;

class Summarizer {
 public:
  using EventHandler = std::function<std::int32_t(const Record& record, SummarizerContext* context)>;
  using ContextMaker = std::function<std::shared_ptr<SummarizerContext>()>;
  static constexpr std::uint64_t kNoRange = ~std::uint64_t{0};

  Summarizer() = default;
  virtual ~Summarizer() = default;
  Summarizer(const Summarizer&) = delete;
  Summarizer& operator=(const Summarizer&) = delete;

  // Feeds one record: boot-change handling, end at sleep, acceptance by
  // class, then the handler's answer.
  virtual void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime);
  // The classes whose fields addEvent reads. A record of any other class may
  // come as an empty record of its class (class, position and times exact),
  // which spares decoding records that nobody reads.
  virtual RecordClassSet classesRead() const { return allRecordClasses(); }
  // Opens a range at `position` unless one is open.
  void beginRangeAtPosition(std::uint64_t position);
  // Records the open range up to `position`; an empty or backwards range is
  // not recorded and the open range stays open with its start.
  void endRangeAtPosition(std::uint64_t position);
  // Drops the open range without recording it.
  void resetRange();
  // Called once after the last record: closes a still-open range unless
  // ranges are discrete.
  virtual void setLastPosition(std::uint64_t position);

  // The recorded ranges, in the order they closed.
  const std::vector<Range>& ranges() const { return ranges_; }
  // The boot's context, or null; never creates.
  SummarizerContext* contextForBoot(const Uuid& boot) const;

  virtual std::unique_ptr<Summary> newSummary() const { return std::make_unique<Summary>(); }
  // The ordering of this kind's summaries; null for none.
  virtual SummaryComparator comparator() const { return nullptr; }
  // Fills `summary` over the relative range: each per-boot piece goes to the
  // absolute-range overload, then the summary's range becomes `range`.
  virtual void summarize(Summary& summary, const Range& range, const Timeline& timeline);
  // Adds one absolute range's totals; nothing by default.
  virtual void summarize(Summary& summary, const AbsRange& range);

  // Configuration.
  const std::string& identifier() const { return identifier_; }
  void setIdentifier(std::string v) { identifier_ = std::move(v); }
  bool resetAtReboot() const { return resetAtReboot_; }
  void setResetAtReboot(bool v) { resetAtReboot_ = v; }
  bool startAtBoot() const { return startAtBoot_; }
  void setStartAtBoot(bool v) { startAtBoot_ = v; }
  bool endAtShutdown() const { return endAtShutdown_; }
  void setEndAtShutdown(bool v) { endAtShutdown_ = v; }
  bool discreteRanges() const { return discreteRanges_; }
  void setDiscreteRanges(bool v) { discreteRanges_ = v; }
  bool endAtSleep() const { return endAtSleep_; }
  void setEndAtSleep(bool v) { endAtSleep_ = v; }
  const std::optional<RecordClass>& eventClass() const { return eventClass_; }
  void setEventClass(std::optional<RecordClass> c) { eventClass_ = c; }
  const std::optional<std::vector<RecordClass>>& eventClasses() const { return eventClasses_; }
  void setEventClasses(std::optional<std::vector<RecordClass>> c) { eventClasses_ = std::move(c); }
  // The class of the per-boot contexts, given as its name and a maker.
  const char* contextClass() const { return contextClassName_; }
  void setContextClass(const char* name, ContextMaker maker);
  void setEventHandler(EventHandler h) { eventHandler_ = std::move(h); }

 protected:
  std::uint64_t rangeStart() const { return rangeStart_; }
  std::uint64_t rangeEnd() const { return rangeEnd_; }
  const std::optional<HashFactory<Uuid, SummarizerContext>>& contexts() const { return contexts_; }

 private:
  std::vector<Range> ranges_;
  std::uint64_t rangeStart_ = kNoRange;
  std::uint64_t rangeEnd_ = 0;
  std::uint64_t lastInBoot_ = 0;
  std::optional<Uuid> prevBoot_;
  std::optional<HashFactory<Uuid, SummarizerContext>> contexts_;

  std::string identifier_;
  bool resetAtReboot_ = false;
  bool startAtBoot_ = false;
  bool endAtShutdown_ = false;
  bool discreteRanges_ = false;
  bool endAtSleep_ = false;
  std::optional<RecordClass> eventClass_;
  std::optional<std::vector<RecordClass>> eventClasses_;
  const char* contextClassName_ = nullptr;
  ContextMaker contextMaker_;
  EventHandler eventHandler_;
};

}  // namespace bw
