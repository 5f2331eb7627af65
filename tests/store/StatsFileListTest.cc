#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "base/Exception.h"
#include "store/Cleanup.h"
#include "store/StatsFileList.h"
#include "support/FakePlatform.h"
#include "support/TempDir.h"
#include "support/Thrown.h"
#include "time/Calendar.h"

namespace bw {
namespace {

using test::setModificationTime;

StoreQuery fromQuery(const std::string& path, std::optional<Date> cutoff = std::nullopt) {
  return StoreQuery{.fromPath = path, .periodicCutoff = cutoff};
}

TEST(StatsFileList, FromFindsNestedFilesAndOnlyTheExactSuffix) {
  test::TempDir dir;
  std::string top = dir.write("top.stats");
  std::string nested = dir.write("a/b/c/deep.stats");
  dir.write("x.stats.bak");
  dir.write("X.STATS");
  dir.write("a/statsfile");
  EXPECT_EQ(statsFileList(fromQuery(dir.path())), (FileList{nested, top}));
}

TEST(StatsFileList, PeriodicFilesMustBeModifiedStrictlyAfterTheCutoff) {
  test::TempDir dir;
  std::string atCutoff = dir.write("x.periodic.stats");
  std::string later = dir.write("y.periodic.stats");
  std::string old = dir.write("plain.stats");
  std::string inPeriodicDir = dir.write("periodic/old.stats");
  setModificationTime(atCutoff, 1700000000);
  setModificationTime(later, 1700000001);
  setModificationTime(old, 1000);
  setModificationTime(inPeriodicDir, 1000);
  EXPECT_EQ(statsFileList(fromQuery(dir.path(), Date{1700000000})), (FileList{old, later}));
  EXPECT_EQ(statsFileList(fromQuery(dir.path())), (FileList{inPeriodicDir, old, atCutoff, later}));
}

TEST(StatsFileList, LocalStoreReadsItsDirectoriesWithoutEnteringSubdirectories) {
  test::TempDir root;
  test::FakePlatform fake(root.path());
  std::string own = root.write("var/db/brindlewick/own.stats");
  root.write("var/db/brindlewick/sub/skipped.stats");
  std::string launchd = root.write("var/log/com.vexil.launchd/launchd.stats");
  std::string user501 = root.write("var/log/com.vexil.launchd.peruser.501/user.stats");
  std::string user0 = root.write("var/log/com.vexil.launchd.peruser.0/user.stats");
  root.write("var/log/com.vexil.launchdX/other.stats");
  root.write("var/log/loose.stats");
  EXPECT_EQ(statsFileList(StoreQuery()), (FileList{own, launchd, user0, user501}));
}

class Cleanup : public ::testing::Test {
 protected:
  void SetUp() override {
    setenv("TZ", "UTC", 1);
    tzset();
    fake.bootUuid = Uuid::parse("AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEEE");
    fake.nowMicros = 1700000000LL * 1000000;  // 2023-11-14 22:13:20 UTC
    horizon = static_cast<long long>(earlierMidnight(Date{1700000000}).secondsSince1970) - 3 * 86400;
  }
  std::string stale(const std::string& relative, long long modified) {
    std::string path = root.write(relative);
    setModificationTime(path, modified);
    return path;
  }
  test::TempDir root;
  test::FakePlatform fake{root.path()};
  long long horizon = 0;
};

TEST_F(Cleanup, DeletesOnlyFilesOlderThanTheHorizonOutsideTheCurrentBoot) {
  ASSERT_EQ(horizon, 1699660800);  // 2023-11-11 00:00:00
  std::string old = stale("var/db/brindlewick/old.stats", horizon - 1);
  std::string atHorizon = stale("var/db/brindlewick/edge.stats", horizon);
  std::string currentBoot = stale("var/db/brindlewick/AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEEE.stats", 1000);
  std::string oldPeriodic = stale("var/log/com.vexil.launchd/x.periodic.stats", 1000);
  std::string perUser = stale("var/log/com.vexil.launchd.peruser.501/u.stats", 1000);
  std::string notStats = stale("var/db/brindlewick/old.txt", 1000);
  removeOldStatsFiles(Date{static_cast<double>(horizon)});
  namespace fs = std::filesystem;
  EXPECT_FALSE(fs::exists(old));
  EXPECT_FALSE(fs::exists(oldPeriodic));
  EXPECT_FALSE(fs::exists(perUser));
  EXPECT_TRUE(fs::exists(atHorizon));
  EXPECT_TRUE(fs::exists(currentBoot));
  EXPECT_TRUE(fs::exists(notStats));
}

TEST_F(Cleanup, NothingIsDeletedWhenTheCurrentBootIsUnknown) {
  fake.bootUuid.reset();
  std::string old = stale("var/db/brindlewick/old.stats", 1000);
  removeOldStatsFiles(Date{static_cast<double>(horizon)});
  EXPECT_TRUE(std::filesystem::exists(old));
}

TEST_F(Cleanup, SafeRemovalRefusesPathsOutsideTheManagedAreas) {
  std::string outside = stale("elsewhere/old.stats", 1000);
  std::string wrongSuffix = stale("var/db/brindlewick/keep.txt", 1000);
  for (const std::string& path : {outside, wrongSuffix, root / "var/db/brindlewick"}) {
    SCOPED_TRACE(path);
    test::thrown([&] { safelyRemove(path); }, kInvalidArgumentException,
                 "Attempted to delete a file that is not in a Brindlewick-managed area of the filesystem.");
  }
  EXPECT_TRUE(std::filesystem::exists(outside));
  EXPECT_TRUE(std::filesystem::exists(wrongSuffix));
  // A stats file lying directly in the log directory with the per-user prefix is admitted.
  std::string loose = stale("var/log/com.vexil.launchd.peruser.501.stats", 1000);
  safelyRemove(loose);
  EXPECT_FALSE(std::filesystem::exists(loose));
}

}  // namespace
}  // namespace bw
