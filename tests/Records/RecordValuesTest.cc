// What records show of their fields: the dictionary form (exact keys; the
// value kinds are pinned by the schema cross-check), the one-line texts of the
// twelve classes that have one (those the event listing shows are checked
// there), absolute times, the boot UUIDs of headers, and the assertions that
// stop a write without a required string.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <map>
#include <random>
#include <set>

#include "RecordTestSupport.h"
#include "Records/LogStartsV0.h"
#include "Records/LogStartsV1.h"
#include "Records/SmcKeys.h"

namespace bw {
namespace {

using C = RecordClass;

// Every dictionary key of every class, in field-number order.
const std::map<RecordClass, std::string> kKeys = {
    {C::BatteryChargeLevel,
     "absoluteTime charge maxCharge cycleCount instantAmperage instantVoltage timeSinceLastCharge "
     "lastMinuteWattage estimatedTimeRemaining smoothedEstimatedTimeRemaining isFullyCharged"},
    {C::SleepWake,
     "absolute_time wall_time reason wake_from_standby wake_type efi_msec booter_msec trampoline_msec "
     "image_read_msec image_pages image1_pages wake_notification_msec lock_screen_ready_msec "
     "graphics_ready_msec record_write_absolute_time xcpm_deep_idle_stats"},
    {C::PanelSelfRefresh, "absolute_time psr_off psr_transit psr_on psr_sleep dpb_off dpb_on"},
    {C::LogStartsV0, "version absoluteTime wallTime bootUuid systemVersion lastBootUuid"},
    {C::LogStartsV1,
     "version absoluteTime wallTime writer bootUuid systemVersion lastBootUuid isFirst lastSystemVersion"},
    {C::SmcKeys, "absolute_time keys"},
    {C::SmcKey, "key s64value u64value dvalue bvalue"},
    {C::PowerStateChange, "absoluteTime change isFullyCharged wallTime"},
    {C::DateChange, "absoluteTime wallTime reason newYday"},
    {C::TimeChange, "absoluteTime wallTime reason gmtoff zoneName yday year"},
    {C::Cstates, "absolute_time is_core core states"},
    {C::Cstate, "level residency"},
    {C::PackageEnergyStatistics,
     "absolute_time energy_model_millijoules pkg_c0_residency pkg_cany_residency pkg_cmax_residency pkg_freq "
     "pkg_freq_nominal maxbusdelay qos_bg_time qos_idle_time"},
    {C::DeviceChange, "absoluteTime deviceType deviceName deviceId nowConnected registryEntryId"},
    {C::FanState, "absolute_time loudness highest_rpm"},
    {C::SystemIO,
     "absoluteTime diskReadOps diskWriteOps diskBytesRead diskBytesWritten networkPacketsIn networkPacketsOut "
     "networkBytesIn networkBytesOut"},
    {C::DisplayBrightness, "absoluteTime brightness"},
    {C::SystemMemory,
     "absoluteTime freeCount wiredCount compressorPageCount purgeableCount purges faults zeroFills reactivations "
     "pageins pageouts decompressions compressions swapins swapouts compressedPageCount internalPageCount "
     "externalPageCount ioaccelAllocatedSize ioaccelResidentSize ioaccelWiredSize ioaccelDirtySize "
     "ioaccelCachedSize ioaccelPurgeableSize memorySize pageSize swapDeviceIsSsd"},
    {C::UserIdle, "absoluteTime change"},
    {C::Interrupts, "absoluteTime vectors"},
    {C::InterruptVector, "cpuNumber interruptCount vectorName"},
    {C::BluetoothPowerResidency, "absoluteTime timeOff timeOn timeSleep timeIdle"},
    {C::ProcessUsage,
     "name pid exitStatus uuid userTime systemTime pkgIdleWkups interruptWkups pageins wiredSize residentSize "
     "physFootprint procStartAbstime procExitAbstime nowAbstime ppid responsiblePid uid childUserTime "
     "childSystemTime childPkgIdleWkups childInterruptWkups childPageins childElapsedAbstime "
     "ioaccelAllocatedSize ioaccelResidentSize ioaccelWiredSize ioaccelDirtySize ioaccelCachedSize "
     "ioaccelPurgeableSize displayName uniqueid parentUniqueid responsibleUniqueid"},
};

// The dictionary shows each present field under its schema key (the schema
// cross-check compares whole dictionaries with the library's reading).
TEST(RecordDictionary, KeysAreExactlyTheseInFieldOrder) {
  ASSERT_EQ(kKeys.size(), static_cast<std::size_t>(kRecordClassCount));
  for (const auto& [recordClass, keys] : kKeys) {
    std::string inOrder;
    for (const FieldInfo& f : recordSchema(recordClass).fields)
      inOrder += std::string(inOrder.empty() ? "" : " ") + f.key;
    EXPECT_EQ(inOrder, keys);
  }
}

// Awkward values of each field kind, in FieldKind order: extremes, signs,
// strings that must be quoted and escaped, byte counts around the hex
// groups, doubles with exponents and the non-finite ones.
const std::vector<Value> kAwkward[] = {
    {0u, 1u, 10u, ~0ull, 1ull << 63},
    {0, -1, -3, std::numeric_limits<long long>::min(), std::numeric_limits<long long>::max()},
    {0u, 4294967295u},
    {-1, 0, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()},
    {true, false},
    {0.0, -0.0, 0.1, -2.5, 1e300, 5e-324, 1.0 / 3, 123456789012345680.0, std::nan(""),
     std::numeric_limits<double>::infinity(), -std::numeric_limits<double>::infinity()},
    {"", "plain_$./:-09", "two words", "q\"b\\s\nn\tt\rr", "\xc3\xa9t\xc3\xa9", std::string("nul\0byte", 8),
     "{a = (b, c);}"},
    {Data{}, Data{0}, Data{1, 2, 3, 4}, Data{0xff, 0xfe, 0x80, 0x7f, 0},
     Data{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 255}},
};

// Every field set, field i to the awkward value (round + i) of its kind; a
// repeated field gets `round % 3` elements, filled the same way.
void fillAwkwardly(Record& record, std::size_t round) {
  const RecordSchema& schema = recordSchema(record.recordClass());
  for (std::size_t i = 0; i < schema.fields.size(); ++i) {
    const FieldInfo& f = schema.fields[i];
    if (f.kind != FieldKind::Message) {
      const std::vector<Value>& values = kAwkward[static_cast<int>(f.kind)];
      f.set(record, values[(round + i) % values.size()]);
      continue;
    }
    for (std::size_t n = 0; n < round % 3; ++n) {
      std::unique_ptr<Record> element = makeRecord(f.elementClass);
      fillAwkwardly(*element, round + n + 1);
      f.add(record, *element);
    }
  }
}

// The dump's writer prints what the dictionary prints, byte for byte: for
// every class, every field set to each awkward value in turn, then fields
// present or absent at random.
TEST(RecordDictionary, TheDirectWriterPrintsWhatTheDictionaryPrints) {
  std::mt19937_64 random(77);
  for (RecordClass c : test::allRecordClasses()) {
    std::vector<std::unique_ptr<Record>> records;
    records.push_back(makeRecord(c));
    for (std::size_t round = 0; round < 11; ++round) {
      records.push_back(makeRecord(c));
      fillAwkwardly(*records.back(), round);
    }
    for (int i = 0; i < 30; ++i) {
      records.push_back(makeRecord(c));
      test::fillRandomly(*records.back(), random);
    }
    for (const std::unique_ptr<Record>& record : records) {
      std::string text = "before ";
      record->appendDictionaryText(text);
      EXPECT_EQ(text, "before " + describeValue(Value(record->dictionaryRepresentation())));
    }
  }
}

const Uuid kBoot = *Uuid::parse("6A1C1D4E-0B7F-4E3A-9C2D-5F8E7A6B4C3D");
const std::string kRaw(kBoot.bytes().begin(), kBoot.bytes().end());

Dictionary process(Dictionary status = {}) {
  status.merge(Dictionary{{"name", "mds"},
                          {"pid", 321},
                          {"userTime", 2'500'000'000},
                          {"systemTime", 600'999'999},
                          {"interruptWkups", 42},
                          {"residentSize", 1048576},
                          {"procStartAbstime", 1000},
                          {"procExitAbstime", 3'723'000},
                          {"nowAbstime", 9'000'000}});
  return status;
}
Dictionary vector(unsigned cpu, const char* name, unsigned count) {
  return {{"cpuNumber", cpu}, {"vectorName", name}, {"interruptCount", count}};
}
Dictionary state(unsigned level, unsigned residency) { return {{"level", level}, {"residency", residency}}; }

TEST(OneLineText, MatchesTheExpectedTextForEveryCase) {
  const std::string usage = "\t 3100 msec\t01:02:02\t    42 intr wkups\tresident  1048576\t321 [mds]";
  const std::string running = "\t 3100 msec\t02:29:59\t    42 intr wkups\tresident  1048576\t321 [mds]";
  const std::string sampled = "\t 3100 msec\t00:00:00\t    42 intr wkups\tresident  1048576\t321 [mds]";
  const std::tuple<RecordClass, Dictionary, std::string> cases[] = {
      {C::LogStartsV1,
       {{"systemVersion", "23A344"}, {"bootUuid", kRaw}, {"lastBootUuid", "12345678-9abc-DEF0-0FED-CBA987654321"}},
       "LogStartsV1\t23A344\t6A1C1D4E-0B7F-4E3A-9C2D-5F8E7A6B4C3D\t12345678-9ABC-DEF0-0FED-CBA987654321"},
      {C::LogStartsV1, {}, "LogStartsV1\t\t\t"},
      {C::BatteryChargeLevel,
       {{"charge", -1}, {"maxCharge", 3}, {"cycleCount", -7}},
       "BatteryChargeLevel\t-33.3\t-1\t3\t-7\t"},
      {C::BatteryChargeLevel, {{"charge", 10}}, "BatteryChargeLevel\tinf\t10\t0\t0\t"},
      {C::PowerStateChange, {{"change", 2}}, "PowerStateChange\tBattery"},
      {C::SleepWake, {{"reason", 1}, {"wake_type", "EC.LidOpen"}}, "Wake (EC.LidOpen)"},
      {C::SleepWake, {{"reason", 3}}, "Wake ()"},
      {C::UserIdle, {{"change", 7}}, "UserIdle\tIdle"},
      {C::ProcessUsage, process(), "ProcessUsage\t0" + usage},
      {C::ProcessUsage, process({{"exitStatus", -1}}), "ProcessUsage\t-" + running},
      {C::ProcessUsage, process({{"exitStatus", -3}}), "ProcessUsage\tS" + sampled},
      {C::ProcessUsage,  // a start after the exit, counters past the signed range
       {{"exitStatus", 5},
        {"procStartAbstime", 5000},
        {"procExitAbstime", 1000},
        {"interruptWkups", ~0ull},
        {"residentSize", 1ull << 63},
        {"pid", ~0ull},
        {"name", "a b"}},
       "ProcessUsage\t5\t    0 msec\t00:00:-4\t    -1 intr wkups\tresident -9223372036854775808\t"
       "18446744073709551615 [a b]"},
      {C::PackageEnergyStatistics, {{"pkg_cany_residency", 987}}, "PackageEnergyStatistics\t987"},
      {C::DeviceChange, {{"deviceType", 4}}, "DeviceChange\t4\t  (@)\tdisconnected"},
      {C::Interrupts,
       {{"vectors", Array{vector(1, "timer", 50), vector(0, "hpet", 10), vector(1, "ipi", 7), vector(0, "nvme", 3)}}},
       "Interrupts\nCPU 0\n\tVector hpet:\t10 interrupts\n\tVector nvme:\t3 interrupts\n"
       "CPU 1\n\tVector timer:\t50 interrupts\n\tVector ipi:\t7 interrupts\n"},
      {C::Interrupts, {}, "Interrupts\n"},
      {C::Cstates,
       {{"core", -1}, {"states", Array{state(1, 500), state(6, 1234567)}}},
       "Package C-state detail: C1     500   C6 1234567   "},
      {C::Cstates,
       {{"is_core", true}, {"core", 3}, {"states", Array{state(3, 12345678)}}},
       "Core 3 C-state detail: C3 12345678   "},
      {C::DisplayBrightness, {{"brightness", 75}}, "DisplayBrightness\t75%"},
      {C::FanState, {{"loudness", 2}, {"highest_rpm", 3500}}, "FanState\t2 (3500 rpm)"},
      {C::FanState, {{"loudness", -1}}, "FanState\t4294967295 (0 rpm)"},
  };
  for (const auto& [c, fields, expected] : cases) EXPECT_EQ(test::build(c, fields)->prettyPrint(), expected);
}

TEST(ProcessUsage, TimeIsNowForRunningOrSampledProcessesAndTheExitOtherwise) {
  const std::pair<std::optional<std::int64_t>, std::uint64_t> cases[] = {{-1, 5000}, {-3, 5000}, {-2, 3000},
                                                                         {0, 3000},  {1, 3000},  {std::nullopt, 3000}};
  for (const auto& [status, expected] : cases) {
    Dictionary fields = {{"nowAbstime", 5000}, {"procExitAbstime", 3000}, {"procStartAbstime", 1000}};
    if (status) fields["exitStatus"] = *status;
    EXPECT_EQ(test::build(C::ProcessUsage, fields)->absoluteTime(), expected) << status.value_or(99);
  }
}

TEST(LogStarts, BootUuidsAreRawBytesOrText) {
  const std::tuple<const char*, std::optional<std::string>, std::optional<Uuid>> cases[] = {
      {"absent", std::nullopt, std::nullopt},
      {"empty", std::string(), std::nullopt},
      {"raw sixteen bytes", kRaw, kBoot},
      {"upper-case text", kBoot.string(), kBoot},
      {"lower-case text", "6a1c1d4e-0b7f-4e3a-9c2d-5f8e7a6b4c3d", kBoot},
      {"text with a trailing NUL", kBoot.string() + std::string(1, '\0'), kBoot},
      {"seventeen bytes are taken as text", kRaw + "x", std::nullopt},
      {"malformed text", "6A1C1D4E+0B7F-4E3A-9C2D-5F8E7A6B4C3D", std::nullopt},
      {"raw cut short", kRaw.substr(0, 15), std::nullopt},
      {"one byte", std::string(1, '\x7f'), std::nullopt},
  };
  for (const auto& [what, bytes, expected] : cases) {
    const Dictionary fields = bytes ? Dictionary{{"bootUuid", *bytes}, {"lastBootUuid", *bytes}} : Dictionary{};
    auto v1 = test::build(C::LogStartsV1, fields);  // version-0 files are dropped whole
    EXPECT_EQ(static_cast<LogStartsV1&>(*v1).bootUUID(), expected) << what;
    EXPECT_EQ(static_cast<LogStartsV1&>(*v1).lastBootUUID(), expected) << what;
  }
}

TEST(RequiredStringDeathTest, AnAbsentVersionOrKeyAbortsTheWriteButAnEmptyOneIsWritten) {
  EXPECT_DEATH(LogStartsV0().serialize(), "nil != self->_version.*Records/LogStartsV0");
  LogStartsV1 v1;
  v1.setBootUuid(kRaw);
  EXPECT_DEATH(v1.serialize(), "nil != self->_version.*Records/LogStartsV1");
  SmcKeys keys;
  keys.addKeys(SmcKey());
  EXPECT_DEATH(keys.serialize(), "nil != self->_key.*Records/SmcKey");
  v1.setVersion("");
  auto decoded = test::decode(C::LogStartsV1, v1.serialize());
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->dictionaryRepresentation().at("version"), Value(""));
}

}  // namespace
}  // namespace bw
