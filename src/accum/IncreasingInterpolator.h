#pragma once
// An interpolator for a counter that never falls: it refuses a sample
// below the series' value at its position, or before its last position.
//
// Refusals throw kInvalidArgumentException and store nothing:
//   "new value < current value", user info "position" (uint64), "value"
//     and "current" (double);
//   "pos < maxPosition", user info "pos" and "maxPosition" (uint64).
// While `maxPosition()` is 0 (empty, or every sample at position 0) any
// sample is accepted unchecked. An equal value or position is accepted.
#include "accum/Interpolator.h"

namespace bw {

class IncreasingInterpolator : public Interpolator {
 public:
  static constexpr const char* kClassName = "IncreasingInterpolator";

  using Interpolator::Interpolator;

  void addValue(double value, std::uint64_t position) override;

 protected:
  const char* className() const override { return kClassName; }
};

}  // namespace bw
