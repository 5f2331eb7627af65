#include "cli/EmptyResult.h"

#include <algorithm>
#include <limits>

#include "base/Console.h"
#include "base/Terminal.h"
#include "cli/Options.h"
#include "domains/WallTimeText.h"
#include "model/Model.h"

namespace bw {

namespace {

constexpr std::uint64_t kOpenEnd = std::numeric_limits<std::uint64_t>::max();

std::string askedRange(const Options& options) {
  switch (options.domain_type()) {
    case kDomainDate:
      return format("on %04u-%02u-%02u", options.domain_ymd_year(), options.domain_ymd_month(),
                    options.domain_ymd_day());
    case kDomainWallTime:
      if (options.domain_end() == kOpenEnd) return "from " + formatWallTime(options.domain_start()) + " on";
      if (options.domain_start() == 0) return "until " + formatWallTime(options.domain_end());
      return "from " + formatWallTime(options.domain_start()) + " to " + formatWallTime(options.domain_end());
    case kDomainRelative:
      return format("at timeline positions %llu to %llu", static_cast<unsigned long long>(options.domain_start()),
                    static_cast<unsigned long long>(options.domain_end()));
    default:
      return "in all the data";
  }
}

std::string dataSpan(const Options& options, const std::vector<std::unique_ptr<Model>>& models) {
  if (options.domain_type() == kDomainRelative) {
    std::uint64_t longest = 0;
    for (const auto& model : models) longest = std::max(longest, model->timeline().duration());
    return format("timeline positions 0 to %llu", static_cast<unsigned long long>(longest));
  }
  std::uint64_t first = kOpenEnd;
  std::uint64_t last = 0;
  for (const auto& model : models) {
    first = std::min(first, model->timeline().startWallTime());
    last = std::max(last, model->timeline().endWallTime());
  }
  if (first == kOpenEnd || last == 0) return "no wall-clock time";
  return formatWallTime(first) + " to " + formatWallTime(last);
}

std::string joined(const std::vector<std::string>& names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) text += (i ? "," : "") + names[i];
  return text;
}

}  // namespace

std::string emptyResultText(const Options& options, const std::vector<std::unique_ptr<Model>>& models,
                            EmptyStage stage) {
  if (stage == EmptyStage::kNoRecords || models.empty()) {
    if (options.only_system_version())
      return "nothing to show: no stats file is of build " + *options.only_system_version();
    if (options.only_boot_uuid())
      return "nothing to show: no stats file is of boot " + options.only_boot_uuid()->string();
    return "nothing to show: no records were read";
  }
  const std::string span = "; the data covers " + dataSpan(options, models);
  switch (stage) {
    case EmptyStage::kNoStateTime:
      return "nothing to show: the states " +
             joined(options.domain_mask_states().value_or(std::vector<std::string>{})) + " never held together " +
             askedRange(options) + span;
    case EmptyStage::kOnlyPostInstall:
      return "nothing to show: all of the sample range " + askedRange(options) + " is post-install time" + span;
    default:
      return "nothing to show: no records " + askedRange(options) + span;
  }
}

void noteEmptyResult(const Options& options, const std::vector<std::unique_ptr<Model>>& models, EmptyStage stage) {
  if (!errIsTerminal()) return;
  terminalNote(emptyResultText(options, models, stage));
}

}  // namespace bw
