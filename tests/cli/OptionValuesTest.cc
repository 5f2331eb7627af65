// What the parser stores for each value-taking option, read in-process with
// a fixed clock.
#include <gtest/gtest.h>

#include <sstream>
#include <vector>

#include "base/Console.h"
#include "cli/OptionParser.h"
#include "support/FakePlatform.h"

namespace bw {
namespace {

struct Parsed {
  Options options;
  int status = 0;  // 0 when parsing returned normally
  std::string err;
};

Parsed parse(std::vector<std::string> args) {
  args.insert(args.begin(), "brindlewick");
  std::vector<char*> argv;
  for (std::string& a : args) argv.push_back(a.data());
  argv.push_back(nullptr);
  std::ostringstream o, e;
  setConsole(&o, &e);
  Parsed p;
  try {
    p.options = parseOptions(static_cast<int>(argv.size() - 1), argv.data());
  } catch (const ProcessExit& x) {
    p.status = x.status;
  }
  setConsole(nullptr, nullptr);
  p.err = e.str();
  return p;
}

class OptionValues : public ::testing::Test {
 protected:
  void SetUp() override {
    setenv("TZ", "UTC", 1);
    tzset();
    gDebug = 0;
  }
  void TearDown() override { gDebug = 0; }
  test::FakePlatform fake;
};

TEST_F(OptionValues, NothingGivenMeansDashboardOverEverything) {
  Parsed p = parse({});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.mode(), kModeDashboard);
  EXPECT_EQ(p.options.domain_type(), kDomainAll);
  EXPECT_EQ(p.options.domain_start(), 0u);
  EXPECT_EQ(p.options.domain_end(), ~std::uint64_t{0});
  EXPECT_EQ(p.options.load_periodic_files_newer_than(), Date::distantPast());
}

TEST_F(OptionValues, DayKeepsAnImpossibleDateThatReadsBackTheSame) {
  Parsed p = parse({"-d", "20240230"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_type(), kDomainDate);
  EXPECT_EQ(p.options.domain_ymd_year(), 2024u);
  EXPECT_EQ(p.options.domain_ymd_month(), 2u);
  EXPECT_EQ(p.options.domain_ymd_day(), 30u);
}

TEST_F(OptionValues, DayRefusesTextThatDoesNotReadBackTheSame) {
  for (const char* bad : {"2024-1-1", "2024+101", "2024011", "202401011", "2024 101", "abcdefgh", "00000101"}) {
    EXPECT_EQ(parse({"-d", bad}).status, 64) << bad;
  }
}

TEST_F(OptionValues, YesterdayOnTheFirstOfJanuaryIsTheLastDayOfTheYearBefore) {
  fake.nowMicros = 1704110400LL * 1000000;  // 2024-01-01 12:00:00 UTC
  Parsed p = parse({"-d", "yesterday"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_ymd_year(), 2023u);
  EXPECT_EQ(p.options.domain_ymd_month(), 12u);
  EXPECT_EQ(p.options.domain_ymd_day(), 31u);
  Parsed today = parse({"--day", "current"});
  EXPECT_EQ(today.options.domain_ymd_year(), 2024u);
  EXPECT_EQ(today.options.domain_ymd_day(), 1u);
}

TEST_F(OptionValues, AgoCountsHoursMinutesAndSecondsBackFromNow) {
  fake.nowMicros = 1700000000123456LL;
  Parsed p = parse({"-A", "1:30"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_type(), kDomainWallTime);
  EXPECT_EQ(p.options.domain_end(), 1700000000123u);
  EXPECT_EQ(p.options.domain_end() - p.options.domain_start(), 5400000u);
  EXPECT_EQ(parse({"-A", "0:0:5"}).options.domain_start(), 1700000000123u - 5000u);
  for (const char* bad : {"0", "0:0", "1:2:3:4", "x"}) EXPECT_EQ(parse({"-A", bad}).status, 64) << bad;
}

TEST_F(OptionValues, DebugRangeIsAStartAndALength) {
  Parsed p = parse({"-R", "5000.1000"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_type(), kDomainRelative);
  EXPECT_EQ(p.options.domain_start(), 5000u);
  EXPECT_EQ(p.options.domain_end(), 6000u);
  for (const char* bad : {"5000", "5000.1000x", "5000,1000"}) EXPECT_EQ(parse({"-R", bad}).status, 64) << bad;
}

TEST_F(OptionValues, StartReadsItsLastFieldAsAFractionOfASecond) {
  Parsed p = parse({"-s", "2024-01-02 03:04:05"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_type(), kDomainWallTime);
  EXPECT_EQ(p.options.domain_start() / 1000, 1704164640u);  // 03:04:00, the 05 is no whole seconds
  EXPECT_EQ(p.options.domain_end(), ~std::uint64_t{0});
  EXPECT_EQ(p.options.load_periodic_files_newer_than(), Date{1704164640});
  Parsed unparsable = parse({"-e", "yesterday at noon"});
  EXPECT_EQ(unparsable.options.domain_end(), 0u);
  EXPECT_EQ(unparsable.options.domain_start(), 0u);
}

TEST_F(OptionValues, LaterOptionsWinButDayFieldsStay) {
  Parsed p = parse({"-d", "20240105", "-s", "2024-01-02 03:04:00", "-D", "-L"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_type(), kDomainWallTime);
  EXPECT_EQ(p.options.domain_ymd_day(), 5u);
  EXPECT_EQ(p.options.mode(), kModeListFiles);
}

TEST_F(OptionValues, BuildAndBootExcludeEachOther) {
  fake.bootUuid = Uuid::parse("11111111-2222-3333-4444-555555555555");
  Parsed current = parse({"-B", "CURRENT"});
  ASSERT_EQ(current.status, 0);
  EXPECT_EQ(current.options.only_boot_uuid(), fake.bootUuid);
  Parsed build = parse({"-b", "Current"});
  EXPECT_EQ(build.options.only_system_version(), std::optional<std::string>("6.1.0-test"));
  EXPECT_EQ(parse({"-b", "current", "-B", "current"}).status, 64);
  EXPECT_EQ(parse({"-B", "current", "-b", "x"}).status, 64);
  EXPECT_EQ(parse({"-B", "not-a-uuid"}).status, 64);
}

TEST_F(OptionValues, CurrentBootThatCannotBeReadLeavesTheFilterUnset) {
  fake.bootUuid.reset();
  Parsed p = parse({"-B", "current", "-b", "x"});
  ASSERT_EQ(p.status, 0);
  EXPECT_FALSE(p.options.only_boot_uuid());
  EXPECT_EQ(p.options.only_system_version(), std::optional<std::string>("x"));
}

TEST_F(OptionValues, StatesSplitAtCommasAndFlagsAreSet) {
  Parsed p = parse({"-S", "A/C,Wake,", "-a", "-J", "-I", "-0", "-f", "/x"});
  ASSERT_EQ(p.status, 0);
  EXPECT_EQ(p.options.domain_mask_states(), (std::vector<std::string>{"A/C", "Wake", ""}));
  EXPECT_TRUE(p.options.show_all());
  EXPECT_TRUE(p.options.includingSubjobs());
  EXPECT_TRUE(p.options.exclude_post_install());
  EXPECT_TRUE(p.options.listfileswithnull());
  EXPECT_EQ(p.options.mode(), kModeDashboard);
  EXPECT_EQ(p.options.from_path(), std::optional<std::string>("/x"));
}

TEST_F(OptionValues, LaunchdTestHappensWhenTheOptionIsRead) {
  fake.ppid = 1;
  EXPECT_EQ(parse({"--daily"}).options.mode(), kModeDaily);
  EXPECT_EQ(parse({"--xpc"}).options.mode(), kModeService);
  fake.ppid = 77;
  Parsed shell = parse({"--xpc"});
  EXPECT_EQ(shell.status, 64);
  EXPECT_EQ(shell.err, "brindlewick: This mode should only be invoked by launchd.\n");
  EXPECT_EQ(parse({"--xpc-debug"}).options.mode(), kModeServiceDebug);
  EXPECT_EQ(parse({"--debug", "--daily"}).status, 0);  // debug first lifts the test
}

TEST_F(OptionValues, DailyWithASampleRangeIsRefused) {
  fake.ppid = 1;
  for (std::vector<std::string> range :
       {std::vector<std::string>{"-d", "today"}, {"-A", "1"}, {"-R", "1.2"}, {"-s", "x"}}) {
    std::vector<std::string> args{"--daily"};
    args.insert(args.end(), range.begin(), range.end());
    Parsed p = parse(args);
    EXPECT_EQ(p.status, 64) << range[0];
    EXPECT_EQ(p.err, "brindlewick: --daily mode should not have a specified domain\n");
  }
}

TEST_F(OptionValues, LocalRecordsNeedTheSuperUserButACopiedStoreDoesNot) {
  fake.euid = 501;
  Parsed local = parse({"-L"});
  EXPECT_EQ(local.status, 77);
  EXPECT_EQ(local.err,
            "brindlewick: When reading the local machine's Brindlewick records, this program must be invoked as "
            "the super-user.\n");
  EXPECT_EQ(parse({"-L", "--from", "/x"}).status, 0);
}

}  // namespace
}  // namespace bw
