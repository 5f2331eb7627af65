#pragma once
// Samples of one quantity within one boot (a cumulative counter or a
// level), answering its value at a position and its change over a range by
// linear interpolation between samples.
//
// Values are stored as whole numbers: a sample is truncated toward zero
// before it is kept (3.7 is stored as 3), negative values as 0. With
// samples (0, 0) and (10, 100): valueAtPosition(5) == 50, (20) == 100
// (held at the edge); extrapolateValueAtPosition(20) adds (20, 200).
// Every query is a binary search over the samples.
#include <cstdint>
#include <string>
#include <vector>

#include "accum/Curve.h"
#include "accum/DataSet.h"
#include "base/Range.h"

namespace bw {

// Selects the constructor that starts a series with the sample (0, 0).
struct WithZero {};
inline constexpr WithZero kWithZero{};

class Interpolator : public Curve {
 public:
  static constexpr const char* kClassName = "Interpolator";

  Interpolator() = default;
  // Holding the one sample (0, 0).
  explicit Interpolator(WithZero);
  ~Interpolator() override = default;
  Interpolator(const Interpolator&) = default;
  Interpolator& operator=(const Interpolator&) = default;
  Interpolator(Interpolator&&) = default;
  Interpolator& operator=(Interpolator&&) = default;

  // Stores `value` truncated to a whole number at `position`, in position
  // order; a repeated position gives a second sample beside the first.
  virtual void addValue(double value, std::uint64_t position);

  // Linear between samples, the edge sample's value outside them; NaN only
  // when there is no sample.
  double valueAtPosition(std::uint64_t position) const override;
  // The line through the samples that `DataSet::dataPoints` chooses for
  // (position, approach, hold), extended to `position` on either side;
  // one chosen sample gives its value, none gives NaN.
  double interpolateValueAtPosition(std::uint64_t position, std::int32_t approach, bool hold) const;
  // The value at `position` on the line through samples `a` and `b`.
  static double lineValue(const DataPoint& a, const DataPoint& b, std::uint64_t position);
  // Adds the value of the line through the last two samples (past the end)
  // or the two samples at or after `position` (otherwise), when there is
  // one, through `addValue` (so checks and truncation apply).
  void extrapolateValueAtPosition(std::uint64_t position);
  // valueAtPosition(L + N) - valueAtPosition(L).
  double deltaInRange(Range range) const;

  // The data set's statistics (see DataSet).
  double maxValue() const { return dataSet_.maxValue(); }
  double maxValueInRange(Range range) const override { return dataSet_.maxValueInRange(range); }
  double meanValueInRange(Range range) const { return dataSet_.meanValueInRange(range); }
  double medianValueInRange(Range range) const { return dataSet_.medianValueInRange(range); }
  double weightedMeanValueInRange(Range range) const { return dataSet_.weightedMeanValueInRange(range); }
  std::vector<double> valuesInRange(Range range) const { return dataSet_.valuesInRange(range); }

  // Largest position added, 0 while empty.
  std::uint64_t maxPosition() const { return dataSet_.maxPosition(); }
  // First sample's position; throws kRangeException while empty.
  std::uint64_t minPosition() const { return dataSet_.minPosition(); }
  const DataSet& dataSet() const { return dataSet_; }
  // Gives back spare sample capacity once no more samples will come.
  void shrinkToFit() { dataSet_.shrinkToFit(); }

  // "<CLASS: ADDRESS <(\n_dataSet = DATASET\n)>>"
  std::string debugDescription() const;

 protected:
  virtual const char* className() const { return kClassName; }
  // Truncates and stores, without checks.
  void store(double value, std::uint64_t position);

 private:
  DataSet dataSet_;
};

}  // namespace bw
