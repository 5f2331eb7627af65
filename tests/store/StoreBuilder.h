#pragma once
// Small builders for stats files written in tests.
#include <string>

#include "store/StatsFileWriter.h"
#include "support/Records.h"

namespace bw::test {

inline constexpr std::uint64_t kWallBase = 1700000000000;

inline LogStartsV1 header(const Uuid& boot, std::uint64_t absoluteTime, const std::string& version = "22A100",
                          std::uint64_t writer = 1) {
  return logStart(boot, absoluteTime, kWallBase + absoluteTime, version, nullptr, "", writer);
}

inline SleepWake sleepAt(std::uint64_t absoluteTime) {
  return sleepWake(absoluteTime, kWallBase + absoluteTime, SleepWake::kSleep);
}

}  // namespace bw::test
