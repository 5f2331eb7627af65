#pragma once
// The tests' one record builder: boots by number and the records the tests
// feed or write, each with the fields that matter set and the rest left
// absent. Times default to 0; wall times are milliseconds since 1970.
#include <cstdint>
#include <string>

#include "Records/BatteryChargeLevel.h"
#include "Records/DeviceChange.h"
#include "Records/LogStartsV1.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "Records/SystemIO.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "base/Uuid.h"
#include "base/Value.h"

namespace bw::test {

// Boot `n`: every byte of the UUID is n.
inline Uuid bootNamed(int n) {
  Uuid::Bytes bytes{};
  bytes.fill(static_cast<std::uint8_t>(n));
  return Uuid(bytes);
}

// The UUID's 16 bytes, as the header's bytes fields hold them.
inline std::string uuidBytes(const Uuid& u) {
  return std::string(reinterpret_cast<const char*>(u.bytes().data()), u.bytes().size());
}

// A header of `boot`; an empty version or last version stays absent.
inline LogStartsV1 logStart(const Uuid& boot, std::uint64_t abs = 0, std::uint64_t wall = 0,
                            const std::string& version = "", const Uuid* last = nullptr,
                            const std::string& lastVersion = "", std::uint64_t writer = 1) {
  LogStartsV1 h;
  h.setVersion("1");
  h.setAbsoluteTime(abs);
  h.setWallTime(wall);
  h.setWriter(writer);
  h.setBootUuid(uuidBytes(boot));
  if (!version.empty()) h.setSystemVersion(version);
  if (last) h.setLastBootUuid(uuidBytes(*last));
  if (!lastVersion.empty()) h.setLastSystemVersion(lastVersion);
  return h;
}

inline SleepWake sleepWake(std::uint64_t abs, std::uint64_t wall, std::uint32_t reason,
                           const std::string& wakeType = "", bool fromStandby = false) {
  SleepWake s;
  s.setAbsoluteTime(abs);
  s.setWallTime(wall);
  s.setReason(reason);
  if (!wakeType.empty()) s.setWakeType(wakeType);
  if (fromStandby) s.setWakeFromStandby(true);
  return s;
}

inline UserIdle idle(std::uint64_t abs = 0, std::uint64_t change = UserIdle::kIdle) {
  UserIdle u;
  u.setAbsoluteTime(abs);
  u.setChange(change);
  return u;
}

// A wall time of 0 stays absent.
inline PowerStateChange powerChange(std::uint64_t change, std::uint64_t abs = 0, std::uint64_t wall = 0,
                                    bool fullyCharged = false) {
  PowerStateChange p;
  p.setAbsoluteTime(abs);
  p.setChange(change);
  if (wall != 0) p.setWallTime(wall);
  if (fullyCharged) p.setIsFullyCharged(true);
  return p;
}

// An empty name or id stays absent.
inline DeviceChange device(std::uint32_t type, std::uint32_t connected, std::uint64_t abs = 0,
                           const std::string& name = "", const std::string& id = "") {
  DeviceChange d;
  d.setAbsoluteTime(abs);
  d.setDeviceType(type);
  d.setNowConnected(connected);
  if (!name.empty()) d.setDeviceName(name);
  if (!id.empty()) d.setDeviceId(id);
  return d;
}

// A gauge sample; a voltage or time of 0 stays absent.
inline BatteryChargeLevel level(std::int64_t charge, std::int64_t maxCharge, std::int64_t mV = 0,
                                std::uint64_t abs = 0) {
  BatteryChargeLevel b;
  if (abs != 0) b.setAbsoluteTime(abs);
  b.setCharge(charge);
  b.setMaxCharge(maxCharge);
  if (mV != 0) b.setInstantVoltage(mV);
  return b;
}

// A laptop gauge sample at `abs`: 5000 mAh full, 12 cycles.
inline BatteryChargeLevel gaugeAt(std::uint64_t abs, std::int64_t charge, std::int64_t mV) {
  BatteryChargeLevel b = level(charge, 5000, mV);
  b.setAbsoluteTime(abs);
  b.setCycleCount(12);
  return b;
}

// A package sample at 2000 MHz with its any-C-state residency counter.
inline PackageEnergyStatistics packageSample(std::uint64_t abs, std::uint64_t residency) {
  PackageEnergyStatistics p;
  p.setAbsoluteTime(abs);
  p.setPkgCanyResidency(residency);
  p.setPkgFreq(2000);
  return p;
}

// An I/O sample with only its disk-read byte counter.
inline SystemIO diskRead(std::uint64_t abs, std::uint64_t bytesRead) {
  SystemIO r;
  r.setAbsoluteTime(abs);
  r.setDiskBytesRead(bytesRead);
  return r;
}

inline TimeChange zoneChange(const std::string& zoneName, std::int64_t gmtoff, std::uint64_t abs = 0,
                             std::uint64_t wall = 0) {
  TimeChange t;
  t.setAbsoluteTime(abs);
  t.setWallTime(wall);
  t.setZoneName(zoneName);
  t.setGmtoff(gmtoff);
  return t;
}

// The record as the dump prints it, on one line: "{ absoluteTime = 5; charge
// = 3; }" with every field that is set, in name order.
inline std::string fieldsOf(const Record& r) {
  std::string text;
  for (char c : describeValue(Value(r.dictionaryRepresentation()))) {
    if (c == '\n') c = ' ';
    if (c != ' ' || text.empty() || text.back() != ' ') text += c;
  }
  return text;
}

}  // namespace bw::test
