#include "model/ModelUsage.h"

#include "model/Model.h"
#include "summarizers/PowerSummary.h"
#include "summarizers/ProcessSummarizer.h"
#include "summarizers/ProcessSummary.h"

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

// The root summary without subjobs counts every process once; each job
// reports its own processes' CPU time and power score.
std::optional<ProcessFigures> ModelUsageInputs::processUsage(const std::vector<Range>& ranges) const {
  if (!model_.processes()) return std::nullopt;
  const std::unique_ptr<ProcessSummary> root = model_.summarizeProcessesIncludingSubjobs(false, ranges);
  ProcessFigures usage;
  usage.cpuSeconds = root->cpuTime() / 1e9;
  for (const auto& [key, job] : root->subprocesses()) {
    const std::string* label = job->label();
    usage.jobs.push_back(JobUsage{label ? *label : key, job->cpuTime() / 1e9, job->powerScore()});
  }
  return usage;
}

std::optional<std::string> ModelUsageInputs::build() const { return model_.systemVersion(); }

void summarizeUsage(Dictionary& usage, const std::vector<Range>& ranges, const Model& model) {
  usageSummarizer(model).summarizeUsage(usage, ranges, ModelUsageInputs(model));
}

void summarizeUsage(Dictionary& usage, const YearMonthDay& day, const std::vector<Range>& ranges, const Model& model) {
  usageSummarizer(model).summarizeUsage(usage, day, ranges, ModelUsageInputs(model));
}

}  // namespace bw
