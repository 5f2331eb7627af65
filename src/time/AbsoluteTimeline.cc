#include "time/AbsoluteTimeline.h"

#include <algorithm>

#include "Records/RecordDecoder.h"
#include "base/Exception.h"
#include "time/BootTimeline.h"

namespace bw {

AbsoluteTimeline::AbsoluteTimeline(const BootTimeline* boot) : boot_(boot) {
  if (boot != nullptr) bootUuid_ = boot->uuid();
}

void AbsoluteTimeline::addObject(const RecordRef& record, std::uint64_t wallTime) {
  widen(record, wallTime);
  owned_.push_back(record);
}

void AbsoluteTimeline::addObjectInPlace(const RecordRef& record, std::uint64_t wallTime) {
  widen(record, wallTime);
  if (count_++ == 0) first_ = &record;
}

void AbsoluteTimeline::widen(const RecordRef& record, std::uint64_t wall) {
  const std::uint64_t time = record.absoluteTime();
  const std::span<const RecordRef> added = records();
  if (!added.empty() && time < added.back().absoluteTime()) ascending_ = false;
  startAbsoluteTime_ = std::min(startAbsoluteTime_, time);
  endAbsoluteTime_ = std::max(endAbsoluteTime_, time);
  if (wall != 0) {
    if (skew_ != 0 && std::int64_t(wall - time) != skew_) {
      throw Exception(kInternalInconsistencyException, "event skew mismatch");
    }
    if (skew_ == 0) skew_ = std::int64_t(wall - startAbsoluteTime_);
  }
  invalidateFrom(parent());
}

void AbsoluteTimeline::adjustSkew(std::int64_t delta) {
  skew_ = std::int64_t(std::uint64_t(skew_) + std::uint64_t(delta));
  invalidateFrom(parent());
}

bool AbsoluteTimeline::enumerateRecordsWithOffset(std::uint64_t offset, const RecordBlock& block) const {
  AbsTime point{bootUuid_, 0};
  bool stop = false;
  for (const RecordRef& record : records()) {
    const std::uint64_t time = record.absoluteTime();
    point._setTime(time);
    block(record, offset + (time - startAbsoluteTime_), std::uint64_t(skew_) + time, point, stop);
    if (stop) return true;
  }
  return false;
}

// Records come in ascending position (when added in ascending time), so a
// cursor moves along the ascending ranges instead of searching them.
bool AbsoluteTimeline::enumerateEventsInRelativeRanges(const std::vector<Range>& ranges, std::uint64_t offset,
                                                       const EventBlock& block) const {
  const std::uint64_t lastEnd = ranges.empty() ? 0 : ranges.back().end();
  const std::span<const RecordRef> records = this->records();
  auto it = records.begin();
  if (ascending_ && !ranges.empty() && ranges.front().location > offset) {
    // Records before the first range are called for nothing and end nothing.
    const std::uint64_t firstTime = startAbsoluteTime_ + (ranges.front().location - offset);
    it = std::partition_point(records.begin(), records.end(),
                              [&](const RecordRef& r) { return r.absoluteTime() < firstTime; });
  }
  AbsTime point{bootUuid_, 0};
  WalkDecoder decode;
  auto cursor = ranges.begin();
  std::uint64_t previous = 0;
  for (; it != records.end(); ++it) {
    const std::uint64_t time = it->absoluteTime();
    const std::uint64_t position = offset + (time - startAbsoluteTime_);
    if (position > lastEnd) return true;
    if (position < previous) cursor = ranges.begin();
    previous = position;
    // The first range that ends after the position is the only one that can hold it.
    while (cursor != ranges.end() && cursor->end() <= position) ++cursor;
    if (cursor == ranges.end() || cursor->location > position) continue;
    point._setTime(time);
    bool ignored = false;
    block(decode(*it), position, std::uint64_t(skew_) + time, point, ignored);
  }
  return false;
}

std::uint64_t AbsoluteTimeline::wallTimeForRelative(std::uint64_t position, std::uint64_t offset) const {
  if (position < offset || position - offset > duration()) return 0;
  return startWallTime() + (position - offset);
}

std::optional<AbsTime> AbsoluteTimeline::absoluteTimeForRelative(std::uint64_t position, std::uint64_t offset) const {
  if (position <= offset || position - offset > duration()) return std::nullopt;
  return AbsTime{bootUuid_, startAbsoluteTime_ + (position - offset)};
}

std::vector<AbsRange> AbsoluteTimeline::absoluteRangesForRelative(std::uint64_t from, std::uint64_t to,
                                                                  std::uint64_t offset) const {
  const std::uint64_t end = offset + duration();
  if (offset > to || end < from) return {};
  const std::uint64_t startTime = offset >= from ? startAbsoluteTime_ : startAbsoluteTime_ + (from - offset);
  const std::uint64_t endTime = end <= to ? endAbsoluteTime_ : startAbsoluteTime_ + (to - offset);
  return {AbsRange::rangeWithBoot(bootUuid_, startTime, endTime)};
}

}  // namespace bw
