#include "PowerEvents.h"

#include <algorithm>
#include <cmath>
#include <string>

#include "Records/BatteryChargeLevel.h"
#include "Records/DateChange.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"

namespace bw::samplestore {

namespace {

constexpr double kMsPerHour = 3'600'000.0;

// Why a clock record was written.
constexpr std::uint32_t kClockSetAtBoot = 0;
constexpr std::uint32_t kZoneChanged = 2;
// Why a date record was written.
constexpr std::uint32_t kMidnight = 0;
constexpr std::uint32_t kDayChangedAsleep = 1;
constexpr std::uint32_t kDayChangedWithZone = 2;

void addUserIdle(std::uint64_t abs, bool idle, RecordSink& sink) {
  UserIdle u;
  u.setAbsoluteTime(abs);
  u.setChange(idle ? UserIdle::kIdle : UserIdle::kActive);
  sink.add(Stream::Power, u);
}

}  // namespace

PowerEvents::PowerEvents(const MachinePlan& plan) : plan_(plan), rng_(plan.seed(), 2) {
  const double design = rng_.uniform(4800, 6000);
  battery_.maxCharge = design * rng_.uniform(0.86, 0.97);
  battery_.cycles = rng_.between(80, 400);
  battery_.charge = battery_.maxCharge * rng_.uniform(0.5, 0.95);
  lastWall_ = plan.boots().front().runs.front().wallStart;
}

void PowerEvents::boot(std::size_t index, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  for (const Run& r : boot.runs) run(boot, r, sink);
}

void PowerEvents::run(const Boot& boot, const Run& run, RecordSink& sink) {
  rest(run.wallStart, run.start == RunStart::Boot);
  std::uint64_t first = run.absStart;
  if (run.start == RunStart::Boot) {
    // The clock and the power source as the system comes up.
    first = boot.firstRecordAbs;
    const auto& switches = plan_.zoneSwitches();
    while (nextSwitch_ < switches.size() && switches[nextSwitch_] <= run.wallAt(first)) ++nextSwitch_;
    timeChange(run, first, kClockSetAtBoot, sink);
    lastDay_ = localDayNumber(run.wallAt(first), plan_.zoneAt(run.wallAt(first)));
    powerStateChange(run, first + 400, plan_.onACAt(run.wallAt(first)), sink);
    addUserIdle(first + 1'500, false, sink);
  } else {
    wake(run, sink);
  }
  // Midnights and zone switches from just after the date was last checked.
  calendarEvents(run, run.start == RunStart::Boot ? first + 1 : first + 1'201, sink);
  idleEvents(run, sink);
  powerSourceEvents(run, first + 2'000, sink);
  for (std::uint64_t abs = first + 3'000; abs < run.absEnd(); abs += 60'000) batterySample(run, abs, sink);
  if (run.end == RunEnd::Sleep) {
    SleepWake sleep;
    sleep.setAbsoluteTime(run.absEnd());
    sleep.setWallTime(run.wallEnd());
    sleep.setReason(SleepWake::kSleep);
    sink.add(Stream::Power, sleep);
  }
  lastWall_ = std::max(lastWall_, run.wallEnd());
}

void PowerEvents::wake(const Run& run, RecordSink& sink) {
  SleepWake w;
  w.setAbsoluteTime(run.absStart);
  w.setWallTime(run.wallStart);
  w.setReason(run.dark ? SleepWake::kDarkWake : SleepWake::kWake);
  w.setWakeFromStandby(run.fromStandby);
  w.setWakeType(run.wakeType);
  w.setEfiMsec(static_cast<std::uint64_t>(run.fromStandby ? rng_.between(1'500, 4'000) : rng_.between(250, 900)));
  w.setTrampolineMsec(static_cast<std::uint64_t>(rng_.between(90, 400)));
  if (run.fromStandby) {
    // Leaving standby reads the memory image back from disk.
    w.setBooterMsec(static_cast<std::uint64_t>(rng_.between(200, 600)));
    w.setImageReadMsec(static_cast<std::uint64_t>(rng_.between(1'800, 8'000)));
    w.setImagePages(static_cast<std::uint64_t>(rng_.between(150'000, 420'000)));
    w.setImage1Pages(static_cast<std::uint64_t>(rng_.between(20'000, 90'000)));
  }
  w.setWakeNotificationMsec(static_cast<std::uint64_t>(rng_.between(150, 800)));
  if (!run.dark) {
    w.setLockScreenReadyMsec(static_cast<std::uint64_t>(rng_.between(400, 1'600)));
    w.setGraphicsReadyMsec(static_cast<std::uint64_t>(rng_.between(300, 1'200)));
  }
  w.setRecordWriteAbsoluteTime(run.absStart + static_cast<std::uint64_t>(rng_.between(1'500, 6'000)));
  w.setXcpmDeepIdleStats("deep_idle=" + std::to_string(run.sleptMs / 1000) +
                         " aborts=" + std::to_string(rng_.below(3)));
  sink.add(Stream::Power, w);

  // What changed while the machine slept: the zone, the date, the user.
  const auto& switches = plan_.zoneSwitches();
  bool zoneMoved = false;
  while (nextSwitch_ < switches.size() && switches[nextSwitch_] <= run.wallStart) {
    ++nextSwitch_;
    zoneMoved = true;
  }
  if (zoneMoved) timeChange(run, run.absStart + 600, kZoneChanged, sink);
  const std::uint64_t dateAbs = run.absStart + 1'200;
  if (localDayNumber(run.wallAt(dateAbs), plan_.zoneAt(run.wallAt(dateAbs))) != lastDay_) {
    dateChange(run, dateAbs, kDayChangedAsleep, sink);
  }
  if (!run.dark) addUserIdle(run.absStart + 800, false, sink);
}

void PowerEvents::calendarEvents(const Run& run, std::uint64_t fromAbs, RecordSink& sink) {
  const auto& switches = plan_.zoneSwitches();
  std::uint64_t t = run.wallAt(fromAbs);
  while (true) {
    const Zone zone = plan_.zoneAt(t);
    const std::int64_t day = localDayNumber(t, zone);
    std::uint64_t next = wallOfLocal(day + 1, 0, zone);
    bool isSwitch = false;
    if (nextSwitch_ < switches.size() && switches[nextSwitch_] <= next) {
      next = std::max(switches[nextSwitch_], t);
      isSwitch = true;
    }
    if (next >= run.wallEnd()) break;
    const std::uint64_t abs = run.absAt(next);
    if (isSwitch) {
      ++nextSwitch_;
      timeChange(run, abs, kZoneChanged, sink);
      if (localDayNumber(next, plan_.zoneAt(next)) != lastDay_) dateChange(run, abs + 1, kDayChangedWithZone, sink);
    } else {
      dateChange(run, abs, kMidnight, sink);
    }
    t = next + 2;
  }
}

void PowerEvents::idleEvents(const Run& run, RecordSink& sink) {
  const auto& idle = plan_.idle();
  auto it = std::lower_bound(idle.begin(), idle.end(), run.wallStart,
                             [](const Interval& i, std::uint64_t w) { return i.end <= w; });
  for (; it != idle.end() && it->start < run.wallEnd(); ++it) {
    if (it->start > run.wallStart) addUserIdle(run.absAt(it->start), true, sink);
    if (it->end < run.wallEnd()) addUserIdle(run.absAt(it->end), false, sink);
  }
}

void PowerEvents::powerSourceEvents(const Run& run, std::uint64_t fromAbs, RecordSink& sink) {
  for (const PowerSource& p : plan_.powerSources()) {
    if (p.wall < run.wallAt(fromAbs) || p.wall >= run.wallEnd()) continue;
    powerStateChange(run, run.absAt(p.wall), p.onAC, sink);
  }
}

void PowerEvents::rest(std::uint64_t wall, bool off) {
  if (wall <= lastWall_) return;
  const double hours = static_cast<double>(wall - lastWall_) / kMsPerHour;
  Battery& b = battery_;
  if (plan_.onACAt(lastWall_)) {
    b.charge = std::min(b.maxCharge, b.charge + 2'500 * hours);
    if (b.charge >= 0.995 * b.maxCharge) {
      b.charge = b.maxCharge;
      b.full = true;
    }
  } else {
    // Asleep the battery loses under a percent an hour; switched off, almost nothing.
    const double loss = b.maxCharge * (off ? 0.0005 : (hours > 3 ? 0.002 : 0.006)) * hours;
    b.charge = std::max(0.02 * b.maxCharge, b.charge - loss);
    b.drained += loss;
  }
  lastWall_ = wall;
}

void PowerEvents::batterySample(const Run& run, std::uint64_t abs, RecordSink& sink) {
  Battery& b = battery_;
  const std::uint64_t wall = run.wallAt(abs);
  const double hours = static_cast<double>(wall - std::min(wall, lastWall_)) / kMsPerHour;
  lastWall_ = std::max(lastWall_, wall);
  const bool onAC = plan_.onACAt(wall);
  const double load = plan_.loadAt(wall, run.dark);
  double amps;
  if (onAC) {
    b.unpluggedAt = 0;
    const double fraction = b.charge / b.maxCharge;
    if (b.full) {
      amps = 0;
    } else {
      // Constant current, then a taper over the last fifth.
      amps = fraction < 0.8 ? rng_.uniform(2'600, 3'200) : 3'000 * (1 - fraction) / 0.2 + 120;
    }
  } else {
    if (b.unpluggedAt == 0) b.unpluggedAt = wall;
    b.full = false;
    amps = -(420 + 2'500 * load + (run.dark ? 0 : 380)) * rng_.uniform(0.96, 1.04);
  }
  b.charge += amps * hours;
  if (amps < 0) {
    b.drained += -amps * hours;
    if (b.drained >= b.maxCharge) {
      b.drained -= b.maxCharge;
      ++b.cycles;
      b.maxCharge *= 0.9998;
    }
  }
  b.charge = std::clamp(b.charge, 0.02 * b.maxCharge, b.maxCharge);
  if (onAC && !b.full && b.charge >= 0.995 * b.maxCharge) {
    b.charge = b.maxCharge;
    b.full = true;
  }
  const double fraction = b.charge / b.maxCharge;
  const double volts = 11'200 + 1'600 * fraction + 0.08 * amps;  // mV
  double minutes = 0;
  if (!onAC) {
    minutes = b.charge / -amps * 60;
  } else if (!b.full && amps > 0) {
    minutes = (b.maxCharge - b.charge) / amps * 60;
  }
  b.smoothedMinutes = 0.8 * b.smoothedMinutes + 0.2 * minutes;

  BatteryChargeLevel level;
  level.setAbsoluteTime(abs);
  level.setCharge(std::llround(b.charge));
  level.setMaxCharge(std::llround(b.maxCharge));
  level.setCycleCount(b.cycles);
  level.setInstantAmperage(std::llround(amps));
  level.setInstantVoltage(std::llround(volts));
  level.setTimeSinceLastCharge(onAC ? 0 : static_cast<std::int64_t>((wall - b.unpluggedAt) / 60'000));
  level.setLastMinuteWattage(std::llround(volts * amps / 1000));
  level.setEstimatedTimeRemaining(std::llround(minutes));
  level.setSmoothedEstimatedTimeRemaining(std::llround(b.smoothedMinutes));
  level.setIsFullyCharged(b.full);
  sink.add(Stream::Power, level);

  // Reaching a full charge is a charge-state change of its own.
  if (onAC && b.full && !fullAnnounced_) {
    powerStateChange(run, abs + 1, true, sink);
    fullAnnounced_ = true;
  }
  if (!onAC) fullAnnounced_ = false;
}

void PowerEvents::timeChange(const Run& run, std::uint64_t abs, std::uint32_t reason, RecordSink& sink) {
  const std::uint64_t wall = run.wallAt(abs);
  const Zone zone = plan_.zoneAt(wall);
  const LocalDate date = civilFromDays(localDayNumber(wall, zone));
  TimeChange t;
  t.setAbsoluteTime(abs);
  t.setWallTime(wall);
  t.setReason(reason);
  t.setGmtoff(zone.gmtoff);
  t.setZoneName(zone.name);
  t.setYday(date.yday);
  t.setYear(date.year);
  sink.add(Stream::Power, t);
}

void PowerEvents::dateChange(const Run& run, std::uint64_t abs, std::uint32_t reason, RecordSink& sink) {
  const std::uint64_t wall = run.wallAt(abs);
  lastDay_ = localDayNumber(wall, plan_.zoneAt(wall));
  DateChange d;
  d.setAbsoluteTime(abs);
  d.setWallTime(wall);
  d.setReason(reason);
  d.setNewYday(static_cast<std::uint32_t>(civilFromDays(lastDay_).yday));
  sink.add(Stream::Power, d);
}

void PowerEvents::powerStateChange(const Run& run, std::uint64_t abs, bool onAC, RecordSink& sink) {
  if (!onAC && battery_.unpluggedAt == 0) battery_.unpluggedAt = run.wallAt(abs);
  PowerStateChange p;
  p.setAbsoluteTime(abs);
  p.setChange(onAC ? PowerStateChange::kOnAC : PowerStateChange::kOnBattery);
  if (onAC && battery_.full) p.setIsFullyCharged(true);
  p.setWallTime(run.wallAt(abs));
  sink.add(Stream::Power, p);
}

}  // namespace bw::samplestore
