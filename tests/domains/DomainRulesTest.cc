#include <gtest/gtest.h>

#include <vector>

#include "Support.h"
#include "domains/AbsoluteDomain.h"
#include "domains/AllDomain.h"
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

TEST(RelativeTimeDomain, IncludesRecordsOnBothBounds) {
  RelativeTimeDomain domain(100, 200);
  for (std::uint64_t p : {50, 100, 200, 201}) feed(domain, idle(), p);
  EXPECT_EQ(domain.ranges(), (Ranges{{100, 101}}));
  EXPECT_FALSE(domain.lastDomain());
}

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

TEST(AbsoluteDomain, SelectsAHalfOpenRangeOfOneBoot) {
  const Uuid a = bootNamed(1), b = bootNamed(2);
  AbsoluteDomain domain(AbsRange::rangeWithBoot(a, 1'000, 2'000));
  feed(domain, idle(), 0, 0, {a, 999});
  feed(domain, idle(), 1, 0, {a, 1'000});
  feed(domain, idle(), 1'000, 0, {a, 1'999});
  feed(domain, idle(), 1'001, 0, {a, 2'000});
  feed(domain, idle(), 1'500, 0, {a, 1'500});
  feed(domain, idle(), 2'000, 0, {b, 1'500});
  domain.setLastPosition(2'000);
  EXPECT_EQ(domain.ranges(), (Ranges{{1, 1'000}, {1'500, 500}}));
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
  EXPECT_EQ(first.ranges(), (Ranges{{0, 20}}));
  EXPECT_EQ(first.uuid(), a);
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

// The run's own tests see the relative and date selections; the wall-time
// and absolute ones, and the silent domains, are checked here.
TEST(DomainAnnouncements, WithDebugEachConstructorPrintsItsSelection) {
  ASSERT_TRUE(test::kProcessZoneSet);
  test::ConsoleCapture capture;
  WallTimeDomain wall(1'705'273'200'000, 1'705'359'600'999);
  AbsoluteDomain absolute(AbsRange::rangeWithBoot(test::bootNamed(0xAB), 1'000, 3'000));
  AllDomain all;
  BootDomain boot(std::nullopt);
  PostInstallDomain postInstall;
  EXPECT_EQ(capture.err.str(),
            "Selecting events from 2024-01-15 00:00:00 +0100 (1705273200) to 2024-01-16 00:00:00 +0100 "
            "(1705359600)\n"
            "Selecting events from 1000 to 3000 in ABABABAB-ABAB-ABAB-ABAB-ABABABABABAB\n");
}

}  // namespace
}  // namespace bw
