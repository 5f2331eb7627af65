#pragma once
// The command line's edge: translates `Options` into what the lower stages
// take (the store's query, the domain's spec, whether summarizers are fed)
// and builds the models of a run from them.
#include <memory>
#include <vector>

#include "domains/DomainSpec.h"
#include "model/ModelLoading.h"

namespace bw {

class Model;
class Options;

StoreQuery storeQuery(const Options& options);
DomainSpec domainSpec(const Options& options);
// Whether the mode reads summarizers: the record dump and the event listing
// need only the domains.
bool feedsSummarizers(const Options& options);

// loadModels(storeQuery(options)).
std::vector<std::unique_ptr<Model>> loadModels(const Options& options);

}  // namespace bw
