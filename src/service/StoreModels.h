#pragma once
// The service's models: the store a request selects, read without any
// progress or terminal output (the service has no terminal).
#include <memory>
#include <vector>

#include "store/StoreQuery.h"

namespace bw {

class Model;

// One unfed model per system version found, each holding its boots in
// sequence. A `--from` directory without stats files ends the process with
// "--from path contained no Brindlewick trace files." (status 66).
std::vector<std::unique_ptr<Model>> loadStoreModels(const StoreQuery& query);

}  // namespace bw
