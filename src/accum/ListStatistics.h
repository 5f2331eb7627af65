#pragma once
// Statistics over a list of numbers and a predicate test over a list. Every
// element is read as a double.
//
//   list::sum({})           == 0
//   list::mean({})          is NaN
//   list::median({3, 1, 2}) == 2,  list::median({4, 1, 3, 2}) == 2.5
//   list::min({}), list::max({}) are NaN
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <ranges>
#include <vector>

namespace bw::list {

template <std::ranges::input_range R>
double sum(const R& list) {
  double total = 0;
  for (const auto& e : list) total += static_cast<double>(e);
  return total;
}

template <std::ranges::sized_range R>
double mean(const R& list) {
  if (std::ranges::size(list) == 0) return std::numeric_limits<double>::quiet_NaN();
  return sum(list) / static_cast<double>(std::ranges::size(list));
}

// The middle element of the sorted list, or the mean of the two middle
// ones for an even count. NaN elements sort after every number.
template <std::ranges::input_range R>
double median(const R& list) {
  std::vector<double> sorted;
  for (const auto& e : list) sorted.push_back(static_cast<double>(e));
  std::size_t c = sorted.size();
  if (c == 0) return std::numeric_limits<double>::quiet_NaN();
  std::sort(sorted.begin(), sorted.end(), [](double a, double b) {
    if (std::isnan(a)) return false;
    return std::isnan(b) || a < b;
  });
  if (c % 2 == 1) return sorted[(c + 1) / 2 - 1];
  return (sorted[c / 2] + sorted[c / 2 - 1]) * 0.5;
}

// Starts from the largest finite double and takes each smaller element, so
// a list of only +inf or NaN answers that largest double. NaN when empty.
template <std::ranges::input_range R>
double min(const R& list) {
  double result = std::numeric_limits<double>::max();
  bool any = false;
  for (const auto& e : list) {
    any = true;
    if (static_cast<double>(e) < result) result = static_cast<double>(e);
  }
  return any ? result : std::numeric_limits<double>::quiet_NaN();
}

// Mirror of `min`, starting from the most negative finite double.
template <std::ranges::input_range R>
double max(const R& list) {
  double result = std::numeric_limits<double>::lowest();
  bool any = false;
  for (const auto& e : list) {
    any = true;
    if (static_cast<double>(e) > result) result = static_cast<double>(e);
  }
  return any ? result : std::numeric_limits<double>::quiet_NaN();
}

// True when `predicate(element, index, stop)` holds for some element. The
// walk ends at the first that holds, or when the predicate sets `stop`.
template <std::ranges::input_range R, class P>
bool any(const R& list, P&& predicate) {
  std::size_t index = 0;
  bool stop = false;
  for (const auto& e : list) {
    if (predicate(e, index, stop)) return true;
    if (stop) break;
    ++index;
  }
  return false;
}

}  // namespace bw::list
