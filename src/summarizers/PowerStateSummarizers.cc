#include "summarizers/PowerStateSummarizers.h"

#include <cstdint>

#include "Records/DeviceChange.h"
#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"

namespace bw {
namespace {

constexpr bool kStartAtBoot = true;

// Identifier, record class, handler and flags shared by the whole family.
template <class R, class Answer>
void configure(Summarizer& s, const char* identifier, bool startAtBoot, Answer answer) {
  s.setIdentifier(identifier);
  s.setStartAtBoot(startAtBoot);
  s.setEndAtShutdown(true);
  s.setResetAtReboot(true);
  s.setEventClass(R::kClass);
  s.setEventHandler(
      [answer](const Record& record, SummarizerContext*) { return answer(static_cast<const R&>(record)); });
}

// 1 when the record's code (compared as 32 bits) is `code`, else 0.
template <class R>
void configureCode(Summarizer& s, const char* identifier, bool startAtBoot, std::uint32_t code) {
  configure<R>(s, identifier, startAtBoot, [code](const R& r) -> std::int32_t {
    if constexpr (R::kClass == RecordClass::SleepWake) {
      return static_cast<std::uint32_t>(r.reason()) == code ? 1 : 0;
    } else {
      return static_cast<std::uint32_t>(r.change()) == code ? 1 : 0;
    }
  });
}

// The connection state of one device type; other types say nothing.
void configureDevice(Summarizer& s, const char* identifier, std::uint32_t deviceType) {
  configure<DeviceChange>(s, identifier, !kStartAtBoot, [deviceType](const DeviceChange& r) -> std::int32_t {
    return r.deviceType() == deviceType ? static_cast<std::int32_t>(r.nowConnected()) : -1;
  });
}

}  // namespace

ACPowerSummarizer::ACPowerSummarizer() {
  configureCode<PowerStateChange>(*this, "ACPower", !kStartAtBoot, PowerStateChange::kOnAC);
}
BatteryPowerSummarizer::BatteryPowerSummarizer() {
  configureCode<PowerStateChange>(*this, "BatteryPower", !kStartAtBoot, PowerStateChange::kOnBattery);
}
SleepSummarizer::SleepSummarizer() { configureCode<SleepWake>(*this, "Sleep", !kStartAtBoot, SleepWake::kSleep); }
WakeSummarizer::WakeSummarizer() { configureCode<SleepWake>(*this, "Wake", kStartAtBoot, SleepWake::kWake); }
DarkWakeSummarizer::DarkWakeSummarizer() {
  configureCode<SleepWake>(*this, "DarkWake", !kStartAtBoot, SleepWake::kDarkWake);
}
UserActiveSummarizer::UserActiveSummarizer() {
  configureCode<UserIdle>(*this, "Active", kStartAtBoot, UserIdle::kActive);
}
UserIdleSummarizer::UserIdleSummarizer() { configureCode<UserIdle>(*this, "Idle", !kStartAtBoot, UserIdle::kIdle); }
WiFiSummarizer::WiFiSummarizer() { configureDevice(*this, "Wi-Fi", DeviceChange::kWiFi); }
BluetoothSummarizer::BluetoothSummarizer() { configureDevice(*this, "Bluetooth", DeviceChange::kBluetooth); }
DiscreteGraphicsSummarizer::DiscreteGraphicsSummarizer() {
  configureDevice(*this, "DiscreteGraphics", DeviceChange::kDiscreteGraphics);
}

}  // namespace bw
