// The binary searches and prefix tables must give the answers of the plain
// walks they replace. These tests run random inputs through both: the
// references below are simple loops over every sample or event.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "Support.h"
#include "accum/Interpolator.h"
#include "accum/Ledger.h"
#include "accum/SawtoothInterpolator.h"

namespace bw {
namespace {

using Points = std::vector<std::pair<std::uint64_t, double>>;
using test::expectSame;

std::uint64_t referenceTime(const std::vector<std::uint64_t>& credits, const std::vector<std::uint64_t>& debits,
                            Range range) {
  const std::uint64_t kInf = UINT64_MAX, L = range.location, e = range.location + range.length;
  if ((!credits.empty() && credits[0] > e) || (credits.empty() && debits.empty())) return 0;
  std::int64_t level = 0;
  std::uint64_t open = L, total = 0;
  for (std::size_t ci = 0, di = 0; ci < credits.size() || di < debits.size();) {
    const std::uint64_t c = ci < credits.size() ? credits[ci] : kInf, d = di < debits.size() ? debits[di] : kInf;
    if (c < d) {
      if (level++ == 0) open = std::max(c, L);
      ++ci;
      continue;
    }
    if (level == 1 || d > e) {
      if (d > L) total += std::min(d, e) - open;
      if (c > e) return total;
    }
    --level;
    ++di;
  }
  return level >= 1 && open < e ? total + (e - open) : total;
}

// Chosen samples for (p, approach, hold), by counting instead of searching.
Points referencePoints(const Points& s, std::uint64_t p, int approach, bool hold) {
  std::size_t n = s.size(), i = 0;
  while (i < n && s[i].first < p) ++i;
  if (i < n && s[i].first == p) return {s[i]};
  if (n == 0) return {};
  if (approach < 0 && i >= 2) return {s[i - 2], s[i - 1]};
  if (approach == 0 && i > 0 && i < n) return {s[i - 1], s[i]};
  if (approach > 0 && i + 1 < n) return {s[i], s[i + 1]};
  if (hold && approach <= 0 && i == n) return {s[n - 1]};
  if (hold && approach >= 0 && i == 0) return {s[0]};
  return {};
}

double referenceValue(const Points& s, std::uint64_t p, int approach = 0, bool hold = true) {
  Points pts = referencePoints(s, p, approach, hold);
  if (pts.size() < 2) return pts.empty() ? NAN : pts[0].second;
  const auto [x0, y0] = pts[0];
  const double slope = (pts[1].second - y0) / static_cast<double>(pts[1].first - x0);
  return x0 <= p ? y0 + slope * static_cast<double>(p - x0) : y0 - slope * static_cast<double>(x0 - p);
}

double referenceSlope(const std::vector<Points>& segments, std::uint64_t a, std::uint64_t b) {
  if (a == b) return 0;
  double delta = 0;
  std::uint64_t time = 0;
  for (std::size_t j = 0; j < segments.size(); ++j) {
    const Points& s = segments[j];
    const std::uint64_t lo = s.front().first, hi = s.back().first;
    if (a > hi) continue;
    if (b < lo) break;
    const bool last = j + 1 == segments.size();
    const std::uint64_t y = b > hi && !last ? hi : b;  // only the last segment's line runs on past its end
    delta += (b > hi && last ? referenceValue(s, b, -1, false) : referenceValue(s, y)) - referenceValue(s, a);
    time += y - std::max(a, lo);
  }
  return delta / static_cast<double>(time);
}

// Whole numbers from 0 to n, both included.
auto randomBelow(unsigned seed) {
  return [engine = std::mt19937_64(seed)](std::uint64_t n) mutable {
    return std::uniform_int_distribution<std::uint64_t>(0, n)(engine);
  };
}

// Random events, mostly ascending, sometimes back in time; queries while
// they arrive and after them.
TEST(ReferenceComparison, LedgerTimeAndValueMatchTheEventWalk) {
  auto below = randomBelow(7);
  auto check = [&](const Ledger& ledger, Range r, std::uint64_t p) {
    ASSERT_EQ(ledger.timeValueWasGreaterThanZeroOverRange(r), referenceTime(ledger.credits(), ledger.debits(), r))
        << "range " << r.location << "+" << r.length;
    const auto credits = std::ranges::count_if(ledger.credits(), [p](auto c) { return c <= p; });
    const auto debits = std::ranges::count_if(ledger.debits(), [p](auto d) { return d <= p; });
    ASSERT_EQ(ledger.valueAtPosition(p), static_cast<std::uint64_t>(std::max<std::ptrdiff_t>(credits - debits, 0)));
  };
  auto list = [&] { return below(1) ? Ledger::List::Credits : Ledger::List::Debits; };
  for (int round = 0; round < 3000; ++round) {
    SCOPED_TRACE(round);
    Ledger ledger;
    std::uint64_t position = 0;
    for (int k = 0, events = static_cast<int>(below(16)); k < events; ++k) {
      position = below(5) == 0 ? below(position) : position + below(6);
      ledger.addTo(list(), position);
      if (below(3) == 0) check(ledger, Range{below(60), below(60)}, below(60));
    }
    check(ledger, Range{below(80), UINT64_MAX - below(3)}, 0);  // the end wraps
    for (int q = 0; q < 20; ++q) check(ledger, Range{below(80), below(80)}, below(80));
  }
}

TEST(ReferenceComparison, DataSetIndexesAndInterpolatedValuesMatchPlainScans) {
  auto below = randomBelow(3);
  for (int round = 0; round < 2000; ++round) {
    SCOPED_TRACE(round);
    Interpolator interpolator;
    Points stored;
    for (int k = 0, n = static_cast<int>(below(10)); k < n; ++k) {
      const std::uint64_t p = below(40);
      const double v = static_cast<double>(below(1000)) / 4;  // stored truncated
      interpolator.addValue(v, p);
      // Inserted before equal positions unless at or past the largest.
      auto at = std::lower_bound(stored.begin(), stored.end(), std::make_pair(p, -1.0));
      stored.insert(stored.empty() || p >= stored.back().first ? stored.end() : at, {p, std::trunc(v)});
    }
    for (int q = 0; q < 20; ++q) {
      const Range r{below(45), below(20)}, indexes = interpolator.dataSet().indexRangeForRange(r);
      std::vector<std::size_t> inside;
      for (std::size_t i = 0; i < stored.size(); ++i)
        if (stored[i].first >= r.location && stored[i].first < r.end()) inside.push_back(i);
      ASSERT_EQ(indexes.length, inside.size());
      ASSERT_TRUE(inside.empty() || indexes.location == inside.front());
      const std::uint64_t p = below(45);
      const int approach = static_cast<int>(below(2)) - 1;
      const bool hold = below(1);
      expectSame({interpolator.interpolateValueAtPosition(p, approach, hold), interpolator.valueAtPosition(p)},
                 {referenceValue(stored, p, approach, hold), referenceValue(stored, p)},
                 "at " + std::to_string(p) + " approach " + std::to_string(approach) + (hold ? " hold" : ""));
    }
  }
}

TEST(ReferenceComparison, SawtoothSlopeMatchesTheSegmentWalk) {
  auto below = randomBelow(5);
  for (int round = 0; round < 1500; ++round) {
    SCOPED_TRACE(round);
    SawtoothInterpolator saw;
    std::vector<Points> segments{{{0, 0}}};
    double last = 0;
    std::uint64_t position = 0;
    for (int k = 0, n = static_cast<int>(below(30)); k < n; ++k) {
      position += below(4);
      // Whole numbers mostly; a fraction now and then (stored truncated).
      double value = below(5) == 0 ? static_cast<double>(below(20)) : last + static_cast<double>(below(6));
      if (below(7) == 0) value += 0.5;
      saw.addValue(value, position);
      if (last > value) segments.push_back({});
      segments.back().push_back({position, std::trunc(value)});
      last = value;
      if (below(4) == 0) {
        const std::uint64_t a = below(position + 5), b = a + below(20);
        expectSame({saw.averageSlopeFrom(a, b)}, {referenceSlope(segments, a, b)}, "while filling");
      }
    }
    ASSERT_EQ(saw.segments().size(), segments.size());
    for (int q = 0; q < 30; ++q) {
      const std::uint64_t a = below(position + 10), b = below(position + 10);  // b < a included
      expectSame({saw.averageSlopeFrom(a, b)}, {referenceSlope(segments, a, b)},
                 "from " + std::to_string(a) + " to " + std::to_string(b));
    }
  }
}

}  // namespace
}  // namespace bw
