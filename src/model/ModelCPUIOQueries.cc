// The model's queries over the processor and I/O summaries.
#include <limits>

#include "model/Model.h"
#include "summarizers/CPUSummary.h"
#include "summarizers/IOSummary.h"

namespace bw {

std::vector<std::unique_ptr<Summary>> Model::sortedCPUSummariesInRanges(const std::vector<Range>& ranges) const {
  return summarizeTop("CPU", ranges, [](const Summary& s) {
    return static_cast<const CPUSummary&>(s).avgCStateResidencyDenom() >= 60000.0;
  });
}

std::vector<std::unique_ptr<Summary>> Model::sortedIOSummariesInRanges(const std::vector<Range>& ranges) const {
  return summarizeTop("IO", ranges, [](const Summary& s) { return s.duration() != 0; });
}

double Model::averageCStateResidencyForRanges(const std::vector<Range>& ranges) const {
  const std::unique_ptr<Summary> summary = summarize("CPU", ranges);
  const auto& cpu = static_cast<const CPUSummary&>(*summary);
  if (cpu.avgCStateResidencyDenom() < 60.0) return std::numeric_limits<double>::quiet_NaN();
  return cpu.avgCStateResidencyNumer() / cpu.avgCStateResidencyDenom() * 100;
}

double Model::averageCStateResidencyForState(const std::vector<std::string>& keys,
                                             const std::vector<Range>& ranges) const {
  return averageCStateResidencyForRanges(rangesForSubstates(keys, ranges).value_or(std::vector<Range>{}));
}

}  // namespace bw
