#include "model/ModelUsage.h"

#include "model/Model.h"
#include "summarizers/PowerSummary.h"

namespace bw {
namespace {

const UsageSummarizer& usageSummarizer(const Model& model) {
  static const UsageSummarizer standalone;
  const auto* own = dynamic_cast<const UsageSummarizer*>(model.summarizer("Usage"));
  return own ? *own : standalone;
}

}  // namespace

std::optional<std::vector<Range>> ModelUsageInputs::rangesForStates(const std::vector<std::string>& keys,
                                                                    const std::vector<Range>& ranges) const {
  for (const std::string& key : keys) {
    if (!model_.summarizer(key)) return std::nullopt;
  }
  return model_.rangesForSubstates(keys, ranges);
}

std::optional<double> ModelUsageInputs::chargeChange(const std::vector<Range>& ranges) const {
  if (!model_.summarizer("Power")) return std::nullopt;
  const std::unique_ptr<Summary> power = model_.summarize("Power", ranges);
  return static_cast<const PowerSummary&>(*power).deltaCharge();
}

std::uint64_t ModelUsageInputs::wallTimeForRelative(std::uint64_t position) const {
  return model_.wallTimeForRelative(position);
}

// Process accounting is not part of the model yet: without it there are no
// CPU seconds or job power scores, and the usage file leaves "CPUTime" and
// "TopJobs" out rather than writing zeros.
std::optional<ProcessUsage> ModelUsageInputs::processUsage(const std::vector<Range>&) const { return std::nullopt; }

void summarizeUsage(Dictionary& usage, const std::vector<Range>& ranges, const Model& model) {
  usageSummarizer(model).summarizeUsage(usage, ranges, ModelUsageInputs(model));
}

void summarizeUsage(Dictionary& usage, const YearMonthDay& day, const std::vector<Range>& ranges, const Model& model) {
  usageSummarizer(model).summarizeUsage(usage, day, ranges, ModelUsageInputs(model));
}

}  // namespace bw
