#pragma once
// What an aggregate asks of each of its member curves: the value at a
// position (linear between samples, held at the edges, NaN without samples)
// and the largest sample within a range of positions (NaN when none lies
// there). Interpolators answer it from their data set; a process answers it
// from its packed samples.
#include <cstdint>

#include "base/Range.h"

namespace bw {

class Curve {
 public:
  virtual ~Curve() = default;
  virtual double valueAtPosition(std::uint64_t position) const = 0;
  virtual double maxValueInRange(Range range) const = 0;
};

}  // namespace bw
