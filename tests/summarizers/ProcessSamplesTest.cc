#include "summarizers/ProcessSamples.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <random>

namespace bw {
namespace {

constexpr std::size_t kCurves = ProcessSamples::kCurves;

bool same(double a, double b) { return (std::isnan(a) && std::isnan(b)) || a == b; }

// Packed samples must answer exactly what plain interpolators fed the same
// samples answer: every position at, between and around the samples, and
// ranges of every kind, including across checkpoints and past the end.
TEST(ProcessSamples, AnswerExactlyAsPlainInterpolators) {
  const struct {
    const char* name;
    unsigned rows;
    bool sparse;          // random subsets of curves per row
    bool wild;            // falling, huge, negative, fractional and NaN values
    unsigned outOfOrder;  // row index that goes back in time (0: none)
  } cases[] = {
      {"dense in order", 300, false, false, 0}, {"sparse in order", 400, true, false, 0},
      {"wild values", 200, true, true, 0},      {"one row back in time", 150, false, false, 90},
      {"short and sparse", 3, true, true, 0},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    std::mt19937_64 random(7);
    ProcessSamples packed;
    std::array<Interpolator, kCurves> plain;
    std::vector<std::uint64_t> probes{0, 1, UINT64_MAX};
    std::uint64_t position = 1000;
    std::array<double, kCurves> level{};
    for (unsigned r = 0; r < c.rows; ++r) {
      position += random() % 3 == 0 ? 0 : random() % 5000;  // repeated positions too
      std::uint64_t at = position;
      if (c.outOfOrder && r == c.outOfOrder) at = position / 2;
      unsigned present = c.sparse ? static_cast<unsigned>(random() % 64) : 0x3F;
      std::array<double, kCurves> row{};
      for (std::size_t k = 0; k < kCurves; ++k) {
        level[k] += static_cast<double>(random() % 100000);
        row[k] = level[k];
        if (c.wild) {
          const double wild[] = {-5, 3.7, NAN, 1.8e19, 1e300, 9007199254740993.0, level[k] / 3};
          if (random() % 2) row[k] = wild[random() % 7];
        }
        if (present & (1u << k)) plain[k].addValue(row[k], at);
      }
      packed.addRow(at, present, row);
      for (std::uint64_t d : {0, 1}) probes.insert(probes.end(), {at - d, at + d});
      probes.push_back(at + random() % 3000);
    }
    packed.shrinkToFit();
    for (std::size_t k = 0; k < kCurves; ++k) {
      SCOPED_TRACE(k);
      EXPECT_EQ(packed.count(k), plain[k].dataSet().count());
      for (std::uint64_t p : probes) {
        ASSERT_TRUE(same(packed.valueAtPosition(k, p), plain[k].valueAtPosition(p))) << p;
      }
      for (unsigned i = 0; i < 400; ++i) {
        const Range range{probes[random() % probes.size()], i % 50 == 0 ? UINT64_MAX : random() % 40000};
        ASSERT_TRUE(same(packed.maxValueInRange(k, range), plain[k].maxValueInRange(range)))
            << range.location << "+" << range.length;
      }
    }
  }
}

}  // namespace
}  // namespace bw
