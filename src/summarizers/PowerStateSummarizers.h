#pragma once
// The summarizers of plain on/off states: power source, sleep and wake, user
// activity, and the Wi-Fi, Bluetooth and discrete-graphics devices. Each is
// pure configuration of the framework: one record class, a handler that
// answers 1 (the state holds), 0 (it ends) or -1 (no change), and flags.
//
// All of them end a boot's open range at its last record and reset at a
// reboot. Only Wake and UserActive also open a range at a boot's first
// record: a boot counts as awake and user-active until a record says
// otherwise, while the other states begin only at their own records.
//
//   ACPower          PowerStateChange  change 0            -> 1, else 0
//   BatteryPower     PowerStateChange  change 1            -> 1, else 0
//   Sleep            SleepWake         reason 0            -> 1, else 0
//   Wake             SleepWake         reason 1            -> 1, else 0  (starts at boot)
//   DarkWake         SleepWake         reason 2            -> 1, else 0
//   Active           UserIdle          change 0            -> 1, else 0  (starts at boot)
//   Idle             UserIdle          change 1            -> 1, else 0
//   Wi-Fi            DeviceChange      deviceType 5        -> nowConnected, else -1
//   Bluetooth        DeviceChange      deviceType 6        -> nowConnected, else -1
//   DiscreteGraphics DeviceChange      deviceType 9        -> nowConnected, else -1
#include "framework/Summarizer.h"

namespace bw {

class ACPowerSummarizer : public Summarizer {
 public:
  ACPowerSummarizer();
};

class BatteryPowerSummarizer : public Summarizer {
 public:
  BatteryPowerSummarizer();
};

class SleepSummarizer : public Summarizer {
 public:
  SleepSummarizer();
};

class WakeSummarizer : public Summarizer {
 public:
  WakeSummarizer();
};

class DarkWakeSummarizer : public Summarizer {
 public:
  DarkWakeSummarizer();
};

class UserActiveSummarizer : public Summarizer {
 public:
  UserActiveSummarizer();
};

class UserIdleSummarizer : public Summarizer {
 public:
  UserIdleSummarizer();
};

class WiFiSummarizer : public Summarizer {
 public:
  WiFiSummarizer();
};

class BluetoothSummarizer : public Summarizer {
 public:
  BluetoothSummarizer();
};

class DiscreteGraphicsSummarizer : public Summarizer {
 public:
  DiscreteGraphicsSummarizer();
};

}  // namespace bw
