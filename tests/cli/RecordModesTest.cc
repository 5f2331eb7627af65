// The record dump, the event listing and the battery plot of the real binary
// over a small multi-boot store, compared as whole outputs.
#include <gtest/gtest.h>

#include <iostream>

#include "cli/RecordModesStore.h"
#include "support/RunTool.h"

namespace bw {
namespace {

class RecordModes : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    store = new test::TempDir();
    test::writeRecordModesStore(*store);
  }
  static void TearDownTestSuite() { delete store; }
  test::ToolResult run(std::vector<std::string> args, const std::string& tz = "UTC") {
    args.insert(args.begin(), {"--from", store->path()});
    test::RunSettings settings;
    settings.env["TZ"] = tz;
    return test::runTool(args, settings);
  }
  static test::TempDir* store;
};
test::TempDir* RecordModes::store = nullptr;

const char* const kModel1Events =
    "2024-01-01 00:00:01\tLogStartsV1\t20A1\tAAAAAAAA-0000-0000-0000-000000000001\t\n"
    "2024-01-01 00:00:02\tTimeChange\n"
    "2024-01-01 00:00:03\tBatteryChargeLevel\t80\t4000\t5000\t12\t\n"
    "2024-01-01 00:00:04\tPowerStateChange\tBattery\n"
    "2024-01-01 00:01:03\tBatteryChargeLevel\t78\t3900\t5000\t12\t\n"
    "2024-01-01 00:01:10\tSleep\n"
    "2024-01-01 00:11:11\tDarkWake from Standby (EC.LidOpen)\n"
    "2024-01-01 00:11:12\tUserIdle\tIdle\n"
    "2024-01-01 "
    "00:15:00\tLogStartsV1\t20A1\tBBBBBBBB-0000-0000-0000-000000000002\tAAAAAAAA-0000-0000-0000-000000000001\n"
    "2024-01-01 00:15:01\tBatteryChargeLevel\t76\t3800\t5000\t12\t\n"
    "2024-01-01 00:15:11\tBatteryChargeLevel\t74\t3700\t5000\t12\t\n";

const char* const kBootCHeader1 =
    "2024-01-01 "
    "00:30:00\tLogStartsV1\t21B5\tCCCCCCCC-0000-0000-0000-000000000003\tBBBBBBBB-0000-0000-0000-000000000002\n";
const char* const kBootCHeader2 =
    "2024-01-01 "
    "01:36:40\tLogStartsV1\t21B5\tCCCCCCCC-0000-0000-0000-000000000003\tBBBBBBBB-0000-0000-0000-000000000002\n";

// Plain listings of each selection. The whole timeline is one range that
// ends at the last record, so each model's last record (the A/C change in
// boot B, the user activity in boot C) is never listed.
TEST_F(RecordModes, EventListingsShowTheSelectedRecordsButEachModelsLast) {
  const std::string all = kModel1Events;
  const struct {
    std::vector<std::string> args;
    std::string out;
  } cases[] = {
      {{"--show-events"},
       all + kBootCHeader1 + "2024-01-01 00:30:00\tDeviceChange\t5\t Wi-Fi (@wlan0)\tconnected\n" + kBootCHeader2},
      // A day starts at the first time-zone record.
      {{"-d", "20240101", "--show-events"}, all.substr(all.find('\n') + 1)},
      // Wall-clock bounds select across boots; an hour ago finds nothing this old.
      {{"-s", "2024-01-01 00:01:00", "-e", "2024-01-01 00:16:00", "--show-events"},
       all.substr(all.find("2024-01-01 00:01:03"))},
      {{"-A", "1", "--show-events"}, ""},
      // Leaving out the post-install hour cuts the updated boot's first hour.
      {{"-I", "--show-events"}, all.substr(all.find("2024-01-01 00:15:00")) + kBootCHeader2},
      // The listing feeds no summarizer, so no state ever held (an unknown
      // state's exit 70 is in TerminalTest).
      {{"-S", "Battery", "--show-events"}, ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(::testing::PrintToString(c.args));
    const test::ToolResult r = run(c.args);
    EXPECT_EQ(r.status, 0);
    EXPECT_EQ(r.err, "");
    EXPECT_EQ(r.out, c.out);
  }
}

TEST_F(RecordModes, EventListingWithDebugShowsPositionsTicksAndOwnWallTimes) {
  test::ToolResult r = run({"--debug", "-b", "20A1", "-R", "3000.667000", "--show-events"});
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.out,
            "3000\t4000\t*2024-01-01 00:00:04 +0000\tPowerStateChange\tBattery\n"
            "62000\t63000\t 2024-01-01 00:01:03 +0000\tBatteryChargeLevel\t78\t3900\t5000\t12\t\n"
            "69000\t70000\t*2024-01-01 00:01:10 +0000\tSleep\n"
            "670000\t71000\t*2024-01-01 00:11:11 +0000\tDarkWake from Standby (EC.LidOpen)\n");
  EXPECT_EQ(r.err, "Adding files from " + store->path() +
                       " recursively (periodic files newer than 0001-01-01 00:00:00 +0000)\n"
                       "Skipping (System Version <20A1>): " +
                       store->path() +
                       "/var/log/com.vexil.launchd.peruser.501/C2.stats\n"
                       "Skipping (System Version <20A1>): " +
                       store->path() +
                       "/var/log/com.vexil.launchd/C1.stats\n"
                       "Selecting events from 3000 to 670000\n");
}

TEST_F(RecordModes, DatesPrintInTheProcesssZoneWhileTheDayFollowsTheRecordedZone) {
  test::ToolResult r = run({"--debug", "-d", "20240101", "-B", "AAAAAAAA-0000-0000-0000-000000000001", "--show-events"},
                           "America/New_York");
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.out,
            "1000\t2000\t*2023-12-31 19:00:02 -0500\tTimeChange\n"
            "2000\t3000\t 2023-12-31 19:00:03 -0500\tBatteryChargeLevel\t80\t4000\t5000\t12\t\n"
            "3000\t4000\t*2023-12-31 19:00:04 -0500\tPowerStateChange\tBattery\n"
            "62000\t63000\t 2023-12-31 19:01:03 -0500\tBatteryChargeLevel\t78\t3900\t5000\t12\t\n"
            "69000\t70000\t*2023-12-31 19:01:10 -0500\tSleep\n"
            "670000\t71000\t*2023-12-31 19:11:11 -0500\tDarkWake from Standby (EC.LidOpen)\n");
  EXPECT_NE(r.err.find("Selecting events from 2024-01-01\n"
                       "Time zone change! Now zone is UTC. Adjusting start/end to 1704067200000-1704153600000\n"),
            std::string::npos);
}

TEST_F(RecordModes, BatteryPlotPrintsFourSectionsOverTheWholeTimeline) {
  test::ToolResult r = run({"-B", "BBBBBBBB-0000-0000-0000-000000000002", "-R", "0.1", "--show-battery"});
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.out,
            "1\t76\n11\t74\n"
            "\n"
            "0\t76\n1\t76\n2\t75.8\n3\t75.6\n4\t75.4\n5\t75.2\n6\t75\n7\t74.8\n8\t74.6\n9\t74.4\n10\t74.2\n11\t74\n"
            "\n"
            "\n"
            "11\t100\n");
}

TEST_F(RecordModes, BatteryPlotMapsSleepsAndPowerSourcesAndHonoursMaskStates) {
  test::ToolResult r = run({"-b", "20A1", "-S", "Battery", "--show-battery"});
  EXPECT_EQ(r.status, 0);
  const std::string out = r.out;
  EXPECT_EQ(out.substr(0, out.find('\n', out.find('\n') + 1) + 1), "2\t80\n62\t78\n");
  EXPECT_NE(out.find("\n\n69\t100\n670\t50\n\n3\t0\n911\t100\n"), std::string::npos) << out.substr(out.size() - 60);
  EXPECT_EQ(run({"-b", "21B5", "-S", "Battery", "--show-battery"}).out, "");
}

// Boot C's header as the dump prints it.
std::string bootCHeader(const std::string& abs, const std::string& wall) {
  return "LogStartsV1 {\n    absoluteTime = " + abs +
         ";\n"
         "    bootUuid = <cccccccc 00000000 00000000 00000003>;\n"
         "    lastBootUuid = <bbbbbbbb 00000000 00000000 00000002>;\n"
         "    lastSystemVersion = 20A1;\n    systemVersion = 21B5;\n    version = 1;\n    wallTime = " +
         wall + ";\n    writer = 1;\n}\n";
}

TEST_F(RecordModes, DumpPrintsEachRecordsDictionaryUnderItsBoot) {
  test::ToolResult r = run({"--dump", "-b", "21B5", "-S", "Sleep", "-I"});
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.err, "");
  EXPECT_EQ(r.out, "===== Boot CCCCCCCC-0000-0000-0000-000000000003 =====\n" + bootCHeader("100", "1704069000100") +
                       "DeviceChange {\n"
                       "    absoluteTime = 200;\n"
                       "    deviceId = wlan0;\n"
                       "    deviceName = Wi-Fi;\n"
                       "    deviceType = 5;\n"
                       "    nowConnected = 1;\n"
                       "}\n" +
                       bootCHeader("4000000", "1704073000000"));
}

}  // namespace
}  // namespace bw
