#pragma once
// Arithmetic on lists of location/length ranges that are ascending and
// non-overlapping, as summarizers and domains keep them.
#include <cstdint>
#include <vector>

#include "base/Range.h"

namespace bw {

// Appends (location, length) to `ranges` unless the length is 0.
inline void addRangeLoc(std::vector<Range>& ranges, std::uint64_t location, std::uint64_t length) {
  if (length != 0) ranges.push_back(Range{location, length});
}

// The overlap of two lists, as a merge walk of intersectionRange: ranges
// that only touch leave a length-0 range at the touching point.
//   [(0,10), (20,10)] with [(10,10)] == [(10,0), (20,0)]
std::vector<Range> intersectRangeLists(const std::vector<Range>& a, const std::vector<Range>& b);

// Every part of a range of `a` that no range of `b` covers, in order. A
// range cut in the middle gives two pieces; empty pieces never appear.
//   [(0,400)] minus [(100,50)] == [(0,100), (150,250)]
//   [(100,50)] minus [(0,400)] == []
std::vector<Range> subtractRanges(const std::vector<Range>& a, const std::vector<Range>& b);

// The sum of the lengths; 0 for none.
std::uint64_t totalLength(const std::vector<Range>& ranges);

}  // namespace bw
