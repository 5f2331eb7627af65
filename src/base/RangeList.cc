#include "base/RangeList.h"

#include <algorithm>

namespace bw {

std::vector<Range> intersectRangeLists(const std::vector<Range>& a, const std::vector<Range>& b) {
  std::vector<Range> result;
  std::size_t i = 0, j = 0;
  while (i < a.size() && j < b.size()) {
    const Range overlap = intersectionRange(a[i], b[j]);
    if (!(overlap == Range{0, 0})) result.push_back(overlap);
    if (a[i].end() >= b[j].end()) {
      ++j;
    } else {
      ++i;
    }
  }
  return result;
}

std::vector<Range> subtractRanges(const std::vector<Range>& a, const std::vector<Range>& b) {
  std::vector<Range> result;
  std::size_t first = 0;  // the first range of b that may still reach a range of a
  for (const Range& range : a) {
    std::uint64_t cursor = range.location;
    const std::uint64_t end = range.end();
    while (first < b.size() && b[first].end() <= cursor) ++first;
    for (std::size_t k = first; k < b.size() && b[k].location < end && cursor < end; ++k) {
      if (b[k].length == 0) continue;
      if (b[k].location > cursor) addRangeLoc(result, cursor, b[k].location - cursor);
      cursor = std::max(cursor, b[k].end());
    }
    if (cursor < end) addRangeLoc(result, cursor, end - cursor);
  }
  return result;
}

std::uint64_t totalLength(const std::vector<Range>& ranges) {
  std::uint64_t total = 0;
  for (const Range& range : ranges) total += range.length;
  return total;
}

}  // namespace bw
