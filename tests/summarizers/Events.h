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
#include "framework/Summarizer.h"

namespace bw::test {

inline Uuid boot(std::uint8_t n) { return Uuid(Uuid::Bytes{n}); }

inline void feed(Summarizer& s, const Record& r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  s.addEvent(r, position, AbsTime{boot(bootNumber), position}, 0);
}

// Feeds `r` with its own absolute time set to `position`, for summarizers
// that keep per-boot series by the record's time.
template <class R>
void feedAt(Summarizer& s, R r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  r.setAbsoluteTime(position);
  feed(s, r, position, bootNumber);
}

// A record of class R after `set` has filled it in.
template <class R, class F>
R make(F set) {
  R r;
  set(r);
  return r;
}
inline SleepWake sleepWake(std::uint32_t reason, bool fromStandby = false, const std::string& wakeType = "") {
  return make<SleepWake>([&](SleepWake& r) {
    r.setReason(reason), r.setWakeFromStandby(fromStandby);
    if (!wakeType.empty()) r.setWakeType(wakeType);
  });
}
inline PowerStateChange powerChange(std::uint64_t change, bool full = false) {
  return make<PowerStateChange>([&](PowerStateChange& r) { r.setChange(change), r.setIsFullyCharged(full); });
}
inline UserIdle userIdle(std::uint32_t change) {
  return make<UserIdle>([&](UserIdle& r) { r.setChange(change); });
}
inline DeviceChange device(std::uint32_t type, std::uint32_t on) {
  return make<DeviceChange>([&](DeviceChange& r) { r.setDeviceType(type), r.setNowConnected(on); });
}
// A gauge sample; a voltage of 0 leaves the voltage out.
inline BatteryChargeLevel level(std::int64_t charge, std::int64_t maxCharge, std::int64_t mV = 0) {
  return make<BatteryChargeLevel>([&](BatteryChargeLevel& r) {
    r.setCharge(charge), r.setMaxCharge(maxCharge);
    if (mV) r.setInstantVoltage(mV);
  });
}
inline LogStartsV1 logStarts(std::uint8_t n) {
  return make<LogStartsV1>([&](LogStartsV1& r) { r.setBootUUID(boot(n)); });
}

}  // namespace bw::test
