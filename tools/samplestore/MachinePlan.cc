#include "MachinePlan.h"

#include <algorithm>
#include <iterator>

namespace bw::samplestore {

namespace {

// The build the laptop starts on and the one an update installs.
constexpr const char* kOldSystemVersion = "31C52";
constexpr const char* kNewSystemVersion = "31D17";

const char* const kFullWakeTypes[] = {"LidOpen", "PowerButton", "Keyboard", "UserActivity"};
const char* const kStandbyWakeTypes[] = {"LidOpen", "PowerButton"};
const char* const kDarkWakeTypes[] = {"Maintenance", "RTC", "Network", "BatteryCheck"};

template <std::size_t N>
const char* pick(const char* const (&names)[N], Random& rng) {
  return names[rng.below(N)];
}

// A time-of-day slot in which the user may open the laptop.
struct Slot {
  double startHour, endHour;  // local
  double startSpreadMin, endSpreadMin;
  double probability;
  bool work;  // at a desk: external power is likely
};

constexpr Slot kWeekdaySlots[] = {
    {8.0, 12.25, 15, 9, 1.0, true},
    {13.1, 17.85, 9, 24, 0.97, true},
    {20.25, 22.75, 18, 20, 0.55, false},
};
constexpr Slot kWeekendSlots[] = {
    {9.75, 12.0, 24, 18, 0.7, false},
    {15.0, 17.5, 24, 24, 0.5, false},
    {20.5, 23.0, 18, 18, 0.6, false},
};

}  // namespace

double hashUnit(std::uint64_t key, std::uint64_t n) {
  return static_cast<double>(mix64(key ^ mix64(n)) >> 11) * 0x1.0p-53;
}

const Run& Boot::runAt(std::uint64_t abs) const {
  auto it =
      std::upper_bound(runs.begin(), runs.end(), abs, [](std::uint64_t a, const Run& r) { return a < r.absStart; });
  return it == runs.begin() ? runs.front() : *std::prev(it);
}

struct MachinePlan::Session {
  enum Ending { kSleep, kShutdown, kUpdate };
  std::uint64_t start = 0;
  std::uint64_t end = 0;
  Ending ending = kSleep;
  bool work = false;
  int day = 0;
};

struct MachinePlan::Episode {
  std::uint64_t start = 0;
  std::uint64_t end = 0;
  bool dark = false;
  bool boots = false;   // begins a new boot
  bool update = false;  // that boot runs the new system version
  bool fromStandby = false;
  const char* wakeType = "";
  std::uint64_t slept = 0;
};

MachinePlan::MachinePlan(int days, std::uint64_t seed)
    : days_(days < 1 ? 1 : days), seed_(seed), firstDay_(daysFromCivil(2024, 2, 5)) {
  Random rng(seed, 1);
  std::vector<Session> sessions = planSessions(rng);
  std::vector<Episode> episodes = planEpisodes(sessions, rng);
  buildBoots(episodes, rng);
  for (const Boot& boot : boots_) {
    for (const Run& run : boot.runs) planUserActivity(run, rng);
  }
  // Zone switches: travel, and saving time wherever the laptop is.
  const std::uint64_t storeStart = boots_.front().runs.front().wallStart;
  const std::uint64_t storeEnd = boots_.back().runs.back().wallEnd();
  for (std::size_t k = 0; k < places_.size(); ++k) {
    const std::uint64_t from = std::max(places_[k].from, storeStart);
    const std::uint64_t to = k + 1 < places_.size() ? places_[k + 1].from : storeEnd;
    if (k > 0) zoneSwitches_.push_back(places_[k].from);
    for (std::uint64_t t : savingSwitches(zoneTable()[places_[k].rule], from, to)) zoneSwitches_.push_back(t);
  }
  std::sort(zoneSwitches_.begin(), zoneSwitches_.end());
}

std::vector<MachinePlan::Session> MachinePlan::planSessions(Random& rng) {
  const auto& table = zoneTable();
  const std::size_t home = rng.below(table.size());
  const std::size_t away = (home + 1 + rng.below(table.size() - 1)) % table.size();
  int tripStart = -1, tripEnd = -1;
  if (days_ >= 6) {
    tripStart = days_ * 55 / 100;
    tripEnd = std::min(days_ - 1, tripStart + static_cast<int>(rng.between(2, 4)));
  }
  std::size_t place = home;
  places_.push_back({0, home});

  std::vector<Session> out;
  std::uint64_t cursor = 0;
  for (int d = 0; d < days_; ++d) {
    if (d == tripStart || d == tripEnd) {
      // A flight: the laptop sleeps in the bag and lands in another zone.
      place = d == tripStart ? away : home;
      const std::uint64_t departure = cursor + 30 * kMinute;
      places_.push_back({departure, place});
      cursor = departure + static_cast<std::uint64_t>(rng.between(4 * kHour, 9 * kHour));
    }
    const ZoneRule& rule = table[place];
    const std::int64_t day = firstDay_ + d;
    const Zone zone = bw::samplestore::zoneAt(rule, wallOfLocal(day, 12 * kHour, Zone{rule.standard, rule.gmtoff}));
    const bool weekend = civilFromDays(day).weekday >= 5;
    const Slot* slots = weekend ? kWeekendSlots : kWeekdaySlots;
    for (int k = 0; k < 3; ++k) {
      const Slot& slot = slots[k];
      // The first day always has its morning and afternoon.
      if (!(d == 0 && k < 2) && !rng.chance(slot.probability)) continue;
      const auto at = [&](double hour, double spreadMin) {
        const double ms = hour * kHour + rng.around(0, spreadMin) * kMinute;
        return wallOfLocal(day, static_cast<std::int64_t>(ms), zone);
      };
      std::uint64_t start = at(slot.startHour, slot.startSpreadMin);
      const std::uint64_t end = at(slot.endHour, slot.endSpreadMin);
      if (!out.empty()) start = std::max(start, cursor + 10 * kMinute);
      if (end < start + 20 * kMinute) continue;
      out.push_back({start, end, Session::kSleep, slot.work, d});
      cursor = end;
    }
  }

  // Restarts and short naps (lid closed between meetings) split sessions.
  std::vector<Session> split;
  for (const Session& s : out) {
    const std::uint64_t length = s.end - s.start;
    if (length > 90 * kMinute && rng.chance(0.35)) {
      const bool restart = rng.chance(0.15);
      const std::uint64_t mid =
          s.start + static_cast<std::uint64_t>(rng.uniform(0.3, 0.7) * static_cast<double>(length));
      const auto gap =
          static_cast<std::uint64_t>(restart ? rng.between(45'000, 90'000) : rng.between(10 * kMinute, 40 * kMinute));
      if (mid + gap + 15 * kMinute < s.end) {
        Session first = s;
        first.end = mid;
        first.ending = restart ? Session::kShutdown : Session::kSleep;
        Session second = s;
        second.start = mid + gap;
        split.push_back(first);
        split.push_back(second);
        continue;
      }
    }
    split.push_back(s);
  }
  // The system update: the first session of the update day that is not the
  // last one ends by installing it.
  const int updateDay = days_ / 2;
  for (std::size_t i = 0; i + 1 < split.size(); ++i) {
    if (split[i].day >= updateDay) {
      split[i].ending = Session::kUpdate;
      break;
    }
  }
  // Some nights the laptop is shut down instead of put to sleep.
  for (std::size_t i = 0; i + 1 < split.size(); ++i) {
    if (split[i].ending == Session::kSleep && split[i + 1].day != split[i].day && rng.chance(0.1)) {
      split[i].ending = Session::kShutdown;
    }
  }
  return split;
}

std::vector<MachinePlan::Episode> MachinePlan::planEpisodes(std::vector<Session>& sessions, Random& rng) {
  std::vector<Episode> episodes;
  bool onAC = rng.chance(0.6);
  powerSources_.push_back({0, onAC});
  std::int64_t batteryMs = 0;  // awake time on battery since the last charge
  constexpr std::int64_t kBatteryLimit = 5 * kHour;
  // Spends [from, to) awake; on battery too long, the user plugs in.
  const auto spend = [&](std::uint64_t from, std::uint64_t to) {
    if (onAC) return;
    const std::int64_t length = static_cast<std::int64_t>(to - from);
    if (batteryMs + length > kBatteryLimit) {
      const std::uint64_t at =
          from + static_cast<std::uint64_t>(std::max<std::int64_t>(kBatteryLimit - batteryMs, kMinute));
      if (at < to) {
        onAC = true;
        batteryMs = 0;
        powerSources_.push_back({at, true});
        return;
      }
    }
    batteryMs += length;
  };

  for (std::size_t i = 0; i < sessions.size(); ++i) {
    const Session& s = sessions[i];
    Episode ep;
    ep.start = s.start;
    ep.end = s.end;
    if (i == 0 || sessions[i - 1].ending != Session::kSleep) {
      ep.boots = true;
      ep.update = i > 0 && sessions[i - 1].ending == Session::kUpdate;
    } else {
      // Asleep: maintenance wakes now and then (often on external power,
      // but only in the first hours), standby after three quiet hours.
      const std::uint64_t standbyDelay = 3 * kHour;
      const std::uint64_t asleep = sessions[i - 1].end;
      std::uint64_t sleepStart = asleep;
      while (true) {
        const std::int64_t interval =
            onAC ? rng.between(50 * kMinute, 110 * kMinute) : rng.between(150 * kMinute, 300 * kMinute);
        const std::uint64_t wake = sleepStart + static_cast<std::uint64_t>(interval);
        if (wake + 15 * kMinute > s.start || (onAC && wake - asleep > 4 * kHour)) break;
        Episode dark;
        dark.start = wake;
        dark.end = wake + static_cast<std::uint64_t>(rng.between(30'000, 4 * kMinute));
        dark.dark = true;
        dark.fromStandby = wake - sleepStart > standbyDelay;
        dark.wakeType = pick(kDarkWakeTypes, rng);
        dark.slept = wake - sleepStart;
        episodes.push_back(dark);
        sleepStart = dark.end;
      }
      ep.slept = s.start - sleepStart;
      ep.fromStandby = ep.slept > standbyDelay;
      ep.wakeType = ep.fromStandby ? pick(kStandbyWakeTypes, rng) : pick(kFullWakeTypes, rng);
    }
    episodes.push_back(ep);

    // The power source: chosen at the session's start, maybe changed within.
    const bool wanted = rng.chance(s.work ? 0.7 : 0.35);
    bool next = rng.chance(0.5) ? onAC : wanted;
    if (!onAC && batteryMs > 4 * kHour) next = true;
    if (next != onAC) {
      onAC = next;
      if (onAC) batteryMs = 0;
      powerSources_.push_back({s.start + static_cast<std::uint64_t>(rng.between(35'000, 90'000)), onAC});
    }
    const std::uint64_t length = s.end - s.start;
    if (length > 30 * kMinute && rng.chance(0.25)) {
      const std::uint64_t change =
          s.start + static_cast<std::uint64_t>(rng.uniform(0.2, 0.9) * static_cast<double>(length));
      spend(s.start, change);
      onAC = !onAC;
      if (onAC) batteryMs = 0;
      powerSources_.push_back({change, onAC});
      spend(change, s.end);
    } else {
      spend(s.start, s.end);
    }
  }
  return episodes;
}

void MachinePlan::buildBoots(const std::vector<Episode>& episodes, Random& rng) {
  std::string version = kOldSystemVersion;
  for (std::size_t i = 0; i < episodes.size(); ++i) {
    const Episode& ep = episodes[i];
    Run run;
    run.wallStart = ep.start;
    run.duration = ep.end - ep.start;
    run.dark = ep.dark;
    if (ep.boots) {
      Boot boot;
      boot.uuid = rng.uuid();
      boot.lastUuid = boots_.empty() ? rng.uuid() : boots_.back().uuid;
      boot.lastSystemVersion = version;
      if (ep.update) {
        version = kNewSystemVersion;
        boot.afterUpdate = true;
      }
      boot.systemVersion = version;
      boot.firstRecordAbs = static_cast<std::uint64_t>(rng.between(12'000, 30'000));
      boots_.push_back(std::move(boot));
      run.absStart = 0;
      run.start = RunStart::Boot;
    } else {
      // The counter ran a few seconds into the sleep, then stopped.
      run.absStart = boots_.back().runs.back().absEnd() + static_cast<std::uint64_t>(rng.between(1'500, 6'000));
      run.start = ep.dark ? RunStart::DarkWake : RunStart::Wake;
      run.fromStandby = ep.fromStandby;
      run.wakeType = ep.wakeType;
      run.sleptMs = ep.slept;
    }
    if (i + 1 == episodes.size()) {
      run.end = RunEnd::Running;
    } else {
      run.end = episodes[i + 1].boots ? RunEnd::Shutdown : RunEnd::Sleep;
    }
    boots_.back().runs.push_back(run);
  }
}

void MachinePlan::planUserActivity(const Run& run, Random& rng) {
  if (run.dark) return;
  const std::uint64_t end = run.wallEnd();
  // Before a sleep the user is idle: minutes when the display dims first,
  // a second when the lid is simply closed.
  const std::uint64_t tail =
      run.end == RunEnd::Running
          ? 0
          : static_cast<std::uint64_t>(rng.chance(0.5) ? rng.between(2 * kMinute, 6 * kMinute) : 1'000);
  const std::uint64_t limit = end - tail;
  std::uint64_t t = run.wallStart + static_cast<std::uint64_t>(rng.between(5 * kMinute, 40 * kMinute));
  const std::size_t first = idle_.size();
  while (t < limit) {
    t += static_cast<std::uint64_t>(rng.between(10 * kMinute, 60 * kMinute));
    if (t + kMinute >= limit) break;
    const std::uint64_t idleEnd =
        std::min(limit, t + static_cast<std::uint64_t>(rng.between(3 * kMinute, 25 * kMinute)));
    idle_.push_back({t, idleEnd});
    t = idleEnd;
  }
  if (tail > 0) {
    if (idle_.size() > first && idle_.back().end == limit) {
      idle_.back().end = end;
    } else {
      idle_.push_back({limit, end});
    }
  }
  if (run.duration > 40 * kMinute && rng.chance(0.35)) {
    const std::uint64_t start =
        run.wallStart + static_cast<std::uint64_t>(rng.uniform(0.05, 0.7) * static_cast<double>(run.duration));
    heavy_.push_back(
        {start, std::min(end, start + static_cast<std::uint64_t>(rng.between(10 * kMinute, 60 * kMinute)))});
  }
}

namespace {

bool inIntervals(const std::vector<Interval>& intervals, std::uint64_t wall) {
  auto it = std::upper_bound(intervals.begin(), intervals.end(), wall,
                             [](std::uint64_t w, const Interval& i) { return w < i.start; });
  return it != intervals.begin() && wall < std::prev(it)->end;
}

}  // namespace

Zone MachinePlan::zoneAt(std::uint64_t wall) const {
  std::size_t rule = places_.front().rule;
  for (const Place& p : places_) {
    if (p.from <= wall) rule = p.rule;
  }
  return bw::samplestore::zoneAt(zoneTable()[rule], wall);
}

bool MachinePlan::onACAt(std::uint64_t wall) const {
  auto it = std::upper_bound(powerSources_.begin(), powerSources_.end(), wall,
                             [](std::uint64_t w, const PowerSource& p) { return w < p.wall; });
  return it == powerSources_.begin() ? powerSources_.front().onAC : std::prev(it)->onAC;
}

bool MachinePlan::userIdleAt(std::uint64_t wall) const { return inIntervals(idle_, wall); }
bool MachinePlan::heavyAt(std::uint64_t wall) const { return inIntervals(heavy_, wall); }

double MachinePlan::loadAt(std::uint64_t wall, bool dark) const {
  const std::uint64_t minute = wall / kMinute;
  if (dark) return 0.2 + 0.3 * hashUnit(seed_ ^ 0xD4, minute);
  if (userIdleAt(wall)) return 0.03 + 0.07 * hashUnit(seed_ ^ 0x1D, minute);
  // A task sets the pace for a quarter of an hour; each minute jitters.
  const double task = hashUnit(seed_ ^ 0x7A, wall / (15 * kMinute));
  double load = 0.06 + 0.32 * task * task + 0.12 * hashUnit(seed_ ^ 0x31, minute);
  if (heavyAt(wall)) load += 0.45;
  return std::min(load, 1.0);
}

double MachinePlan::meanLoad(std::uint64_t fromWall, std::uint64_t toWall, bool dark) const {
  double sum = loadAt(fromWall, dark);
  int n = 1;
  for (std::uint64_t t = fromWall + kMinute; t < toWall; t += kMinute, ++n) sum += loadAt(t, dark);
  return sum / n;
}

}  // namespace bw::samplestore
