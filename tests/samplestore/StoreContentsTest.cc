// The generated store read back with the project's reader: every record it
// claims to have written, boots chained across the system update, and
// segments where the generator put wakes.
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "Records/LogStartsV1.h"
#include "Records/RecordDecoder.h"
#include "SampleStore.h"
#include "store/RecordReader.h"
#include "store/StatsFileList.h"
#include "support/ConsoleCapture.h"
#include "support/TempDir.h"
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
  for (std::size_t b = 1; b < boots.size(); ++b) {
    EXPECT_EQ(boots[b].lastUuid, boots[b - 1].uuid);
    EXPECT_EQ(boots[b].lastSystemVersion, boots[b - 1].systemVersion);
    updates += boots[b].systemVersion != boots[b - 1].systemVersion;
  }
  EXPECT_EQ(updates, 1);
  // Sequencing the headers read back keeps every boot: one chain per version, no warning.
  BootRecords copy = store.read.boots;
  test::ConsoleCapture console(0);
  const auto timelines = sequenceBoots(copy);
  EXPECT_EQ(console.out.str(), "");
  ASSERT_EQ(timelines.size(), 2u);
  std::size_t chained = 0;
  for (const auto& [version, timeline] : timelines) chained += timeline->objects().size();
  EXPECT_EQ(chained, boots.size());
}

}  // namespace
}  // namespace bw::samplestore
