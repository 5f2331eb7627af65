#pragma once
// A point in one boot's absolute time: the boot's UUID with a tick count
// (milliseconds since that boot). A bare tick count means nothing without
// its boot, so the two always travel together.
//
// A plain value: copying is `copy`. No equality is defined on purpose;
// callers compare `boot` and `time` explicitly.
#include <cstdint>
#include <string>

#include "base/Uuid.h"

namespace bw {

struct AbsTime {
  Uuid boot;
  std::uint64_t time = 0;

  static AbsTime timeWithBoot(const Uuid& boot, std::uint64_t time) { return AbsTime{boot, time}; }

  // Moves the point along its boot. Only the timeline walks use it, on the
  // one point they hand to every callback in turn.
  void _setTime(std::uint64_t t) { time = t; }

  // "AbsTime: ( UUID, TIME )" with the time printed signed.
  std::string description() const;
  // "<AbsTime: ADDRESS, boot: UUID, time: TIME>" with the time unsigned.
  std::string debugDescription() const;
};

}  // namespace bw
