#include "summarizers/CounterContext.h"

#include <cmath>
#include <limits>

namespace bw {

void CounterContext::addCounter(const std::string& key, double raw, std::uint64_t position) {
  Carry& carry = carries_[key];
  if (carry.seen && raw < carry.lastRaw) carry.offset += carry.lastRaw - raw;
  carry.lastRaw = raw;
  carry.seen = true;
  (*this)[key].addValue(raw + carry.offset, position);
}

double CounterContext::deltaInRange(const std::string& key, Range range) const {
  const Interpolator* series = find(key);
  if (!series || series->dataSet().count() == 0) return 0;
  return series->deltaInRange(range);
}

double CounterContext::maxInRange(const std::string& key, Range range) const {
  const Interpolator* series = find(key);
  if (!series || series->dataSet().count() == 0) return std::numeric_limits<double>::quiet_NaN();
  double best = std::fmax(series->valueAtPosition(range.location), series->valueAtPosition(range.end()));
  // Samples in [L, L + N); the end itself is covered by its interpolated value.
  const double inside = series->maxValueInRange(range);
  return std::isnan(inside) ? best : std::fmax(best, inside);
}

}  // namespace bw
