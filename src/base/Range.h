#pragma once
// A location/length pair: a half-open stretch [location, location + length)
// of positions or ticks.
#include <algorithm>
#include <cstdint>

namespace bw {

struct Range {
  std::uint64_t location = 0;
  std::uint64_t length = 0;

  std::uint64_t end() const { return location + length; }
  // Whether `p` lies in [location, location + length).
  bool contains(std::uint64_t p) const { return p >= location && p - location < length; }

  friend bool operator==(const Range&, const Range&) = default;
};

// The overlap of two ranges. Disjoint ranges give (0, 0); ranges that only
// touch give a length-0 range at the touching point, which is not (0, 0).
inline Range intersectionRange(const Range& a, const Range& b) {
  if (a.location + a.length < b.location || b.location + b.length < a.location) return Range{0, 0};
  std::uint64_t location = std::max(a.location, b.location);
  return Range{location, std::min(a.location + a.length, b.location + b.length) - location};
}

}  // namespace bw
