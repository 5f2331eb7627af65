#include "cli/ModelLoader.h"

#include "cli/Options.h"
#include "model/Model.h"

namespace bw {

StoreQuery storeQuery(const Options& options) {
  StoreQuery query;
  query.fromPath = options.from_path();
  query.periodicCutoff = options.load_periodic_files_newer_than();
  query.onlyBoot = options.only_boot_uuid();
  query.onlySystemVersion = options.only_system_version();
  return query;
}

DomainSpec domainSpec(const Options& options) {
  DomainSpec spec;
  spec.type = options.domain_type();
  spec.start = options.domain_start();
  spec.end = options.domain_end();
  spec.day = YearMonthDay{static_cast<std::int32_t>(options.domain_ymd_year()),
                          static_cast<std::int32_t>(options.domain_ymd_month()),
                          static_cast<std::int32_t>(options.domain_ymd_day())};
  return spec;
}

bool feedsSummarizers(const Options& options) {
  return options.mode() != kModeDump && options.mode() != kModeShowEvents;
}

std::vector<std::unique_ptr<Model>> loadModels(const Options& options) { return loadModels(storeQuery(options)); }

}  // namespace bw
