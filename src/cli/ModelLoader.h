#pragma once
// The command line's edge: translates `Options` into what the lower stages
// take (the store's query, the domain's choice, which summarizers are fed)
// and builds the models of a run from them.
#include <memory>
#include <vector>

#include "domains/DomainChoice.h"
#include "model/Model.h"
#include "store/StatsFileList.h"
#include "store/StoreQuery.h"

namespace bw {

class Options;
class StoreWatch;

StoreQuery storeQuery(const Options& options);
DomainChoice domainChoice(const Options& options);
// The summarizers the mode reads: none for the record dump and the event
// listing (they need only the domains); for the battery plot the battery's
// and the -S states' (all with --debug, whose diagnostics come from every
// summarizer); all for the rest.
SummarizerFeed summarizerFeed(const Options& options);

// The stats files of the run. A `--from` directory without any ends the run
// with "--from path contained no Brindlewick trace files." (status 66).
// `observer` hears of folders that could not be listed.
FileList runFileList(const StoreQuery& query, ReadObserver* observer = nullptr);

// Reads the store the options select and builds one model per system
// version, each holding its boots in sequence; nothing is fed yet. A person
// at a terminal sees the reading's progress and damage (cli/StoreWatch.h);
// a caller that passes its own `watch` keeps the progress line up through
// its later steps and ends it itself.
std::vector<std::unique_ptr<Model>> loadModels(const Options& options, StoreWatch* watch = nullptr);

}  // namespace bw
