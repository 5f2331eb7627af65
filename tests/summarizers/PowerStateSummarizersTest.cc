#include "summarizers/PowerStateSummarizers.h"

#include <gtest/gtest.h>

#include <map>

#include "Events.h"
#include "summarizers/ModelSummarizers.h"

namespace bw {
namespace {

using Ranges = std::vector<Range>;

// Every model summarizer fed the same records; ranges by key.
class States {
 public:
  States() {
    for (auto& [key, s] : makeModelSummarizers()) all[key] = std::move(s);
  }
  void add(const Record& r, std::uint64_t position, std::uint8_t bootNumber = 1) {
    for (auto& [key, s] : all) test::feed(*s, r, position, bootNumber);
  }
  void finish(std::uint64_t last) {
    for (auto& [key, s] : all) s->setLastPosition(last);
  }
  Ranges operator[](const std::string& key) const { return all.at(key)->ranges(); }
  std::map<std::string, std::unique_ptr<Summarizer>> all;
};

// A device type nobody follows: it only marks a record's position.
const DeviceChange kNeutral = test::device(1, 1);

struct Fed {
  const Record& record;
  std::uint64_t position;
  std::uint8_t boot = 1;
};

TEST(PowerStates, EachStateFollowsItsRecordsBootsAndShutdowns) {
  const SleepWake sleep = test::sleepWake(0, 0, 0), dark = test::sleepWake(0, 0, 2), wake = test::sleepWake(0, 0, 1);
  const PowerStateChange ac = test::powerChange(0), battery = test::powerChange(1);
  const PowerStateChange high = test::powerChange(std::uint64_t{1} << 32);  // compared as 32 bits: external power
  const UserIdle idle = test::idle(0, 1), active = test::idle(0, 0);
  const DeviceChange wifiOn = test::device(5, 1), wifiOff = test::device(5, 0);
  const DeviceChange gpuOn = test::device(9, 2), gpuOff = test::device(9, 0);
  const struct {
    const char* what;
    std::vector<Fed> records;
    std::uint64_t last;
    std::map<std::string, Ranges> expected;  // states not named held never
  } cases[] = {
      // Wake is open again from 200 until the last position.
      {"sleep, dark wake, wake",
       {{kNeutral, 0}, {sleep, 100}, {dark, 150}, {wake, 200}},
       300,
       {{"Sleep", {{100, 50}}}, {"DarkWake", {{150, 50}}}, {"Wake", {{0, 100}, {200, 100}}}, {"Active", {{0, 300}}}}},
      // Sleep is closed at boot 1's last record.
      {"only wake and active start at boot; all end at shutdown",
       {{kNeutral, 10}, {sleep, 20}, {kNeutral, 30}, {kNeutral, 40, 2}, {kNeutral, 60, 2}},
       60,
       {{"Wake", {{10, 10}, {40, 20}}}, {"Active", {{10, 20}, {40, 20}}}, {"Sleep", {{20, 10}}}}},
      {"power source and user idle",
       {{ac, 0}, {idle, 30}, {battery, 50}, {active, 70}, {high, 80}},
       100,
       {{"A/C", {{0, 50}, {80, 20}}},
        {"Battery", {{50, 30}}},
        {"Active", {{0, 30}, {70, 30}}},
        {"Idle", {{30, 40}}},
        {"Wake", {{0, 100}}}}},
      // Wi-Fi already off changes nothing; any non-zero state turns a device on.
      {"devices follow their own type",
       {{wifiOn, 10}, {wifiOff, 30}, {wifiOff, 40}, {gpuOn, 50}, {gpuOff, 70}},
       100,
       {{"Wi-Fi", {{10, 20}}}, {"DiscreteGraphics", {{50, 20}}}, {"Wake", {{10, 90}}}, {"Active", {{10, 90}}}}},
  };
  for (const auto& c : cases) {
    States states;
    for (const Fed& f : c.records) states.add(f.record, f.position, f.boot);
    states.finish(c.last);
    for (const char* key :
         {"Wake", "Active", "Sleep", "DarkWake", "A/C", "Battery", "Idle", "Wi-Fi", "Bluetooth", "DiscreteGraphics"}) {
      const auto expected = c.expected.find(key);
      EXPECT_EQ(states[key], expected == c.expected.end() ? Ranges{} : expected->second) << c.what << ": " << key;
    }
  }
}

}  // namespace
}  // namespace bw
