#include "accum/Interpolator.h"

#include <gtest/gtest.h>

#include <cmath>

#include "Support.h"
#include "accum/IncreasingInterpolator.h"

namespace bw {
namespace {

using test::info;
using test::thrown;

template <class T = Interpolator>
T series(std::initializer_list<std::pair<std::uint64_t, double>> samples) {
  T interpolator;
  for (auto [p, v] : samples) interpolator.addValue(v, p);
  return interpolator;
}

TEST(Interpolator, EmptySeriesAnswersNaN) {
  Interpolator empty;
  EXPECT_TRUE(std::isnan(empty.valueAtPosition(0)));
  EXPECT_TRUE(std::isnan(empty.valueAtPosition(100)));
  EXPECT_TRUE(std::isnan(empty.deltaInRange({0, 10})));
  EXPECT_EQ(empty.maxPosition(), 0u);
  auto e = thrown([&] { empty.minPosition(); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), kRangeException);
}

TEST(Interpolator, WithZeroStartsAtTheOrigin) {
  Interpolator zero(kWithZero);
  EXPECT_EQ(zero.dataSet().count(), 1u);
  EXPECT_EQ(zero.valueAtPosition(50), 0);
  EXPECT_EQ(zero.minPosition(), 0u);
}

TEST(Interpolator, ValueIsLinearBetweenSamplesAndHeldOutside) {
  auto s = series({{10, 100}, {20, 300}});
  const std::pair<std::uint64_t, double> cases[] = {{0, 100}, {10, 100}, {12, 140}, {15, 200},
                                                    {20, 300}, {99, 300}};
  for (auto [p, v] : cases) EXPECT_EQ(s.valueAtPosition(p), v) << "at " << p;
  EXPECT_EQ(s.deltaInRange({10, 5}), 100);
  EXPECT_EQ(s.deltaInRange({0, 1000}), 200);
}

TEST(Interpolator, StoresWholeNumbersOnly) {
  auto s = series({{10, 3.7}, {20, 9.99}, {30, -4}});
  EXPECT_EQ(s.valueAtPosition(10), 3);
  EXPECT_EQ(s.valueAtPosition(20), 9);
  EXPECT_EQ(s.valueAtPosition(30), 0);  // negative samples are kept as 0
  EXPECT_EQ(s.valueAtPosition(15), 6);
}

struct InterpolateCase {
  std::uint64_t position;
  std::int32_t approach;
  bool hold;
  double expected;  // NaN for no answer
};

TEST(Interpolator, InterpolatesAndExtrapolatesThroughTheChosenPoints) {
  // Slopes: 1 per unit from 10 to 20, 2 from 20 to 30.
  auto s = series({{10, 10}, {20, 20}, {30, 40}});
  const InterpolateCase cases[] = {
      {25, 0, false, 30},  {25, -1, false, 25},  // line through 10 and 20, extended
      {25, 1, false, NAN}, {5, 1, false, 5},     // line through 10 and 20, backwards
      {35, -1, false, 50}, {35, 0, false, NAN},  {35, 0, true, 40},
      {15, -1, true, NAN}, {15, 1, true, 10},    // line through 20 and 30 at 15
      {20, -1, false, 20}, {5, 0, true, 10},     {5, -1, true, NAN},
  };
  for (const auto& c : cases) {
    double v = s.interpolateValueAtPosition(c.position, c.approach, c.hold);
    if (std::isnan(c.expected)) {
      EXPECT_TRUE(std::isnan(v)) << "at " << c.position << " approach " << c.approach << " got " << v;
    } else {
      EXPECT_DOUBLE_EQ(v, c.expected) << "at " << c.position << " approach " << c.approach;
    }
  }
}

TEST(Interpolator, ExtrapolationAddsTheLinesValue) {
  auto s = series({{0, 0}, {10, 100}});
  EXPECT_EQ(s.valueAtPosition(5), 50);
  EXPECT_EQ(s.valueAtPosition(20), 100);
  s.extrapolateValueAtPosition(20);
  EXPECT_EQ(s.dataSet().count(), 3u);
  EXPECT_EQ(s.valueAtPosition(20), 200);
  EXPECT_EQ(s.maxPosition(), 20u);
}

TEST(Interpolator, ExtrapolationBeforeAndInsideUsesTheSamplesAfter) {
  auto before = series({{10, 100}, {20, 200}});
  before.extrapolateValueAtPosition(5);
  EXPECT_EQ(before.dataSet().positions().front(), 5u);
  EXPECT_EQ(before.valueAtPosition(5), 50);

  auto inside = series({{10, 100}, {20, 200}, {30, 400}});
  inside.extrapolateValueAtPosition(15);  // line through 20 and 30: 100
  EXPECT_EQ(inside.dataSet().count(), 4u);
  EXPECT_EQ(inside.dataSet().values()[1], 100);

  auto tooFew = series({{10, 100}, {20, 200}});
  tooFew.extrapolateValueAtPosition(15);  // no two samples from 15 on: nothing added
  EXPECT_EQ(tooFew.dataSet().count(), 2u);
  auto single = series({{10, 100}});
  single.extrapolateValueAtPosition(20);
  EXPECT_EQ(single.dataSet().count(), 1u);
}

TEST(Interpolator, ExtrapolatedValueIsTruncatedToo) {
  auto s = series({{0, 0}, {3, 10}});
  s.extrapolateValueAtPosition(4);  // 13.33...
  EXPECT_EQ(s.valueAtPosition(4), 13);
}

TEST(Interpolator, DebugDescriptionWrapsTheDataSet) {
  IncreasingInterpolator s(kWithZero);
  std::string text = s.debugDescription();
  EXPECT_EQ(text, "<IncreasingInterpolator: " + test::addressOf(&s) + " <(\n_dataSet = <DataSet: " +
                      test::addressOf(&s.dataSet()) + " <(\n0, 0\n\n)>>\n)>>");
}

TEST(IncreasingInterpolator, AcceptsAnythingWhileMaxPositionIsZero) {
  IncreasingInterpolator s;
  s.addValue(5, 0);
  s.addValue(1, 0);  // lower value, unchecked
  EXPECT_EQ(s.maxPosition(), 0u);
  EXPECT_EQ(s.dataSet().count(), 2u);
  s.addValue(0, 10);
  EXPECT_EQ(s.dataSet().count(), 3u);
}

TEST(IncreasingInterpolator, RefusesAValueBelowTheSeries) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}});
  auto e = thrown([&] { s.addValue(90, 20); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), "NSInvalidArgumentException");
  EXPECT_EQ(e->reason(), "new value < current value");
  EXPECT_EQ(info<std::uint64_t>(*e, "position"), 20u);
  EXPECT_EQ(info<double>(*e, "value"), 90);
  EXPECT_EQ(info<double>(*e, "current"), 100);
  EXPECT_EQ(e->userInfo().size(), 3u);
  EXPECT_EQ(s.dataSet().count(), 2u);
}

TEST(IncreasingInterpolator, RefusesAPositionBeforeTheLast) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}});
  auto e = thrown([&] { s.addValue(150, 5); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), kInvalidArgumentException);
  EXPECT_EQ(e->reason(), "pos < maxPosition");
  EXPECT_EQ(info<std::uint64_t>(*e, "pos"), 5u);
  EXPECT_EQ(info<std::uint64_t>(*e, "maxPosition"), 10u);
  EXPECT_EQ(e->userInfo().size(), 2u);
  EXPECT_EQ(s.dataSet().count(), 2u);
}

TEST(IncreasingInterpolator, ChecksTheValueBeforeThePosition) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}});
  auto e = thrown([&] { s.addValue(10, 5); });  // both wrong
  ASSERT_TRUE(e);
  EXPECT_EQ(e->reason(), "new value < current value");
  EXPECT_EQ(info<double>(*e, "current"), 50);
}

TEST(IncreasingInterpolator, AcceptsEqualValueAndPosition) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}});
  s.addValue(100, 10);
  s.addValue(100, 20);
  EXPECT_EQ(s.dataSet().count(), 4u);
}

TEST(IncreasingInterpolator, ExtrapolationGoesThroughTheChecks) {
  auto s = series<IncreasingInterpolator>({{0, 0}, {10, 100}, {20, 100}});
  auto e = thrown([&] { s.extrapolateValueAtPosition(5); });  // 100 at 5, before maxPosition
  ASSERT_TRUE(e);
  EXPECT_EQ(e->reason(), "pos < maxPosition");
  s.extrapolateValueAtPosition(30);
  EXPECT_EQ(s.valueAtPosition(30), 100);
}

}  // namespace
}  // namespace bw
