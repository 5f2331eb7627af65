#include "summarizers/ModelSummarizers.h"

#include "summarizers/BatterySummarizer.h"
#include "summarizers/BrightnessSummarizer.h"
#include "summarizers/CPUSummarizer.h"
#include "summarizers/DeviceSummarizer.h"
#include "summarizers/FanSummarizer.h"
#include "summarizers/IOSummarizer.h"
#include "summarizers/MemorySummarizer.h"
#include "summarizers/PSRSummarizer.h"
#include "summarizers/PowerStateSummarizers.h"
#include "summarizers/ProcessSummarizer.h"
#include "summarizers/StandbySummarizer.h"
#include "summarizers/UsageSummarizer.h"

namespace bw {

std::vector<std::pair<std::string, std::unique_ptr<Summarizer>>> makeModelSummarizers() {
  std::vector<std::pair<std::string, std::unique_ptr<Summarizer>>> all;
  auto add = [&all](const char* key, std::unique_ptr<Summarizer> summarizer) {
    all.emplace_back(key, std::move(summarizer));
  };
  add("A/C", std::make_unique<ACPowerSummarizer>());
  add("Battery", std::make_unique<BatteryPowerSummarizer>());
  add("Active", std::make_unique<UserActiveSummarizer>());
  add("Idle", std::make_unique<UserIdleSummarizer>());
  add("Sleep", std::make_unique<SleepSummarizer>());
  add("Wake", std::make_unique<WakeSummarizer>());
  add("DarkWake", std::make_unique<DarkWakeSummarizer>());
  add("Bluetooth", std::make_unique<BluetoothSummarizer>());
  add("DiscreteGraphics", std::make_unique<DiscreteGraphicsSummarizer>());
  add("Wi-Fi", std::make_unique<WiFiSummarizer>());
  add("CPU", std::make_unique<CPUSummarizer>());
  add("IO", std::make_unique<IOSummarizer>());
  add("Power", std::make_unique<BatterySummarizer>());
  add("Processes", std::make_unique<ProcessSummarizer>());
  add("Standby", std::make_unique<StandbySummarizer>());
  add("Memory", std::make_unique<MemorySummarizer>());
  add("Backlight", std::make_unique<BrightnessSummarizer>());
  add("PanelSelfRefresh", std::make_unique<PSRSummarizer>());
  add("Fan", std::make_unique<FanSummarizer>());
  add("Devices", std::make_unique<DeviceSummarizer>());
  add("Usage", std::make_unique<UsageSummarizer>());
  return all;
}

std::vector<std::string> modelSummarizerKeys() {
  std::vector<std::string> keys;
  for (const auto& entry : makeModelSummarizers()) keys.push_back(entry.first);
  return keys;
}

}  // namespace bw
