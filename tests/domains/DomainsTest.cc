// The date and wall-time domains: bounds that follow the recorded zone, and
// changes dated back to where the clock crossed a bound. The other domains are
// reached through the run's options (RecordModesTest, DailyRunTest, the service).
#include <gtest/gtest.h>

#include <vector>

#include "Support.h"
#include "domains/DateDomain.h"
#include "domains/WallTimeDomain.h"

namespace bw {
namespace {

using test::ConsoleCapture;
using test::feed;
using test::idle;
using test::wakeAt;
using test::zoneChange;
using Ranges = std::vector<Range>;

// 2024-01-15 in Lagos (+1): 2024-01-14 23:00 UTC to a day later.
constexpr std::uint64_t kLagosStart = 1'705'273'200'000, kLagosEnd = 1'705'359'600'000;
// The same day in Harare (+2): an hour earlier.
constexpr std::uint64_t kHarareStart = 1'705'269'600'000, kHarareEnd = 1'705'356'000'000;
// Positions run this far behind the wall clock.
constexpr std::uint64_t kBase = 1'705'260'000'000;

void feedAt(DateDomain& domain, const Record& r, std::uint64_t wallTime) {
  feed(domain, r, wallTime - kBase, wallTime);
}

TEST(DateDomain, AZoneChangeFromPlusOneToPlusTwoMovesBothBoundsAnHourEarlier) {
  ASSERT_TRUE(test::kProcessZoneSet);
  ConsoleCapture capture;
  DateDomain domain({2024, 1, 15});
  feedAt(domain, zoneChange("WAT", 3600), kLagosStart - 8'200'000);
  EXPECT_EQ(domain.start(), kLagosStart);
  EXPECT_EQ(domain.end(), kLagosEnd);
  feedAt(domain, idle(), kLagosStart - 1'000'000);  // inside the Harare day only
  feedAt(domain, zoneChange("CAT", 7200), kLagosStart - 999'000);
  feedAt(domain, zoneChange("CAT", 7200), kLagosStart);  // the same zone again
  EXPECT_EQ(domain.start(), kHarareStart);
  EXPECT_EQ(domain.end(), kHarareEnd);
  EXPECT_EQ(domain.tzName(), "Africa/Harare");
  feedAt(domain, idle(), kHarareEnd);
  feedAt(domain, idle(), kHarareEnd + 1'000);  // past the Harare day, inside the Lagos one
  EXPECT_EQ(domain.ranges(), (Ranges{{12'201'000, 83'800'000}}));
  EXPECT_EQ(capture.err.str(),
            "Selecting events from 2024-01-15\n"
            "Time zone change! Now zone is Africa/Lagos. Adjusting start/end to 1705273200000-1705359600000\n"
            "Time zone change! Now zone is Africa/Harare. Adjusting start/end to 1705269600000-1705356000000\n");
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

}  // namespace
}  // namespace bw
