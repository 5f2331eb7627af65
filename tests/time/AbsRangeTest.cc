#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <any>

#include "base/Exception.h"
#include "time/AbsRange.h"

namespace bw {
namespace {

const Uuid kBoot = *Uuid::parse("0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9");
const Uuid kOtherBoot = *Uuid::parse("11111111-2222-3333-4444-555555555555");

TEST(AbsTime, DescriptionPrintsTheTimeSignedAndTheDebugFormUnsigned) {
  AbsTime t = AbsTime::timeWithBoot(kBoot, UINT64_MAX);
  EXPECT_EQ(t.description(), "AbsTime: ( 0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9, -1 )");
  EXPECT_THAT(t.debugDescription(),
              testing::MatchesRegex("<AbsTime: 0x[0-9a-f]+, boot: 0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9, "
                                    "time: 18446744073709551615>"));
  t._setTime(42);
  EXPECT_EQ(t.description(), "AbsTime: ( 0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9, 42 )");
}

TEST(AbsRange, EqualEndsGiveAnEmptyRangeEndingAtItsStart) {
  AbsRange r = AbsRange::rangeWithBoot(kBoot, 7, 7);
  EXPECT_EQ(r.location(), 7u);
  EXPECT_EQ(r.length(), 0u);
  EXPECT_EQ(r.end().time, 7u);
  EXPECT_EQ(r.end().boot, kBoot);
  EXPECT_EQ(r.range(), (Range{7, 0}));
}

TEST(AbsRange, BackwardsEndsRaiseWithStartAndEndSwappedInTheUserInfo) {
  try {
    AbsRange::rangeWithBoot(kBoot, 10, 5);
    FAIL() << "no exception";
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), "NSInvalidArgumentException");
    EXPECT_EQ(e.reason(), "end < start");
    EXPECT_EQ(std::any_cast<std::uint64_t>(e.userInfo().at("start")), 5u);
    EXPECT_EQ(std::any_cast<std::uint64_t>(e.userInfo().at("end")), 10u);
    EXPECT_EQ(std::any_cast<Uuid>(e.userInfo().at("boot")), kBoot);
  }
}

TEST(AbsRange, LocationAndLengthAreStoredUncheckedEvenWhenTheEndWraps) {
  AbsRange r = AbsRange::rangeWithBootLocation(kBoot, UINT64_MAX - 1, 3);
  EXPECT_EQ(r.start().time, UINT64_MAX - 1);
  EXPECT_EQ(r.end().time, 1u);
}

TEST(AbsRange, RangeFromTimeWithAnAbsentPointIsNoneAndRaisesNothing) {
  AbsTime t = AbsTime::timeWithBoot(kBoot, 5);
  EXPECT_FALSE(AbsRange::rangeFromTime(nullptr, &t).has_value());
  EXPECT_FALSE(AbsRange::rangeFromTime(&t, nullptr).has_value());
  EXPECT_FALSE(AbsRange::rangeFromTime(nullptr, nullptr).has_value());
}

TEST(AbsRange, RangeFromTimeSpansTwoPointsOfOneBoot) {
  AbsTime a = AbsTime::timeWithBoot(kBoot, 100);
  AbsTime b = AbsTime::timeWithBoot(kBoot, 130);
  auto r = AbsRange::rangeFromTime(&a, &b);
  ASSERT_TRUE(r.has_value());
  EXPECT_EQ(r->boot(), kBoot);
  EXPECT_EQ(r->location(), 100u);
  EXPECT_EQ(r->length(), 30u);
  EXPECT_THROW(AbsRange::rangeFromTime(&b, &a), Exception);
}

TEST(AbsRange, PointsOnDifferentBootsRaiseEvenAtEqualTimes) {
  AbsTime a = AbsTime::timeWithBoot(kBoot, 100);
  AbsTime b = AbsTime::timeWithBoot(kOtherBoot, 100);
  try {
    AbsRange::rangeFromTime(&a, &b);
    FAIL() << "no exception";
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), "NSInvalidArgumentException");
    EXPECT_EQ(e.reason(), "start.boot != end.boot");
    EXPECT_EQ(std::any_cast<AbsTime>(e.userInfo().at("start")).boot, kBoot);
    EXPECT_EQ(std::any_cast<AbsTime>(e.userInfo().at("end")).boot, kOtherBoot);
  }
}

TEST(AbsRange, DescriptionsShowLocationLengthAndTheEndAfterEndSemicolon) {
  AbsRange r = AbsRange::rangeWithBoot(kBoot, 100, 150);
  EXPECT_EQ(r.description(), "AbsRange: 0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9 { 100, 50 }");
  EXPECT_THAT(r.debugDescription(),
              testing::MatchesRegex("<AbsRange: 0x[0-9a-f]+, boot: 0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9, "
                                    "start: 100, end; 150>"));
  EXPECT_EQ(r.start().time, 100u);
  EXPECT_EQ(r.end().time, 150u);
}

}  // namespace
}  // namespace bw
