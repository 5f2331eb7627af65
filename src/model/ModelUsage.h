#pragma once
// The usage summary of a model: the model answers the usage summarizer's
// questions (state ranges, battery charge change, wall times, processes),
// and summarizeUsage updates the usage file's dictionary through the
// model's "Usage" summarizer.
#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"
#include "summarizers/UsageSummarizer.h"

namespace bw {

class Model;

class ModelUsageInputs : public UsageInputs {
 public:
  explicit ModelUsageInputs(const Model& model) : model_(model) {}

  // rangesForSubstates; none when a key has no summarizer.
  std::optional<std::vector<Range>> rangesForStates(const std::vector<std::string>& keys,
                                                    const std::vector<Range>& ranges) const override;
  // The "Power" summary's deltaCharge.
  std::optional<double> chargeChange(const std::vector<Range>& ranges) const override;
  std::uint64_t wallTimeForRelative(std::uint64_t position) const override;
  // The root process summary's CPU seconds and each job's label, CPU
  // seconds and power score; none without a "Processes" summarizer.
  std::optional<ProcessFigures> processUsage(const std::vector<Range>& ranges) const override;
  // The model's system version.
  std::optional<std::string> build() const override;

 protected:
  const Model& model_;
};

// Updates `usage` with the day that `ranges` cover (or the day given).
void summarizeUsage(Dictionary& usage, const std::vector<Range>& ranges, const Model& model);
void summarizeUsage(Dictionary& usage, const YearMonthDay& day, const std::vector<Range>& ranges, const Model& model);

}  // namespace bw
