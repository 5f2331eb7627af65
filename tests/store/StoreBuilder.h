#pragma once
// Small builders for stats files written in tests.
#include <string>

#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"
#include "base/Uuid.h"
#include "store/StatsFileWriter.h"

namespace bw::test {

inline Uuid bootNamed(int n) {
  Uuid::Bytes b{};
  b[0] = static_cast<std::uint8_t>(n);
  b[15] = 0xB0;
  return Uuid(b);
}

inline LogStartsV1 header(const Uuid& boot, std::uint64_t absoluteTime, const std::string& version = "22A100",
                          std::uint64_t writer = 1) {
  LogStartsV1 h;
  h.setVersion("1");
  h.setAbsoluteTime(absoluteTime);
  h.setWallTime(1700000000000 + absoluteTime);
  h.setWriter(writer);
  h.setBootUuid(std::string(reinterpret_cast<const char*>(boot.bytes().data()), 16));
  h.setSystemVersion(version);
  return h;
}

inline UserIdle idle(std::uint64_t absoluteTime, std::uint32_t change = 1) {
  UserIdle u;
  u.setAbsoluteTime(absoluteTime);
  u.setChange(change);
  return u;
}

inline SleepWake sleepAt(std::uint64_t absoluteTime) {
  SleepWake s;
  s.setAbsoluteTime(absoluteTime);
  s.setWallTime(1700000000000 + absoluteTime);
  s.setReason(0);
  return s;
}

}  // namespace bw::test
