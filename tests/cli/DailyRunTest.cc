#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "base/RangeList.h"
#include "cli/DailyRun.h"
#include "cli/DailyStore.h"
#include "cli/Options.h"
#include "cli/ReportState.h"
#include "model/Model.h"
#include "reports/DailyReports.h"
#include "store/PropertyListReader.h"
#include "support/ConsoleCapture.h"
#include "support/MachineFixture.h"
#include "support/TempDir.h"

namespace bw {
namespace {

using test::kDay;
using test::kHour;
using test::kJan1;

// Records every call as one line.
struct RecordingReports : DailyReports {
  void telemetry(const Model& model, const std::vector<Range>& ranges, const std::string& kind,
                 const std::optional<std::string>& day) override {
    calls.push_back("telemetry " + model.systemVersion() + " " + kind + " " + day.value_or("-") + " " +
                    std::to_string(totalLength(ranges)));
  }
  void standbyTelemetry(const std::string& kind, const std::string& day, const Model& model,
                        const std::vector<Range>&) override {
    calls.push_back("standby " + model.systemVersion() + " " + kind + " " + day);
  }
  void topEventTrace(Date start, Date end, const std::string& signature, int flags) override {
    calls.push_back(
        format("trace %s %.0f %.0f %d", signature.c_str(), start.secondsSince1970, end.secondsSince1970, flags));
  }
  void topPowerEvents(const Model& model, const std::vector<Range>&, std::size_t count) override {
    calls.push_back("power " + model.systemVersion() + " " + std::to_string(count));
  }
  void topFanEvents(const Model& model, const std::vector<Range>&, std::size_t count) override {
    calls.push_back("fan " + model.systemVersion() + " " + std::to_string(count));
  }
  std::vector<std::string> calls;
};

// The trace line of a span given in wall-clock milliseconds.
std::string trace(const std::string& signature, std::uint64_t startMs, std::uint64_t endMs) {
  return "trace " + signature + " " + std::to_string(startMs / 1000) + " " + std::to_string(endMs / 1000) + " 0";
}

Date at(std::uint64_t wallMs) { return Date::fromMilliseconds(static_cast<double>(wallMs)); }

class DailyRun : public test::MachineFixture {
 protected:
  void SetUp() override {
    MachineFixture::SetUp();
    fake.systemVersion = "B2";
    options.setFrom_path(store.path());
  }

  void now(std::uint64_t wallMs) { fake.nowMicros = static_cast<std::int64_t>(wallMs) * 1000; }
  void writeState(const Dictionary& state) { ASSERT_TRUE(writePropertyListFile(stateFilePath(), Value(state))); }
  Dictionary state() const {
    std::optional<Value> v = readPropertyList(stateFilePath());
    return v && v->is<Dictionary>() ? v->get<Dictionary>() : Dictionary{};
  }
  std::vector<std::string> run() {
    RecordingReports reports;
    runDaily(options, reports);
    return reports.calls;
  }

  test::TempDir store;
  Options options;
};

TEST(DailyDates, DaysRunFromTheDayAfterTheLastReportToYesterday) {
  setenv("TZ", "UTC", 1);
  tzset();
  struct Case {
    std::optional<YearMonthDay> last;
    std::uint64_t now;
    bool debug;
    std::vector<YearMonthDay> expected;
  };
  const std::uint64_t jan4 = kJan1 + 3 * kDay + 10 * kHour;
  const std::uint64_t feb2 = kJan1 + 32 * kDay + 10 * kHour;
  const std::uint64_t mar1 = kJan1 + 60 * kDay + 1;  // 2024 is a leap year
  const Case cases[] = {
      // Two days, none and a debug run's today are in the runs below.
      {YearMonthDay{2024, 1, 31}, feb2, false, {{2024, 2, 1}}},
      {std::nullopt, mar1, false, {{2024, 2, 29}}},
      {std::nullopt, kJan1 + 5, false, {{2023, 12, 31}}},
      {YearMonthDay{2024, 1, 4}, jan4, true, {}},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(datesToReport(c.last, at(c.now), c.debug), c.expected) << c.now << " debug " << c.debug;
  }
}

// The records come hourly and carry no wall time, so a day's range runs
// from its first record to the first record after its end (25 hours), and
// from the zone record, 500 ms into the boot, on the first day.
TEST_F(DailyRun, LastReportThreeDaysAgoReportsTwoDaysInOrderAndSavesTheLater) {
  test::writeBoot(store / "a.stats", test::kBootA, "B2", kJan1, 80);
  writeState({{"LastReportDate", Value(at(kJan1))}, {"LastReportBuild", "B2"}, {"Other", "kept"}});
  now(kJan1 + 3 * kDay + 10 * kHour);
  const std::vector<std::string> trace2 = {trace("com.vexil.Brindlewick.Daily", kJan1 + kDay, kJan1 + 2 * kDay)};
  EXPECT_EQ(run(),
            (std::vector<std::string>{
                "telemetry B2 daily 20240102 90000000", "standby B2 daily 20240102", trace2[0], "power B2 3",
                "fan B2 3", "telemetry B2 daily 20240103 90000000", "standby B2 daily 20240103",
                trace("com.vexil.Brindlewick.Daily", kJan1 + 2 * kDay, kJan1 + 3 * kDay), "power B2 3", "fan B2 3"}));
  const Dictionary saved = state();
  EXPECT_EQ(saved.at("LastReportDate"), Value(at(kJan1 + 2 * kDay)));
  EXPECT_EQ(saved.at("LastReportBuild"), Value("B2"));
  EXPECT_EQ(saved.at("Other"), Value("kept"));

  std::optional<Value> usage = readPropertyList(usageFilePath());
  ASSERT_TRUE(usage && usage->is<Dictionary>());
  EXPECT_EQ(usage->get<Dictionary>().count("2024-01-02"), 1u);
  EXPECT_EQ(usage->get<Dictionary>().count("2024-01-03"), 1u);
}

TEST_F(DailyRun, LastReportYesterdayReportsNothingAndLeavesTheStateFileAlone) {
  test::writeBoot(store / "a.stats", test::kBootA, "B2", kJan1, 80);
  writeState({{"LastReportDate", Value(at(kJan1 + 2 * kDay))}, {"LastReportBuild", "A1"}});
  std::ifstream before(stateFilePath());
  const std::string bytes((std::istreambuf_iterator<char>(before)), {});
  now(kJan1 + 3 * kDay + 10 * kHour);
  EXPECT_EQ(run(), std::vector<std::string>{});
  std::ifstream after(stateFilePath());
  EXPECT_EQ(std::string((std::istreambuf_iterator<char>(after)), {}), bytes);
  EXPECT_FALSE(std::filesystem::exists(usageFilePath()));

  // A debug run reports today as well: nothing left only once today is.
  writeState({{"LastReportDate", Value(at(kJan1 + 3 * kDay))}});
  test::ConsoleCapture console;
  EXPECT_EQ(run(), std::vector<std::string>{});
  EXPECT_NE(console.err.str().find("No dates to report - all done with daily report.\n"), std::string::npos);
}

TEST_F(DailyRun, ABuildChangeReportsThePostInstallHourAndOlderBuildsGetNoTopEvents) {
  // A1 runs Jan 1 to Jan 2 02:00; B2 boots at Jan 2 12:00 for a day.
  test::writeBoot(store / "a.stats", test::kBootA, "A1", kJan1, 26);
  test::writeBoot(store / "b.stats", test::kBootB, "B2", kJan1 + kDay + 12 * kHour, 24, &test::kBootA, "A1");
  writeState({{"LastReportDate", Value(at(kJan1 - kDay))}, {"LastReportBuild", "A1"}});
  now(kJan1 + 3 * kDay + 10 * kHour);
  std::vector<std::string> calls = run();

  std::vector<std::string> a1, b2;
  for (const std::string& c : calls) (c.find(" A1 ") != std::string::npos ? a1 : b2).push_back(c);
  EXPECT_EQ(a1, (std::vector<std::string>{"telemetry A1 daily 20240101 89999500", "standby A1 daily 20240101",
                                          "telemetry A1 daily 20240102 7200000", "standby A1 daily 20240102"}));
  ASSERT_GE(b2.size(), 2u);
  EXPECT_EQ(b2[0], "telemetry B2 postinstall - 3600000");
  const std::uint64_t bootStart = kJan1 + kDay + 12 * kHour;
  EXPECT_EQ(b2[1], trace("com.vexil.Brindlewick.PostInstall", bootStart, bootStart + kHour));
  // The day (00:00:00.5 to 13:00 into the boot) loses the post-install
  // hour; the top events follow each day.
  EXPECT_EQ(b2[2], "telemetry B2 daily 20240102 43200000");
  EXPECT_EQ(b2[4], trace("com.vexil.Brindlewick.Daily", bootStart, kJan1 + 2 * kDay));
  EXPECT_EQ(state().at("LastReportBuild"), Value("B2"));
}

TEST_F(DailyRun, ADebugRunReportsTodayAndWritesNothing) {
  test::writeBoot(store / "a.stats", test::kBootA, "B2", kJan1, 30);
  now(kJan1 + 20 * kHour);
  test::ConsoleCapture console;
  ASSERT_FALSE(run().empty());
  const std::string e = console.err.str();
  EXPECT_NE(e.find("Daily dates to report: (\n    2023-12-31,\n    2024-01-01\n)"), std::string::npos) << e;
  EXPECT_NE(e.find("__saveLastReportYMD_block_invoke: 2024-01-01 00:00:00 +0000"), std::string::npos);
  EXPECT_NE(e.find("__saveLastReportBuild_block_invoke: B2"), std::string::npos);
  EXPECT_NE(console.out.str().find("===== Usage Summary (after) =====\n"), std::string::npos);
  EXPECT_FALSE(std::filesystem::exists(stateFilePath()));
  EXPECT_FALSE(std::filesystem::exists(usageFilePath()));
}

}  // namespace
}  // namespace bw
