#include "time/Timeline.h"

#include <algorithm>

#include "Records/RecordDecoder.h"

namespace bw {

std::unique_ptr<Timeline> Timeline::timelineWithTimelines(std::vector<std::unique_ptr<Timeline>> timelines) {
  auto timeline = std::make_unique<Timeline>();
  for (auto& child : timelines) timeline->addObject(std::move(child));
  timeline->ensureIndex();
  return timeline;
}

void Timeline::addObject(std::unique_ptr<Timeline> child) {
  child->parent_ = this;
  if (std::uint64_t wall = child->wallTime(); wall != 0) {
    startWallTime_ = std::min(startWallTime_, wall);
    storedEndWallTime_ = std::max(storedEndWallTime_, wall);
  }
  children_.push_back(std::move(child));
  invalidateFrom(this);
}

void Timeline::invalidateFrom(Timeline* node) {
  while (node != nullptr && node->indexValid_) {
    node->indexValid_ = false;
    node = node->parent_;
  }
}

std::uint64_t Timeline::endWallTime() const { return children_.empty() ? 0 : children_.back()->endWallTime(); }

std::uint64_t Timeline::duration() const {
  ensureIndex();
  return duration_;
}

std::optional<AbsTime> Timeline::highestAbsTime() const {
  if (children_.empty()) return std::nullopt;
  return children_.back()->highestAbsTime();
}

// A child that starts after the previous one ends keeps the wall-clock gap
// on the axis; one that starts at or before it follows on directly.
void Timeline::ensureIndex() const {
  if (indexValid_) return;
  const std::size_t n = children_.size();
  offsets_.resize(n);
  ends_.resize(n);
  std::uint64_t running = 0;
  std::uint64_t longest = 0;
  const Timeline* previous = nullptr;
  for (std::size_t i = 0; i < n; ++i) {
    const Timeline& child = *children_[i];
    std::uint64_t offset = running;
    if (previous != nullptr) {
      std::uint64_t start = child.startWallTime();
      std::uint64_t previousEnd = previous->endWallTime();
      if (start > previousEnd) offset = running + (start - previousEnd);
    }
    running = offset + child.duration();
    offsets_[i] = offset;
    ends_[i] = running;
    longest = std::max(longest, running);
    previous = &child;
  }
  duration_ = longest;
  indexValid_ = true;
}

// Child spans never overlap except where they touch (each child starts at
// or after the previous one's end), so offsets and ends both ascend and a
// child whose span misses [from, to] can answer nothing.
std::pair<std::size_t, std::size_t> Timeline::candidates(std::uint64_t from, std::uint64_t to) const {
  ensureIndex();
  auto first = std::lower_bound(ends_.begin(), ends_.end(), from) - ends_.begin();
  auto last = std::upper_bound(offsets_.begin(), offsets_.end(), to) - offsets_.begin();
  return {static_cast<std::size_t>(first), static_cast<std::size_t>(std::max(first, last))};
}

bool Timeline::enumerateTimelinesWithOffset(std::uint64_t offset, const TimelineBlock& block) const {
  ensureIndex();
  bool stop = false;
  for (std::size_t i = 0; i < children_.size(); ++i) {
    block(*children_[i], offset + offsets_[i], stop);
    if (stop) return true;
  }
  return false;
}

bool Timeline::enumerateEventsWithOffset(std::uint64_t offset, const EventBlock& block) const {
  WalkDecoder decode;
  return enumerateRecordsWithOffset(
      offset, [&](const RecordRef& record, std::uint64_t position, std::uint64_t wallTime, const AbsTime& absTime,
                  bool& stop) { block(decode(record), position, wallTime, absTime, stop); });
}

bool Timeline::enumerateRecordsWithOffset(std::uint64_t offset, const RecordBlock& block) const {
  ensureIndex();
  for (std::size_t i = 0; i < children_.size(); ++i) {
    if (children_[i]->enumerateRecordsWithOffset(offset + offsets_[i], block)) return true;
  }
  return false;
}

// Every child is visited whatever the others report. Children that lie
// wholly before the first range or at or after the last range's end would
// call the block for nothing, so they are skipped.
bool Timeline::enumerateEventsInRelativeRanges(const std::vector<Range>& ranges, std::uint64_t offset,
                                               const EventBlock& block) const {
  if (ranges.empty() || children_.empty()) return false;
  const std::uint64_t firstLocation = ranges.front().location;
  const std::uint64_t lastEnd = ranges.back().end();
  if (lastEnd <= offset) return false;
  const std::uint64_t from = firstLocation > offset ? firstLocation - offset : 0;
  auto [first, last] = candidates(from, lastEnd - 1 - offset);
  for (std::size_t i = first; i < last; ++i) {
    children_[i]->enumerateEventsInRelativeRanges(ranges, offset + offsets_[i], block);
  }
  return false;
}

// As a walk over the children in order: each child at or before the
// position is asked until one answers; a position in the gap before a
// child is extrapolated from the start of the child before that gap.
std::uint64_t Timeline::wallTimeForRelative(std::uint64_t position, std::uint64_t offset) const {
  if (children_.empty()) return 0;
  if (position < offset) return position;  // before the first child, which has no predecessor
  auto [first, last] = candidates(position - offset, position - offset);
  for (std::size_t i = first; i < last; ++i) {
    if (std::uint64_t wall = children_[i]->wallTimeForRelative(position, offset + offsets_[i]); wall != 0) {
      return wall;
    }
  }
  if (last < children_.size()) {
    if (last == 0) return position;
    return children_[last - 1]->startWallTime() + (position - (offset + offsets_[last - 1]));
  }
  return 0;
}

// As a walk over the children in order that ends at the first child past
// the position; a gap therefore has no absolute time.
std::optional<AbsTime> Timeline::absoluteTimeForRelative(std::uint64_t position, std::uint64_t offset) const {
  if (children_.empty() || position < offset) return std::nullopt;
  auto [first, last] = candidates(position - offset, position - offset);
  for (std::size_t i = first; i < last; ++i) {
    if (auto time = children_[i]->absoluteTimeForRelative(position, offset + offsets_[i])) return time;
  }
  return std::nullopt;
}

// The run of answering children: those before it answer nothing, and the
// first silent child after it ends the walk.
std::vector<AbsRange> Timeline::absoluteRangesForRelative(std::uint64_t from, std::uint64_t to,
                                                          std::uint64_t offset) const {
  std::vector<AbsRange> result;
  if (children_.empty() || to < offset) return result;
  auto [first, last] = candidates(from > offset ? from - offset : 0, to - offset);
  for (std::size_t i = first; i < last; ++i) {
    std::vector<AbsRange> ranges = children_[i]->absoluteRangesForRelative(from, to, offset + offsets_[i]);
    if (ranges.empty()) {
      if (!result.empty()) break;
      continue;
    }
    result.insert(result.end(), ranges.begin(), ranges.end());
  }
  return result;
}

std::vector<AbsRange> Timeline::absoluteRangesForRelativeRanges(const std::vector<Range>& ranges) const {
  std::vector<AbsRange> result;
  for (const Range& range : ranges) {
    std::vector<AbsRange> part = absoluteRangesForRelativeRange(range);
    result.insert(result.end(), part.begin(), part.end());
  }
  return result;
}

}  // namespace bw
