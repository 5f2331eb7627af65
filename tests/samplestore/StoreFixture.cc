#include "StoreFixture.h"

#include <memory>

#include "time/BootSequencer.h"

namespace bw::samplestore::test {

RecordsByBoot readStore(const std::string& directory) {
  Options options;
  options.setFrom_path(directory);
  return readAllRecords(options);
}

const SharedStore& sharedStore() {
  static const std::unique_ptr<SharedStore> store = [] {
    auto s = std::make_unique<SharedStore>();
    s->config.days = 7;  // long enough for a trip, a weekend and the update
    s->config.scale = 30;
    s->config.seed = 11;
    s->config.output = s->dir / "store";
    s->report = generateSampleStore(s->config);
    s->read = readStore(s->config.output);
    for (const BootSummary& boot : s->report.boots) {
      std::vector<Record*> records = s->read.boots[boot.uuid];
      sortByAbsoluteTime(records);
      s->boots.push_back(std::move(records));
    }
    return s;
  }();
  return *store;
}

}  // namespace bw::samplestore::test
