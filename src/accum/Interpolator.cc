#include "accum/Interpolator.h"

#include <cmath>
#include <limits>

#include "accum/WholeNumber.h"
#include "base/Console.h"

namespace bw {

Interpolator::Interpolator(WithZero) { store(0, 0); }

void Interpolator::addValue(double value, std::uint64_t position) { store(value, position); }

void Interpolator::store(double value, std::uint64_t position) {
  dataSet_.addValue(static_cast<double>(truncateToUnsigned(value)), position);
}

double Interpolator::valueAtPosition(std::uint64_t position) const {
  return interpolateValueAtPosition(position, 0, true);
}

double Interpolator::interpolateValueAtPosition(std::uint64_t position, std::int32_t approach, bool hold) const {
  DataPoint points[2];
  switch (dataSet_.dataPoints(points, position, approach, hold)) {
    case 0:
      return std::numeric_limits<double>::quiet_NaN();
    case 1:
      return points[0].value;
    default:
      return lineValue(points[0], points[1], position);
  }
}

double Interpolator::lineValue(const DataPoint& a, const DataPoint& b, std::uint64_t position) {
  double slope = (b.value - a.value) / static_cast<double>(b.position - a.position);
  if (a.position <= position) return a.value + slope * static_cast<double>(position - a.position);
  return a.value - slope * static_cast<double>(a.position - position);
}

void Interpolator::extrapolateValueAtPosition(std::uint64_t position) {
  std::int32_t approach = position > maxPosition() ? -1 : 1;
  double value = interpolateValueAtPosition(position, approach, false);
  if (!std::isnan(value)) addValue(value, position);
}

double Interpolator::deltaInRange(Range range) const {
  return valueAtPosition(range.location + range.length) - valueAtPosition(range.location);
}

std::string Interpolator::debugDescription() const {
  return format("<%s: %p <(\n_dataSet = %s\n)>>", className(), static_cast<const void*>(this),
                dataSet_.debugDescription().c_str());
}

}  // namespace bw
