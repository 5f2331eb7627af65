#pragma once
// Stores for the daily run's tests, in UTC: boots whose records run over
// whole days, so that day domains find them.
#include <string>

#include "cli/RecordModesStore.h"

namespace bw::test {

inline constexpr std::uint64_t kHour = 3600000;
inline constexpr std::uint64_t kDay = 24 * kHour;

// One boot of `version` starting at wall time `start`, with a zone record
// and a user-idle change every hour for `hours` hours.
inline void writeBoot(const std::string& path, const Uuid& boot, const std::string& version, std::uint64_t start,
                      std::uint64_t hours, const Uuid* last = nullptr, const std::string& lastVersion = "") {
  StatsFileWriter w;
  w.append(logStart(boot, 1000, start, version, last, lastVersion));
  w.append(zoneChange("UTC", 0, 1500, start + 500));
  for (std::uint64_t h = 1; h <= hours; ++h) w.append(idle(1000 + h * kHour, h % 2));
  w.writeTo(path);
}

}  // namespace bw::test
