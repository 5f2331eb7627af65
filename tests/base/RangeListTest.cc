#include "base/RangeList.h"

#include <gtest/gtest.h>

namespace bw {
namespace {

using Ranges = std::vector<Range>;

TEST(RangeList, IntersectionKeepsTouchingPointsAsEmptyRanges) {
  EXPECT_EQ(intersectRangeLists({{0, 10}, {20, 10}}, {{10, 10}}), (Ranges{{10, 0}, {20, 0}}));
  EXPECT_EQ(intersectRangeLists({{0, 5}}, {{6, 5}}), Ranges{});
  EXPECT_EQ(intersectRangeLists({{0, 10}, {20, 10}, {40, 10}}, {{5, 30}}), (Ranges{{5, 5}, {20, 10}}));
}

TEST(RangeList, SubtractionCutsSplitsAndDropsWhatIsCovered) {
  struct Case {
    Ranges a, b, expected;
  };
  const Case cases[] = {
      {{{0, 400}}, {{100, 50}}, {{0, 100}, {150, 250}}},
      {{{100, 50}}, {{0, 400}}, {}},
      {{{0, 100}, {200, 100}}, {{50, 200}}, {{0, 50}, {250, 50}}},  // one cut across two
      {{{0, 100}}, {{0, 10}, {20, 10}, {90, 30}}, {{10, 10}, {30, 60}}},
      {{{0, 100}, {300, 10}}, {{100, 200}}, {{0, 100}, {300, 10}}},  // touching only
      {{{0, 100}}, {{50, 0}}, {{0, 100}}},                           // empty cut
      {{{0, 10}, {20, 10}}, {}, {{0, 10}, {20, 10}}},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(subtractRanges(c.a, c.b), c.expected);
  }
}

TEST(RangeList, TotalLengthSumsLengthsAndEmptyRangesAreNotAppended) {
  EXPECT_EQ(totalLength({}), 0u);
  EXPECT_EQ(totalLength({{0, 100}, {150, 250}}), 350u);
  Ranges ranges;
  for (std::uint64_t length : {0, 5}) addRangeLoc(ranges, 10, length);
  EXPECT_EQ(ranges, (Ranges{{10, 5}}));
}

}  // namespace
}  // namespace bw
