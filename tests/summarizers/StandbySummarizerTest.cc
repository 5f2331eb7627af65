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
using Ranges = std::vector<Range>;
using Counts = std::map<std::string, std::uint64_t>;

StandbySummary summarize(const StandbySummarizer& s, Range range, StandbySummary summary = {}) {
  s.summarize(summary, range);
  return summary;
}

TEST(Standby, SleepEndedByAWakeFromStandbyIsARangeAndCountsByWakeType) {
  StandbySummarizer s;
  feed(s, sleepWake(0), 10);
  feed(s, sleepWake(1, true, "RTC"), 50);
  feed(s, sleepWake(0), 60);
  feed(s, sleepWake(2, true, ""), 80);  // no wake type: counted under "__ALL__" only
  EXPECT_EQ(s.ranges(), (Ranges{{10, 40}, {60, 20}}));

  StandbySummary summary = summarize(s, {0, 100});
  EXPECT_EQ(summary.wakesFromStandby(), 2u);
  EXPECT_EQ(summary.darkWakesFromStandby(), 1u);
  EXPECT_EQ(summary.wakeTypes(), (Counts{{"RTC", 1}}));
  EXPECT_EQ(summary.duration(), 100u);
  EXPECT_EQ(summary.range(), Range{});  // left to the caller

  summary = summarize(s, {100, 50}, summary);  // adds duration, no wakes
  EXPECT_EQ(summary.duration(), 150u);
  EXPECT_EQ(summary.wakesFromStandby(), 2u);
}

TEST(Standby, CountsWakesAfterTheRangeStartUpToAndIncludingItsEnd) {
  StandbySummarizer s;
  feed(s, sleepWake(0), 10);
  feed(s, sleepWake(2, true, "EC"), 50);
  EXPECT_EQ(summarize(s, {40, 10}).wakeTypes(), (Counts{{"EC", 1}}));
  EXPECT_EQ(summarize(s, {40, 10}).darkWakesFromStandby(), 1u);
  EXPECT_EQ(summarize(s, {50, 10}).wakesFromStandby(), 0u);
  EXPECT_EQ(summarize(s, {50, 10}).wakeTypes(), (Counts{{"EC", 0}}));  // known types are always listed
}

TEST(Standby, OrdinaryWakeDropsTheSleepAndOtherRecordsAreIgnored) {
  StandbySummarizer s;
  feed(s, sleepWake(0), 10);
  feed(s, test::device(5, 1), 20);
  feed(s, sleepWake(1), 30);
  feed(s, sleepWake(1, true, "RTC"), 40);  // no sleep open: counted, no range
  EXPECT_TRUE(s.ranges().empty());
  EXPECT_EQ(summarize(s, {0, 100}).wakesFromStandby(), 1u);
}

TEST(Standby, SummariesCarryTheSummarizersDiskDetails) {
  test::FakePlatform platform;
  StandbySummarizer s;
  s.setSsdProductName(std::string("Disk A"));
  s.setSsdProductRevisionLevel(std::string("R1"));
  auto made = s.newSummary();
  const auto& summary = dynamic_cast<const StandbySummary&>(*made);
  EXPECT_EQ(summary.ssdProductName(), s.ssdProductName());
  EXPECT_EQ(summary.ssdProductRevisionLevel(), s.ssdProductRevisionLevel());
  EXPECT_TRUE(summary.ssdProductName().has_value());
}

// A fake /proc and /sys under a temporary root, with a swap file whose
// file system's device number links to the block device `node` (a path
// under sys/devices/virtual/block).
class SwapDiskLookup : public ::testing::Test {
 protected:
  void swapFile(const std::string& node) {
    root.write("proc/swaps", "Filename\tType\tSize\tUsed\tPriority\n/swap\\040file\tfile\t1024\t0\t-2\n");
    struct stat st {};
    ASSERT_EQ(::stat(root.write("swap file").c_str(), &st), 0);
    const std::string deviceDir = root / ("sys/devices/virtual/block/" + node);
    std::filesystem::create_directories(deviceDir);
    std::filesystem::create_directories(root / "sys/dev/block");
    std::filesystem::create_symlink("../../devices/virtual/block/" + node,
                                    root / format("sys/dev/block/%u:%u", major(st.st_dev), minor(st.st_dev)));
  }
  SwapDiskInfo lookUp() { return lookUpSwapDisk(root.path()); }

  test::TempDir root;
  test::FakePlatform platform;
};

TEST_F(SwapDiskLookup, PartitionOnASolidStateDiskNamesTheParentDisk) {
  swapFile("sdz/sdz2");
  root.write("sys/devices/virtual/block/sdz/sdz2/partition", "2\n");
  root.write("sys/block/sdz/queue/rotational", "0\n");
  root.write("sys/block/sdz/device/model", "Fast Disk 1000   \n");
  root.write("sys/block/sdz/device/rev", "FW12\n");
  const SwapDiskInfo info = lookUp();
  EXPECT_EQ(info.productName, "Fast Disk 1000");
  EXPECT_EQ(info.productRevisionLevel, "FW12");
  EXPECT_TRUE(platform.assumptionLogLines.empty());
}

TEST_F(SwapDiskLookup, WholeDiskTakesTheFirmwareRevisionWhenThereIsNoRev) {
  swapFile("nvz0n1");
  root.write("sys/block/nvz0n1/queue/rotational", "0\n");
  root.write("sys/block/nvz0n1/device/model", "NV 2\n");
  root.write("sys/block/nvz0n1/device/firmware_rev", "3B2QGXA7\n");
  EXPECT_EQ(lookUp().productRevisionLevel, "3B2QGXA7");
}

TEST_F(SwapDiskLookup, RotatingDiskAnswersNothingSilently) {
  swapFile("sdz");
  root.write("sys/block/sdz/queue/rotational", "1\n");
  root.write("sys/block/sdz/device/model", "Spinner\n");
  EXPECT_FALSE(lookUp().productName);
  EXPECT_TRUE(platform.assumptionLogLines.empty());
}

TEST_F(SwapDiskLookup, FailuresGoToTheAssumptionLogWithTheErrorNumber) {
  EXPECT_FALSE(lookUp().productName);  // no /proc/swaps at all
  root.write("proc/swaps", "Filename\tType\tSize\tUsed\tPriority\n");
  EXPECT_FALSE(lookUp().productName);  // no swap in use
  root.write("proc/swaps", "Filename\tType\tSize\tUsed\tPriority\n/gone\tfile\t1\t0\t-2\n");
  EXPECT_FALSE(lookUp().productName);  // the swap file cannot be stat'ed
  ASSERT_EQ(platform.assumptionLogLines.size(), 3u);
  EXPECT_EQ(platform.assumptionLogLines[0], format("Swap disk lookup: cannot read /proc/swaps: %d", ENOENT));
  EXPECT_EQ(platform.assumptionLogLines[1], "Swap disk lookup: no swap in use: 0");
  EXPECT_EQ(platform.assumptionLogLines[2], format("Swap disk lookup: stat /gone: %d", ENOENT));
}

TEST_F(SwapDiskLookup, DeviceNumberWithoutABlockDeviceIsLogged) {
  swapFile("sdz");
  std::filesystem::remove_all(root / "sys/dev/block");
  EXPECT_FALSE(lookUp().productName);
  ASSERT_EQ(platform.assumptionLogLines.size(), 1u);
  EXPECT_TRUE(platform.assumptionLogLines[0].starts_with("Swap disk lookup: no block device ")) << platform.assumptionLogLines[0];
}

}  // namespace
}  // namespace bw
