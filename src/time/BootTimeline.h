#pragma once
// The timeline of one boot: its records cut into segments of constant skew.
// A segment starts wherever a record's wall time jumps against the tick
// counter (a sleep, a clock or time-zone change). Records written before the
// clock was first set (wall times before 2013) are moved onto the first
// plausible clock reading of the boot.
//
// The boot's first record must be a LogStartsV1; it names the system
// version. The records behind the handles must outlive the timeline.
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "Records/RecordRef.h"
#include "base/Uuid.h"
#include "time/Timeline.h"

namespace bw {

class AbsoluteTimeline;

class BootTimeline : public Timeline {
 public:
  // Wall times above this (2013-01-01 00:00:00 UTC, in ms) are taken as a
  // set clock.
  static constexpr std::uint64_t kClockSetWallTime = 0x13BF3685800ULL;

  // Builds the boot from `events`, sorted by absolute time. Throws
  // kInvalidArgumentException "invalid event stream detected" unless the
  // first record is exactly a LogStartsV1 kept decoded.
  // The boot keeps `events`; its segments point into them.
  BootTimeline(const Uuid& uuid, std::optional<Uuid> lastUUID, RecordList events);
  BootTimeline(const Uuid& uuid, RecordList events) : BootTimeline(uuid, std::nullopt, std::move(events)) {}
  // The same over records kept decoded, which must outlive the timeline.
  BootTimeline(const Uuid& uuid, std::optional<Uuid> lastUUID, std::span<Record* const> events)
      : BootTimeline(uuid, lastUUID, RecordList(events.begin(), events.end())) {}
  BootTimeline(const Uuid& uuid, std::span<Record* const> events) : BootTimeline(uuid, std::nullopt, events) {}

  const Uuid& uuid() const { return uuid_; }
  const std::optional<Uuid>& lastUUID() const { return lastUUID_; }
  // The first record's system version, when it has one.
  const std::optional<std::string>& systemVersion() const { return systemVersion_; }
  std::size_t segmentCount() const { return objects().size(); }
  const AbsoluteTimeline& segment(std::size_t index) const;

  // The first segment's start and the last segment's end.
  std::uint64_t startWallTime() const override;
  std::uint64_t endWallTime() const override;

 private:
  AbsoluteTimeline& newSegment();

  Uuid uuid_;
  std::optional<Uuid> lastUUID_;
  std::optional<std::string> systemVersion_;
  RecordList records_;
};

}  // namespace bw
