#pragma once
// One segment: a run of records within one boot whose skew (wall time minus
// absolute time) is constant, so positions, wall times and absolute times
// convert by plain addition. Segments hold handles on records kept
// elsewhere, in the order added; a walk decodes each record as it reaches it,
// and the record it hands to the block is valid only during that call.
//
// A record at absolute time t of a segment placed at offset X has the
// position X + (t - startAbsoluteTime) and the wall time skew + t.
#include <cstdint>
#include <span>
#include <vector>

#include "Records/RecordRef.h"
#include "time/Timeline.h"

namespace bw {

class BootTimeline;

class AbsoluteTimeline : public Timeline {
 public:
  // `boot` is the boot that owns the segment (not owned; may be null, in
  // which case AbsTimes carry the all-zero UUID).
  explicit AbsoluteTimeline(const BootTimeline* boot);

  // Widens the absolute span to the record's time; a record with a wall
  // time (`wallTime`, 0 for none) sets the skew (from the segment's lowest
  // absolute time) or must match it, else throws
  // kInternalInconsistencyException "event skew mismatch".
  void addObject(const RecordRef& record, std::uint64_t wallTime);
  void addObject(const Record* record) { addObject(record, record->wallTime()); }
  // The same for a record that stays where it is, right after the last one
  // added this way, in storage that outlives the segment: the segment then
  // copies nothing. A segment takes its records one way or the other.
  void addObjectInPlace(const RecordRef& record, std::uint64_t wallTime);
  std::span<const RecordRef> records() const {
    return owned_.empty() ? std::span<const RecordRef>(first_, count_) : std::span<const RecordRef>(owned_);
  }

  // Adds `delta` to the skew (the boot moves early segments onto the clock).
  void adjustSkew(std::int64_t delta);

  const BootTimeline* boot() const { return boot_; }
  const Uuid& bootUuid() const { return bootUuid_; }
  std::uint64_t startAbsoluteTime() const { return startAbsoluteTime_; }  // all ones while empty
  std::uint64_t endAbsoluteTime() const { return endAbsoluteTime_; }
  std::int64_t skew() const { return skew_; }

  std::uint64_t duration() const override { return endAbsoluteTime_ - startAbsoluteTime_; }
  std::uint64_t startWallTime() const override { return std::uint64_t(skew_) + startAbsoluteTime_; }
  std::uint64_t endWallTime() const override { return std::uint64_t(skew_) + endAbsoluteTime_; }
  std::optional<AbsTime> highestAbsTime() const override { return AbsTime{bootUuid_, endAbsoluteTime_}; }

  bool enumerateRecordsWithOffset(std::uint64_t offset, const RecordBlock& block) const override;
  // Calls the block once for each record inside some range; the first record
  // past the last range's end ends the segment's walk and returns true.
  bool enumerateEventsInRelativeRanges(const std::vector<Range>& ranges, std::uint64_t offset,
                                       const EventBlock& block) const override;
  using Timeline::enumerateEventsInRelativeRanges;

  // 0 before the offset and more than `duration` after it; otherwise
  // startWallTime + (position - offset). The first instant has a wall time.
  std::uint64_t wallTimeForRelative(std::uint64_t position, std::uint64_t offset) const override;
  using Timeline::wallTimeForRelative;
  // An AbsTime when 0 < position - offset <= duration: the first instant
  // has none.
  std::optional<AbsTime> absoluteTimeForRelative(std::uint64_t position, std::uint64_t offset) const override;
  using Timeline::absoluteTimeForRelative;
  // None when the segment lies wholly outside [from, to]; else one range
  // clipped to it.
  std::vector<AbsRange> absoluteRangesForRelative(std::uint64_t from, std::uint64_t to,
                                                  std::uint64_t offset) const override;

 private:
  // Takes the record's times into the segment's span and skew.
  void widen(const RecordRef& record, std::uint64_t wallTime);

  const BootTimeline* boot_;
  Uuid bootUuid_;
  RecordList owned_;                  // records added by copy
  const RecordRef* first_ = nullptr;  // or records left in place
  std::size_t count_ = 0;
  std::uint64_t startAbsoluteTime_ = UINT64_MAX;
  std::uint64_t endAbsoluteTime_ = 0;
  std::int64_t skew_ = 0;
  // Whether the records were added in ascending absolute time, which lets
  // range walks start by binary search.
  bool ascending_ = true;
};

}  // namespace bw
