#include "cli/ModelRunner.h"

#include <algorithm>

#include "base/Console.h"
#include "base/Exception.h"
#include "base/RangeList.h"
#include "cli/EmptyResult.h"
#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "cli/StoreWatch.h"
#include "domains/Domain.h"
#include "domains/PostInstallDomain.h"
#include "model/Model.h"
#include "summarizers/ModelSummarizers.h"

namespace bw {

void checkMaskStates(const Options& options) {
  if (!options.domain_mask_states()) return;
  const std::vector<std::string> keys = modelSummarizerKeys();
  for (const std::string& state : *options.domain_mask_states()) {
    if (std::find(keys.begin(), keys.end(), state) == keys.end()) {
      throw Exception(kInvalidArgumentException, "no such summarizer: " + state);
    }
  }
}

void runPerModel(const Options& options, const ModelAction& action) {
  checkMaskStates(options);
  const std::vector<std::string> maskStates = options.domain_mask_states().value_or(std::vector<std::string>{});
  StoreWatch watch;
  const std::vector<std::unique_ptr<Model>> models = loadModels(options, &watch);
  bool acted = false;
  EmptyStage reached = EmptyStage::kNoRecords;
  std::size_t fed = 0;
  for (const std::unique_ptr<Model>& model : models) {
    if (!acted) watch.step(format("feeding model %zu of %zu", ++fed, models.size()));
    std::unique_ptr<Domain> domain = Domain::domainWithChoice(domainChoice(options));
    std::unique_ptr<PostInstallDomain> postInstall;
    std::vector<Summarizer*> domains{domain.get()};
    if (options.exclude_post_install()) {
      postInstall = std::make_unique<PostInstallDomain>();
      domains.push_back(postInstall.get());
    }
    model->processEventsWithDomains(domains, summarizerFeed(options));

    reached = std::max(reached, EmptyStage::kNoRange);
    if (domain->ranges().empty()) continue;
    reached = std::max(reached, EmptyStage::kNoStateTime);
    std::optional<std::vector<Range>> ranges = model->rangesForSubstates(maskStates, domain->ranges());
    if (!ranges || ranges->empty()) continue;
    reached = std::max(reached, EmptyStage::kOnlyPostInstall);
    if (postInstall && !postInstall->ranges().empty()) *ranges = subtractRanges(*ranges, postInstall->ranges());
    if (!ranges->empty()) {
      watch.end();
      action(*model, *ranges);
      acted = true;
    }
  }
  watch.end();
  if (!acted) noteEmptyResult(options, models, reached);
}

}  // namespace bw
