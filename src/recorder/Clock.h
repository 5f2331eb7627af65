#pragma once
// The recorder's clocks: the machine's absolute clock (CLOCK_MONOTONIC, which
// stops while asleep), the wall clock, the time spent asleep (to place
// process start times, which the kernel counts with sleep included) and the
// local zone. Tests replace it.
#include <cstdint>
#include <string>

namespace bw::recorder {

struct LocalTime {
  std::int64_t gmtoff = 0;  // seconds east of UTC
  std::string zone;         // abbreviation, "CET"
  int yday = 0;             // 0 = 1 January
  int year = 0;             // e.g. 2026
};

class Clock {
 public:
  virtual ~Clock() = default;
  // Milliseconds of CLOCK_MONOTONIC: the records' absolute time.
  virtual std::uint64_t absoluteMs() const = 0;
  // Milliseconds since 1970 UTC.
  virtual std::uint64_t wallMs() const = 0;
  // Milliseconds the machine slept since boot (CLOCK_BOOTTIME - CLOCK_MONOTONIC).
  virtual std::uint64_t asleepMs() const = 0;
  // The local calendar at a wall time, the zone re-read first.
  virtual LocalTime local(std::uint64_t wallMs) const = 0;
};

class SystemClock final : public Clock {
 public:
  std::uint64_t absoluteMs() const override;
  std::uint64_t wallMs() const override;
  std::uint64_t asleepMs() const override;
  LocalTime local(std::uint64_t wallMs) const override;
};

// The wall time of the next local midnight after `wallMs`.
std::uint64_t nextLocalMidnight(std::uint64_t wallMs);

}  // namespace bw::recorder
