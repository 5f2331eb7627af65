// What the summarizers will expect of the generated records: counters that
// only grow within a boot, processes whose records form consistent lives and
// families, a battery that behaves like one, and every kind of event a
// laptop's week brings.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>

#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DateChange.h"
#include "Records/DeviceChange.h"
#include "Records/Interrupts.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/PowerStateChange.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "MachinePlan.h"
#include "StoreFixture.h"

namespace bw::samplestore {
namespace {

using test::only;
using test::sharedStore;

TEST(SampleStoreRealism, ProcessorCountersOnlyGrowWithinABootAndRestartAtBoot) {
  const auto& store = sharedStore();
  for (const auto& records : store.boots) {
    const auto pkg = only<PackageEnergyStatistics>(records);
    ASSERT_GT(pkg.size(), 10u);
    EXPECT_LT(pkg.front()->pkgC0Residency() + pkg.front()->pkgCanyResidency(), 120'000u) << "counters start at boot";
    for (std::size_t i = 1; i < pkg.size(); ++i) {
      const auto* a = pkg[i - 1];
      const auto* b = pkg[i];
      EXPECT_GE(b->pkgC0Residency(), a->pkgC0Residency());
      EXPECT_GE(b->pkgCanyResidency(), a->pkgCanyResidency());
      EXPECT_GE(b->pkgCmaxResidency(), a->pkgCmaxResidency());
      EXPECT_LE(b->pkgCmaxResidency(), b->pkgCanyResidency());
      EXPECT_GE(b->energyModelMillijoules(), a->energyModelMillijoules());
      EXPECT_GE(b->qosBgTime(), a->qosBgTime());
      EXPECT_GE(b->qosIdleTime(), a->qosIdleTime());
      // Residency never runs ahead of the clock.
      EXPECT_LE(b->pkgC0Residency() + b->pkgCanyResidency(), b->absoluteTime());
      EXPECT_EQ(b->pkgFreqNominal(), pkg.front()->pkgFreqNominal());
      EXPECT_GE(b->pkgFreq(), 500u);
      EXPECT_LE(b->pkgFreq(), b->pkgFreqNominal() * 2);
    }

    std::map<std::pair<std::int64_t, std::uint64_t>, std::uint64_t> residency;  // (core, level)
    int packages = 0;
    for (const Cstates* c : only<Cstates>(records)) {
      EXPECT_EQ(c->isCore(), c->core() != -1);
      if (c->core() == -1) ++packages;
      for (const Cstate& s : c->states()) {
        auto& last = residency[{c->core(), s.level()}];
        EXPECT_GE(s.residency(), last);
        last = s.residency();
      }
    }
    EXPECT_EQ(static_cast<std::size_t>(packages), pkg.size());

    std::map<std::pair<std::uint32_t, std::string>, std::uint64_t> counts;
    for (const Interrupts* in : only<Interrupts>(records)) {
      for (const InterruptVector& v : in->vectors()) {
        auto& last = counts[{v.cpuNumber(), v.vectorName()}];
        EXPECT_GE(v.interruptCount(), last);
        last = v.interruptCount();
      }
    }
    EXPECT_FALSE(counts.empty());
  }
}

TEST(SampleStoreRealism, ProcessRecordsFormConsistentLivesAndFamilies) {
  const auto& store = sharedStore();
  std::set<std::int64_t> statuses;
  std::set<std::string> names;
  for (const auto& records : store.boots) {
    struct Life {
      const ProcessUsage* first = nullptr;
      std::uint64_t cpu = 0;
      bool exited = false;
    };
    std::map<std::uint64_t, Life> lives;  // by unique id
    const auto processes = only<ProcessUsage>(records);
    for (const ProcessUsage* p : processes) {
      statuses.insert(p->exitStatus());
      names.insert(p->name());
      Life& life = lives[p->uniqueid()];
      if (!life.first) life.first = p;
      SCOPED_TRACE(p->name() + " uniqueid " + std::to_string(p->uniqueid()));
      EXPECT_FALSE(life.exited) << "a record after the exit";
      EXPECT_EQ(p->pid(), life.first->pid());
      EXPECT_EQ(p->name(), life.first->name());
      EXPECT_EQ(p->procStartAbstime(), life.first->procStartAbstime());
      EXPECT_GE(p->absoluteTime(), p->procStartAbstime());
      EXPECT_GE(p->userTime() + p->systemTime(), life.cpu) << "CPU time went back";
      life.cpu = p->userTime() + p->systemTime();
      life.exited = p->exitStatus() != -1 && p->exitStatus() != -3;
      if (p->exitStatus() != -2) {
        EXPECT_TRUE(p->UUID().has_value());
      }
    }
    // launchd is process 1; the user's launchd is its child.
    ASSERT_TRUE(lives.count(1));
    EXPECT_EQ(lives[1].first->pid(), 1u);
    EXPECT_EQ(lives[1].first->name(), "launchd");
    int userLaunchds = 0;
    for (const auto& [id, life] : lives) {
      const ProcessUsage* p = life.first;
      if (p->name() == "launchd" && p->uid() == 501 && p->parentUniqueid() == 1) ++userLaunchds;
      // Parents and responsible processes are processes of the same boot.
      if (id != 1) {
        EXPECT_TRUE(lives.count(p->parentUniqueid())) << p->name();
      }
      EXPECT_TRUE(lives.count(p->responsibleUniqueid())) << p->name();
      if (p->name() == "PluginProcess") {
        EXPECT_FALSE(p->displayName().empty());
        EXPECT_NE(p->responsibleUniqueid(), p->uniqueid());
      }
    }
    EXPECT_EQ(userLaunchds, 1);
  }
  for (std::int64_t s : {-3, -2, -1, 0}) EXPECT_TRUE(statuses.count(s)) << "exit status " << s;
  EXPECT_TRUE(std::any_of(statuses.begin(), statuses.end(), [](std::int64_t s) { return s > 0; }));
  // Names that the job-name cleaning has to deal with: a trailing dot and an
  // upper-case UUID, a trailing dot and digits, a leading launcher slot.
  const auto uuidSuffix = [](const std::string& n) {
    if (n.size() < 38 || n[n.size() - 37] != '.') return false;
    const std::string tail = n.substr(n.size() - 36);
    return Uuid::parse(tail).has_value() && tail == Uuid::parse(tail)->string();
  };
  const auto numberSuffix = [](const std::string& n) {
    const std::size_t dot = n.rfind('.');
    return dot != std::string::npos && dot + 1 < n.size() &&
           std::all_of(n.begin() + static_cast<std::ptrdiff_t>(dot) + 1, n.end(), [](char ch) { return ch >= '0' && ch <= '9'; });
  };
  const auto launcherSlot = [](const std::string& n) { return n.rfind("[0x", 0) == 0 && n.find("-0x") < n.find("]."); };
  EXPECT_TRUE(std::any_of(names.begin(), names.end(), uuidSuffix));
  EXPECT_TRUE(std::any_of(names.begin(), names.end(), numberSuffix));
  EXPECT_TRUE(std::any_of(names.begin(), names.end(), launcherSlot));
}

TEST(SampleStoreRealism, BatteryChargesOnExternalPowerAndDrainsOnBattery) {
  const auto& store = sharedStore();
  std::int64_t cycles = 0;
  bool fullSeen = false;
  int charging = 0, draining = 0;
  for (const auto& records : store.boots) {
    bool onAC = false;
    for (const Record* r : records) {
      if (const auto* p = recordCast<PowerStateChange>(r)) {
        onAC = p->change() == 0;
        fullSeen |= p->isFullyCharged();
      }
      const auto* level = recordCast<BatteryChargeLevel>(r);
      if (!level) continue;
      EXPECT_GT(level->charge(), 0);
      EXPECT_LE(level->charge(), level->maxCharge());
      EXPECT_GE(level->instantVoltage(), 10'000);
      EXPECT_LE(level->instantVoltage(), 13'500);
      EXPECT_GE(level->cycleCount(), cycles);
      cycles = level->cycleCount();
      // The gauge's current follows the power source.
      if (onAC) {
        EXPECT_GE(level->instantAmperage(), 0);
        charging += level->instantAmperage() > 0;
      } else {
        EXPECT_LT(level->instantAmperage(), 0);
        ++draining;
      }
      EXPECT_EQ(level->lastMinuteWattage() < 0, level->instantAmperage() < 0);
    }
  }
  EXPECT_TRUE(fullSeen);
  EXPECT_GT(charging, 0);
  EXPECT_GT(draining, 0);
}

TEST(SampleStoreRealism, AWeekBringsEveryKindOfPowerAndDeviceEvent) {
  const auto& store = sharedStore();
  std::set<std::uint32_t> wakeReasons, idleChanges, deviceTypes;
  std::set<std::uint64_t> sources;
  std::set<std::string> zones, wakeTypes;
  std::set<std::uint32_t> days;
  int standby = 0;
  for (const auto& records : store.boots) {
    for (const SleepWake* s : only<SleepWake>(records)) {
      wakeReasons.insert(s->reason());
      standby += s->wakeFromStandby();
      if (s->reason() != 0) {
        wakeTypes.insert(s->wakeType());
        EXPECT_GT(s->efiMsec(), 0u);
        EXPECT_GT(s->recordWriteAbsoluteTime(), s->absoluteTime());
        EXPECT_EQ(s->hasImageReadMsec(), s->wakeFromStandby());
        EXPECT_EQ(s->hasGraphicsReadyMsec(), s->reason() == 1);
      }
    }
    for (const PowerStateChange* p : only<PowerStateChange>(records)) sources.insert(p->change());
    for (const UserIdle* u : only<UserIdle>(records)) idleChanges.insert(u->change());
    for (const DeviceChange* d : only<DeviceChange>(records)) deviceTypes.insert(d->deviceType());
    for (const TimeChange* t : only<TimeChange>(records)) {
      zones.insert(t->zoneName());
      days.insert(static_cast<std::uint32_t>(t->yday()));
    }
    for (const DateChange* d : only<DateChange>(records)) days.insert(d->newYday());
  }
  EXPECT_EQ(wakeReasons, (std::set<std::uint32_t>{0, 1, 2}));
  EXPECT_GT(standby, 0);
  EXPECT_GE(wakeTypes.size(), 3u);
  EXPECT_EQ(sources, (std::set<std::uint64_t>{0, 1}));
  EXPECT_EQ(idleChanges, (std::set<std::uint32_t>{0, 1}));
  for (std::uint32_t type : {5u, 6u, 9u}) EXPECT_TRUE(deviceTypes.count(type)) << "device type " << type;
  EXPECT_GT(deviceTypes.size(), 3u);
  EXPECT_GE(zones.size(), 2u) << "a trip to another zone";
  // The store starts on day 35 of the year (5 February); every later day is
  // announced, by a date record or by the clock record of a boot.
  for (std::uint32_t day = 36; day < 35u + static_cast<std::uint32_t>(store.config.days); ++day) {
    EXPECT_TRUE(days.count(day)) << "day " << day;
  }
}

TEST(SampleStoreRealism, ZoneChangesAreAnnouncedAtOnceOrAtTheNextWake) {
  const auto& store = sharedStore();
  const MachinePlan plan(store.config.days, store.config.seed);
  std::vector<const TimeChange*> clocks;
  std::vector<std::uint64_t> wakes;  // wall times the machine came up
  for (const auto& records : store.boots) {
    wakes.push_back(records.front()->wallTime());
    for (const SleepWake* s : only<SleepWake>(records)) {
      if (s->reason() != 0) wakes.push_back(s->wallTime());
    }
    for (const TimeChange* t : only<TimeChange>(records)) {
      // Every clock record names the zone the laptop is in.
      const Zone zone = plan.zoneAt(t->wallTime());
      EXPECT_EQ(t->zoneName(), zone.name);
      EXPECT_EQ(t->gmtoff(), zone.gmtoff);
      clocks.push_back(t);
    }
  }
  ASSERT_FALSE(plan.zoneSwitches().empty());
  for (std::uint64_t at : plan.zoneSwitches()) {
    const auto clock = std::find_if(clocks.begin(), clocks.end(), [&](const TimeChange* t) { return t->wallTime() >= at; });
    ASSERT_NE(clock, clocks.end());
    if ((*clock)->wallTime() == at) continue;  // awake when it happened
    const auto wake = std::lower_bound(wakes.begin(), wakes.end(), at);
    ASSERT_NE(wake, wakes.end());
    EXPECT_LE((*clock)->wallTime(), *wake + 2'000) << "switch at " << at;
  }
}

TEST(SampleStoreRealism, DevicesSwitchOnAndOffInTurn) {
  const auto& store = sharedStore();
  for (const auto& records : store.boots) {
    std::map<std::string, std::uint32_t> state;  // device id -> connected
    for (const DeviceChange* d : only<DeviceChange>(records)) {
      auto [it, fresh] = state.try_emplace(d->deviceId(), 0);
      if (!fresh || d->nowConnected() == 0) {
        EXPECT_NE(it->second, d->nowConnected()) << d->deviceName() << " at " << d->absoluteTime();
      }
      it->second = d->nowConnected();
    }
    EXPECT_TRUE(state.count("wlan0"));
    EXPECT_TRUE(state.count("bt0"));
  }
}

}  // namespace
}  // namespace bw::samplestore
