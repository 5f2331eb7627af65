#pragma once
// A small store for the record modes' end-to-end tests, written with the
// record classes' own encoder.
//
// Version 20A1: boot A (00:00:01 UTC on 2024-01-01; on battery; asleep from
// 00:01:10 for ten minutes) and boot B (00:15:00.5, naming A as its previous
// boot). Version 21B5: boot C (00:30:00, updated from 20A1, two files).
#include <string>

#include "Records/BatteryChargeLevel.h"
#include "Records/DeviceChange.h"
#include "Records/LogStartsV1.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "base/Uuid.h"
#include "store/StatsFileWriter.h"
#include "support/TempDir.h"

namespace bw::test {

inline const Uuid kBootA = *Uuid::parse("AAAAAAAA-0000-0000-0000-000000000001");
inline const Uuid kBootB = *Uuid::parse("BBBBBBBB-0000-0000-0000-000000000002");
inline const Uuid kBootC = *Uuid::parse("CCCCCCCC-0000-0000-0000-000000000003");
inline constexpr std::uint64_t kJan1 = 1704067200000;  // 2024-01-01 00:00:00 UTC

inline std::string raw(const Uuid& u) { return std::string(reinterpret_cast<const char*>(u.bytes().data()), 16); }

inline LogStartsV1 logStart(const Uuid& boot, std::uint64_t abs, std::uint64_t wall, const std::string& version,
                            const Uuid* last, const std::string& lastVersion = "") {
  LogStartsV1 h;
  h.setVersion("1");
  h.setAbsoluteTime(abs);
  h.setWallTime(wall);
  h.setWriter(1);
  h.setBootUuid(raw(boot));
  h.setSystemVersion(version);
  if (last) h.setLastBootUuid(raw(*last));
  if (!lastVersion.empty()) h.setLastSystemVersion(lastVersion);
  return h;
}

inline BatteryChargeLevel level(std::uint64_t abs, std::int64_t charge, std::int64_t voltage) {
  BatteryChargeLevel b;
  b.setAbsoluteTime(abs);
  b.setCharge(charge);
  b.setMaxCharge(5000);
  b.setCycleCount(12);
  b.setInstantVoltage(voltage);
  return b;
}

inline SleepWake sleepWake(std::uint64_t abs, std::uint64_t wall, std::uint32_t reason, const std::string& type = "",
                           bool standby = false) {
  SleepWake s;
  s.setAbsoluteTime(abs);
  s.setWallTime(wall);
  s.setReason(reason);
  if (!type.empty()) s.setWakeType(type);
  if (standby) s.setWakeFromStandby(true);
  return s;
}

inline void writeRecordModesStore(const TempDir& dir) {
  StatsFileWriter a;
  a.append(logStart(kBootA, 1000, kJan1 + 1000, "20A1", nullptr));
  TimeChange zone;
  zone.setAbsoluteTime(2000);
  zone.setWallTime(kJan1 + 2000);
  zone.setZoneName("UTC");
  zone.setGmtoff(0);
  a.append(zone);
  PowerStateChange battery;
  battery.setAbsoluteTime(4000);
  battery.setChange(1);
  battery.setWallTime(kJan1 + 4000);
  a.append(battery);
  a.append(level(3000, 4000, 12000));
  a.append(level(63000, 3900, 11800));
  a.append(sleepWake(70000, kJan1 + 70000, 0));
  a.append(sleepWake(71000, kJan1 + 671000, 2, "EC.LidOpen", true));
  UserIdle idle;
  idle.setAbsoluteTime(72000);
  idle.setChange(1);
  a.append(idle);
  a.writeTo(dir.write("var/db/brindlewick/A.stats"));

  StatsFileWriter b;
  b.append(logStart(kBootB, 500, kJan1 + 900500, "20A1", &kBootA, "20A1"));
  b.append(level(1500, 3800, 11700));
  b.append(level(11500, 3700, 11600));
  PowerStateChange ac;
  ac.setAbsoluteTime(12000);
  ac.setChange(0);
  ac.setIsFullyCharged(true);
  b.append(ac);
  b.writeTo(dir.write("var/db/brindlewick/B.stats"));

  StatsFileWriter c1, c2;
  c1.append(logStart(kBootC, 100, kJan1 + 1800100, "21B5", &kBootB, "20A1"));
  DeviceChange wifi;
  wifi.setAbsoluteTime(200);
  wifi.setDeviceType(5);
  wifi.setDeviceName("Wi-Fi");
  wifi.setDeviceId("wlan0");
  wifi.setNowConnected(1);
  c1.append(wifi);
  c1.writeTo(dir.write("var/log/com.vexil.launchd/C1.stats"));
  c2.append(logStart(kBootC, 4000000, kJan1 + 5800000, "21B5", &kBootB, "20A1"));
  UserIdle active;
  active.setAbsoluteTime(4000500);
  active.setChange(0);
  c2.append(active);
  c2.writeTo(dir.write("var/log/com.vexil.launchd.peruser.501/C2.stats"));
}

}  // namespace bw::test
