// The one-line texts of the twelve classes that have one.
#include <gtest/gtest.h>

#include <functional>
#include <set>

#include "RecordTestSupport.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/Interrupts.h"
#include "Records/LogStartsV1.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/PowerStateChange.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"

namespace bw {
namespace {

struct TextCase {
  const char* name;
  std::function<std::unique_ptr<Record>()> make;
  std::string expected;
};

class OneLineText : public ::testing::TestWithParam<TextCase> {};

TEST_P(OneLineText, MatchesTheExpectedText) {
  std::optional<std::string> text = GetParam().make()->prettyPrint();
  ASSERT_TRUE(text.has_value());
  EXPECT_EQ(*text, GetParam().expected);
}

template <class T, class Setup>
std::function<std::unique_ptr<Record>()> build(Setup setup) {
  return [setup]() -> std::unique_ptr<Record> {
    auto record = std::make_unique<T>();
    setup(*record);
    return record;
  };
}

const Uuid kBoot = *Uuid::parse("0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F0");
const Uuid kLastBoot = *Uuid::parse("12345678-9ABC-DEF0-0FED-CBA987654321");

std::string rawBytes(const Uuid& u) { return std::string(u.bytes().begin(), u.bytes().end()); }

ProcessUsage exitedProcess() {
  ProcessUsage p;
  p.setName("mds");
  p.setPid(321);
  p.setUserTime(2'500'000'000);
  p.setSystemTime(600'999'999);
  p.setInterruptWkups(42);
  p.setResidentSize(1048576);
  p.setProcStartAbstime(1000);
  p.setProcExitAbstime(3'723'000);
  p.setNowAbstime(9'000'000);
  return p;
}

InterruptVector vector(std::uint32_t cpu, const char* name, std::uint64_t count) {
  InterruptVector v;
  v.setCpuNumber(cpu);
  v.setVectorName(name);
  v.setInterruptCount(count);
  return v;
}

Cstate state(std::uint64_t level, std::uint64_t residency) {
  Cstate s;
  s.setLevel(level);
  s.setResidency(residency);
  return s;
}

INSTANTIATE_TEST_SUITE_P(
    Records, OneLineText,
    ::testing::Values(
        TextCase{"LogStartsV1WithRawAndTextUuids", build<LogStartsV1>([](LogStartsV1& r) {
                   r.setSystemVersion("23A344");
                   r.setBootUuid(rawBytes(kBoot));
                   r.setLastBootUuid(kLastBoot.string());
                 }),
                 "LogStartsV1\t23A344\t0F1E2D3C-4B5A-6978-8796-A5B4C3D2E1F0\t12345678-9ABC-DEF0-0FED-"
                 "CBA987654321"},
        TextCase{"LogStartsV1WithNothing", build<LogStartsV1>([](LogStartsV1&) {}), "LogStartsV1\t\t\t"},
        TextCase{"BatteryChargeLevel", build<BatteryChargeLevel>([](BatteryChargeLevel& r) {
                   r.setCharge(4321);
                   r.setMaxCharge(5000);
                   r.setCycleCount(12);
                 }),
                 "BatteryChargeLevel\t86.4\t4321\t5000\t12\t"},
        TextCase{"BatteryChargeLevelFull", build<BatteryChargeLevel>([](BatteryChargeLevel& r) {
                   r.setCharge(5000);
                   r.setMaxCharge(5000);
                 }),
                 "BatteryChargeLevel\t100\t5000\t5000\t0\t"},
        TextCase{"BatteryChargeLevelNegative", build<BatteryChargeLevel>([](BatteryChargeLevel& r) {
                   r.setCharge(-1);
                   r.setMaxCharge(3);
                   r.setCycleCount(-7);
                 }),
                 "BatteryChargeLevel\t-33.3\t-1\t3\t-7\t"},
        TextCase{"BatteryChargeLevelWithoutMaxCharge",
                 build<BatteryChargeLevel>([](BatteryChargeLevel& r) { r.setCharge(10); }),
                 "BatteryChargeLevel\tinf\t10\t0\t0\t"},
        TextCase{"PowerStateChangeAC", build<PowerStateChange>([](PowerStateChange&) {}),
                 "PowerStateChange\tA/C"},
        TextCase{"PowerStateChangeBattery",
                 build<PowerStateChange>([](PowerStateChange& r) { r.setChange(2); }),
                 "PowerStateChange\tBattery"},
        TextCase{"SleepWakeSleep", build<SleepWake>([](SleepWake& r) { r.setWakeType("ignored"); }), "Sleep"},
        TextCase{"SleepWakeWake", build<SleepWake>([](SleepWake& r) {
                   r.setReason(1);
                   r.setWakeType("EC.LidOpen");
                 }),
                 "Wake (EC.LidOpen)"},
        TextCase{"SleepWakeDarkWakeFromStandby", build<SleepWake>([](SleepWake& r) {
                   r.setReason(2);
                   r.setWakeFromStandby(true);
                   r.setWakeType("X");
                 }),
                 "DarkWake from Standby (X)"},
        TextCase{"SleepWakeOtherReasonWithoutType", build<SleepWake>([](SleepWake& r) { r.setReason(3); }),
                 "Wake ()"},
        TextCase{"UserIdleActive", build<UserIdle>([](UserIdle&) {}), "UserIdle\tActive"},
        TextCase{"UserIdleIdle", build<UserIdle>([](UserIdle& r) { r.setChange(7); }), "UserIdle\tIdle"},
        TextCase{"ProcessUsageExited", build<ProcessUsage>([](ProcessUsage& r) {
                   r = exitedProcess();
                   r.setExitStatus(0);
                 }),
                 "ProcessUsage\t0\t 3100 msec\t01:02:02\t    42 intr wkups\tresident  1048576\t321 [mds]"},
        TextCase{"ProcessUsageWithoutExitStatus",
                 build<ProcessUsage>([](ProcessUsage& r) { r = exitedProcess(); }),
                 "ProcessUsage\t0\t 3100 msec\t01:02:02\t    42 intr wkups\tresident  1048576\t321 [mds]"},
        TextCase{"ProcessUsageFailed", build<ProcessUsage>([](ProcessUsage& r) {
                   r = exitedProcess();
                   r.setExitStatus(-2);
                 }),
                 "ProcessUsage\t-2\t 3100 msec\t01:02:02\t    42 intr wkups\tresident  1048576\t321 [mds]"},
        TextCase{"ProcessUsageRunning", build<ProcessUsage>([](ProcessUsage& r) {
                   r = exitedProcess();
                   r.setExitStatus(-1);
                 }),
                 "ProcessUsage\t-\t 3100 msec\t02:29:59\t    42 intr wkups\tresident  1048576\t321 [mds]"},
        TextCase{"ProcessUsageSampled", build<ProcessUsage>([](ProcessUsage& r) {
                   r = exitedProcess();
                   r.setExitStatus(-3);
                 }),
                 "ProcessUsage\tS\t 3100 msec\t00:00:00\t    42 intr wkups\tresident  1048576\t321 [mds]"},
        TextCase{"ProcessUsageEmpty", build<ProcessUsage>([](ProcessUsage&) {}),
                 "ProcessUsage\t0\t    0 msec\t00:00:00\t     0 intr wkups\tresident        0\t0 []"},
        TextCase{"PackageEnergyStatistics", build<PackageEnergyStatistics>([](PackageEnergyStatistics& r) {
                   r.setPkgCanyResidency(987);
                 }),
                 "PackageEnergyStatistics\t987"},
        TextCase{"PackageEnergyStatisticsAbsent",
                 build<PackageEnergyStatistics>([](PackageEnergyStatistics& r) {
                   r.setPkgCanyResidency(987);
                   r.setHasPkgCanyResidency(false);
                 }),
                 "PackageEnergyStatistics\t0"},
        TextCase{"DeviceChangeConnected", build<DeviceChange>([](DeviceChange& r) {
                   r.setDeviceType(3);
                   r.setDeviceName("Magic Mouse");
                   r.setDeviceId("0x1234");
                   r.setNowConnected(1);
                 }),
                 "DeviceChange\t3\t Magic Mouse (@0x1234)\tconnected"},
        TextCase{"DeviceChangeDisconnected", build<DeviceChange>([](DeviceChange& r) { r.setDeviceType(4); }),
                 "DeviceChange\t4\t  (@)\tdisconnected"},
        TextCase{"InterruptsGroupedByCpu", build<Interrupts>([](Interrupts& r) {
                   r.addVectors(vector(1, "timer", 50));
                   r.addVectors(vector(0, "hpet", 10));
                   r.addVectors(vector(1, "ipi", 7));
                   r.addVectors(vector(0, "nvme", 3));
                 }),
                 "Interrupts\nCPU 0\n\tVector hpet:\t10 interrupts\n\tVector nvme:\t3 interrupts\n"
                 "CPU 1\n\tVector timer:\t50 interrupts\n\tVector ipi:\t7 interrupts\n"},
        TextCase{"InterruptsEmpty", build<Interrupts>([](Interrupts&) {}), "Interrupts\n"},
        TextCase{"CstatesPackage", build<Cstates>([](Cstates& r) {
                   r.setCore(-1);
                   r.addStates(state(1, 500));
                   r.addStates(state(6, 1234567));
                 }),
                 "Package C-state detail: C1     500   C6 1234567   "},
        TextCase{"CstatesCoreZeroIsNotThePackage", build<Cstates>([](Cstates& r) {
                   r.setIsCore(false);
                   r.setCore(0);
                 }),
                 "Core 0 C-state detail: "},
        TextCase{"CstatesCore", build<Cstates>([](Cstates& r) {
                   r.setIsCore(true);
                   r.setCore(3);
                   r.addStates(state(3, 12345678));
                 }),
                 "Core 3 C-state detail: C3 12345678   "},
        TextCase{"DisplayBrightness",
                 build<DisplayBrightness>([](DisplayBrightness& r) { r.setBrightness(75); }),
                 "DisplayBrightness\t75%"},
        TextCase{"FanState", build<FanState>([](FanState& r) {
                   r.setLoudness(2);
                   r.setHighestRpm(3500);
                 }),
                 "FanState\t2 (3500 rpm)"},
        TextCase{"FanStateNegativeLoudness", build<FanState>([](FanState& r) { r.setLoudness(-1); }),
                 "FanState\t4294967295 (0 rpm)"}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(OneLineText, OnlyTheTwelveClassesHaveOne) {
  const std::set<RecordClass> withText = {
      RecordClass::BatteryChargeLevel, RecordClass::SleepWake,    RecordClass::LogStartsV1,
      RecordClass::PowerStateChange,   RecordClass::Cstates,      RecordClass::PackageEnergyStatistics,
      RecordClass::DeviceChange,       RecordClass::FanState,     RecordClass::DisplayBrightness,
      RecordClass::UserIdle,           RecordClass::ProcessUsage, RecordClass::Interrupts,
  };
  for (RecordClass c : test::allRecordClasses())
    EXPECT_EQ(makeRecord(c)->prettyPrint().has_value(), withText.count(c) == 1) << recordClassName(c);
}

}  // namespace
}  // namespace bw
