#pragma once
// (position, value) samples kept sorted by position, with statistics over
// ranges of positions. Interpolators keep their samples in one.
//
// Samples nearly always arrive in ascending position: a sample at or past
// `maxPosition()` is appended without searching, an earlier one is inserted
// at its binary-search place. Equal positions are never merged. Every
// lookup is a binary search; statistics cost one pass over the samples that
// lie in the asked range.
#include <cstdint>
#include <functional>
#include <limits>
#include <string>
#include <vector>

#include "base/Range.h"

namespace bw {

// One sample handed back by `DataSet::dataPoints`.
struct DataPoint {
  std::uint64_t position = 0;
  double value = 0;
};

class DataSet {
 public:
  // Location of `indexRangeForRange` when the set is empty.
  static constexpr std::uint64_t kNotFound = std::numeric_limits<std::int64_t>::max();

  DataSet() = default;

  // Appends when `position >= maxPosition()`, otherwise inserts in order
  // (before any sample already at that position). Either way
  // `previousPosition()` becomes `position`.
  void addValue(double value, std::uint64_t position);

  // Insertion index: the first sample at `position` if there is one, else
  // the first larger one, else the count.
  std::uint64_t indexForPosition(std::uint64_t position) const;

  // Indexes of the samples with L <= position < L + N, as (first, count).
  // An empty set answers (kNotFound, 0). With no sample in range the count
  // is 0 and the location only roughly where such samples would be: over
  // 10, 20, 30, (10, 20) gives (0, 2), (11, 9) gives (2, 0), (40, 5) gives
  // (3, 0). A range whose end wraps past 2^64 selects nothing.
  Range indexRangeForRange(Range range) const;

  // Calls `visitor(position, value)` for each sample of `indexRangeForRange`,
  // in ascending order.
  void enumerateValuesInRange(Range range, const std::function<void(std::uint64_t, double)>& visitor) const;
  std::vector<double> valuesInRange(Range range) const;

  // Statistics over the samples in the range; NaN when there is none.
  double maxValueInRange(Range range) const;
  double minValueInRange(Range range) const;
  double meanValueInRange(Range range) const;
  double medianValueInRange(Range range) const;
  // Each value weighted by the time since the previous sample (or since the
  // range start for the first). With total weight 0 the answer is NaN,
  // except for a single sample, which answers its own value.
  double weightedMeanValueInRange(Range range) const;

  // The range forms over the positions (0, count): a range of positions,
  // not of indexes, so only samples at positions below the count count.
  double maxValue() const;
  double minValue() const;
  double meanValue() const;

  // The value of a sample standing at `position` (the first of several),
  // NaN when none stands there. Throws kRangeException when `position` is
  // past the last sample or the set is empty: ask only for known positions.
  double valueAtPosition(std::uint64_t position) const;

  // Chooses up to two samples around `position` (see the rules in the .cc),
  // writes them in ascending order into `points` and answers how many.
  // `approach` < 0 looks before the position, > 0 after, 0 around it;
  // `hold` lets a position outside the samples take the edge sample.
  int dataPoints(DataPoint points[2], std::uint64_t position, std::int32_t approach, bool hold) const;

  // First stored position; throws kRangeException on an empty set.
  std::uint64_t minPosition() const;
  // Largest position ever added; 0 while empty.
  std::uint64_t maxPosition() const { return maxPosition_; }
  // Position of the most recent `addValue`, wherever it went; 0 when empty.
  std::uint64_t previousPosition() const { return previousPosition_; }
  void setPreviousPosition(std::uint64_t p) { previousPosition_ = p; }

  std::size_t count() const { return positions_.size(); }
  const std::vector<std::uint64_t>& positions() const { return positions_; }
  // Replacing the lists keeps `maxPosition()`; the caller keeps them sorted
  // and of equal length.
  void setPositions(std::vector<std::uint64_t> positions) { positions_ = std::move(positions); }
  const std::vector<double>& values() const { return values_; }
  void setValues(std::vector<double> values) { values_ = std::move(values); }
  // Kept for the holder; the data set never fills it.
  const std::vector<Range>& continuousRanges() const { return continuousRanges_; }
  std::vector<Range>& continuousRanges() { return continuousRanges_; }
  void setContinuousRanges(std::vector<Range> ranges) { continuousRanges_ = std::move(ranges); }

  // Gives back the lists' spare capacity, for sets that are complete.
  void shrinkToFit() {
    positions_.shrink_to_fit();
    values_.shrink_to_fit();
    continuousRanges_.shrink_to_fit();
  }

  // "<DataSet: ADDRESS <(" then one "POSITION, VALUE" line per sample, the
  // value printed as an unsigned integer, then ")>>".
  std::string debugDescription() const;

 private:
  std::uint64_t maxPosition_ = 0;
  std::vector<std::uint64_t> positions_;
  std::vector<double> values_;
  std::vector<Range> continuousRanges_;
  std::uint64_t previousPosition_ = 0;
};

}  // namespace bw
