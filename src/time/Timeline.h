#pragma once
// One continuous axis of positions (milliseconds) over an ordered list of
// child timelines: boots under a top timeline, segments under a boot.
// While the machine runs, positions advance with its tick counter; between
// children (a sleep, the time between boots) they advance by the wall-clock
// gap, and children that overlap in wall time get no gap at all.
//
// Every operation that takes an offset treats the node's first position as
// that offset. Lookups of positions find the children that can answer by
// binary search over child offsets computed once (and again after a change
// below), yet answer exactly as a walk over all children in order would.
//
// Wall times are milliseconds since 1970 (0 means none); absolute times are
// ticks of one boot; a timeline is built and walked on one thread.
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "base/Range.h"
#include "time/AbsRange.h"
#include "time/AbsTime.h"

namespace bw {

class Record;
class RecordRef;
class Timeline;

// Called for each record of a walk with its position, its wall time and its
// AbsTime. The AbsTime is one object moved from record to record: copy it
// to keep it. Setting `stop` ends a plain walk (range walks ignore it).
using EventBlock = std::function<void(const Record& event, std::uint64_t position, std::uint64_t wallTime,
                                      const AbsTime& absTime, bool& stop)>;
// The same walk over record handles: nothing is decoded.
using RecordBlock = std::function<void(const RecordRef& record, std::uint64_t position, std::uint64_t wallTime,
                                       const AbsTime& absTime, bool& stop)>;
// Called for each child timeline with the child's offset on the axis.
using TimelineBlock = std::function<void(const Timeline& child, std::uint64_t offset, bool& stop)>;

class Timeline {
 public:
  Timeline() = default;
  virtual ~Timeline() = default;
  Timeline(const Timeline&) = delete;
  Timeline& operator=(const Timeline&) = delete;

  // A timeline with `timelines` as its children, in the given order.
  static std::unique_ptr<Timeline> timelineWithTimelines(std::vector<std::unique_ptr<Timeline>> timelines);

  // Appends (and owns) a child. A child with a non-zero wall time lowers
  // the stored start wall time and raises the stored end wall time.
  void addObject(std::unique_ptr<Timeline> child);
  const std::vector<std::unique_ptr<Timeline>>& objects() const { return children_; }

  // Starts at all ones; the least non-zero wall time of the children added.
  virtual std::uint64_t startWallTime() const { return startWallTime_; }
  // The last child's end wall time (0 without children). The stored maximum
  // is kept apart in storedEndWallTime().
  virtual std::uint64_t endWallTime() const;
  std::uint64_t storedEndWallTime() const { return storedEndWallTime_; }
  std::uint64_t wallTime() const { return startWallTime(); }
  // The largest (child offset + child duration) with offset 0; 0 if empty.
  virtual std::uint64_t duration() const;
  // The last child's highest AbsTime; none without children.
  virtual std::optional<AbsTime> highestAbsTime() const;

  // Calls `block` with each child and its offset; true if the block stopped.
  virtual bool enumerateTimelinesWithOffset(std::uint64_t offset, const TimelineBlock& block) const;
  // Walks every record in order, each decoded as the block gets it; true if
  // the block stopped.
  bool enumerateEventsWithOffset(std::uint64_t offset, const EventBlock& block) const;
  // Walks every record's handle in order; true if the block stopped.
  virtual bool enumerateRecordsWithOffset(std::uint64_t offset, const RecordBlock& block) const;
  bool enumerateRecordsUsingBlock(const RecordBlock& block) const { return enumerateRecordsWithOffset(0, block); }
  bool enumerateEventsUsingBlock(const EventBlock& block) const { return enumerateEventsWithOffset(0, block); }
  // Calls `block` for the records whose position lies in one of `ranges`
  // (ascending, non-overlapping, half-open). The whole timeline is always
  // covered: the block's stop flag is not consulted, and the result says
  // only whether a segment ended past the last range.
  virtual bool enumerateEventsInRelativeRanges(const std::vector<Range>& ranges, std::uint64_t offset,
                                               const EventBlock& block) const;
  void enumerateEventsInRelativeRanges(const std::vector<Range>& ranges, const EventBlock& block) const {
    enumerateEventsInRelativeRanges(ranges, 0, block);
  }

  // The wall time at `position`: a child's answer where a child covers it,
  // else extrapolated from the start of the child before the gap it lies
  // in; 0 past the end.
  virtual std::uint64_t wallTimeForRelative(std::uint64_t position, std::uint64_t offset) const;
  virtual std::uint64_t wallTimeForRelative(std::uint64_t position) const { return wallTimeForRelative(position, 0); }
  // The AbsTime at `position`; none in a gap, past the end, and at the
  // first instant of a segment that no earlier segment touches.
  virtual std::optional<AbsTime> absoluteTimeForRelative(std::uint64_t position, std::uint64_t offset) const;
  virtual std::optional<AbsTime> absoluteTimeForRelative(std::uint64_t position) const {
    return absoluteTimeForRelative(position, 0);
  }
  // The AbsRanges that cover positions [from, to]: one per segment from the
  // first that answers to the last of the unbroken run after it. Empty means
  // none. Throws "end < start" when from > to inside one segment.
  virtual std::vector<AbsRange> absoluteRangesForRelative(std::uint64_t from, std::uint64_t to,
                                                          std::uint64_t offset) const;
  std::vector<AbsRange> absoluteRangesForRelativeRange(const Range& range) const {
    return absoluteRangesForRelative(range.location, range.location + range.length, 0);
  }
  // The concatenation, in order, of each range's AbsRanges.
  std::vector<AbsRange> absoluteRangesForRelativeRanges(const std::vector<Range>& ranges) const;

 protected:
  // Marks the child index of `node` and of every ancestor stale. A stale
  // node's ancestors are always stale, so the climb stops at the first one.
  static void invalidateFrom(Timeline* node);
  Timeline* parent() const { return parent_; }
  // Computes the child offsets if a change made them stale. Builders call
  // it when done, so that a finished timeline is only ever read.
  void ensureIndex() const;

 private:
  // Children [first, last) whose span [offset, offset + duration] can hold
  // a relative position in [from, to]; the others answer nothing.
  std::pair<std::size_t, std::size_t> candidates(std::uint64_t from, std::uint64_t to) const;

  std::vector<std::unique_ptr<Timeline>> children_;
  Timeline* parent_ = nullptr;
  std::uint64_t startWallTime_ = UINT64_MAX;
  std::uint64_t storedEndWallTime_ = 0;

  // Child offsets and ends (offset + duration) at offset 0, both ascending.
  mutable bool indexValid_ = false;
  mutable std::vector<std::uint64_t> offsets_;
  mutable std::vector<std::uint64_t> ends_;
  mutable std::uint64_t duration_ = 0;
};

}  // namespace bw
