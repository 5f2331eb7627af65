#include "summarizers/CPUSummary.h"

#include <cmath>
#include <limits>

namespace bw {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

double ratio(double numer, double denom) { return denom > 0 ? numer / denom : kNaN; }

}  // namespace

double averagePkgFrequencyGHz(const CPUSummary& s) {
  return ratio(s.avgPkgFrequencyNumer(), s.avgPkgFrequencyDenom()) / 1000;
}

double interruptRateHz(const CPUSummary& s) {
  return std::round(ratio(s.avgInterruptRateNumer(), s.avgInterruptRateDenom()) * 1000);
}

double cStateResidencyPercent(const CPUSummary& s) {
  return ratio(s.avgCStateResidencyNumer(), s.avgCStateResidencyDenom()) * 100;
}

double cStateLevelPercent(const CPUSummary& s, std::uint64_t level) {
  const auto& breakdown = s.avgCStateResidencyBreakdown();
  if (!breakdown) return kNaN;
  const auto it = breakdown->find(level);
  if (it == breakdown->end()) return kNaN;
  return ratio(it->second, s.avgCStateResidencyDenom()) * 100;
}

double backgroundQoSRatioPercent(const CPUSummary& s) {
  if (!(s.qosDenom() > 0)) return kNaN;
  return s.qosBgTime() / (s.qosDenom() - s.qosIdleTime()) * 100;
}

}  // namespace bw
