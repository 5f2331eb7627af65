// What the parser stores for each value-taking option, read in-process with
// a fixed clock.
#include <gtest/gtest.h>

#include <tuple>
#include <vector>

#include "cli/OptionParser.h"
#include "support/ConsoleCapture.h"
#include "support/MachineFixture.h"

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
  test::ConsoleCapture console(0);
  Parsed p;
  try {
    p.options = parseOptions(static_cast<int>(argv.size() - 1), argv.data());
  } catch (const ProcessExit& x) {
    p.status = x.status;
  }
  p.err = console.err.str();
  return p;
}

class OptionValues : public test::MachineFixture {};

// The domain as (type, start, end, year, month, day).
using Domain = std::tuple<std::uint32_t, std::uint64_t, std::uint64_t, std::uint32_t, std::uint32_t, std::uint32_t>;
Domain domainOf(const Options& o) {
  return {o.domain_type(),     o.domain_start(),     o.domain_end(),
          o.domain_ymd_year(), o.domain_ymd_month(), o.domain_ymd_day()};
}

TEST_F(OptionValues, EachRangeOptionSetsItsDomainAndLaterOnesWinButDayFieldsStay) {
  constexpr std::uint64_t kNow = 1704110400123, kEver = ~std::uint64_t{0};  // 2024-01-01 12:00:00.123 UTC
  constexpr std::uint64_t kJan2 = 1704164640000;                            // 2024-01-02 03:04:00 UTC
  fake.nowMicros = static_cast<std::int64_t>(kNow) * 1000 + 456;
  const struct {
    std::vector<std::string> args;
    Domain domain;
  } cases[] = {
      {{}, {kDomainAll, 0, kEver, 0, 0, 0}},
      {{"-d", "20240230"}, {kDomainDate, 0, kEver, 2024, 2, 30}},  // impossible, but it reads back the same
      {{"-d", "yesterday"}, {kDomainDate, 0, kEver, 2023, 12, 31}},
      {{"--day", "current"}, {kDomainDate, 0, kEver, 2024, 1, 1}},
      {{"-A", "1:30"}, {kDomainWallTime, kNow - 5400000, kNow, 0, 0, 0}},
      {{"-A", "0:0:5"}, {kDomainWallTime, kNow - 5000, kNow, 0, 0, 0}},
      {{"-R", "5000.1000"}, {kDomainRelative, 5000, 6000, 0, 0, 0}},
      {{"-s", "2024-01-02 03:04:05"}, {kDomainWallTime, kJan2 + 50, kEver, 0, 0, 0}},  // the 05 is read as 0.05 s
      {{"-e", "yesterday at noon"}, {kDomainWallTime, 0, 0, 0, 0, 0}},                 // unparsable
      {{"-d", "20240105", "-s", "2024-01-02 03:04:00"}, {kDomainWallTime, kJan2, kEver, 2024, 1, 5}},
  };
  for (const auto& c : cases) {
    const Parsed p = parse(c.args);
    EXPECT_EQ(p.status, 0);
    EXPECT_EQ(domainOf(p.options), c.domain) << ::testing::PrintToString(c.args);
  }
  EXPECT_EQ(parse({}).options.mode(), kModeDashboard);
  EXPECT_EQ(parse({}).options.load_periodic_files_newer_than(), Date::distantPast());
  EXPECT_EQ(parse({"-s", "2024-01-02 03:04:05"}).options.load_periodic_files_newer_than(), Date{1704164640});
  EXPECT_EQ(parse({"-d", "20240105", "-D", "-L"}).options.mode(), kModeListFiles);
}

TEST_F(OptionValues, RangesThatDoNotReadBackTheSameAreUsageErrors) {
  for (const char* bad : {"2024-1-1", "2024+101", "2024011", "202401011", "2024 101", "abcdefgh", "00000101"})
    EXPECT_EQ(parse({"-d", bad}).status, 64) << bad;
  for (const char* bad : {"0", "0:0", "1:2:3:4", "x"}) EXPECT_EQ(parse({"-A", bad}).status, 64) << bad;
  for (const char* bad : {"5000", "5000.1000x", "5000,1000"}) EXPECT_EQ(parse({"-R", bad}).status, 64) << bad;
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

TEST_F(OptionValues, LaunchdTestHappensWhenTheOptionIsRead) {
  fake.ppid = 1;
  EXPECT_EQ(parse({"--daily"}).options.mode(), kModeDaily);
  EXPECT_EQ(parse({"--xpc"}).options.mode(), kModeService);
  fake.ppid = 77;  // from a shell: CommandLineTest runs the refusal and the lift by --debug
  EXPECT_EQ(parse({"--xpc"}).status, 64);
  EXPECT_EQ(parse({"--xpc-debug"}).options.mode(), kModeServiceDebug);
}

}  // namespace
}  // namespace bw
