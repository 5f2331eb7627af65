// The generated store read back with the project's reader: every record it
// claims to have written, and boots whose headers chain across the system
// update.
#include <gtest/gtest.h>

#include <algorithm>

#include "Records/LogStartsV1.h"
#include "SampleStore.h"
#include "store/RecordReader.h"
#include "store/StatsFileList.h"
#include "support/TempDir.h"

namespace bw::samplestore {
namespace {

// A week-long store of a small laptop, generated once per test process and
// read back with the record reader.
struct SharedStore {
  bw::test::TempDir dir;
  StoreConfig config;
  StoreReport report;
  RecordsByBoot read;
};

const SharedStore& sharedStore() {
  static const std::unique_ptr<SharedStore> store = [] {
    auto s = std::make_unique<SharedStore>();
    s->config = StoreConfig{
        .days = 7, .seed = 11, .scale = 30, .output = s->dir / "store"};  // a trip, a weekend and the update
    s->report = generateSampleStore(s->config);
    s->read = readAllRecords(StoreQuery{.fromPath = s->config.output});
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
    const auto* h = recordCast<LogStartsV1>(store.read.boots.at(boots[b].uuid).front().decoded());
    ASSERT_NE(h, nullptr);
    EXPECT_EQ(h->lastBootUUID(), boots[b].lastUuid);
    EXPECT_EQ(h->systemVersion(), boots[b].systemVersion);
    EXPECT_EQ(h->lastSystemVersion(), boots[b].lastSystemVersion);
    if (b == 0) continue;
    EXPECT_EQ(boots[b].lastUuid, boots[b - 1].uuid);
    EXPECT_EQ(boots[b].lastSystemVersion, boots[b - 1].systemVersion);
    updates += boots[b].systemVersion != boots[b - 1].systemVersion;
  }
  EXPECT_EQ(updates, 1);
}

}  // namespace
}  // namespace bw::samplestore
