#include <gtest/gtest.h>

#include <vector>

#include "Support.h"
#include "domains/AbsoluteDomain.h"
#include "domains/AllDomain.h"
#include "domains/BootDomain.h"
#include "domains/DateDomain.h"
#include "domains/PostInstallDomain.h"
#include "domains/RelativeTimeDomain.h"
#include "domains/WallTimeDomain.h"
#include "domains/WallTimeText.h"

namespace bw {
namespace {

using test::ConsoleCapture;
using Ranges = std::vector<Range>;

TEST(DomainAnnouncements, WithDebugEachConstructorPrintsItsSelection) {
  ASSERT_TRUE(test::kProcessZoneSet);
  ConsoleCapture capture;
  RelativeTimeDomain relative(100, 200);
  WallTimeDomain wall(1'705'273'200'000, 1'705'359'600'999);
  AbsoluteDomain absolute(AbsRange::rangeWithBoot(test::bootNamed(0xAB), 1'000, 3'000));
  DateDomain date({2024, 1, 5});
  AllDomain all;
  BootDomain boot(std::nullopt);
  PostInstallDomain postInstall;
  EXPECT_EQ(capture.err.str(),
            "Selecting events from 100 to 200\n"
            "Selecting events from 2024-01-15 00:00:00 +0100 (1705273200) to 2024-01-16 00:00:00 +0100 "
            "(1705359600)\n"
            "Selecting events from 1000 to 3000 in ABABABAB-ABAB-ABAB-ABAB-ABABABABABAB\n"
            "Selecting events from 2024-01-05\n");
}

TEST(DomainAnnouncements, WithoutDebugNothingIsPrintedAndDatesHaveNoOffset) {
  {
    ConsoleCapture capture(0);
    RelativeTimeDomain relative(100, 200);
    WallTimeDomain wall(0, 1);
    DateDomain date({2024, 1, 5});
    EXPECT_EQ(capture.err.str(), "");
  }
  EXPECT_EQ(formatWallTime(1'720'000'000'000), "2024-07-03 11:46:40");  // summer time, +0200
}

}  // namespace
}  // namespace bw
