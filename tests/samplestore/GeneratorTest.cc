// The generator as a program: the same seed gives the same bytes, the
// output directory is never mixed with an older store, and the plan behind
// the records keeps the machine's clocks and states coherent for any seed.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>

#include "MachinePlan.h"
#include "SampleStore.h"
#include "WallClock.h"
#include "support/RunTool.h"
#include "support/TempDir.h"

namespace bw::samplestore {
namespace {

namespace fs = std::filesystem;

// Relative path -> (bytes, modification time in ns) of every file below `root`.
std::map<std::string, std::pair<std::string, long long>> snapshot(const std::string& root) {
  std::map<std::string, std::pair<std::string, long long>> files;
  for (const auto& entry : fs::recursive_directory_iterator(root)) {
    if (!entry.is_regular_file()) continue;
    std::ifstream in(entry.path(), std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    struct stat st {};
    stat(entry.path().c_str(), &st);
    files[fs::relative(entry.path(), root).string()] = {bytes.str(),
                                                        st.st_mtim.tv_sec * 1'000'000'000LL + st.st_mtim.tv_nsec};
  }
  return files;
}

StoreConfig smallConfig(const std::string& output, std::uint64_t seed) {
  return StoreConfig{.days = 2, .seed = seed, .scale = 20, .output = output};
}

TEST(SampleStoreGenerator, SameSeedGivesTheSameFilesBytesAndTimesAnotherSeedDoesNot) {
  bw::test::TempDir dir;
  const StoreReport first = generateSampleStore(smallConfig(dir / "a", 5));
  const StoreReport again = generateSampleStore(smallConfig(dir / "b", 5));
  generateSampleStore(smallConfig(dir / "c", 6));
  const auto a = snapshot(dir / "a");
  EXPECT_EQ(a.size(), first.files.size());
  EXPECT_EQ(a, snapshot(dir / "b"));
  EXPECT_EQ(first.records, again.records);
  // Another seed is another laptop: other boots, so other file names.
  for (const auto& [path, content] : snapshot(dir / "c")) EXPECT_EQ(a.count(path), 0u) << path;
}

TEST(SampleStoreGenerator, RefusesToWriteIntoANonEmptyDirectory) {
  bw::test::TempDir dir;
  dir.write("store/var/db/brindlewick/old.stats", "x");
  EXPECT_THROW(generateSampleStore(smallConfig(dir / "store", 1)), std::runtime_error);
  EXPECT_EQ(snapshot(dir / "store").size(), 1u);
  fs::create_directories(dir / "empty");
  EXPECT_NO_THROW(generateSampleStore(smallConfig(dir / "empty", 1)));
}

TEST(SampleStoreGenerator, ProgramWritesWhatTheLibraryWritesPresetsYieldToOptionsAndBadArgumentsFail) {
  const std::string program = BRINDLEWICK_TOOLS_DIR "/samplestore/brindlewick-samplestore";
  bw::test::TempDir dir;
  const auto result =
      bw::test::runBinary(program, {"--days", "2", "--scale", "20", "--seed", "5", "--output", dir / "p"});
  ASSERT_EQ(result.status, 0) << result.err;
  const StoreReport report = generateSampleStore(smallConfig(dir / "l", 5));
  EXPECT_NE(result.out.find(std::to_string(report.totalRecords()) + " records"), std::string::npos) << result.out;
  EXPECT_EQ(snapshot(dir / "p"), snapshot(dir / "l"));

  const auto quiet =
      bw::test::runBinary(program, {"--preset", "large", "--days", "1", "--scale", "10", "-q", "--output", dir / "s"});
  ASSERT_EQ(quiet.status, 0) << quiet.err;
  EXPECT_EQ(quiet.out, "");
  generateSampleStore(StoreConfig{.days = 1, .seed = largePreset().seed, .scale = 10, .output = dir / "t"});
  EXPECT_EQ(snapshot(dir / "s"), snapshot(dir / "t"));

  for (const std::vector<std::string>& args : {std::vector<std::string>{"--days", "2"},
                                               {"--output", dir / "q", "--days", "0"},
                                               {"--output", dir / "q", "--scale", "x"},
                                               {"--output", dir / "q", "--preset", "huge"},
                                               {"--output", dir / "q", "extra"}}) {
    EXPECT_EQ(bw::test::runBinary(program, args).status, 64) << args.back();
  }
  EXPECT_FALSE(fs::exists(dir / "q"));
  EXPECT_EQ(bw::test::runBinary(program, {"--output", dir / "p"}).status, 1) << "the store is there already";
}

TEST(SampleStoreWallClock, CivilDaysWeekdaysYearDaysAndSavingTimeSwitches) {
  EXPECT_EQ(daysFromCivil(1970, 1, 1), 0);
  EXPECT_EQ(civilFromDays(0).weekday, 3);  // a Thursday
  EXPECT_EQ(daysFromCivil(2024, 2, 5), 19758);
  EXPECT_EQ(civilFromDays(19758).weekday, 0);
  EXPECT_EQ(civilFromDays(19758).yday, 35);
  EXPECT_EQ(civilFromDays(daysFromCivil(2024, 3, 1)).yday, 60);  // after 29 February
  EXPECT_EQ(civilFromDays(daysFromCivil(2023, 12, 31)).yday, 364);
  EXPECT_EQ(dateText(civilFromDays(daysFromCivil(2000, 2, 29))), "2000-02-29");
  // 2024-02-05 07:30 UTC is still the 4th in Los Angeles and already the 5th in Tokyo.
  EXPECT_EQ(localDayNumber(1'707'118'200'000, Zone{"PST", -8 * 3600}), 19757);
  EXPECT_EQ(localDayNumber(1'707'118'200'000, Zone{"JST", 9 * 3600}), 19758);
  EXPECT_EQ(wallOfLocal(19758, 0, Zone{"PST", -8 * 3600}), 1'707'120'000'000u);

  const auto find = [](const char* name) {
    const auto& table = zoneTable();
    return *std::find_if(table.begin(), table.end(),
                         [&](const ZoneRule& r) { return std::string(r.standard) == name; });
  };
  const std::uint64_t year2024 = 1'704'067'200'000, year2025 = 1'735'689'600'000;
  // North America: 10 March 2024 02:00 PST and 3 November 2024 02:00 PDT; Europe: 31 March and 27 October, 01:00 UTC.
  EXPECT_EQ(savingSwitches(find("PST"), year2024, year2025),
            (std::vector<std::uint64_t>{1'710'064'800'000, 1'730'624'400'000}));
  EXPECT_EQ(savingSwitches(find("CET"), year2024, year2025),
            (std::vector<std::uint64_t>{1'711'846'800'000, 1'729'990'800'000}));
  EXPECT_TRUE(savingSwitches(find("JST"), year2024, year2025).empty());
  const Zone summer = zoneAt(find("CET"), 1'720'000'000'000);
  EXPECT_STREQ(summer.name, "CEST");
  EXPECT_EQ(summer.gmtoff, 7200);
  EXPECT_STREQ(zoneAt(find("PST"), 1'710'064'799'999).name, "PST");
  EXPECT_STREQ(zoneAt(find("PST"), 1'710'064'800'000).name, "PDT");
}

TEST(SampleStoreRandom, MappingsStayInRangeAndStreamsDiffer) {
  Random rng(42), a(42, 1), b(42, 1), c(42, 2);
  std::set<std::int64_t> seen;
  for (int i = 0; i < 10'000; ++i) seen.insert(rng.between(-3, 3));
  EXPECT_EQ(seen, (std::set<std::int64_t>{-3, -2, -1, 0, 1, 2, 3}));
  EXPECT_EQ(Random(42).below(0), 0u);
  const std::uint64_t first = a.next();
  EXPECT_EQ(first, b.next());
  EXPECT_NE(first, c.next());
}

// Plans for many seeds: the invariants the record generators rely on.
TEST(SampleStorePlan, RunsAlternateWithSleepsAndStatesStayInsideRuns) {
  for (std::uint64_t seed = 1; seed <= 25; ++seed) {
    SCOPED_TRACE("seed " + std::to_string(seed));
    const MachinePlan plan(12, seed);
    std::uint64_t lastWall = 0;
    int updates = 0;
    std::vector<const samplestore::Run*> all;
    for (const Boot& boot : plan.boots()) {
      updates += boot.afterUpdate;
      ASSERT_FALSE(boot.runs.empty());
      EXPECT_EQ(boot.runs.front().start, RunStart::Boot);
      EXPECT_EQ(boot.runs.front().absStart, 0u);
      EXPECT_LT(boot.firstRecordAbs + 60'000, boot.runs.front().absEnd());
      EXPECT_GT(boot.runs.front().wallStart, lastWall);
      // Runs alternate with sleeps; that the ticks stop and the wall clock goes on is checked on the records.
      for (std::size_t r = 0; r < boot.runs.size(); ++r) {
        const samplestore::Run& run = boot.runs[r];
        all.push_back(&run);
        EXPECT_GE(run.duration, 30'000u);
        if (r > 0) {
          const samplestore::Run& before = boot.runs[r - 1];
          EXPECT_EQ(before.end, RunEnd::Sleep);
          EXPECT_NE(run.start, RunStart::Boot);
        }
        EXPECT_EQ(&boot.runAt(run.absStart), &run);
        EXPECT_EQ(boot.wallAt(run.absEnd()), run.wallEnd());
      }
      lastWall = boot.runs.back().wallEnd();
    }
    EXPECT_EQ(updates, 1);
    EXPECT_EQ(all.back()->end, RunEnd::Running);
    const auto inFullRun = [&](std::uint64_t wall) {
      return std::any_of(all.begin(), all.end(), [&](const samplestore::Run* r) {
        return !r->dark && r->wallStart < wall && wall <= r->wallEnd();
      });
    };
    for (std::size_t i = 1; i < plan.powerSources().size(); ++i) {
      EXPECT_TRUE(inFullRun(plan.powerSources()[i].wall)) << "power source change " << i;
      EXPECT_NE(plan.powerSources()[i].onAC, plan.powerSources()[i - 1].onAC);
    }
    for (const Interval& idle : plan.idle())
      EXPECT_TRUE(idle.start < idle.end && inFullRun(idle.start + 1) && inFullRun(idle.end));
    EXPECT_GE(plan.zoneSwitches().size(), 2u);  // twelve days include a trip there and back
  }
}

}  // namespace
}  // namespace bw::samplestore
