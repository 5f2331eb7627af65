#include <gtest/gtest.h>

#include <sstream>

#include "Records/LogStartsV0.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "store/RecordReader.h"
#include "store/StoreBuilder.h"
#include "support/FakePlatform.h"
#include "support/TempDir.h"

namespace bw {
namespace {

using test::bootNamed;
using test::header;
using test::idle;
using test::sleepAt;

class RecordReader : public ::testing::Test {
 protected:
  void SetUp() override {
    gDebug = 1;
    setConsole(&out_, &err_);
  }
  void TearDown() override {
    gDebug = 0;
    setConsole(nullptr, nullptr);
  }
  std::string write(const std::string& name, const StatsFileWriter& w) {
    std::string path = dir / name;
    EXPECT_TRUE(w.writeTo(path));
    return path;
  }
  RecordsByBoot read(const std::vector<std::string>& paths) { return readStatsFiles(paths, query); }
  std::string debugText() const { return err_.str(); }

  test::TempDir dir;
  test::FakePlatform fake;
  StoreQuery query;
  std::ostringstream out_, err_;
};

std::vector<std::uint64_t> times(const std::vector<Record*>& records) {
  std::vector<std::uint64_t> t;
  for (const Record* r : records) t.push_back(r->absoluteTime());
  return t;
}

TEST_F(RecordReader, EmptyFileContributesNothingAndSaysNothing) {
  RecordsByBoot r = read({write("empty.stats", StatsFileWriter())});
  EXPECT_TRUE(r.boots.empty());
  EXPECT_EQ(debugText(), "");
  EXPECT_TRUE(fake.systemLogLines.empty());
}

TEST_F(RecordReader, RecordsEarlierThanTheLatestHeaderAreDiscarded) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(idle(99));
  w.append(idle(100));
  w.append(header(bootNamed(1), 500));
  w.append(idle(499));
  w.append(idle(500));
  w.append(idle(600));
  RecordsByBoot r = read({write("a.stats", w)});
  EXPECT_EQ(times(r.boots[bootNamed(1)]), (std::vector<std::uint64_t>{100, 100, 500, 500, 600}));
}

TEST_F(RecordReader, VersionZeroAnywhereDropsTheWholeFile) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(idle(200));
  LogStartsV0 v0;
  v0.setVersion("0");
  v0.setAbsoluteTime(300);
  w.append(v0);
  std::string path = write("v0.stats", w);
  RecordsByBoot r = read({path});
  EXPECT_TRUE(r.boots.empty());
  EXPECT_EQ(debugText(), "Skipping (Version 0): " + path + "\n");
  EXPECT_EQ(r.pool.recordCount(), 0u);
}

TEST_F(RecordReader, AFileNotStartingWithAHeaderIsDropped) {
  StatsFileWriter w;
  w.append(idle(50), 0);  // no class: skipped silently, the header is still awaited
  w.append(sleepAt(100));
  w.append(header(bootNamed(1), 100));
  std::string path = write("bad.stats", w);
  EXPECT_TRUE(read({path}).boots.empty());
  EXPECT_EQ(debugText(), "Skipping (Malformed File <SleepWake>): " + path + "\n");
}

TEST_F(RecordReader, UnknownTypesAreLoggedOncePerFileWithTheKeyShiftedBySix) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(idle(150), 5);  // key 0x2A
  w.append(idle(160), 0);
  w.append(idle(200));
  w.append(idle(250), 23);  // key 186, just above the table: the class before
  std::string path = write("a.stats", w);
  RecordsByBoot r = read({path, path});
  EXPECT_EQ(r.boots[bootNamed(1)].size(), 6u);
  EXPECT_EQ(fake.systemLogLines, (std::vector<std::string>{"Unknown message type 0x0 in file: " + path,
                                                           "Unknown message type 0x0 in file: " + path}));
}

TEST_F(RecordReader, BootAndBuildFiltersDropFilesOfOtherBootsAndBuilds) {
  StatsFileWriter one, two;
  one.append(header(bootNamed(1), 100, "22A100"));
  two.append(header(bootNamed(2), 100, "23B200"));
  std::string p1 = write("1.stats", one), p2 = write("2.stats", two);
  query.onlyBoot = bootNamed(2);
  RecordsByBoot byBoot = read({p1, p2});
  EXPECT_EQ(byBoot.boots.size(), 1u);
  EXPECT_TRUE(byBoot.boots.count(bootNamed(2)));
  EXPECT_EQ(debugText(), "Skipping (Boot UUID <" + bootNamed(2).string() + ">): " + p1 + "\n");
  query.onlyBoot.reset();
  query.onlySystemVersion = "22A100";
  RecordsByBoot byBuild = read({p1, p2});
  EXPECT_EQ(byBuild.boots.size(), 1u);
  EXPECT_TRUE(byBuild.boots.count(bootNamed(1)));
}

TEST_F(RecordReader, AFilterAppliesToEveryHeaderOfTheFile) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(header(bootNamed(2), 200));
  query.onlyBoot = bootNamed(1);
  EXPECT_TRUE(read({write("a.stats", w)}).boots.empty());
}

TEST_F(RecordReader, ADecodingFailureLeavesTheBootOnlyItsHeaders) {
  StatsFileWriter good, damaged;
  good.append(header(bootNamed(1), 100));
  good.append(idle(150));
  damaged.append(header(bootNamed(1), 200));
  damaged.append(idle(250));
  damaged.appendRaw(std::string("\x5a\x10\x08", 3));  // a UserIdle body cut short
  std::string pGood = write("a.stats", good), pDamaged = write("b.stats", damaged);
  RecordsByBoot r = read({pGood, pDamaged});
  EXPECT_EQ(times(r.boots[bootNamed(1)]), (std::vector<std::uint64_t>{100, 200}));
  ASSERT_EQ(fake.systemLogLines.size(), 3u);
  EXPECT_EQ(fake.systemLogLines[0], " ** Caught an exception while reading file: " + pDamaged);
  EXPECT_EQ(fake.systemLogLines[1].rfind(" ** exception: ", 0), 0u);
  EXPECT_EQ(fake.systemLogLines[2], " ** All data from boot " + bootNamed(1).string() + " will be dropped.");
}

TEST_F(RecordReader, AFailureBeforeAnyRecordDropsTheFileWithoutMarkingItsBoot) {
  StatsFileWriter good, broken;
  good.append(header(bootNamed(1), 100));
  good.append(idle(150));
  broken.appendRaw(std::string("\x62\x05\x0a\x01", 4));  // a header body cut short
  RecordsByBoot r = read({write("a.stats", good), write("b.stats", broken)});
  EXPECT_EQ(times(r.boots[bootNamed(1)]), (std::vector<std::uint64_t>{100, 150}));
  EXPECT_EQ(fake.systemLogLines.size(), 2u);
}

TEST_F(RecordReader, TwoWriterFiveFilesForOneBootEndTheRun) {
  StatsFileWriter a, b;
  a.append(header(bootNamed(1), 100, "22A100", 5));
  b.append(header(bootNamed(1), 200, "22A100", 5));
  std::string pa = write("a.stats", a), pb = write("b.stats", b);
  try {
    read({pa, pb});
    FAIL() << "no exception";
  } catch (const Exception& e) {
    EXPECT_EQ(e.name(), kInternalInconsistencyException);
    EXPECT_EQ(e.reason(), "duplicate boot uuid detected");
  }
  StatsFileWriter other;
  other.append(header(bootNamed(2), 100, "22A100", 5));
  EXPECT_EQ(read({pa, write("c.stats", other)}).boots.size(), 2u);
}

TEST_F(RecordReader, FilesOfOneBootAppendInTheOrderGiven) {
  StatsFileWriter a, b;
  a.append(header(bootNamed(1), 500));
  a.append(idle(600));
  b.append(header(bootNamed(1), 100));
  b.append(idle(200));
  RecordsByBoot r = read({write("a.stats", a), write("b.stats", b)});
  EXPECT_EQ(times(r.boots[bootNamed(1)]), (std::vector<std::uint64_t>{500, 600, 100, 200}));
}

}  // namespace
}  // namespace bw
