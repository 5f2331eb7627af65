#include "service/StoreModels.h"

#include "base/Console.h"
#include "model/Model.h"
#include "store/RecordReader.h"
#include "store/StatsFileList.h"
#include "time/BootSequencer.h"

namespace bw {

std::vector<std::unique_ptr<Model>> loadStoreModels(const StoreQuery& query) {
  const FileList files = statsFileList(query);
  if (query.fromPath && files.empty()) exitWithMessage(66, "--from path contained no Brindlewick trace files.");
  RecordsByBoot read = readStatsFiles(std::vector<std::string>(files.begin(), files.end()), query);
  auto pool = std::make_shared<RecordPool>(std::move(read.pool));
  std::vector<std::unique_ptr<Model>> models;
  for (auto& [version, timeline] : sequenceBoots(read.boots)) {
    auto model = std::make_unique<Model>(std::move(timeline), version);
    model->retainRecords(pool);
    models.push_back(std::move(model));
  }
  return models;
}

}  // namespace bw
