// What the summarizers will expect of the generated records: counters that
// only grow within a boot, processes whose records form consistent lives and
// families, a battery that behaves like one, and every kind of event a
// laptop's week brings.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <regex>
#include <set>

#include "MachinePlan.h"
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
#include "StoreFixture.h"

namespace bw::samplestore {
namespace {

using test::only;
using test::sharedStore;

TEST(SampleStoreRealism, ProcessorCountersOnlyGrowWithinABootAndRestartAtBoot) {
  for (const auto& records : sharedStore().boots) {
    const auto pkg = only<PackageEnergyStatistics>(records);
    ASSERT_GT(pkg.size(), 10u);
    EXPECT_LT(pkg.front()->pkgC0Residency() + pkg.front()->pkgCanyResidency(), 120'000u) << "counters start at boot";
    for (std::size_t i = 1; i < pkg.size(); ++i) {
      const auto *a = pkg[i - 1], *b = pkg[i];
      EXPECT_TRUE(b->pkgC0Residency() >= a->pkgC0Residency() && b->pkgCanyResidency() >= a->pkgCanyResidency() &&
                  b->pkgCmaxResidency() >= a->pkgCmaxResidency() &&
                  b->energyModelMillijoules() >= a->energyModelMillijoules() && b->qosBgTime() >= a->qosBgTime() &&
                  b->qosIdleTime() >= a->qosIdleTime())
          << "a counter went back at " << b->absoluteTime();
      EXPECT_LE(b->pkgCmaxResidency(), b->pkgCanyResidency());
      EXPECT_LE(b->pkgC0Residency() + b->pkgCanyResidency(), b->absoluteTime()) << "residency ran ahead of the clock";
    }
    std::map<std::pair<std::int64_t, std::uint64_t>, std::uint64_t> residency;  // (core, level)
    std::size_t packages = 0;
    for (const Cstates* c : only<Cstates>(records)) {
      packages += c->core() == -1;
      for (const Cstate& s : c->states())
        EXPECT_GE(s.residency(), std::exchange(residency[{c->core(), s.level()}], s.residency()));
    }
    EXPECT_EQ(packages, pkg.size());
    std::map<std::pair<std::uint32_t, std::string>, std::uint64_t> counts;
    for (const Interrupts* in : only<Interrupts>(records)) {
      for (const InterruptVector& v : in->vectors())
        EXPECT_GE(v.interruptCount(), std::exchange(counts[{v.cpuNumber(), v.vectorName()}], v.interruptCount()));
    }
    EXPECT_FALSE(counts.empty());
  }
}

TEST(SampleStoreRealism, ProcessRecordsFormConsistentLivesAndFamilies) {
  std::set<std::int64_t> statuses;
  std::set<std::string> names;
  for (const auto& records : sharedStore().boots) {
    std::map<std::uint64_t, std::vector<const ProcessUsage*>> lives;  // by unique id
    for (const ProcessUsage* p : only<ProcessUsage>(records)) {
      statuses.insert(p->exitStatus());
      names.insert(p->name());
      auto& life = lives[p->uniqueid()];
      SCOPED_TRACE(p->name() + " uniqueid " + std::to_string(p->uniqueid()));
      if (!life.empty()) {
        const ProcessUsage* last = life.back();
        EXPECT_TRUE(last->exitStatus() == -1 || last->exitStatus() == -3) << "a record after the exit";
        EXPECT_TRUE(p->pid() == last->pid() && p->name() == last->name() &&
                    p->procStartAbstime() == last->procStartAbstime());
        EXPECT_GE(p->userTime() + p->systemTime(), last->userTime() + last->systemTime()) << "CPU time went back";
      }
      EXPECT_GE(p->absoluteTime(), p->procStartAbstime());
      EXPECT_TRUE(p->exitStatus() == -2 || p->UUID().has_value());
      life.push_back(p);
    }
    // launchd is process 1; the user's launchd is its child; parents and responsible processes are of the same boot.
    ASSERT_TRUE(lives.count(1));
    EXPECT_EQ(lives[1].front()->pid(), 1u);
    EXPECT_EQ(lives[1].front()->name(), "launchd");
    int userLaunchds = 0;
    for (const auto& [id, life] : lives) {
      const ProcessUsage* p = life.front();
      userLaunchds += p->name() == "launchd" && p->uid() == 501 && p->parentUniqueid() == 1;
      EXPECT_TRUE(id == 1 || lives.count(p->parentUniqueid())) << p->name();
      EXPECT_TRUE(lives.count(p->responsibleUniqueid())) << p->name();
    }
    EXPECT_EQ(userLaunchds, 1);
  }
  for (std::int64_t s : {-3, -2, -1, 0}) EXPECT_TRUE(statuses.count(s)) << "exit status " << s;
  EXPECT_GT(*statuses.rbegin(), 0);
  // Names the job-name cleaning has to deal with: a dot and an upper-case UUID, a dot and digits, a leading launcher
  // slot.
  for (const char* form : {R"(.+\.[0-9A-F]{8}-[0-9A-F]{4}-[0-9A-F]{4}-[0-9A-F]{4}-[0-9A-F]{12})", R"(.+\.[0-9]+)",
                           R"(\[0x[^\]-]*-0x[^\]]*\]\..*)"}) {
    const std::regex re(form);
    EXPECT_TRUE(std::any_of(names.begin(), names.end(), [&](const std::string& n) { return std::regex_match(n, re); }))
        << form;
  }
}

// Zone changes are announced at once or at the next wake, with the zone the plan says.
TEST(SampleStoreRealism, AWeekBringsEveryKindOfEventWithZonesABatteryAndDevicesThatBehave) {
  const auto& store = sharedStore();
  const MachinePlan plan(store.config.days, store.config.seed);
  std::vector<std::uint64_t> clocks, wakes;  // wall times of clock records and of the machine coming up
  std::set<std::uint32_t> wakeReasons, idleChanges, deviceTypes, days;
  std::set<std::uint64_t> sources;
  std::set<std::string> zones, wakeTypes;
  int standby = 0, charging = 0, draining = 0;
  bool fullSeen = false;
  std::int64_t cycles = 0;
  for (const auto& records : store.boots) {
    bool onAC = false;
    wakes.push_back(records.front()->wallTime());
    std::map<std::string, std::uint32_t> connected;  // device id -> state
    for (const Record* r : records) {
      if (const auto* p = recordCast<PowerStateChange>(r)) {
        onAC = p->change() == 0;
        fullSeen |= p->isFullyCharged();
        sources.insert(p->change());
      } else if (const auto* level = recordCast<BatteryChargeLevel>(r)) {
        EXPECT_TRUE(level->charge() > 0 && level->charge() <= level->maxCharge()) << level->charge();
        EXPECT_TRUE(level->instantVoltage() >= 10'000 && level->instantVoltage() <= 13'500) << level->instantVoltage();
        EXPECT_GE(level->cycleCount(), std::exchange(cycles, level->cycleCount()));
        EXPECT_TRUE(onAC ? level->instantAmperage() >= 0 : level->instantAmperage() < 0)
            << "the current follows the power source";
        charging += onAC && level->instantAmperage() > 0;
        draining += !onAC;
        EXPECT_EQ(level->lastMinuteWattage() < 0, level->instantAmperage() < 0);
      } else if (const auto* s = recordCast<SleepWake>(r)) {
        wakeReasons.insert(s->reason());
        standby += s->wakeFromStandby();
        if (s->reason() == 0) continue;
        wakes.push_back(s->wallTime());
        wakeTypes.insert(s->wakeType());
        EXPECT_GT(s->efiMsec(), 0u);
        EXPECT_GT(s->recordWriteAbsoluteTime(), s->absoluteTime());
        EXPECT_EQ(s->hasImageReadMsec(), s->wakeFromStandby());
        EXPECT_EQ(s->hasGraphicsReadyMsec(), s->reason() == 1);
      } else if (const auto* d = recordCast<DeviceChange>(r)) {
        deviceTypes.insert(d->deviceType());
        const auto [it, fresh] = connected.try_emplace(d->deviceId(), 0);
        EXPECT_TRUE((fresh && d->nowConnected() != 0) || it->second != d->nowConnected())
            << d->deviceName() << " switched twice the same way";
        it->second = d->nowConnected();
      } else if (const auto* t = recordCast<TimeChange>(r)) {
        zones.insert(t->zoneName());
        EXPECT_EQ(t->zoneName(), plan.zoneAt(t->wallTime()).name);
        EXPECT_EQ(t->gmtoff(), plan.zoneAt(t->wallTime()).gmtoff);
        clocks.push_back(t->wallTime());
        days.insert(static_cast<std::uint32_t>(t->yday()));
      } else if (const auto* dc = recordCast<DateChange>(r)) {
        days.insert(dc->newYday());
      } else if (const auto* u = recordCast<UserIdle>(r)) {
        idleChanges.insert(u->change());
      }
    }
    EXPECT_TRUE(connected.count("wlan0") && connected.count("bt0"));
  }
  EXPECT_TRUE(fullSeen && charging > 0 && draining > 0 && standby > 0);
  EXPECT_EQ(wakeReasons, (std::set<std::uint32_t>{0, 1, 2}));
  EXPECT_GE(wakeTypes.size(), 3u);
  EXPECT_EQ(sources, (std::set<std::uint64_t>{0, 1}));
  EXPECT_EQ(idleChanges, (std::set<std::uint32_t>{0, 1}));
  for (std::uint32_t type : {5u, 6u, 9u}) EXPECT_TRUE(deviceTypes.count(type)) << "device type " << type;
  EXPECT_GT(deviceTypes.size(), 3u);
  EXPECT_GE(zones.size(), 2u) << "a trip to another zone";
  // The store starts on day 35 (5 February); every later day is announced by a date record or a boot's clock record.
  for (std::uint32_t day = 36; day < 35u + static_cast<std::uint32_t>(store.config.days); ++day)
    EXPECT_TRUE(days.count(day)) << "day " << day;
  ASSERT_FALSE(plan.zoneSwitches().empty());
  for (std::uint64_t at : plan.zoneSwitches()) {
    const auto clock = std::lower_bound(clocks.begin(), clocks.end(), at);
    const auto wake = std::lower_bound(wakes.begin(), wakes.end(), at);
    ASSERT_NE(clock, clocks.end());
    EXPECT_TRUE(*clock == at || (wake != wakes.end() && *clock <= *wake + 2'000)) << "switch at " << at;
  }
}

}  // namespace
}  // namespace bw::samplestore
