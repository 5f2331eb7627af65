#include "store/RecordTypeTable.h"

#include <array>

namespace bw {

std::optional<RecordClass> recordClassForType(std::uint64_t type) {
  using C = RecordClass;
  static const std::array<std::optional<RecordClass>, kRecordTypeCount> kTable = {
      std::nullopt,                // 0
      C::LogStartsV0,              // 1
      C::BatteryChargeLevel,       // 2
      C::PackageEnergyStatistics,  // 3
      C::ProcessUsage,             // 4
      std::nullopt,                // 5
      C::PowerStateChange,         // 6
      C::SleepWake,                // 7
      C::SleepWake,                // 8
      C::TimeChange,               // 9
      C::DateChange,               // 10
      C::UserIdle,                 // 11
      C::LogStartsV1,              // 12
      C::DeviceChange,             // 13
      C::Interrupts,               // 14
      C::SystemMemory,             // 15
      C::BluetoothPowerResidency,  // 16
      C::SystemIO,                 // 17
      C::Cstates,                  // 18
      C::DisplayBrightness,        // 19
      C::FanState,                 // 20
      C::SmcKeys,                  // 21
      C::PanelSelfRefresh,         // 22
  };
  if (type >= kRecordTypeCount) return std::nullopt;
  return kTable[type];
}

}  // namespace bw
