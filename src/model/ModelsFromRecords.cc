#include "model/ModelsFromRecords.h"

#include "time/BootSequencer.h"

namespace bw {

std::vector<std::unique_ptr<Model>> modelsFromRecords(RecordsByBoot read) {
  auto storage = std::make_shared<RecordStorage>(std::move(read.storage));
  std::vector<std::unique_ptr<Model>> models;
  for (auto& [version, timeline] : sequenceBoots(read.boots)) {
    auto model = std::make_unique<Model>(std::move(timeline), version);
    model->retainRecords(storage);
    models.push_back(std::move(model));
  }
  return models;
}

}  // namespace bw
