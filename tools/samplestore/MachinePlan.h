#pragma once
// The simulated laptop's life, decided before any record is written: when
// the user works, when the machine sleeps, wakes dark or leaves standby,
// when it boots (and when a system update reboots it), where it is (time
// zone), when it runs on external power, when the user is idle and how busy
// the processor is. Every record generator reads this one plan, so that
// power, processor, device and process records tell the same story.
//
// Each boot is a list of runs. A run is a stretch in which the machine's
// tick counter and the wall clock advance together (one skew); a sleep ends
// a run and the next run begins at its wake, with the counter a few seconds
// further and the wall clock hours further.
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "Random.h"
#include "WallClock.h"
#include "base/Uuid.h"

namespace bw::samplestore {

enum class RunStart { Boot, Wake, DarkWake };
enum class RunEnd { Sleep, Shutdown, Running };

struct Run {
  std::uint64_t wallStart = 0;  // wall time at absStart
  std::uint64_t absStart = 0;   // the boot's tick counter, ms
  std::uint64_t duration = 0;   // ms, on both clocks
  bool dark = false;            // a maintenance wake: display off, no user
  RunStart start = RunStart::Boot;
  RunEnd end = RunEnd::Sleep;
  bool fromStandby = false;   // the wake that began the run left standby
  const char* wakeType = "";  // what woke the machine
  std::uint64_t sleptMs = 0;  // wall time asleep before the wake

  std::uint64_t absEnd() const { return absStart + duration; }
  std::uint64_t wallEnd() const { return wallStart + duration; }
  std::int64_t skew() const { return static_cast<std::int64_t>(wallStart - absStart); }
  std::uint64_t wallAt(std::uint64_t abs) const { return static_cast<std::uint64_t>(skew()) + abs; }
  std::uint64_t absAt(std::uint64_t wall) const { return wall - static_cast<std::uint64_t>(skew()); }
};

struct Boot {
  Uuid uuid;
  Uuid lastUuid;  // the boot before (for the first boot, one no longer kept)
  std::string systemVersion;
  std::string lastSystemVersion;
  bool afterUpdate = false;          // the first boot of a new system version
  std::uint64_t firstRecordAbs = 0;  // when the system starts writing
  std::vector<Run> runs;

  // The run holding `abs`: the last one that starts at or before it.
  const Run& runAt(std::uint64_t abs) const;
  std::uint64_t wallAt(std::uint64_t abs) const { return runAt(abs).wallAt(abs); }
  std::uint64_t lastAbs() const { return runs.back().absEnd(); }
};

struct Interval {
  std::uint64_t start = 0;  // wall ms, half-open
  std::uint64_t end = 0;
};

struct PowerSource {
  std::uint64_t wall = 0;  // from this wall time on
  bool onAC = false;
};

class MachinePlan {
 public:
  // Plans `days` local days from a fixed Monday in winter.
  MachinePlan(int days, std::uint64_t seed);

  std::uint64_t seed() const { return seed_; }
  const std::vector<Boot>& boots() const { return boots_; }
  // Wall instants at which the zone in effect changes (travel, saving time).
  const std::vector<std::uint64_t>& zoneSwitches() const { return zoneSwitches_; }
  // Power source changes, ascending; the first is the state at the start.
  const std::vector<PowerSource>& powerSources() const { return powerSources_; }
  const std::vector<Interval>& idle() const { return idle_; }

  Zone zoneAt(std::uint64_t wall) const;
  bool onACAt(std::uint64_t wall) const;
  bool userIdleAt(std::uint64_t wall) const;
  bool heavyAt(std::uint64_t wall) const;
  // How busy the processor package is, 0..1, in the minute of `wall`.
  double loadAt(std::uint64_t wall, bool dark) const;
  // The mean load over [fromWall, toWall) sampled a minute apart.
  double meanLoad(std::uint64_t fromWall, std::uint64_t toWall, bool dark) const;

  // Days planned and the local day number of the first.
  int days() const { return days_; }
  std::int64_t firstDay() const { return firstDay_; }

 private:
  struct Session;
  struct Episode;
  std::vector<Session> planSessions(Random& rng);
  std::vector<Episode> planEpisodes(std::vector<Session>& sessions, Random& rng);
  void planUserActivity(const Run& run, Random& rng);
  void buildBoots(const std::vector<Episode>& episodes, Random& rng);

  int days_;
  std::uint64_t seed_;
  std::int64_t firstDay_;
  struct Place {
    std::uint64_t from;
    std::size_t rule;
  };
  std::vector<Place> places_;
  std::vector<std::uint64_t> zoneSwitches_;
  std::vector<PowerSource> powerSources_;
  std::vector<Interval> idle_;
  std::vector<Interval> heavy_;
  std::vector<Boot> boots_;
};

// Calls fn(run, abs) every `period` ms of each run of `boot`, beginning
// `offset` after the run starts (after the first record, in the boot's
// first run) and ending before the run does.
template <class Fn>
void forEachTick(const Boot& boot, std::uint64_t offset, std::uint64_t period, Fn&& fn) {
  for (const Run& run : boot.runs) {
    std::uint64_t abs = (run.start == RunStart::Boot ? boot.firstRecordAbs : run.absStart) + offset;
    for (; abs < run.absEnd(); abs += period) fn(run, abs);
  }
}

// A stable pseudo-random real in [0, 1) for (key, n): lets generators vary
// values by time without sharing a random stream.
double hashUnit(std::uint64_t key, std::uint64_t n);

}  // namespace bw::samplestore
