#pragma once
// A small store for the record modes' end-to-end tests, written with the
// record classes' own encoder.
//
// Version 20A1: boot A (00:00:01 UTC on 2024-01-01; on battery; asleep from
// 00:01:10 for ten minutes) and boot B (00:15:00.5, naming A as its previous
// boot). Version 21B5: boot C (00:30:00, updated from 20A1, two files).
#include <string>

#include "store/StatsFileWriter.h"
#include "support/Records.h"
#include "support/TempDir.h"

namespace bw::test {

inline const Uuid kBootA = *Uuid::parse("AAAAAAAA-0000-0000-0000-000000000001");
inline const Uuid kBootB = *Uuid::parse("BBBBBBBB-0000-0000-0000-000000000002");
inline const Uuid kBootC = *Uuid::parse("CCCCCCCC-0000-0000-0000-000000000003");
inline constexpr std::uint64_t kJan1 = 1704067200000;  // 2024-01-01 00:00:00 UTC

inline void writeRecordModesStore(const TempDir& dir) {
  StatsFileWriter a;
  a.append(logStart(kBootA, 1000, kJan1 + 1000, "20A1"));
  a.append(zoneChange("UTC", 0, 2000, kJan1 + 2000));
  a.append(powerChange(PowerStateChange::kOnBattery, 4000, kJan1 + 4000));
  a.append(gaugeAt(3000, 4000, 12000));
  a.append(gaugeAt(63000, 3900, 11800));
  a.append(sleepWake(70000, kJan1 + 70000, SleepWake::kSleep));
  a.append(sleepWake(71000, kJan1 + 671000, SleepWake::kDarkWake, "EC.LidOpen", true));
  a.append(idle(72000, UserIdle::kIdle));
  a.writeTo(dir.write("var/db/brindlewick/A.stats"));

  StatsFileWriter b;
  b.append(logStart(kBootB, 500, kJan1 + 900500, "20A1", &kBootA, "20A1"));
  b.append(gaugeAt(1500, 3800, 11700));
  b.append(gaugeAt(11500, 3700, 11600));
  b.append(powerChange(PowerStateChange::kOnAC, 12000, 0, true));
  b.writeTo(dir.write("var/db/brindlewick/B.stats"));

  StatsFileWriter c1, c2;
  c1.append(logStart(kBootC, 100, kJan1 + 1800100, "21B5", &kBootB, "20A1"));
  c1.append(device(DeviceChange::kWiFi, 1, 200, "Wi-Fi", "wlan0"));
  c1.writeTo(dir.write("var/log/com.vexil.launchd/C1.stats"));
  c2.append(logStart(kBootC, 4000000, kJan1 + 5800000, "21B5", &kBootB, "20A1"));
  c2.append(idle(4000500, UserIdle::kActive));
  c2.writeTo(dir.write("var/log/com.vexil.launchd.peruser.501/C2.stats"));
}

}  // namespace bw::test
