#include "cli/ModelLoader.h"

#include "base/Console.h"
#include "cli/Options.h"
#include "cli/StoreWatch.h"
#include "model/ModelsFromRecords.h"
#include "store/RecordReader.h"

namespace bw {

StoreQuery storeQuery(const Options& options) {
  StoreQuery query;
  query.fromPath = options.from_path();
  query.periodicCutoff = options.load_periodic_files_newer_than();
  query.onlyBoot = options.only_boot_uuid();
  query.onlySystemVersion = options.only_system_version();
  return query;
}

DomainChoice domainChoice(const Options& options) {
  DomainChoice choice;
  choice.type = options.domain_type();
  choice.start = options.domain_start();
  choice.end = options.domain_end();
  choice.day = YearMonthDay{static_cast<std::int32_t>(options.domain_ymd_year()),
                            static_cast<std::int32_t>(options.domain_ymd_month()),
                            static_cast<std::int32_t>(options.domain_ymd_day())};
  return choice;
}

SummarizerFeed summarizerFeed(const Options& options) {
  switch (options.mode()) {
    case kModeDump:
    case kModeShowEvents:
      return SummarizerFeed::only({});
    case kModeShowBattery: {
      if (gDebug) return SummarizerFeed::all();
      std::vector<std::string> keys = options.domain_mask_states().value_or(std::vector<std::string>{});
      keys.push_back("Power");
      return SummarizerFeed::only(std::move(keys));
    }
    default:
      return SummarizerFeed::all();
  }
}

FileList runFileList(const StoreQuery& query, ReadObserver* observer) {
  FileList files = statsFileList(query, observer);
  if (query.fromPath && files.empty()) exitWithMessage(66, "--from path contained no Brindlewick trace files.");
  return files;
}

std::vector<std::unique_ptr<Model>> loadModels(const Options& options, StoreWatch* outerWatch) {
  const StoreQuery query = storeQuery(options);
  StoreWatch ownWatch;
  StoreWatch& watch = outerWatch ? *outerWatch : ownWatch;
  const FileList files = runFileList(query, &watch);
  watch.begin(files.size());
  RecordsByBoot read = readStatsFiles(std::vector<std::string>(files.begin(), files.end()), query, &watch);
  watch.step("sequencing boots");
  return modelsFromRecords(std::move(read));
}

}  // namespace bw
