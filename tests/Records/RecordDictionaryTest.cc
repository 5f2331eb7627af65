// The dictionary form of the records: exact keys, value types, presence,
// and the description built on it.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <vector>

#include "RecordTestSupport.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DateChange.h"
#include "Records/LogStartsV1.h"
#include "Records/SleepWake.h"
#include "Records/SmcKeys.h"
#include "Records/UserIdle.h"

namespace bw {
namespace {

// Every dictionary key of every class, in field-number order.
const std::map<RecordClass, std::vector<std::string>> kKeys = {
    {RecordClass::BatteryChargeLevel,
     {"absoluteTime", "charge", "maxCharge", "cycleCount", "instantAmperage", "instantVoltage",
      "timeSinceLastCharge", "lastMinuteWattage", "estimatedTimeRemaining", "smoothedEstimatedTimeRemaining",
      "isFullyCharged"}},
    {RecordClass::SleepWake,
     {"absolute_time", "wall_time", "reason", "wake_from_standby", "wake_type", "efi_msec", "booter_msec",
      "trampoline_msec", "image_read_msec", "image_pages", "image1_pages", "wake_notification_msec",
      "lock_screen_ready_msec", "graphics_ready_msec", "record_write_absolute_time", "xcpm_deep_idle_stats"}},
    {RecordClass::PanelSelfRefresh,
     {"absolute_time", "psr_off", "psr_transit", "psr_on", "psr_sleep", "dpb_off", "dpb_on"}},
    {RecordClass::LogStartsV0,
     {"version", "absoluteTime", "wallTime", "bootUuid", "systemVersion", "lastBootUuid"}},
    {RecordClass::LogStartsV1,
     {"version", "absoluteTime", "wallTime", "writer", "bootUuid", "systemVersion", "lastBootUuid", "isFirst",
      "lastSystemVersion"}},
    {RecordClass::SmcKeys, {"absolute_time", "keys"}},
    {RecordClass::SmcKey, {"key", "s64value", "u64value", "dvalue", "bvalue"}},
    {RecordClass::PowerStateChange, {"absoluteTime", "change", "isFullyCharged", "wallTime"}},
    {RecordClass::DateChange, {"absoluteTime", "wallTime", "reason", "newYday"}},
    {RecordClass::TimeChange, {"absoluteTime", "wallTime", "reason", "gmtoff", "zoneName", "yday", "year"}},
    {RecordClass::Cstates, {"absolute_time", "is_core", "core", "states"}},
    {RecordClass::Cstate, {"level", "residency"}},
    {RecordClass::PackageEnergyStatistics,
     {"absolute_time", "energy_model_millijoules", "pkg_c0_residency", "pkg_cany_residency",
      "pkg_cmax_residency", "pkg_freq", "pkg_freq_nominal", "maxbusdelay", "qos_bg_time", "qos_idle_time"}},
    {RecordClass::DeviceChange,
     {"absoluteTime", "deviceType", "deviceName", "deviceId", "nowConnected", "registryEntryId"}},
    {RecordClass::FanState, {"absolute_time", "loudness", "highest_rpm"}},
    {RecordClass::SystemIO,
     {"absoluteTime", "diskReadOps", "diskWriteOps", "diskBytesRead", "diskBytesWritten", "networkPacketsIn",
      "networkPacketsOut", "networkBytesIn", "networkBytesOut"}},
    {RecordClass::DisplayBrightness, {"absoluteTime", "brightness"}},
    {RecordClass::SystemMemory,
     {"absoluteTime",
      "freeCount",
      "wiredCount",
      "compressorPageCount",
      "purgeableCount",
      "purges",
      "faults",
      "zeroFills",
      "reactivations",
      "pageins",
      "pageouts",
      "decompressions",
      "compressions",
      "swapins",
      "swapouts",
      "compressedPageCount",
      "internalPageCount",
      "externalPageCount",
      "ioaccelAllocatedSize",
      "ioaccelResidentSize",
      "ioaccelWiredSize",
      "ioaccelDirtySize",
      "ioaccelCachedSize",
      "ioaccelPurgeableSize",
      "memorySize",
      "pageSize",
      "swapDeviceIsSsd"}},
    {RecordClass::UserIdle, {"absoluteTime", "change"}},
    {RecordClass::Interrupts, {"absoluteTime", "vectors"}},
    {RecordClass::InterruptVector, {"cpuNumber", "interruptCount", "vectorName"}},
    {RecordClass::BluetoothPowerResidency, {"absoluteTime", "timeOff", "timeOn", "timeSleep", "timeIdle"}},
    {RecordClass::ProcessUsage,
     {"name",
      "pid",
      "exitStatus",
      "uuid",
      "userTime",
      "systemTime",
      "pkgIdleWkups",
      "interruptWkups",
      "pageins",
      "wiredSize",
      "residentSize",
      "physFootprint",
      "procStartAbstime",
      "procExitAbstime",
      "nowAbstime",
      "ppid",
      "responsiblePid",
      "uid",
      "childUserTime",
      "childSystemTime",
      "childPkgIdleWkups",
      "childInterruptWkups",
      "childPageins",
      "childElapsedAbstime",
      "ioaccelAllocatedSize",
      "ioaccelResidentSize",
      "ioaccelWiredSize",
      "ioaccelDirtySize",
      "ioaccelCachedSize",
      "ioaccelPurgeableSize",
      "displayName",
      "uniqueid",
      "parentUniqueid",
      "responsibleUniqueid"}},
};

std::vector<std::string> keysOf(const Dictionary& d) {
  std::vector<std::string> keys;
  for (const auto& [key, value] : d) keys.push_back(key);
  return keys;
}

TEST(RecordDictionary, EveryFieldSetShowsEveryKeyOfItsClass) {
  ASSERT_EQ(kKeys.size(), static_cast<std::size_t>(kRecordClassCount));
  std::mt19937_64 random(5);
  for (const auto& [recordClass, expectedKeys] : kKeys) {
    std::unique_ptr<Record> record = makeRecord(recordClass);
    // Repeat until the random filler has set every optional field once.
    for (int i = 0; i < 64; ++i) test::fillRandomly(*record, random);
    std::vector<std::string> sorted = expectedKeys;
    std::sort(sorted.begin(), sorted.end());
    EXPECT_EQ(keysOf(record->dictionaryRepresentation()), sorted) << recordClassName(recordClass);
  }
}

TEST(RecordDictionary, AnEmptyRecordShowsOnlyItsRequiredScalars) {
  EXPECT_EQ(keysOf(UserIdle().dictionaryRepresentation()),
            (std::vector<std::string>{"absoluteTime", "change"}));
  EXPECT_EQ(keysOf(BatteryChargeLevel().dictionaryRepresentation()),
            (std::vector<std::string>{"charge", "cycleCount", "maxCharge"}));
  // A required string counts as absent until set; an empty repeated field is absent.
  EXPECT_EQ(keysOf(LogStartsV1().dictionaryRepresentation()),
            (std::vector<std::string>{"absoluteTime", "wallTime"}));
  EXPECT_EQ(keysOf(Cstates().dictionaryRepresentation()), (std::vector<std::string>{"absolute_time"}));
  EXPECT_TRUE(Cstate().dictionaryRepresentation().empty());
}

TEST(RecordDictionary, SleepWakeUsesSnakeCaseAndDateChangeCamelCase) {
  SleepWake sleep;
  sleep.setAbsoluteTime(1);
  sleep.setWallTime(2);
  DateChange date;
  date.setAbsoluteTime(1);
  date.setWallTime(2);
  date.setNewYday(3);
  EXPECT_EQ(sleep.dictionaryRepresentation(),
            (Dictionary{{"absolute_time", Value(1u)}, {"wall_time", Value(2u)}}));
  EXPECT_EQ(date.dictionaryRepresentation(),
            (Dictionary{{"absoluteTime", Value(1u)}, {"wallTime", Value(2u)}, {"newYday", Value(3u)}}));
}

TEST(RecordDictionary, ValuesKeepTheirKinds) {
  BatteryChargeLevel level;
  level.setAbsoluteTime(10);
  level.setCharge(-3);
  level.setIsFullyCharged(false);
  EXPECT_EQ(level.dictionaryRepresentation(), (Dictionary{{"absoluteTime", Value(std::uint64_t{10})},
                                                          {"charge", Value(std::int64_t{-3})},
                                                          {"maxCharge", Value(std::int64_t{0})},
                                                          {"cycleCount", Value(std::int64_t{0})},
                                                          {"isFullyCharged", Value(false)}}));

  SmcKey key;
  key.setKey("TB0T");
  key.setDvalue(31.5);
  key.setBvalue(std::string("\x01\x00\xff", 3));
  EXPECT_EQ(key.dictionaryRepresentation(),
            (Dictionary{
                {"key", Value("TB0T")}, {"dvalue", Value(31.5)}, {"bvalue", Value(Data{0x01, 0x00, 0xff})}}));
}

TEST(RecordDictionary, RepeatedFieldsAreArraysOfTheElementsDictionaries) {
  Cstates states;
  states.setAbsoluteTime(5);
  Cstate first;
  first.setLevel(1);
  Cstate second;
  second.setResidency(9);
  states.addStates(first);
  states.addStates(second);
  EXPECT_EQ(states.dictionaryRepresentation(),
            (Dictionary{{"absolute_time", Value(5u)},
                        {"states", Value(Array{Value(Dictionary{{"level", Value(1u)}}),
                                               Value(Dictionary{{"residency", Value(9u)}})})}}));
}

TEST(RecordDictionary, DescriptionIsTheDefaultDescriptionThenTheDictionary) {
  UserIdle idle;
  idle.setAbsoluteTime(42);
  idle.setChange(1);
  const std::string text = idle.description();
  EXPECT_EQ(text.rfind("<UserIdle: 0x", 0), 0u) << text;
  const std::string tail = "> {\n    absoluteTime = 42;\n    change = 1;\n}";
  ASSERT_GE(text.size(), tail.size());
  EXPECT_EQ(text.substr(text.size() - tail.size()), tail);
}

}  // namespace
}  // namespace bw
