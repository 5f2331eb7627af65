// Building the models of a run: read the store, sequence the boots of each
// system version, and (when asked) keep only the versions whose sample range
// holds time in the requested states.
#include "base/Console.h"
#include "cli/Options.h"
#include "domains/Domain.h"
#include "model/Model.h"
#include "store/RecordReader.h"
#include "time/BootSequencer.h"

namespace bw {

std::vector<std::unique_ptr<Model>> Model::modelsWithOptions(const Options& options, bool processEvents) {
  RecordsByBoot read = readAllRecords(options);
  auto pool = std::make_shared<RecordPool>(std::move(read.pool));
  std::map<std::string, std::unique_ptr<Timeline>> timelines = sequenceBoots(read.boots);

  const std::vector<std::string> maskStates = options.domain_mask_states().value_or(std::vector<std::string>{});
  std::vector<std::unique_ptr<Model>> models;
  for (auto& [version, timeline] : timelines) {
    auto model = std::make_unique<Model>(std::move(timeline), version);
    model->retainRecords(pool);
    if (processEvents) {
      std::unique_ptr<Domain> domain = Domain::domainWithOptions(options);
      model->processEventsWithDomains({domain.get()}, options);
      const std::optional<std::vector<Range>> masked = model->rangesForSubstates(maskStates, domain->ranges());
      if (gDebug) {
        err() << "[m.states rangesForSubstates:OPTIONS.domain_mask_states maskedWithRanges:nil] = "
              << describeRanges(model->rangesForSubstates(maskStates, std::nullopt)) << "\n";
        err() << "d.ranges = " << describeRanges(domain->ranges()) << "\n";
        err() << "[m.states rangesForSubstates:OPTIONS.domain_mask_states maskedWithRanges:d.ranges] = "
              << describeRanges(masked) << "\n";
      }
      if (!masked || masked->empty()) continue;
      if (gDebug) err() << "Keeping this model, because the domain had ranges.\n";
    }
    models.push_back(std::move(model));
  }
  return models;
}

}  // namespace bw
