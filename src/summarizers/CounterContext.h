#pragma once
// A per-boot context of interpolators (one per key) fed with cumulative
// counters and levels. A counter that falls (a reset or wrap inside the
// boot) is carried on from the level it had reached: the time across the
// fall counts as no change, so deltas over any range are never negative.
// Samples (10, 100), (20, 150), (30, 20), (40, 70) are kept as
// (10, 100), (20, 150), (30, 150), (40, 200).
#include <cstdint>
#include <map>
#include <string>

#include "framework/SummarizerContext.h"

namespace bw {

class CounterContext : public InterpolatorContext {
 public:
  // Adds a cumulative counter's raw sample under `key`.
  void addCounter(const std::string& key, double raw, std::uint64_t position);
  // Adds a level (no carrying) under `key`.
  void addLevel(const std::string& key, double value, std::uint64_t position) {
    (*this)[key].addValue(value, position);
  }

  // valueAtPosition(end) - valueAtPosition(start) of the key's series; 0
  // when the key has no sample (nothing counted).
  double deltaInRange(const std::string& key, Range range) const;
  // The largest value of the key's series over [L, L + N]: the interpolated
  // ends and every sample between; NaN when the key has no sample.
  double maxInRange(const std::string& key, Range range) const;

 private:
  struct Carry {
    double lastRaw = 0;
    double offset = 0;
    bool seen = false;
  };
  std::map<std::string, Carry> carries_;
};

}  // namespace bw
