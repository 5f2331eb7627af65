#pragma once
// Reading a store into models: the stats files a query selects, their
// records grouped by boot, the boots chained per system version, one unfed
// model per version.
#include <memory>
#include <vector>

#include "store/StatsFileList.h"
#include "store/StoreQuery.h"

namespace bw {

class Model;

// The stats files of the query. A `--from` directory without any ends the
// run with "--from path contained no Brindlewick trace files." (status 66).
FileList runFileList(const StoreQuery& query);

// One model per system version found, each holding its boots in sequence;
// nothing is fed yet.
std::vector<std::unique_ptr<Model>> loadModels(const StoreQuery& query);

}  // namespace bw
