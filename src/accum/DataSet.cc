#include "accum/DataSet.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

#include "accum/ListStatistics.h"
#include "accum/WholeNumber.h"
#include "base/Console.h"
#include "base/Exception.h"

namespace bw {

namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

[[noreturn]] void throwBeyondBounds(std::uint64_t index, std::uint64_t count) {
  std::string reason = count == 0
                           ? format("index %llu beyond bounds for empty list", static_cast<unsigned long long>(index))
                           : format("index %llu beyond bounds [0 .. %llu]", static_cast<unsigned long long>(index),
                                    static_cast<unsigned long long>(count - 1));
  throw Exception(kRangeException, reason, {{"index", index}, {"count", count}});
}

}  // namespace

void DataSet::addValue(double value, std::uint64_t position) {
  if (maxPosition_ <= position) {
    maxPosition_ = position;
    positions_.push_back(position);
    values_.push_back(value);
  } else {
    auto i = static_cast<std::ptrdiff_t>(indexForPosition(position));
    positions_.insert(positions_.begin() + i, position);
    values_.insert(values_.begin() + i, value);
  }
  previousPosition_ = position;
}

std::uint64_t DataSet::indexForPosition(std::uint64_t position) const {
  return static_cast<std::uint64_t>(std::lower_bound(positions_.begin(), positions_.end(), position) -
                                    positions_.begin());
}

Range DataSet::indexRangeForRange(Range range) const {
  const std::int64_t n = static_cast<std::int64_t>(positions_.size());
  if (n == 0) return Range{kNotFound, 0};
  const std::uint64_t begin = range.location;
  const std::uint64_t end = range.location + range.length;
  if (end < begin) return Range{indexForPosition(begin), 0};
  const auto outside = [&](std::int64_t i) {
    return positions_[static_cast<std::size_t>(i)] < begin || positions_[static_cast<std::size_t>(i)] >= end;
  };
  const auto a = static_cast<std::int64_t>(indexForPosition(begin));
  const auto b = std::min(static_cast<std::int64_t>(indexForPosition(end)), n - 1);
  const std::int64_t k = b - a;  // -1 when every sample lies before the range
  bool dropFirst = false;
  if (k != -1) dropFirst = outside(a);
  const std::int64_t m = k + (dropFirst ? 0 : 1);
  bool dropLast = false;
  if (m > 0) dropLast = outside(b);
  const std::int64_t length = m - (dropLast ? 1 : 0);
  const auto location = static_cast<std::uint64_t>(a + (dropFirst ? 1 : 0));
  return Range{location, static_cast<std::uint64_t>(length)};
}

void DataSet::enumerateValuesInRange(Range range, const std::function<void(std::uint64_t, double)>& visitor) const {
  Range indexes = indexRangeForRange(range);
  if (indexes.location == kNotFound) return;
  for (std::uint64_t i = indexes.location; i < indexes.end(); ++i) visitor(positions_[i], values_[i]);
}

std::vector<double> DataSet::valuesInRange(Range range) const {
  Range indexes = indexRangeForRange(range);
  if (indexes.location == kNotFound) return {};
  return std::vector<double>(values_.begin() + static_cast<std::ptrdiff_t>(indexes.location),
                             values_.begin() + static_cast<std::ptrdiff_t>(indexes.end()));
}

double DataSet::maxValueInRange(Range range) const {
  double result = kNaN;
  enumerateValuesInRange(range, [&](std::uint64_t, double v) {
    if (v > result || std::isnan(result)) result = v;
  });
  return result;
}

double DataSet::minValueInRange(Range range) const {
  double result = kNaN;
  enumerateValuesInRange(range, [&](std::uint64_t, double v) {
    if (v < result || std::isnan(result)) result = v;
  });
  return result;
}

double DataSet::meanValueInRange(Range range) const {
  double sum = 0;
  std::uint64_t count = 0;
  enumerateValuesInRange(range, [&](std::uint64_t, double v) {
    sum += v;
    ++count;
  });
  return count == 0 ? kNaN : sum / static_cast<double>(count);
}

double DataSet::medianValueInRange(Range range) const { return list::median(valuesInRange(range)); }

double DataSet::weightedMeanValueInRange(Range range) const {
  std::uint64_t previous = range.location;
  double weightedSum = 0;
  std::uint64_t totalWeight = 0;
  std::uint64_t count = 0;
  double single = kNaN;
  enumerateValuesInRange(range, [&](std::uint64_t p, double v) {
    std::uint64_t weight = p - previous;
    previous = p;
    weightedSum += static_cast<double>(weight) * v;
    totalWeight += weight;
    ++count;
    single = v;
  });
  if (totalWeight == 0) return count == 1 ? single : kNaN;
  return weightedSum / static_cast<double>(totalWeight);
}

double DataSet::maxValue() const { return maxValueInRange(Range{0, count()}); }
double DataSet::minValue() const { return minValueInRange(Range{0, count()}); }
double DataSet::meanValue() const { return meanValueInRange(Range{0, count()}); }

double DataSet::valueAtPosition(std::uint64_t position) const {
  std::uint64_t i = indexForPosition(position);
  if (i >= positions_.size()) throwBeyondBounds(i, positions_.size());
  return positions_[i] == position ? values_[i] : kNaN;
}

// The rules, tried in order, with n samples and i the insertion index:
//   1. a sample at the position itself: that one;
//   2. no samples: none;
//   3. approach < 0 and i >= 2: the two samples before the position;
//   4. approach = 0 and 0 < i < n: the samples on either side;
//   5. approach > 0 and i < n - 1: the two samples from i on;
//   6. not holding: none;
//   7. holding: the last sample when the position lies after it (approach
//      <= 0), the first when it lies before it (approach >= 0), else none.
int DataSet::dataPoints(DataPoint points[2], std::uint64_t position, std::int32_t approach, bool hold) const {
  const std::size_t n = positions_.size();
  const std::size_t i = indexForPosition(position);
  const auto take = [&](int slot, std::size_t index) { points[slot] = DataPoint{positions_[index], values_[index]}; };
  if (i < n && positions_[i] == position) {
    take(0, i);
    return 1;
  }
  if (n == 0) return 0;
  std::size_t first;
  if (approach < 0 && i >= 2) {
    first = i - 2;
  } else if (approach == 0 && i > 0 && i < n) {
    first = i - 1;
  } else if (approach > 0 && i + 1 < n) {
    first = i;
  } else {
    if (!hold) return 0;
    if (approach <= 0 && i == n) {
      take(0, n - 1);
      return 1;
    }
    if (approach >= 0 && i == 0) {
      take(0, 0);
      return 1;
    }
    return 0;
  }
  take(0, first);
  take(1, first + 1);
  return 2;
}

std::uint64_t DataSet::minPosition() const {
  if (positions_.empty()) throwBeyondBounds(0, 0);
  return positions_[0];
}

std::string DataSet::debugDescription() const {
  std::string text = format("<%s: %p <(\n", "DataSet", static_cast<const void*>(this));
  for (std::size_t i = 0; i < positions_.size() && i < values_.size(); ++i) {
    text += format("%lu, %lu\n", static_cast<unsigned long>(positions_[i]),
                   static_cast<unsigned long>(truncateToUnsigned(values_[i])));
  }
  text += "\n)>>";
  return text;
}

}  // namespace bw
