#include "cli/ModelRunner.h"

#include "cli/ModelLoader.h"
#include "cli/Options.h"
#include "domains/Domain.h"
#include "domains/PostInstallDomain.h"
#include "base/RangeList.h"
#include "model/Model.h"

namespace bw {

void runPerModel(const Options& options, const ModelAction& action) {
  const std::vector<std::string> maskStates = options.domain_mask_states().value_or(std::vector<std::string>{});
  for (const std::unique_ptr<Model>& model : loadModels(options)) {
    std::unique_ptr<Domain> domain = Domain::domainWithSpec(domainSpec(options));
    std::unique_ptr<PostInstallDomain> postInstall;
    std::vector<Summarizer*> domains{domain.get()};
    if (options.exclude_post_install()) {
      postInstall = std::make_unique<PostInstallDomain>();
      domains.push_back(postInstall.get());
    }
    model->processEventsWithDomains(domains, feedsSummarizers(options));

    if (domain->ranges().empty()) continue;
    std::optional<std::vector<Range>> ranges = model->rangesForSubstates(maskStates, domain->ranges());
    if (!ranges || ranges->empty()) continue;
    if (postInstall && !postInstall->ranges().empty()) *ranges = subtractRanges(*ranges, postInstall->ranges());
    if (!ranges->empty()) action(*model, *ranges);
  }
}

}  // namespace bw
