#include "framework/Summarizer.h"

#include <algorithm>

#include "Records/SleepWake.h"
#include "time/Timeline.h"

namespace bw {

void Summarizer::setContextClass(const char* name, ContextMaker maker) {
  contextClassName_ = name;
  contextMaker_ = std::move(maker);
}

void Summarizer::addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  // A boot change: a context made just now for this boot, or (without
  // contexts, or with one already there) another boot than the last record's.
  SummarizerContext* context = nullptr;
  bool bootChange = false;
  if (contextMaker_) {
    if (!contexts_) contexts_.emplace(HashFactory<Uuid, SummarizerContext>::Block(contextMaker_));
    context = &contexts_->objectForKey(absTime.boot, &bootChange);
  }
  if (!bootChange) {
    if (prevBoot_ == absTime.boot) {
      lastInBoot_ = position;
    } else {
      bootChange = true;
    }
  }
  if (bootChange) {
    if (endAtShutdown_) endRangeAtPosition(lastInBoot_);
    if (resetAtReboot_) resetRange();
    if (startAtBoot_) beginRangeAtPosition(position);
    prevBoot_ = absTime.boot;
    lastInBoot_ = 0;
  }

  if (endAtSleep_ && event.recordClass() == RecordClass::SleepWake &&
      static_cast<const SleepWake&>(event).reason() == SleepWake::kSleep) {
    endRangeAtPosition(position);
  }

  bool accepted = eventClass_ && *eventClass_ == event.recordClass();
  if (!accepted && eventClasses_) {
    accepted = std::find(eventClasses_->begin(), eventClasses_->end(), event.recordClass()) != eventClasses_->end();
  }
  if (!accepted || !eventHandler_) return;

  const std::int32_t answer = eventHandler_(event, context);
  if (answer == 0) {
    endRangeAtPosition(position);
  } else if (answer != -1) {
    if (discreteRanges_) endRangeAtPosition(position);
    beginRangeAtPosition(position);
  }
}

void Summarizer::beginRangeAtPosition(std::uint64_t position) {
  if (rangeStart_ != kNoRange) return;
  rangeStart_ = position;
  rangeEnd_ = 0;
}

void Summarizer::endRangeAtPosition(std::uint64_t position) {
  rangeEnd_ = position;
  if (rangeStart_ == kNoRange || position <= rangeStart_) return;
  ranges_.push_back(Range{rangeStart_, position - rangeStart_});
  resetRange();
}

void Summarizer::resetRange() {
  rangeStart_ = kNoRange;
  rangeEnd_ = 0;
}

void Summarizer::setLastPosition(std::uint64_t position) {
  if (!discreteRanges_ && rangeEnd_ == 0) endRangeAtPosition(position);
}

SummarizerContext* Summarizer::contextForBoot(const Uuid& boot) const {
  if (!contexts_) return nullptr;
  return contexts_->objectForKeyedSubscript(boot).get();
}

void Summarizer::summarize(Summary& summary, const Range& range, const Timeline& timeline) {
  for (const AbsRange& piece : timeline.absoluteRangesForRelativeRange(range)) summarize(summary, piece);
  summary.setRange(range);
}

void Summarizer::summarize(Summary&, const AbsRange&) {}

}  // namespace bw
