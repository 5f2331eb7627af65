#pragma once
// Arithmetic on lists of location/length ranges that are ascending and
// non-overlapping, as domains and summarizers keep them. Appending a single
// non-empty range is `addRangeLoc` (accum/ListStatistics.h).
#include <cstdint>
#include <vector>

#include "base/Range.h"

namespace bw {

// Every part of a range of `a` that no range of `b` covers, in order. A
// range cut in the middle gives two pieces; empty pieces never appear.
//   [(0,400)] minus [(100,50)] == [(0,100), (150,250)]
//   [(100,50)] minus [(0,400)] == []
std::vector<Range> subtractRanges(const std::vector<Range>& a, const std::vector<Range>& b);

// The sum of the lengths; 0 for none.
std::uint64_t totalLength(const std::vector<Range>& ranges);

}  // namespace bw
