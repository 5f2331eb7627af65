#include <gtest/gtest.h>

#include <vector>

#include "Support.h"
#include "domains/BootDomain.h"
#include "domains/PostInstallDomain.h"
#include "domains/RelativeTimeDomain.h"
#include "domains/WallTimeDomain.h"

namespace bw {
namespace {

using test::bootNamed;
using test::feed;
using test::idle;
using test::wakeAt;
using Ranges = std::vector<Range>;

// Start 1,030,000 and end 1,100,000 ms of wall time; positions run 999,000
// ms behind the wall clock, as on one segment.
TEST(WallTimeDomain, DatesChangesBackToWhereTheClockCrossedTheBounds) {
  WallTimeDomain domain(1'030'000, 1'100'000);
  feed(domain, wakeAt(0), 1'000, 1'000'000);
  feed(domain, wakeAt(0), 61'000, 1'060'000);   // start passed 30 s before
  feed(domain, wakeAt(0), 161'000, 1'160'000);  // end passed 60 s before
  EXPECT_EQ(domain.ranges(), (Ranges{{31'000, 70'000}}));
  EXPECT_EQ(domain.lastTime(), 161'000u);
}

TEST(BootDomain, SelectsTheGivenBootOrTheFirstOneSeen) {
  const Uuid a = bootNamed(1), b = bootNamed(2), c = bootNamed(3);
  BootDomain given(b), first(std::nullopt);
  const std::pair<std::uint64_t, Uuid> records[] = {{0, a}, {10, a}, {20, b}, {30, b}, {40, c}};
  for (auto& [position, boot] : records) {
    feed(given, idle(), position, 0, {boot, position});
    feed(first, idle(), position, 0, {boot, position});
  }
  EXPECT_EQ(given.ranges(), (Ranges{{20, 20}}));
  EXPECT_EQ(std::pair(first.ranges(), first.uuid()), std::pair(Ranges{{0, 20}}, std::optional(a)));
}

// A header of `system`, updated from `last` (none: absent).
LogStartsV1 logStart(const char* system, const char* last = "") {
  return test::logStart({}, 0, 0, system, nullptr, last);
}

TEST(PostInstallDomain, CoversTheFirstHourAfterAnUpdateOnce) {
  const Uuid a = bootNamed(1), b = bootNamed(2);
  PostInstallDomain domain;
  feed(domain, logStart("21A1", "21A1"), 0, 0, {a, 500});  // same system: no update
  feed(domain, logStart("21B7", "21A1"), 1'000, 0, {a, 1'000});
  feed(domain, idle(), 3'601'000, 0, {a, 3'601'000});  // exactly one hour: inside
  feed(domain, idle(), 3'601'001, 0, {a, 3'601'001});
  // A later boot with yet another system never reopens it.
  feed(domain, logStart("21C1", "21B7"), 4'000'000, 0, {b, 0});
  domain.setLastPosition(4'000'000);
  EXPECT_EQ(domain.ranges(), (Ranges{{1'000, 3'600'001}}));
  ASSERT_TRUE(domain.startAbsTime().has_value());
  EXPECT_EQ(domain.startAbsTime()->time, 1'000u);
}

}  // namespace
}  // namespace bw
