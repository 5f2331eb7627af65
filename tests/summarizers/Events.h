#pragma once
// Records for the summarizer tests, fed at positions of one boot or another.
#include <cstdint>
#include <string>

#include "Records/BatteryChargeLevel.h"
#include "Records/DeviceChange.h"
#include "Records/LogStartsV1.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"
#include "model/Summarizer.h"

namespace bw::test {

inline Uuid boot(std::uint8_t n) { return Uuid(Uuid::Bytes{n}); }

inline void feed(Summarizer& s, const Record& r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  s.addEvent(r, position, AbsTime{boot(bootNumber), position}, 0);
}

inline SleepWake sleepWake(std::uint32_t reason, bool fromStandby = false, const std::string& wakeType = "") {
  SleepWake r;
  r.setReason(reason);
  r.setWakeFromStandby(fromStandby);
  if (!wakeType.empty()) r.setWakeType(wakeType);
  return r;
}

inline PowerStateChange powerChange(std::uint64_t change, bool fullyCharged = false) {
  PowerStateChange r;
  r.setChange(change);
  r.setIsFullyCharged(fullyCharged);
  return r;
}

inline UserIdle userIdle(std::uint32_t change) {
  UserIdle r;
  r.setChange(change);
  return r;
}

inline DeviceChange device(std::uint32_t type, std::uint32_t connected) {
  DeviceChange r;
  r.setDeviceType(type);
  r.setNowConnected(connected);
  return r;
}

// A gauge sample; a voltage of 0 leaves the voltage out.
inline BatteryChargeLevel level(std::int64_t charge, std::int64_t maxCharge, std::int64_t mV = 0) {
  BatteryChargeLevel r;
  r.setCharge(charge);
  r.setMaxCharge(maxCharge);
  if (mV) r.setInstantVoltage(mV);
  return r;
}

inline LogStartsV1 logStarts(std::uint8_t bootNumber) {
  LogStartsV1 r;
  r.setBootUUID(boot(bootNumber));
  return r;
}

}  // namespace bw::test
