#pragma once
// Reading a double as an unsigned 64-bit count, as the accumulators do when
// they keep whole numbers only or print a value as an integer.
#include <cmath>
#include <cstdint>

namespace bw {

// Truncates toward zero. Negative values and NaN read as 0 and values of
// 2^64 or more as the largest count, so that no input is undefined.
inline std::uint64_t truncateToUnsigned(double v) {
  if (!(v > 0)) return 0;
  if (v >= 18446744073709551616.0) return UINT64_MAX;
  return static_cast<std::uint64_t>(v);
}

}  // namespace bw
