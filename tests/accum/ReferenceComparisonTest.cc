// The binary searches and prefix tables must give the answers of the plain
// walks they replace. These tests run random inputs through both: the
// references below are simple loops over every sample or event.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "accum/DataSet.h"
#include "accum/Interpolator.h"
#include "accum/Ledger.h"
#include "accum/SawtoothInterpolator.h"

namespace bw {
namespace {

using Points = std::vector<std::pair<std::uint64_t, double>>;

// --- references -----------------------------------------------------------

std::uint64_t referenceTime(const std::vector<std::uint64_t>& credits, const std::vector<std::uint64_t>& debits,
                            Range range) {
  const std::uint64_t kInf = std::numeric_limits<std::uint64_t>::max();
  const std::uint64_t L = range.location, e = range.location + range.length;
  if (!credits.empty() && credits[0] > e) return 0;
  if (credits.empty() && debits.empty()) return 0;
  std::int64_t level = 0;
  std::uint64_t open = L, total = 0;
  std::size_t ci = 0, di = 0;
  for (;;) {
    std::uint64_t c = ci < credits.size() ? credits[ci] : kInf;
    std::uint64_t d = di < debits.size() ? debits[di] : kInf;
    if (c < d) {
      if (level == 0) open = std::max(c, L);
      ++level;
      ++ci;
    } else {
      if (level == 1 || d > e) {
        if (d > L) total += std::min(d, e) - open;
        if (c > e) return total;
      }
      --level;
      ++di;
    }
    if (ci == credits.size() && di == debits.size()) break;
  }
  if (level >= 1 && open < e) total += e - open;
  return total;
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
  if (!hold) return {};
  if (approach <= 0 && i == n) return {s[n - 1]};
  if (approach >= 0 && i == 0) return {s[0]};
  return {};
}

double referenceValue(const Points& s, std::uint64_t p, int approach = 0, bool hold = true) {
  Points pts = referencePoints(s, p, approach, hold);
  if (pts.empty()) return NAN;
  if (pts.size() == 1) return pts[0].second;
  auto [x0, y0] = pts[0];
  auto [x1, y1] = pts[1];
  double slope = (y1 - y0) / static_cast<double>(x1 - x0);
  return x0 <= p ? y0 + slope * static_cast<double>(p - x0) : y0 - slope * static_cast<double>(x0 - p);
}

double referenceSlope(const std::vector<Points>& segments, std::uint64_t a, std::uint64_t b) {
  if (a == b) return 0;
  double delta = 0;
  std::uint64_t time = 0;
  for (std::size_t j = 0; j < segments.size(); ++j) {
    const Points& s = segments[j];
    std::uint64_t lo = s.front().first, hi = s.back().first;
    if (a > hi) continue;
    if (b < lo) break;
    double va = referenceValue(s, a), vb = referenceValue(s, b);
    std::uint64_t x = std::max(a, lo), y = b;
    if (b > hi) {
      if (j + 1 != segments.size()) {
        y = hi;
        vb = referenceValue(s, y);
      } else {
        vb = referenceValue(s, b, -1, false);
      }
    }
    delta += vb - va;
    time += y - x;
  }
  return delta / static_cast<double>(time);
}

void expectClose(double actual, double expected, const std::string& where) {
  if (std::isnan(expected) || std::isnan(actual)) {
    EXPECT_EQ(std::isnan(actual), std::isnan(expected)) << where << ": " << actual << " vs " << expected;
  } else if (std::isinf(expected)) {
    EXPECT_EQ(actual, expected) << where;
  } else {
    EXPECT_NEAR(actual, expected, 1e-9 * std::max(1.0, std::fabs(expected))) << where;
  }
}

// --- comparisons ----------------------------------------------------------

TEST(ReferenceComparison, LedgerTimeMatchesTheEventWalk) {
  std::mt19937_64 rng(7);
  auto below = [&](std::uint64_t n) { return std::uniform_int_distribution<std::uint64_t>(0, n)(rng); };
  for (int round = 0; round < 3000; ++round) {
    Ledger ledger;
    const int events = static_cast<int>(below(16));
    std::uint64_t position = 0;
    for (int k = 0; k < events; ++k) {
      // Mostly ascending, sometimes back in time; credits and debits mixed.
      position = below(5) == 0 ? below(position) : position + below(6);
      if (below(1)) {
        ledger.addCreditAtPosition(position);
      } else {
        ledger.addDebitAtPosition(position);
      }
      if (below(3) == 0) {
        Range r{below(60), below(60)};
        ASSERT_EQ(ledger.timeValueWasGreaterThanZeroOverRange(r), referenceTime(ledger.credits(), ledger.debits(), r))
            << "round " << round << " after " << k << " events, range " << r.location << "+" << r.length;
      }
    }
    for (int q = 0; q < 20; ++q) {
      Range r{below(80), below(80)};
      if (q == 0) r = Range{below(80), std::numeric_limits<std::uint64_t>::max() - below(3)};  // end wraps
      ASSERT_EQ(ledger.timeValueWasGreaterThanZeroOverRange(r), referenceTime(ledger.credits(), ledger.debits(), r))
          << "round " << round << " range " << r.location << "+" << r.length;
      std::uint64_t p = below(80);
      std::uint64_t credits = 0, debits = 0;
      for (auto c : ledger.credits()) credits += c <= p;
      for (auto d : ledger.debits()) debits += d <= p;
      ASSERT_EQ(ledger.valueAtPosition(p), credits > debits ? credits - debits : 0);
    }
  }
}

TEST(ReferenceComparison, MergedLedgerMatchesTheEventWalkOnceFinalized) {
  std::mt19937_64 rng(11);
  auto below = [&](std::uint64_t n) { return std::uniform_int_distribution<std::uint64_t>(0, n)(rng); };
  for (int round = 0; round < 500; ++round) {
    Ledger a, b;
    for (int k = 0; k < 8; ++k) {
      (below(1) ? a : b).addTo(below(1) ? Ledger::List::Credits : Ledger::List::Debits, below(40));
    }
    a.timeValueWasGreaterThanZeroOverRange({0, 10});  // tables built before the merge
    a.merge(b);
    a.finalizeMerges();
    for (int q = 0; q < 10; ++q) {
      Range r{below(50), below(50)};
      ASSERT_EQ(a.timeValueWasGreaterThanZeroOverRange(r), referenceTime(a.credits(), a.debits(), r));
    }
  }
}

TEST(ReferenceComparison, DataSetQueriesMatchPlainScans) {
  std::mt19937_64 rng(3);
  auto below = [&](std::uint64_t n) { return std::uniform_int_distribution<std::uint64_t>(0, n)(rng); };
  for (int round = 0; round < 2000; ++round) {
    Interpolator interpolator;
    Points stored;
    const int n = static_cast<int>(below(10));
    for (int k = 0; k < n; ++k) {
      std::uint64_t p = below(40);
      double v = static_cast<double>(below(1000)) / 4;
      interpolator.addValue(v, p);
      // The reference keeps the truncated value, inserted before equal positions
      // unless appended at or past the largest position.
      auto at = std::lower_bound(stored.begin(), stored.end(), std::make_pair(p, -1.0));
      if (stored.empty() || p >= stored.back().first) at = stored.end();
      stored.insert(at, {p, std::trunc(v)});
    }
    const DataSet& set = interpolator.dataSet();
    for (int q = 0; q < 20; ++q) {
      Range r{below(45), below(20)};
      std::vector<std::size_t> inside;
      for (std::size_t i = 0; i < stored.size(); ++i) {
        if (stored[i].first >= r.location && stored[i].first < r.end()) inside.push_back(i);
      }
      Range indexes = set.indexRangeForRange(r);
      ASSERT_EQ(indexes.length, inside.size());
      if (!inside.empty()) {
        ASSERT_EQ(indexes.location, inside.front());
      }
      std::uint64_t p = below(45);
      int approach = static_cast<int>(below(2)) - 1;
      bool hold = below(1);
      std::string where = "round " + std::to_string(round) + " p " + std::to_string(p) + " approach " +
                          std::to_string(approach) + (hold ? " hold" : "");
      expectClose(interpolator.interpolateValueAtPosition(p, approach, hold),
                  referenceValue(stored, p, approach, hold), where);
      expectClose(interpolator.valueAtPosition(p), referenceValue(stored, p), where);
    }
  }
}

TEST(ReferenceComparison, SawtoothSlopeMatchesTheSegmentWalk) {
  std::mt19937_64 rng(5);
  auto below = [&](std::uint64_t n) { return std::uniform_int_distribution<std::uint64_t>(0, n)(rng); };
  for (int round = 0; round < 1500; ++round) {
    SawtoothInterpolator saw;
    std::vector<Points> segments{{{0, 0}}};
    double last = 0;
    std::uint64_t position = 0;
    const int n = static_cast<int>(below(30));
    for (int k = 0; k < n; ++k) {
      position += below(4);
      // Whole numbers mostly; a fraction now and then (stored truncated).
      double value = below(5) == 0 ? static_cast<double>(below(20)) : last + static_cast<double>(below(6));
      if (below(7) == 0) value += 0.5;
      saw.addValue(value, position);
      if (last > value) segments.push_back({});
      segments.back().push_back({position, std::trunc(value)});
      last = value;
      if (below(4) == 0) {
        std::uint64_t a = below(position + 5), b = a + below(20);
        expectClose(saw.averageSlopeFrom(a, b), referenceSlope(segments, a, b),
                    "round " + std::to_string(round) + " while filling");
      }
    }
    ASSERT_EQ(saw.segments().size(), segments.size());
    for (int q = 0; q < 30; ++q) {
      std::uint64_t a = below(position + 10), b = below(position + 10);  // b < a included
      expectClose(saw.averageSlopeFrom(a, b), referenceSlope(segments, a, b),
                  "round " + std::to_string(round) + " from " + std::to_string(a) + " to " + std::to_string(b));
    }
  }
}

}  // namespace
}  // namespace bw
