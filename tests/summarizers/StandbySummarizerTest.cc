#include "summarizers/StandbySummarizer.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>

#include <filesystem>

#include "Events.h"
#include "base/Console.h"
#include "summarizers/SwapDisk.h"
#include "support/FakePlatform.h"
#include "support/TempDir.h"

namespace bw {
namespace {

using test::feed;
using test::sleepWake;
using Counts = std::map<std::string, std::uint64_t>;

StandbySummary summarize(const StandbySummarizer& s, Range range, StandbySummary summary = {}) {
  s.summarize(summary, range);
  return summary;
}

TEST(Standby, SleepEndedByAWakeFromStandbyIsARangeAndCountsByWakeType) {
  StandbySummarizer s;
  feed(s, sleepWake(0, 0, 0), 10);
  feed(s, sleepWake(0, 0, 1, "RTC", true), 50);
  feed(s, sleepWake(0, 0, 0), 60);
  feed(s, sleepWake(0, 0, 2, "", true), 80);  // no wake type: counted under "__ALL__" only
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10, 40}, {60, 20}}));

  StandbySummary summary = summarize(s, {0, 100});
  EXPECT_EQ(summary.wakesFromStandby(), 2u);
  EXPECT_EQ(summary.darkWakesFromStandby(), 1u);
  EXPECT_EQ(summary.wakeTypes(), (Counts{{"RTC", 1}}));
  EXPECT_EQ(summary.duration(), 100u);
  // Wakes count after the range start up to and including its end.
  const StandbySummary rtc = summarize(s, {40, 10});
  EXPECT_EQ(rtc.wakeTypes(), (Counts{{"RTC", 1}}));
  EXPECT_EQ(rtc.darkWakesFromStandby(), 0u);  // the full wake at 50 is not dark
  EXPECT_EQ(summarize(s, {50, 10}).wakeTypes(), (Counts{{"RTC", 0}}));
}

// A fake /proc and /sys under a temporary root: a swap file whose file
// system's device number links to the block device `node`.
class SwapDiskLookup : public ::testing::Test {
 protected:
  void swapFile(const std::string& node) {
    root.write("proc/swaps", "Filename\tType\tSize\tUsed\tPriority\n/swap\\040file\tfile\t1024\t0\t-2\n");
    struct stat st {};
    ASSERT_EQ(::stat(root.write("swap file").c_str(), &st), 0);
    std::filesystem::create_directories(root / ("sys/devices/virtual/block/" + node));
    std::filesystem::create_directories(root / "sys/dev/block");
    std::filesystem::create_symlink("../../devices/virtual/block/" + node,
                                    root / format("sys/dev/block/%u:%u", major(st.st_dev), minor(st.st_dev)));
  }
  SwapDiskInfo lookUp() { return lookUpSwapDisk(root.path()); }

  test::TempDir root;
  test::FakePlatform platform;
};

TEST_F(SwapDiskLookup, PartitionOnASolidStateDiskNamesTheParentDiskARotatingOneNothing) {
  swapFile("sdz/sdz2");
  root.write("sys/devices/virtual/block/sdz/sdz2/partition", "2\n");
  root.write("sys/block/sdz/queue/rotational", "0\n");
  root.write("sys/block/sdz/device/model", "Fast Disk 1000   \n");
  root.write("sys/block/sdz/device/rev", "FW12\n");
  root.write("sys/block/sdz/device/firmware_rev", "other\n");
  const SwapDiskInfo info = lookUp();
  EXPECT_EQ(info.productName, "Fast Disk 1000");
  EXPECT_EQ(info.productRevisionLevel, "FW12");
  EXPECT_TRUE(info.solidState);
  std::filesystem::remove(root / "sys/block/sdz/device/rev");
  EXPECT_EQ(lookUp().productRevisionLevel, "other");
  root.write("sys/block/sdz/queue/rotational", "1\n");  // a rotating disk answers nothing, silently
  EXPECT_FALSE(lookUp().productName);
  EXPECT_FALSE(lookUp().solidState);
  EXPECT_TRUE(platform.assumptionLogLines.empty());
}

}  // namespace
}  // namespace bw
