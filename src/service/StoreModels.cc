#include "service/StoreModels.h"

#include "base/Console.h"
#include "model/ModelsFromRecords.h"
#include "store/RecordReader.h"
#include "store/StatsFileList.h"

namespace bw {

std::vector<std::unique_ptr<Model>> loadStoreModels(const StoreQuery& query) {
  const FileList files = statsFileList(query);
  if (query.fromPath && files.empty()) exitWithMessage(66, "--from path contained no Brindlewick trace files.");
  RecordsByBoot read = readStatsFiles(std::vector<std::string>(files.begin(), files.end()), query);
  return modelsFromRecords(std::move(read));
}

}  // namespace bw
