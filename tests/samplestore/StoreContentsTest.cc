// The generated store read back with the project's reader: every record it
// claims to have written, in the store's layout, boots chained across the
// system update, and wall clock and ticks that agree the way timelines need.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <sstream>

#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/TimeChange.h"
#include "StoreFixture.h"
#include "base/Console.h"
#include "store/StatsFileList.h"
#include "time/AbsoluteTimeline.h"
#include "time/BootTimeline.h"

namespace bw::samplestore {
namespace {

using test::only;
using test::sharedStore;

TEST(SampleStoreContents, ReaderFindsEveryRecordTheGeneratorReportsPerClass) {
  const auto& store = sharedStore();
  ClassCounts read{};
  for (const auto& [uuid, records] : store.read.boots) {
    for (const Record* r : records) ++read[static_cast<std::size_t>(r->recordClass())];
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

TEST(SampleStoreContents, FilesLieInTheStoreLayoutNamedByBootAndDatedByTheirLastRecord) {
  const auto& store = sharedStore();
  std::map<std::size_t, int> powerFiles;
  for (const StoreFile& f : store.report.files) {
    SCOPED_TRACE(f.path);
    const BootSummary& boot = store.report.boots.at(f.boot);
    const std::string relative = f.path.substr(store.config.output.size() + 1);
    const std::string directory = relative.substr(0, relative.rfind('/'));
    EXPECT_TRUE(directory == "var/db/brindlewick" || directory == "var/log/com.vexil.launchd" ||
                directory == "var/log/com.vexil.launchd.peruser.501");
    EXPECT_NE(relative.find(boot.uuid.string()), std::string::npos);
    EXPECT_EQ(relative.find("periodic") != std::string::npos, f.writer == 3);
    RecordPool pool;
    const FileRecords file = readStatsFile(f.path, StoreQuery(), pool);
    ASSERT_FALSE(file.damaged);
    ASSERT_EQ(file.records.size(), f.records);
    const auto* header = recordCast<LogStartsV1>(file.records.front());
    ASSERT_NE(header, nullptr);
    EXPECT_EQ(header->bootUUID(), boot.uuid);
    EXPECT_EQ(header->writer(), f.writer);
    EXPECT_EQ(header->isFirst(), f.writer == 5 ? 1u : 0u);
    for (const Record* r : file.records) EXPECT_GE(r->absoluteTime(), header->absoluteTime());
    powerFiles[f.boot] += f.writer == 5;
    // Dated by the wall time of the last record, to the millisecond.
    const BootTimeline timeline(boot.uuid, boot.lastUuid, store.boots[f.boot]);
    const std::uint64_t last = file.records.back()->absoluteTime();
    std::size_t s = timeline.segmentCount() - 1;
    while (s > 0 && timeline.segment(s).startAbsoluteTime() > last) --s;
    struct stat st {};
    ASSERT_EQ(stat(f.path.c_str(), &st), 0);
    EXPECT_EQ(st.st_size, static_cast<off_t>(f.bytes));
    EXPECT_EQ(static_cast<std::int64_t>(st.st_mtim.tv_sec) * 1000 + st.st_mtim.tv_nsec / 1'000'000,
              timeline.segment(s).skew() + static_cast<std::int64_t>(last));
  }
  for (std::size_t b = 0; b < store.report.boots.size(); ++b) EXPECT_EQ(powerFiles[b], 1) << "boot " << b;
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
    for (const LogStartsV1* h : only<LogStartsV1>(store.boots[b])) {
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
  std::ostringstream out, err;
  setConsole(&out, &err);
  const auto timelines = sequenceBoots(copy);
  setConsole(nullptr, nullptr);
  EXPECT_EQ(out.str(), "");
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

}  // namespace
}  // namespace bw::samplestore
