#pragma once
// A week-long store of a small laptop, generated once per test process and
// read back with the record reader, for the tests that look at its contents.
#include <memory>
#include <string>
#include <vector>

#include "SampleStore.h"
#include "store/RecordReader.h"
#include "support/TempDir.h"
#include "time/BootSequencer.h"

namespace bw::samplestore::test {

struct SharedStore {
  bw::test::TempDir dir;
  StoreConfig config;
  StoreReport report;
  RecordsByBoot read;
  std::vector<std::vector<Record*>> boots;  // per boot, sorted by absolute time, in the order written
};

inline const SharedStore& sharedStore() {
  static const std::unique_ptr<SharedStore> store = [] {
    auto s = std::make_unique<SharedStore>();
    s->config = StoreConfig{
        .days = 7, .seed = 11, .scale = 30, .output = s->dir / "store"};  // a trip, a weekend and the update
    s->report = generateSampleStore(s->config);
    s->read = readAllRecords(StoreQuery{.fromPath = s->config.output});
    for (const BootSummary& boot : s->report.boots) {
      s->boots.push_back(s->read.boots[boot.uuid]);
      sortByAbsoluteTime(s->boots.back());
    }
    return s;
  }();
  return *store;
}

// The records of class T among `records`, in order.
template <class T>
std::vector<const T*> only(const std::vector<Record*>& records) {
  std::vector<const T*> out;
  for (const Record* r : records) {
    if (const T* t = recordCast<T>(r)) out.push_back(t);
  }
  return out;
}

}  // namespace bw::samplestore::test
