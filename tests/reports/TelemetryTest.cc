#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <sstream>

#include "Records/BatteryChargeLevel.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/PanelSelfRefresh.h"
#include "cli/DailyRun.h"
#include "cli/DailyStore.h"
#include "cli/Options.h"
#include "cli/ReportState.h"
#include "reports/JournalDailyReports.h"
#include "reports/JournalSink.h"
#include "reports/Telemetry.h"
#include "support/ConsoleCapture.h"
#include "support/FakePlatform.h"
#include "support/MachineFixture.h"
#include "support/TempDir.h"

namespace bw {
namespace {

using test::kHour;
using test::kJan1;

const std::string kKey = "com.vexil.message.";

// Jan 1 2024 (UTC) of one boot of build B2: on battery from the start, idle
// in the second hour, on A/C from 03:00, asleep 04:00-05:00, a dark wake
// until 05:30, asleep again until a wake from standby at 07:00, then awake.
class StoreWriter {
 public:
  explicit StoreWriter(bool battery) : battery_(battery) {
    w_.append(test::logStart(test::kBootA, 1000, kJan1, "B2", nullptr));
    w_.append(test::zoneChange("UTC", 0, 1500, kJan1 + 500));
  }
  template <class R>
  void add(std::uint64_t t, R r) {
    r.setAbsoluteTime(1000 + t);
    w_.append(r);
  }
  void power(std::uint64_t t, std::uint64_t change) { w_.append(test::powerChange(change, 1000 + t, kJan1 + t)); }
  void sleepWake(std::uint64_t t, std::uint32_t reason, bool standby = false) {
    SleepWake s = test::sleepWake(1000 + t, kJan1 + t, reason, standby ? "UserActivity" : "", standby);
    if (standby) s.setEfiMsec(100), s.setImageReadMsec(2000), s.setImagePages(100000);
    w_.append(s);
  }
  void write(const std::string& path) {
    power(1000, battery_ ? 1 : 0);
    add(2000, test::device(5, 1, 0, "dev")), add(2000, test::device(3, 1, 0, "dev"));
    DisplayBrightness b;
    b.setBrightness(50);
    add(2000, b);
    PanelSelfRefresh psr;
    psr.setPsrOn(0), psr.setPsrOff(0);
    add(2000, psr);
    if (battery_) add(2000, test::gaugeAt(0, 4000, 12000));
    add(kHour, test::idle());
    if (battery_) add(kHour, test::gaugeAt(0, 3800, 11800));
    const UserIdle active = test::idle(0, UserIdle::kActive);
    add(2 * kHour, active);
    if (battery_) add(2 * kHour, test::gaugeAt(0, 3600, 11700));
    psr.setPsrOn(1800000), psr.setPsrOff(5400000);
    add(2 * kHour, psr);
    power(3 * kHour, 0);
    sleepWake(4 * kHour, 0);
    sleepWake(5 * kHour, 2);
    sleepWake(5 * kHour + kHour / 2, 0);
    sleepWake(7 * kHour, 1, true);
    for (std::uint64_t h = 8; h <= 25; ++h) add(h * kHour, active);
    w_.writeTo(path);
  }

 private:
  bool battery_;
  StatsFileWriter w_;
};

class Telemetry : public test::MachineFixture {
 protected:
  void SetUp() override {
    MachineFixture::SetUp();
    fake.systemVersion = "B2";
    fake.nowMicros = static_cast<std::int64_t>(kJan1 + 34 * kHour) * 1000;
    writePropertyListFile(stateFilePath(), Value(Dictionary{{"LastReportDate", Value(Date{(kJan1 - 86400000) / 1e3})},
                                                            {"LastReportBuild", "B2"}}));
    options.setFrom_path(store.path());
    // A device's battery comes first by name and is passed over.
    supply.write("hid-mouse/type", "Battery\n");
    supply.write("hid-mouse/scope", "Device\n");
    supply.write("hid-mouse/cycle_count", "7\n");
    supply.write("BAT0/type", "Battery\n");
    supply.write("BAT0/cycle_count", "42\n");
    supply.write("BAT0/charge_full", "4500000\n");
    supply.write("BAT0/charge_full_design", "5000000\n");
    supply.write("BAT0/health", "Good\n");
  }

  // The messages of a daily run over the store.
  std::vector<TelemetryMessage> run(bool battery) {
    StoreWriter(battery).write(store / "day.stats");
    CapturingSink sink;
    JournalDailyReports reports(sink, supply.path());
    runDaily(options, reports);
    return sink.messages;
  }

  test::TempDir store, supply;
  Options options;
};

std::vector<std::string> domains(const std::vector<TelemetryMessage>& messages) {
  std::vector<std::string> d;
  for (const TelemetryMessage& m : messages) d.push_back(m.domain());
  return d;
}

TEST_F(Telemetry, ADayWithBatteryACSleepAndDarkWakeSendsTheSixMessagesThenStandby) {
  const std::vector<TelemetryMessage> messages = run(true);
  const std::vector<std::string> d = domains(messages);
  ASSERT_GE(d.size(), 9u);
  EXPECT_EQ(
      std::vector<std::string>(d.begin(), d.begin() + 9),
      (std::vector<std::string>{
          "com.vexil.telemetry.battery.daily", "com.vexil.telemetry.cstates.daily", "com.vexil.telemetry.memory.daily",
          "com.vexil.telemetry.fan", "com.vexil.telemetry.psr", "com.vexil.telemetry.processes.daily",
          "com.vexil.telemetry.standby", "com.vexil.telemetry.standby.details", "com.vexil.brindlewick.trace"}));
  for (std::size_t i = 0; i < 8; ++i) {
    const auto& f = messages[i].fields();
    ASSERT_GE(f.size(), 5u);
    EXPECT_EQ(f[0], std::pair(kKey + "domain", d[i]));
    EXPECT_EQ(f[1], std::pair(kKey + "reason", std::string("daily")));
    EXPECT_EQ(f[2], std::pair(kKey + "date", std::string("20240101")));
    EXPECT_EQ(f[3], std::pair(kKey + "os_build", std::string("B2")));
    EXPECT_EQ(f[4].first, kKey + "duration");
  }

  const TelemetryMessage& battery = messages[0];
  // On battery and awake from 00:00:01 to 03:00: 400 mAh given.
  const std::pair<const char*, const char*> fields[] = {{"battery-wake.delta_charge", "400"},
                                                        {"battery-wake.delta_charge.duration", "10799"},
                                                        {"battery-idle.delta_charge.duration", "3600"},
                                                        {"battery.cycle_count", "42"},
                                                        {"battery.max_capacity", "4500"},
                                                        {"battery.design_capacity", "5000"},
                                                        {"battery.health", "Good"},
                                                        {"battery-wake.display_brightness", "50"},
                                                        {"device.wi-fi", "yes"},
                                                        {"device.audio", "yes"},
                                                        {"ac-sleep.device.wi-fi", "yes"}};
  for (auto [key, value] : fields) EXPECT_EQ(battery.value(kKey + key), value) << key;
  for (const char* key : {"battery-wake.avg_power", "ac-wake.delta_charge.duration", "ac-sleep.delta_charge.duration",
                          "ac-darkwake.delta_charge.duration"})
    EXPECT_TRUE(battery.value(kKey + key)) << key;

  const TelemetryMessage& psr = messages[4];
  EXPECT_EQ(psr.value(kKey + "psr"), "25");
  EXPECT_TRUE(psr.value(kKey + "psr.duration"));
  EXPECT_TRUE(psr.value(kKey + "battery.duration"));
  EXPECT_FALSE(psr.value(kKey + "battery.psr.duration"));

  const TelemetryMessage& details = messages[7];
  EXPECT_EQ(details.value(kKey + "efi_ms"), "100");
  EXPECT_EQ(details.value(kKey + "wake_type"), "UserActivity");
  EXPECT_EQ(details.value(kKey + "image_read_mb_s"), "205");  // 409.6 MB in 2 s
  EXPECT_EQ(messages[6].value(kKey + "wakes"), "1");

  // The day's trace names its span; the power events follow, ranked.
  EXPECT_EQ(messages[8].value(kKey + "signature"), "com.vexil.Brindlewick.Daily");
  EXPECT_EQ(messages[8].value(kKey + "start"), std::to_string(kJan1 / 1000));
  EXPECT_EQ(messages[8].value(kKey + "end"), std::to_string(kJan1 / 1000 + 86400));
  ASSERT_GE(messages.size(), 10u);
  for (std::size_t i = 9; i < messages.size(); ++i) {
    EXPECT_EQ(messages[i].domain(), "com.vexil.brindlewick.top-power-event");
    EXPECT_EQ(messages[i].value(kKey + "rank"), std::to_string(i - 8));
    EXPECT_TRUE(messages[i].value(kKey + "avg_power"));
  }
  EXPECT_LE(messages.size(), 12u);
}

TEST_F(Telemetry, ADesktopStillSendsTheACAndWakeGroups) {
  const std::vector<TelemetryMessage> messages = run(false);
  ASSERT_FALSE(messages.empty());
  const TelemetryMessage& battery = messages[0];
  EXPECT_EQ(battery.domain(), "com.vexil.telemetry.battery.daily");
  for (const char* key :
       {"ac-wake.delta_charge.duration", "wake-active.delta_charge.duration", "wake-idle.delta_charge.duration"})
    EXPECT_TRUE(battery.value(kKey + key)) << key;
  for (const auto& [key, value] : battery.fields())
    EXPECT_EQ(key.rfind(kKey + "battery-", 0), std::string::npos) << key;
}

TEST(TelemetryFields, JournalFieldsAreUpperCaseWithUnderscores) {
  EXPECT_EQ(journalFieldName("com.vexil.message.battery-wake.avg_power"), "COM_VEXIL_MESSAGE_BATTERY_WAKE_AVG_POWER");
  EXPECT_EQ(journalFieldName("com.vexil.message.device.wi-fi"), "COM_VEXIL_MESSAGE_DEVICE_WI_FI");
  EXPECT_NE(journalMessageId("com.vexil.telemetry.fan"), journalMessageId("com.vexil.telemetry.psr"));
  EXPECT_EQ(journalMessageId("com.vexil.telemetry.fan").size(), 32u);
  TelemetryMessage m("com.vexil.telemetry.fan");
  m.setField("", "samples", "3");
  EXPECT_EQ(syslogLine(m), "com.vexil.telemetry.fan com.vexil.message.samples=3");
}

}  // namespace
}  // namespace bw
