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
#include "time/BootSequencer.h"
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
  for (RecordClass absent : {RecordClass::LogStartsV0, RecordClass::Cstate, RecordClass::SmcKey, RecordClass::InterruptVector}) {
    EXPECT_EQ(store.report.records[static_cast<std::size_t>(absent)], 0u) << recordClassName(absent);
  }
  EXPECT_EQ(std::count(store.report.records.begin(), store.report.records.end(), 0u), 4);

  Options options;
  options.setFrom_path(store.config.output);
  EXPECT_EQ(statsFileList(options).size(), store.report.files.size());
}

// The wall time of a record's absolute time in a built boot timeline.
std::uint64_t wallOf(const BootTimeline& boot, std::uint64_t abs) {
  for (std::size_t i = boot.segmentCount(); i-- > 0;) {
    const AbsoluteTimeline& s = boot.segment(i);
    if (s.startAbsoluteTime() <= abs) return static_cast<std::uint64_t>(s.skew()) + abs;
  }
  return 0;
}

TEST(SampleStoreContents, FilesLieInTheStoreLayoutNamedByBootAndDatedByTheirLastRecord) {
  const auto& store = sharedStore();
  const std::string root = store.config.output + "/";
  std::map<std::size_t, int> powerFiles;
  for (const StoreFile& f : store.report.files) {
    SCOPED_TRACE(f.path);
    const BootSummary& boot = store.report.boots.at(f.boot);
    const std::string relative = f.path.substr(root.size());
    const std::string directory = relative.substr(0, relative.rfind('/'));
    EXPECT_TRUE(directory == "var/db/brindlewick" || directory == "var/log/com.vexil.launchd" ||
                directory == "var/log/com.vexil.launchd.peruser.501");
    EXPECT_NE(relative.find(boot.uuid.string()), std::string::npos);
    EXPECT_EQ(relative.find("periodic") != std::string::npos, f.writer == 3);

    RecordPool pool;
    const FileRecords file = readStatsFile(f.path, Options(), pool);
    ASSERT_FALSE(file.damaged);
    ASSERT_EQ(file.records.size(), f.records);
    const auto* header = recordCast<LogStartsV1>(file.records.front());
    ASSERT_NE(header, nullptr);
    EXPECT_EQ(header->bootUUID(), boot.uuid);
    EXPECT_EQ(header->writer(), f.writer);
    EXPECT_EQ(header->isFirst(), f.writer == 5 ? 1u : 0u);
    for (const Record* r : file.records) EXPECT_GE(r->absoluteTime(), header->absoluteTime());
    if (f.writer == 5) ++powerFiles[f.boot];

    // Dated by the wall time of the last record, to the millisecond.
    std::vector<Record*> records = store.read.boots.at(boot.uuid);
    sortByAbsoluteTime(records);
    const BootTimeline timeline(boot.uuid, boot.lastUuid, records);
    struct stat st {};
    ASSERT_EQ(stat(f.path.c_str(), &st), 0);
    EXPECT_EQ(st.st_size, static_cast<off_t>(f.bytes));
    const std::uint64_t mtime = static_cast<std::uint64_t>(st.st_mtim.tv_sec) * 1000 + static_cast<std::uint64_t>(st.st_mtim.tv_nsec) / 1'000'000;
    EXPECT_EQ(mtime, wallOf(timeline, file.records.back()->absoluteTime()));
  }
  for (std::size_t b = 0; b < store.report.boots.size(); ++b) EXPECT_EQ(powerFiles[b], 1) << "boot " << b;
}

TEST(SampleStoreContents, BootsChainByTheirHeadersAndTheUpdateStartsANewVersion) {
  const auto& store = sharedStore();
  const auto& boots = store.report.boots;
  ASSERT_GE(boots.size(), 2u);
  int updates = 0;
  for (std::size_t b = 0; b < boots.size(); ++b) {
    SCOPED_TRACE("boot " + std::to_string(b));
    const auto headers = only<LogStartsV1>(store.boots[b]);
    ASSERT_FALSE(headers.empty());
    EXPECT_EQ(store.boots[b].front()->recordClass(), RecordClass::LogStartsV1);
    for (const LogStartsV1* h : headers) {
      EXPECT_EQ(h->bootUUID(), boots[b].uuid);
      EXPECT_EQ(h->lastBootUUID(), boots[b].lastUuid);
      EXPECT_EQ(h->systemVersion(), boots[b].systemVersion);
      EXPECT_EQ(h->lastSystemVersion(), boots[b].lastSystemVersion);
    }
    if (b == 0) {
      EXPECT_EQ(store.read.boots.count(boots[0].lastUuid), 0u) << "the boot before the store is gone";
      continue;
    }
    EXPECT_EQ(boots[b].lastUuid, boots[b - 1].uuid);
    EXPECT_EQ(boots[b].lastSystemVersion, boots[b - 1].systemVersion);
    if (boots[b].systemVersion != boots[b - 1].systemVersion) ++updates;
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

TEST(SampleStoreContents, WallTimesShareOneSkewPerSegmentAndOnlyWakesStartSegments) {
  const auto& store = sharedStore();
  for (std::size_t b = 0; b < store.boots.size(); ++b) {
    SCOPED_TRACE("boot " + std::to_string(b));
    const auto& records = store.boots[b];
    std::optional<std::int64_t> skew;
    std::uint64_t lastWall = 0, lastAbs = 0;
    std::size_t wakes = 0;
    bool asleep = false;
    for (const Record* r : records) {
      if (r->wallTime() == 0) continue;
      const std::int64_t k = static_cast<std::int64_t>(r->wallTime() - r->absoluteTime());
      const auto* sw = recordCast<SleepWake>(r);
      if (sw && sw->reason() != 0) {
        // Asleep, the ticks stopped while the wall clock went on.
        ASSERT_TRUE(asleep) << "a wake without a sleep at " << r->absoluteTime();
        EXPECT_GT(r->wallTime() - lastWall, r->absoluteTime() - lastAbs + 60'000);
        EXPECT_LT(r->absoluteTime() - lastAbs, 10'000u);
        asleep = false;
        ++wakes;
        skew = k;
      } else {
        ASSERT_FALSE(asleep) << r->className() << " written while asleep at " << r->absoluteTime();
        if (skew) {
          EXPECT_EQ(k, *skew) << r->className() << " at " << r->absoluteTime();
        }
        skew = k;
        asleep = sw != nullptr;
      }
      lastWall = r->wallTime();
      lastAbs = r->absoluteTime();
    }
    const BootSummary& boot = store.report.boots[b];
    EXPECT_EQ(wakes + 1, boot.runs);
    const BootTimeline timeline(boot.uuid, boot.lastUuid, records);
    EXPECT_EQ(timeline.segmentCount(), wakes + 1);
    if (b > 0) {
      // Boots follow each other on the wall clock.
      std::vector<Record*> previous = store.boots[b - 1];
      const BootTimeline before(store.report.boots[b - 1].uuid, store.report.boots[b - 1].lastUuid, previous);
      EXPECT_LT(before.endWallTime(), timeline.startWallTime());
    }
  }
}

TEST(SampleStoreContents, EveryBootBeginsWithTheClockAndThePowerSource) {
  const auto& store = sharedStore();
  static const std::set<std::string> known = {"PST", "PDT", "MST", "MDT", "CST", "CDT", "EST", "EDT", "GMT",
                                              "BST", "CET", "CEST", "IST", "SGT", "JST"};
  for (std::size_t b = 0; b < store.boots.size(); ++b) {
    SCOPED_TRACE("boot " + std::to_string(b));
    const auto& records = store.boots[b];
    ASSERT_GE(records.size(), 3u);
    const auto* clock = recordCast<TimeChange>(records[1]);
    ASSERT_NE(clock, nullptr) << records[1]->className();
    EXPECT_EQ(clock->absoluteTime(), records[0]->absoluteTime());
    EXPECT_TRUE(known.count(clock->zoneName())) << clock->zoneName();
    EXPECT_EQ(clock->gmtoff() % 1800, 0);
    EXPECT_EQ(records[2]->recordClass(), RecordClass::PowerStateChange);
  }
}

}  // namespace
}  // namespace bw::samplestore
