#include <gtest/gtest.h>

#include <map>
#include <sstream>
#include <tuple>

#include "Records/LogStartsV0.h"
#include "Records/RecordDecoder.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "store/RecordReader.h"
#include "store/StatsFileWriter.h"
#include "support/ConsoleCapture.h"
#include "support/FakePlatform.h"
#include "support/Records.h"
#include "support/TempDir.h"
#include "support/Thrown.h"

namespace bw {
namespace {

using test::bootNamed;
using test::idle;

constexpr std::uint64_t kWallBase = 1700000000000;

// A header whose wall time runs kWallBase ahead of its absolute time.
LogStartsV1 header(const Uuid& boot, std::uint64_t abs, const std::string& version = "22A100",
                   std::uint64_t writer = 1) {
  return test::logStart(boot, abs, kWallBase + abs, version, nullptr, "", writer);
}
SleepWake sleepAt(std::uint64_t abs) { return test::sleepWake(abs, kWallBase + abs, SleepWake::kSleep); }

class RecordReader : public ::testing::Test {
 protected:
  std::string write(const std::string& name, const StatsFileWriter& w) {
    std::string path = dir / name;
    EXPECT_TRUE(w.writeTo(path));
    return path;
  }
  RecordsByBoot read(const std::vector<std::string>& paths) { return readStatsFiles(paths, query); }
  std::string debugText() const { return console.err.str(); }

  test::TempDir dir;
  test::FakePlatform fake;
  StoreQuery query;
  test::ConsoleCapture console;
};

std::vector<std::uint64_t> times(const RecordList& records) {
  std::vector<std::uint64_t> t;
  for (const RecordRef& r : records) t.push_back(r.absoluteTime());
  return t;
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

// Files dropped whole, each with the debug line that says why: a version-0
// record anywhere, a record before the first header (records of no class are
// skipped while the header is awaited); an empty file says nothing at all.
TEST_F(RecordReader, DroppedFilesSayWhyInTheDebugText) {
  StatsFileWriter empty, v0, headless;
  v0.append(header(bootNamed(1), 100));
  v0.append(idle(200));
  LogStartsV0 version0;
  version0.setVersion("0");
  version0.setAbsoluteTime(300);
  v0.append(version0);
  headless.append(idle(50), 0);
  headless.append(sleepAt(100));
  headless.append(header(bootNamed(1), 100));
  const std::tuple<const char*, const StatsFileWriter&, std::string> cases[] = {
      {"empty.stats", empty, ""},
      {"v0.stats", v0, "Skipping (Version 0): "},
      {"bad.stats", headless, "Skipping (Malformed File <SleepWake>): "}};
  for (const auto& [name, w, why] : cases) {
    SCOPED_TRACE(name);
    console.err.str("");
    const std::string path = write(name, w);
    const RecordsByBoot r = read({path});
    EXPECT_TRUE(r.boots.empty() && r.storage.kept.empty() && r.storage.files.empty());
    EXPECT_EQ(debugText(), why.empty() ? "" : why + path + "\n");
    EXPECT_TRUE(!why.empty() || fake.systemLogLines.empty());  // the empty file comes first
  }
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
  ASSERT_EQ(r.boots[bootNamed(1)].size(), 6u);
  EXPECT_EQ(r.boots[bootNamed(1)].back().recordClass(), RecordClass::UserIdle);
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
  // The build filter is in the runs of RecordModesTest.
}

// A second header of another boot stays under the file's first boot, and a
// filter applies to every header of the file.
TEST_F(RecordReader, AFileIsFiledUnderItsFirstBootAndAFilterAppliesToEveryHeader) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(header(bootNamed(2), 200));
  const std::string path = write("a.stats", w);
  RecordsByBoot plain = read({path});
  ASSERT_EQ(plain.boots.size(), 1u);
  EXPECT_EQ(plain.boots[bootNamed(1)].size(), 2u);
  query.onlyBoot = bootNamed(1);
  EXPECT_TRUE(read({path}).boots.empty());
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
  EXPECT_EQ(fake.systemLogLines.size(), 3u);  // their text is in TerminalTest
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
  test::thrown([&] { read({pa, pb}); }, kInternalInconsistencyException, "duplicate boot uuid detected");
  StatsFileWriter other;
  other.append(header(bootNamed(2), 100, "22A100", 5));
  EXPECT_EQ(read({pa, write("c.stats", other)}).boots.size(), 2u);
}

// Records stay in the file: only headers are kept decoded, and each handle
// decodes to what was written, fields absent in it absent again (the decoder
// reuses one value per class).
TEST_F(RecordReader, HandlesDecodeToWhatWasWrittenWithOnlyHeadersKeptDecoded) {
  StatsFileWriter w;
  w.append(header(bootNamed(1), 100));
  w.append(test::sleepWake(200, kWallBase + 200, SleepWake::kWake, "Lid"));
  w.append(sleepAt(300));
  w.append(idle(400));
  RecordsByBoot r = read({write("a.stats", w)});
  const RecordList& records = r.boots[bootNamed(1)];
  ASSERT_EQ(records.size(), 4u);
  EXPECT_EQ(r.storage.kept.size(), 1u);
  EXPECT_EQ(r.storage.files.size(), 1u);
  EXPECT_NE(records[0].decoded(), nullptr);
  EXPECT_EQ(records[1].decoded(), nullptr);
  RecordDecoder decoder;
  EXPECT_EQ(std::tuple(wallTimeOf(records[2], decoder), wallTimeOf(records[3], decoder)),
            std::tuple(kWallBase + 300, 0ull));
  const auto& wake = static_cast<const SleepWake&>(decoder.record(records[1]));
  EXPECT_EQ(std::tuple(wake.reason(), wake.wakeType()), std::tuple(SleepWake::kWake, std::string("Lid")));
  const auto& sleep = static_cast<const SleepWake&>(decoder.record(records[2]));
  EXPECT_EQ(&sleep, &wake);  // one value per class, reused
  EXPECT_EQ(std::tuple(sleep.reason(), sleep.hasWakeType(), sleep.wakeType(), sleep.absoluteTime()),
            std::tuple(SleepWake::kSleep, false, std::string(), 300ull));
  // A walk started inside another walk's callback decodes into values of its own.
  WalkDecoder outer;
  const auto& outerWake = static_cast<const SleepWake&>(outer(records[1]));
  {
    WalkDecoder inner;
    EXPECT_EQ(static_cast<const SleepWake&>(inner(records[2])).reason(), SleepWake::kSleep);
  }
  EXPECT_EQ(outerWake.wakeType(), "Lid");
}

// Framing on several threads hands files over in the order given: the same
// boots, records and messages, in the same order, as one thread.
TEST_F(RecordReader, ThreadsChangeNothingButTheSpeed) {
  std::vector<std::string> paths;
  for (int i = 0; i < 24; ++i) {
    StatsFileWriter w;
    w.append(header(bootNamed(1 + i % 3), 1000 * i));
    for (int k = 1; k <= i; ++k) w.append(idle(1000 * i + k));
    if (i % 5 == 1) w.append(idle(1000 * i + 999), 5);            // an unknown type: one log line
    if (i % 7 == 3) w.appendRaw(std::string("\x5a\x10\x08", 3));  // damaged: its boot keeps headers only
    paths.push_back(write("f" + std::to_string(i) + ".stats", w));
  }
  StatsFileWriter v0;
  v0.append(idle(5));
  paths.insert(paths.begin() + 7, write("malformed.stats", v0));
  auto outcome = [&](unsigned threads) {
    fake.systemLogLines.clear();
    console.err.str("");
    RecordsByBoot r = readStatsFiles(paths, query, nullptr, threads);
    std::map<Uuid, std::vector<std::uint64_t>> byBoot;
    for (const auto& [boot, records] : r.boots) byBoot[boot] = times(records);
    return std::tuple(byBoot, fake.systemLogLines, debugText());
  };
  const auto one = outcome(1);
  EXPECT_EQ(std::get<1>(one).size(), 5u + 3u * 3u);  // five unknown-type lines, three damaged files
  EXPECT_NE(std::get<2>(one), "");
  for (unsigned threads : {2u, 4u, 8u}) EXPECT_EQ(outcome(threads), one) << threads << " threads";
}

}  // namespace
}  // namespace bw
