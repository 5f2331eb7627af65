// The generated store read back with the project's reader: every record it
// claims to have written, boots chained across the system update, wall clock
// and ticks that agree the way timelines need, and what the summarizers will
// expect of a laptop's week (a battery that behaves like one, every kind of
// event).
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <sstream>

#include "MachinePlan.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/DateChange.h"
#include "Records/DeviceChange.h"
#include "Records/LogStartsV1.h"
#include "Records/PowerStateChange.h"
#include "Records/RecordDecoder.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "SampleStore.h"
#include "store/RecordReader.h"
#include "store/StatsFileList.h"
#include "support/ConsoleCapture.h"
#include "support/TempDir.h"
#include "time/AbsoluteTimeline.h"
#include "time/BootSequencer.h"
#include "time/BootTimeline.h"

namespace bw::samplestore {
namespace {

// A week-long store of a small laptop, generated once per test process and
// read back with the record reader.
struct SharedStore {
  bw::test::TempDir dir;
  StoreConfig config;
  StoreReport report;
  RecordsByBoot read;
  std::vector<std::unique_ptr<Record>> owned;
  std::vector<std::vector<Record*>> boots;  // per boot, decoded, sorted by absolute time, in the order written
};

const SharedStore& sharedStore() {
  static const std::unique_ptr<SharedStore> store = [] {
    auto s = std::make_unique<SharedStore>();
    s->config = StoreConfig{
        .days = 7, .seed = 11, .scale = 30, .output = s->dir / "store"};  // a trip, a weekend and the update
    s->report = generateSampleStore(s->config);
    s->read = readAllRecords(StoreQuery{.fromPath = s->config.output});
    for (const BootSummary& boot : s->report.boots) {
      RecordList refs = s->read.boots[boot.uuid];
      sortByAbsoluteTime(refs);
      auto& records = s->boots.emplace_back();
      for (const RecordRef& r : refs) records.push_back(s->owned.emplace_back(copyRecord(r)).get());
    }
    return s;
  }();
  return *store;
}

TEST(SampleStoreContents, ReaderFindsEveryRecordTheGeneratorReportsPerClass) {
  const auto& store = sharedStore();
  ClassCounts read{};
  for (const auto& [uuid, records] : store.read.boots) {
    for (const RecordRef& r : records) ++read[static_cast<std::size_t>(r.recordClass())];
  }
  for (int k = 0; k < kRecordClassCount; ++k) {
    EXPECT_EQ(read[static_cast<std::size_t>(k)], store.report.records[static_cast<std::size_t>(k)])
        << recordClassName(static_cast<RecordClass>(k));
  }
  EXPECT_EQ(store.read.boots.size(), store.report.boots.size());
  // Sub-message classes never stand alone; the rest all occur.
  for (RecordClass absent :
       {RecordClass::LogStartsV0, RecordClass::Cstate, RecordClass::SmcKey, RecordClass::InterruptVector}) {
    EXPECT_EQ(store.report.records[static_cast<std::size_t>(absent)], 0u) << recordClassName(absent);
  }
  EXPECT_EQ(std::count(store.report.records.begin(), store.report.records.end(), 0u), 4);
  EXPECT_EQ(statsFileList(StoreQuery{.fromPath = store.config.output}).size(), store.report.files.size());
}

TEST(SampleStoreContents, BootsChainByTheirHeadersAndTheUpdateStartsANewVersion) {
  const auto& store = sharedStore();
  const auto& boots = store.report.boots;
  ASSERT_GE(boots.size(), 2u);
  EXPECT_EQ(store.read.boots.count(boots[0].lastUuid), 0u) << "the boot before the store is gone";
  int updates = 0;
  for (std::size_t b = 0; b < boots.size(); ++b) {
    SCOPED_TRACE("boot " + std::to_string(b));
    EXPECT_EQ(store.boots[b].front()->recordClass(), RecordClass::LogStartsV1);
    for (const Record* r : store.boots[b]) {
      const LogStartsV1* h = recordCast<LogStartsV1>(r);
      if (h == nullptr) continue;
      EXPECT_EQ(h->bootUUID(), boots[b].uuid);
      EXPECT_EQ(h->lastBootUUID(), boots[b].lastUuid);
      EXPECT_EQ(h->systemVersion(), boots[b].systemVersion);
      EXPECT_EQ(h->lastSystemVersion(), boots[b].lastSystemVersion);
    }
    if (b == 0) continue;
    EXPECT_EQ(boots[b].lastUuid, boots[b - 1].uuid);
    EXPECT_EQ(boots[b].lastSystemVersion, boots[b - 1].systemVersion);
    updates += boots[b].systemVersion != boots[b - 1].systemVersion;
  }
  EXPECT_EQ(updates, 1);
  // Sequencing keeps every boot: one chain per version, no warning.
  BootRecords copy = store.read.boots;
  test::ConsoleCapture console(0);
  const auto timelines = sequenceBoots(copy);
  EXPECT_EQ(console.out.str(), "");
  ASSERT_EQ(timelines.size(), 2u);
  std::size_t chained = 0;
  for (const auto& [version, timeline] : timelines) chained += timeline->objects().size();
  EXPECT_EQ(chained, boots.size());
}

TEST(SampleStoreContents, WallTimesShareOneSkewPerSegmentOnlyWakesStartSegmentsAndBootsBeginWithClockAndPower) {
  const auto& store = sharedStore();
  static const std::set<std::string> zones = {"PST", "PDT", "MST", "MDT",  "CST", "CDT", "EST", "EDT",
                                              "GMT", "BST", "CET", "CEST", "IST", "SGT", "JST"};
  std::uint64_t lastBootEnd = 0;
  for (std::size_t b = 0; b < store.boots.size(); ++b) {
    SCOPED_TRACE("boot " + std::to_string(b));
    const auto& records = store.boots[b];
    ASSERT_GE(records.size(), 3u);
    const auto* clock = recordCast<TimeChange>(records[1]);
    ASSERT_NE(clock, nullptr) << records[1]->className();
    EXPECT_EQ(clock->absoluteTime(), records[0]->absoluteTime());
    EXPECT_TRUE(zones.count(clock->zoneName())) << clock->zoneName();
    EXPECT_EQ(clock->gmtoff() % 1800, 0);
    EXPECT_EQ(records[2]->recordClass(), RecordClass::PowerStateChange);

    std::optional<std::int64_t> skew;
    std::uint64_t lastWall = 0, lastAbs = 0;
    std::size_t wakes = 0;
    bool asleep = false;
    for (const Record* r : records) {
      if (r->wallTime() == 0) continue;
      const std::int64_t k = static_cast<std::int64_t>(r->wallTime() - r->absoluteTime());
      const auto* sw = recordCast<SleepWake>(r);
      if (sw && sw->reason() != 0) {  // asleep, the ticks stopped while the wall clock went on
        ASSERT_TRUE(asleep) << "a wake without a sleep at " << r->absoluteTime();
        EXPECT_GT(r->wallTime() - lastWall, r->absoluteTime() - lastAbs + 60'000);
        EXPECT_LT(r->absoluteTime() - lastAbs, 10'000u);
        asleep = false;
        ++wakes;
      } else {
        ASSERT_FALSE(asleep) << r->className() << " written while asleep at " << r->absoluteTime();
        EXPECT_TRUE(!skew || k == *skew) << r->className() << " at " << r->absoluteTime();
        asleep = sw != nullptr;
      }
      skew = k;
      lastWall = r->wallTime();
      lastAbs = r->absoluteTime();
    }
    const BootSummary& boot = store.report.boots[b];
    EXPECT_EQ(wakes + 1, boot.runs);
    const BootTimeline timeline(boot.uuid, boot.lastUuid, records);
    EXPECT_EQ(timeline.segmentCount(), wakes + 1);
    EXPECT_LT(lastBootEnd, timeline.startWallTime()) << "boots follow each other on the wall clock";
    lastBootEnd = timeline.endWallTime();
  }
}

// Zone changes are announced at once or at the next wake, with the zone the plan says.
TEST(SampleStoreContents, AWeekBringsEveryKindOfEventWithZonesABatteryAndDevicesThatBehave) {
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
