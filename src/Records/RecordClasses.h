#pragma once
// The one list of the record classes: each class with the stats-file type
// numbers that decode as it (none for the classes that only appear nested in
// another record). The class tags, their names, the factory and the reader's
// type table are all generated from it, in this order.
//
// Use: #define X(Class, ...) ..., then BW_RECORD_CLASSES(X); the type
// numbers come as the variadic arguments.
#define BW_RECORD_CLASSES(X)     \
  X(LogStartsV0, 1)              \
  X(LogStartsV1, 12)             \
  X(BatteryChargeLevel, 2)       \
  X(PackageEnergyStatistics, 3)  \
  X(ProcessUsage, 4)             \
  X(PowerStateChange, 6)         \
  X(SleepWake, 7, 8)             \
  X(TimeChange, 9)               \
  X(DateChange, 10)              \
  X(UserIdle, 11)                \
  X(DeviceChange, 13)            \
  X(Interrupts, 14)              \
  X(InterruptVector)             \
  X(SystemMemory, 15)            \
  X(BluetoothPowerResidency, 16) \
  X(SystemIO, 17)                \
  X(Cstates, 18)                 \
  X(Cstate)                      \
  X(DisplayBrightness, 19)       \
  X(FanState, 20)                \
  X(SmcKeys, 21)                 \
  X(SmcKey)                      \
  X(PanelSelfRefresh, 22)
