#include "accum/AggregateInterpolator.h"

#include <gtest/gtest.h>

#include <cmath>

#include "Support.h"
#include "accum/IncreasingInterpolator.h"

namespace bw {
namespace {

using test::info;
using test::thrown;

const Uuid kBoot = *Uuid::parse("0F0E0D0C-0B0A-0908-0706-050403020100");
const Uuid kOtherBoot = *Uuid::parse("00000000-0000-0000-0000-000000000001");

std::shared_ptr<Interpolator> series(std::initializer_list<std::pair<std::uint64_t, double>> samples) {
  auto s = std::make_shared<IncreasingInterpolator>();
  for (auto [p, v] : samples) s->addValue(v, p);
  return s;
}

TEST(AggregateInterpolator, UnknownBootAnswersZeroSumsAndNaNMaximum) {
  AggregateInterpolator aggregate;
  aggregate.addInterpolator(series({{0, 5}}), kOtherBoot);
  EXPECT_EQ(aggregate.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 0);
  EXPECT_EQ(aggregate.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 10)), 0);
  EXPECT_TRUE(std::isnan(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 10))));
  EXPECT_EQ(aggregate.boots().count(), 1u);  // queries create nothing
}

TEST(AggregateInterpolator, SumsTheMembersOfTheBoot) {
  AggregateInterpolator aggregate;
  auto a = series({{0, 0}, {10, 100}});
  auto b = series({{0, 10}, {20, 30}});
  aggregate.addInterpolator(a, kBoot);
  aggregate.addInterpolator(b, kBoot);
  aggregate.addInterpolator(a, kBoot);  // the same member counts once
  aggregate.addInterpolator(series({{0, 1000}}), kOtherBoot);
  EXPECT_EQ(aggregate.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 100 + 20);
  EXPECT_EQ(aggregate.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 20)), 100 + 20);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 15)), 100);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBootLocation(kBoot, 15, 10)), 30);
}

TEST(AggregateInterpolator, MaximumIgnoresMembersWithoutSamplesInRange) {
  AggregateInterpolator aggregate;
  aggregate.addInterpolator(series({{0, 7}}), kBoot);
  aggregate.addInterpolator(series({{50, 9}}), kBoot);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 10)), 7);
  EXPECT_EQ(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBootLocation(kBoot, 40, 20)), 9);
  EXPECT_TRUE(std::isnan(aggregate.maxValueInAbsoluteRange(AbsRange::rangeWithBootLocation(kBoot, 20, 10))));
}

TEST(AggregateInterpolator, EmptyMemberIsReportedAsNegativeValue) {
  AggregateInterpolator aggregate;
  aggregate.addInterpolator(series({{0, 1}}), kBoot);
  aggregate.addInterpolator(std::make_shared<Interpolator>(), kBoot);
  AbsTime t = AbsTime::timeWithBoot(kBoot, 10);
  auto e = thrown([&] { aggregate.valueAtAbsoluteTime(t); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), "NSInternalInconsistencyException");
  EXPECT_EQ(e->reason(), "value < 0");
  EXPECT_EQ(info<std::string>(*e, "absTime"), t.debugDescription());
  EXPECT_TRUE(std::isnan(info<double>(*e, "value")));
  EXPECT_EQ(e->userInfo().size(), 2u);
}

TEST(AggregateInterpolator, FallingOrUnanswerableMemberFailsTheDelta) {
  AggregateInterpolator aggregate;
  auto falling = std::make_shared<Interpolator>();
  falling->addValue(10, 0);
  falling->addValue(4, 10);
  aggregate.addInterpolator(falling, kBoot);
  auto e = thrown([&] { aggregate.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 10)); });
  ASSERT_TRUE(e);
  EXPECT_EQ(e->name(), kInternalInconsistencyException);
  EXPECT_EQ(e->reason(), "start value < end value");
  EXPECT_EQ(info<double>(*e, "start value"), 10);
  EXPECT_EQ(info<double>(*e, "end value"), 4);
  EXPECT_EQ(info<std::string>(*e, "start").rfind("<AbsTime: 0x", 0), 0u);
  EXPECT_NE(info<std::string>(*e, "start").find("time: 0>"), std::string::npos);
  EXPECT_NE(info<std::string>(*e, "end").find(", boot: 0F0E0D0C-0B0A-0908-0706-050403020100, time: 10>"),
            std::string::npos);
  EXPECT_EQ(e->userInfo().size(), 4u);

  AggregateInterpolator empty;
  empty.addInterpolator(std::make_shared<Interpolator>(), kBoot);
  auto nan = thrown([&] { empty.deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(kBoot, 0, 10)); });
  ASSERT_TRUE(nan);
  EXPECT_EQ(nan->reason(), "start value < end value");
}

TEST(AggregateInterpolator, MergeSharesMembersBootByBoot) {
  auto a = series({{0, 0}, {10, 10}});
  auto b = series({{0, 0}, {10, 20}});
  auto c = series({{0, 0}, {10, 40}});
  AggregateInterpolator first, second;
  first.addInterpolator(a, kBoot);
  second.addInterpolator(a, kBoot);
  second.addInterpolator(b, kBoot);
  second.addInterpolator(c, kOtherBoot);
  first.merge(second);
  first.finalizeMerges();
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 30);
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kOtherBoot, 10)), 40);
  EXPECT_TRUE(first.boots().objectForKeyedSubscript(kOtherBoot)->contains(c.get()));
  EXPECT_NE(first.boots().objectForKeyedSubscript(kOtherBoot), second.boots().objectForKeyedSubscript(kOtherBoot));
  c->addValue(50, 20);  // shared, not copied
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kOtherBoot, 20)), 50);
  first.merge(first);
  EXPECT_EQ(first.valueAtAbsoluteTime(AbsTime::timeWithBoot(kBoot, 10)), 30);
}

}  // namespace
}  // namespace bw
