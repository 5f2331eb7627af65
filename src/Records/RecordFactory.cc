#include "Records/RecordFactory.h"

#include <iterator>
#include <new>

#include "Records/BatteryChargeLevel.h"
#include "Records/BluetoothPowerResidency.h"
#include "Records/Cstates.h"
#include "Records/DateChange.h"
#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/Interrupts.h"
#include "Records/LogStartsV0.h"
#include "Records/LogStartsV1.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/PanelSelfRefresh.h"
#include "Records/PowerStateChange.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/SmcKeys.h"
#include "Records/SystemIO.h"
#include "Records/SystemMemory.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"

namespace bw {

namespace {

struct ClassEntry {
  RecordClass recordClass;
  RecordLayout layout;
  Record* (*construct)(void* storage);
  std::unique_ptr<Record> (*make)();
  const RecordSchema& (*schema)();
};

template <class T>
constexpr ClassEntry entry() {
  return ClassEntry{T::kClass, RecordLayout{sizeof(T), alignof(T)},
                    [](void* storage) -> Record* { return new (storage) T(); },
                    []() -> std::unique_ptr<Record> { return std::make_unique<T>(); }, &T::schema};
}

// In RecordClass order.
constexpr ClassEntry kClasses[] = {
#define BW_RECORD_ENTRY(name, ...) entry<name>(),
    BW_RECORD_CLASSES(BW_RECORD_ENTRY)
#undef BW_RECORD_ENTRY
};

const ClassEntry& entryOf(RecordClass c) { return kClasses[static_cast<std::size_t>(c)]; }

}  // namespace

std::unique_ptr<Record> makeRecord(RecordClass c) { return entryOf(c).make(); }

RecordLayout recordLayout(RecordClass c) { return entryOf(c).layout; }

Record* constructRecord(RecordClass c, void* storage) { return entryOf(c).construct(storage); }

const RecordSchema& recordSchema(RecordClass c) { return entryOf(c).schema(); }

}  // namespace bw
