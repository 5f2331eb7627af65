// The dashboard of the real binary over small stores written here, compared
// as whole texts or by the lines a case is about; and the byte sizes the
// stores do not reach.
#include <gtest/gtest.h>

#include <sstream>

#include "Records/DeviceChange.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/SystemIO.h"
#include "cli/RecordModesStore.h"
#include "reports/ReportText.h"
#include "summarizers/ProcessRecords.h"
#include "support/RunTool.h"

namespace bw {
namespace {

using test::kBootA;
using test::kBootB;
using test::kJan1;
using test::Sample;

constexpr std::uint64_t kMiB = 1048576, kGiB = 1073741824;

BatteryChargeLevel gauge(std::uint64_t abs, std::int64_t charge) { return test::gaugeAt(abs, charge, 12000); }

// Two boots of version 20A1, one hour apart (positions are ms from boot A's
// first record; boot B starts at 7,200,000 by the wall clock).
// Boot A, positions 0 to 3,600,000: awake, on battery (the laptop) or A/C
// (the desktop), idle from 1,800,000; gauge 4000 -> 3500 of 5000 mAh at
// 12 V; package residency 0.9 per ms at 2 GHz; 2 GiB read from disk;
// Wi-Fi connected; App (started before the boot's first record, 36 s of
// CPU, 3600 interrupts, 7200 idle wake-ups, 100 MiB) and helper (its child,
// 18 s, 90 interrupts, 1 MiB).
// Boot B, positions 7,200,000 to 9,000,000: awake and active on A/C, the
// laptop charging 3500 -> 3700; residency 0.8 per ms; two Tool processes
// (60 s and 30 s, 600 and 300 interrupts, 1 GiB each).
void writeTwoBootStore(const test::TempDir& dir, bool laptop) {
  StatsFileWriter a;
  a.append(test::logStart(kBootA, 1000, kJan1 + 1000, "20A1", nullptr));
  a.append(test::powerChange(laptop ? 1 : 0, 1000, kJan1 + 1000));
  if (laptop) a.append(gauge(1000, 4000));
  a.append(test::packageSample(1000, 500)), a.append(test::diskRead(1000, 0));
  a.append(test::device(DeviceChange::kWiFi, 1, 1000, "Built-in Wi-Fi", "wlan0"));
  Sample app{.uniqueid = 10, .at = 2000, .name = "App", .responsible = 10, .start = 500, .resident = 100 * kMiB};
  Sample helper{.uniqueid = 11, .at = 2000, .name = "helper", .parent = 10, .start = 1500, .resident = kMiB};
  a.append(test::processUsage(app)), a.append(test::processUsage(helper));
  a.append(test::idle(1801000));
  if (laptop) a.append(gauge(3601000, 3500));
  a.append(test::packageSample(3601000, 500 + 3240000)), a.append(test::diskRead(3601000, 2 * kGiB));
  app.at = helper.at = 3601000;
  app.cpuMs = 36000, app.interrupts = 3600, app.idle = 7200;
  helper.cpuMs = 18000, helper.interrupts = 90;
  a.append(test::processUsage(app)), a.append(test::processUsage(helper));
  a.writeTo(dir.write("var/db/brindlewick/A.stats"));

  StatsFileWriter b;
  b.append(test::logStart(kBootB, 1000, kJan1 + 7201000, "20A1", &kBootA, "20A1"));
  b.append(test::powerChange(0, 1000, kJan1 + 7201000));
  if (laptop) b.append(gauge(1000, 3500));
  b.append(test::packageSample(1000, 500));
  Sample tool1{.uniqueid = 20, .at = 2000, .name = "Tool", .start = 1500, .resident = kGiB};
  Sample tool2{.uniqueid = 21, .at = 2000, .name = "Tool", .start = 1500, .resident = kGiB};
  b.append(test::processUsage(tool1)), b.append(test::processUsage(tool2));
  if (laptop) b.append(gauge(1801000, 3700));
  b.append(test::packageSample(1801000, 500 + 1440000));
  tool1.at = tool2.at = 1801000;
  tool1.cpuMs = 60000, tool1.interrupts = 600;
  tool2.cpuMs = 30000, tool2.interrupts = 300;
  b.append(test::processUsage(tool1)), b.append(test::processUsage(tool2));
  b.writeTo(dir.write("var/db/brindlewick/B.stats"));
}

class Dashboard : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    laptop = new test::TempDir();
    desktop = new test::TempDir();
    writeTwoBootStore(*laptop, true);
    writeTwoBootStore(*desktop, false);
  }
  static void TearDownTestSuite() { delete laptop, delete desktop; }
  static std::string run(const test::TempDir& store, std::vector<std::string> args) {
    args.insert(args.begin(), {"--from", store.path()});
    test::RunSettings settings;
    settings.env["TZ"] = "UTC";
    test::ToolResult r = test::runTool(args, settings);
    EXPECT_EQ(r.status, 0) << r.err;
    EXPECT_EQ(r.err, "");
    return r.out;
  }
  static bool has(const std::string& text, const std::string& line) {
    return text.find("\n" + line + "\n") != std::string::npos;
  }
  static test::TempDir* laptop;
  static test::TempDir* desktop;
};
test::TempDir* Dashboard::laptop = nullptr;
test::TempDir* Dashboard::desktop = nullptr;

// The I/O figures of the laptop store at a rate of `rate` KB/s.
std::string io(const std::string& rate) {
  return "          Disk Reads:\t         0\n         Disk Writes:\t         0\n"
         "          Bytes Read:\t    2048.0 MB (     " +
         rate +
         " KB/s)\n"
         "       Bytes Written:\t       0.0 KB (       0.0 KB/s)\n\n"
         "        Packets Sent:\t         0\n    Packets Received:\t         0\n"
         "          Bytes Sent:\t       0.0 KB (       0.0 KB/s)\n"
         "      Bytes Received:\t       0.0 KB (       0.0 KB/s)\n";
}

// Boot A's hour, as the battery ranking and the CPU ranking both print it.
const std::string kBootAHour = R"(                Time:	2024-01-01 00:00:01 to 2024-01-01 01:00:01 (01:00:00)
               Power:	-6000 mW (-10.0 %/hr)
      Avg. Frequency:	2.000 GHz
         C-State Res:	90.0%
    Process Intrpts.:	3690
            CPU Time:	00:00:54 (1.5%)
                  	00:00:36 (1.0%)  	3600	App
                  	00:00:18 (0.5%)  	90	helper
                  	00:00:00 (0.0%)  	0	Tool
)";

// Derived by hand from the store above. Total: positions 0 to 9,000,000 =
// 02:30:00. Wake: A's hour and B's half hour; active: A until 1,800,000 and
// all of B; on battery: A. Battery lines: 500 mAh of 5000 in one hour is
// -10 %/hr; -0.5 Ah x 12 V / 1 h = -6000 mW; each half hour uses 250 mAh;
// states that never held have no capacity: 0 / 0 prints "nan". Residency:
// (0.9 x 3,600,000 + 0.8 x 1,800,000) / 5,400,000 = 86.7 %; A/C is B only
// (80 %), battery is A only (90 %); idle on A/C never happened. I/O: the
// absolute pieces last 5400 s, so 2 GiB is 388.4 KB/s, and 582.5 KB/s over
// A's own hour. Processes: 36 + 18 + 90 s = 00:02:24, 2.7 % of 5400 s;
// 3600 + 90 + 900 interrupts; helper and the two Tools started inside the
// ranges, App before; a job's resident size is its largest process's
// (Tool: 1 GiB, printed in MB); 1 MiB is not above 1 MiB and prints in KB.
// Battery use ranks A's hour alone (B charges); CPU activity ranks lowest residency first, B then A;
// within a range jobs of equal CPU time go by label. Wi-Fi: A's hour, 40 %
// of the total.
const std::string kLaptopDashboard = R"(
Summary
=======
      System Version:	20A1
          Total Time:	02:30:00

Usage
=====
         Time on A/C:	00:30:00
     Time on Battery:	01:00:00
           Wake Time:	01:30:00
         User Active:	01:00:00
           User Idle:	00:30:00
      Dark Wake Time:	00:00:00
          Sleep Time:	00:00:00
        Standby Time:	00:00:00


Battery
=======
Time on Battery	-10.0 %/hr	 -500 mAh	-6000 mW
Wake	-10.0 %/hr	 -500 mAh	-6000 mW
User Active	-10.0 %/hr	 -250 mAh	-6000 mW
User Idle	-10.0 %/hr	 -250 mAh	-6000 mW
Dark Wake	nan %/hr	    0 mAh	0 mW
Sleep	nan %/hr	    0 mAh	0 mW
Standby	nan %/hr	    0 mAh	0 mW


CPU Summary
===========
      Avg. Frequency:	2.000 GHz
         C-State Res:	86.7%
                 A/C:	80.0%
         User Active:	80.0%
             Battery:	90.0%
         User Active:	90.0%
           User Idle:	90.0%


I/O Summary
===========
)" + io("388.4") +
                                     R"(
Top I/O Activity
================
                Time:	2024-01-01 00:00:01 to 2024-01-01 01:00:01 (01:00:00)
)" + io("582.5") +
                                     R"(

Processes
=========
           Wake Time:	01:30:00
            CPU Time:	00:02:24 (2.7%)
          Interrupts:	4590
    Process Launches:	3

Top CPU Time:
00:01:30	1.7%	Tool
00:00:36	0.7%	App
00:00:18	0.3%	helper

Top Interrupts / Idle Wakeups:
   3600 (0.7/sec)	   7200 wkups (1.3/sec)	App
    900 (0.2/sec)	      0 wkups (0.0/sec)	Tool
     90 (0.0/sec)	      0 wkups (0.0/sec)	helper

Top Process Launches:
      2	Tool
      1	helper
      0	App

Top Resident Size:
    1024.0 MB	Tool
     100.0 MB	App
    1024.0 KB	helper


Top Battery Usage
=================
)" + kBootAHour +
                                     R"(

Top CPU Activity
================
                Time:	2024-01-01 02:00:01 to 2024-01-01 02:30:01 (00:30:00)
      Avg. Frequency:	2.000 GHz
         C-State Res:	80.0%
    Process Intrpts.:	900
            CPU Time:	00:01:30 (5.0%)
                  	00:01:30 (5.0%)  	900	Tool
                  	00:00:00 (0.0%)  	0	App
                  	00:00:00 (0.0%)  	0	helper

)" + kBootAHour +
                                     R"(

Connected Devices
=================
            Wi-Fi on:	01:00:00 (40% of total)
     Discrete GPU on:	00:00:00 (0% of total)
        Bluetooth on:	00:00:00 (0% of total)

Wi-Fi Devices
 - Built-in Wi-Fi
)";

std::vector<std::string> lines(const std::string& text) {
  std::vector<std::string> out;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) out.push_back(line);
  return out;
}

TEST_F(Dashboard, LaptopStorePrintsEverySectionAsDerived) {
  // The default command, --dashboard and mode 1 are one and the same.
  const std::string text = run(*laptop, {});
  EXPECT_EQ(run(*laptop, {"--dashboard"}), text);
  const std::vector<std::string> got = lines(text), expected = lines(kLaptopDashboard);
  for (std::size_t i = 0; i < std::max(got.size(), expected.size()); ++i) {
    EXPECT_EQ(i < got.size() ? got[i] : "<none>", i < expected.size() ? expected[i] : "<none>") << "line " << i + 1;
  }
}

TEST_F(Dashboard, DesktopShowsNoBatteryFiguresUnlessAll) {
  const std::string plain = run(*desktop, {});
  for (const char* line : {"         Time on A/C:\t01:30:00", "Battery", "                 A/C:\t86.7%",
                           "             Battery:\t90.0%", "Top Battery Usage"}) {
    EXPECT_FALSE(has(plain, line)) << line;
  }
  EXPECT_TRUE(has(plain, "         User Active:\t85.0%"));  // (0.9 + 0.8) / 2
  EXPECT_TRUE(has(plain, "           User Idle:\t90.0%"));
  EXPECT_TRUE(has(plain, "Top CPU Activity"));

  const std::string all = run(*desktop, {"--all"});
  for (const char* line : {"         Time on A/C:\t01:30:00", "     Time on Battery:\t00:00:00", "Battery",
                           "Time on Battery\tnan %/hr\t    0 mAh\t0 mW", "                 A/C:\t86.7%",
                           "All I/O Activity", "All Battery Usage", "All CPU Activity"}) {
    EXPECT_TRUE(has(all, line)) << line;
  }
  // Never on battery: no battery C-state line even with --all (no number).
  EXPECT_FALSE(has(all, "             Battery:\t90.0%"));
  EXPECT_EQ(all.find("Top "), std::string::npos);
}

TEST_F(Dashboard, IncludingSubjobsChangesTheOwnersLineButNotTheTotals) {
  const std::string plain = run(*laptop, {}), with = run(*laptop, {"-J"});
  EXPECT_TRUE(has(plain, "00:00:36\t0.7%\tApp"));
  EXPECT_TRUE(has(with, "00:00:54\t1.0%\tApp"));  // its own 36 s and helper's 18 s
  EXPECT_TRUE(has(with, "00:00:18\t0.3%\thelper"));
  for (const char* total :
       {"            CPU Time:\t00:02:24 (2.7%)", "          Interrupts:\t4590", "    Process Launches:\t3"}) {
    EXPECT_TRUE(has(plain, total)) << total;
    EXPECT_TRUE(has(with, total)) << total;
  }
}

TEST(ReportText, LongLabelsRunOnAndBytesChooseTheirUnit) {
  std::ostringstream o;
  printLabelLine(o, std::string(21, 'x'), "v");
  EXPECT_EQ(o.str(), std::string(21, 'x') + ":\tv\n");
  EXPECT_EQ(byteText(1048577), "       1.0 MB");
  EXPECT_EQ(byteText(1.073741824e12), " 1024000.0 MB");  // GB only above 1000 GiB
  EXPECT_EQ(byteText(2.147483648e12), "    2000.0 GB");
}

}  // namespace
}  // namespace bw
