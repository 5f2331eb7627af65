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

TEST(PowerStates, SleepThenDarkWakeThenWakeSplitTheTimeline) {
  States states;
  states.add(kNeutral, 0);
  states.add(test::sleepWake(0, 0, 0), 100);
  states.add(test::sleepWake(0, 0, 2), 150);
  states.add(test::sleepWake(0, 0, 1), 200);
  EXPECT_EQ(states["Sleep"], (Ranges{{100, 50}}));
  EXPECT_EQ(states["DarkWake"], (Ranges{{150, 50}}));
  EXPECT_EQ(states["Wake"], (Ranges{{0, 100}}));  // open again from 200
  states.finish(300);
  EXPECT_EQ(states["Wake"], (Ranges{{0, 100}, {200, 100}}));
}

TEST(PowerStates, OnlyWakeAndActiveStartAtBootAndEveryStateEndsAtShutdown) {
  States states;
  states.add(kNeutral, 10);
  states.add(test::sleepWake(0, 0, 0), 20);
  states.add(kNeutral, 30);
  states.add(kNeutral, 40, 2);
  states.add(kNeutral, 60, 2);
  states.finish(60);
  EXPECT_EQ(states["Wake"], (Ranges{{10, 10}, {40, 20}}));
  EXPECT_EQ(states["Active"], (Ranges{{10, 20}, {40, 20}}));
  EXPECT_EQ(states["Sleep"], (Ranges{{20, 10}}));  // closed at boot 1's last record
  for (const char* key : {"A/C", "Battery", "Idle", "DarkWake", "Wi-Fi", "Bluetooth", "DiscreteGraphics"})
    EXPECT_TRUE(states[key].empty()) << key;
}

TEST(PowerStates, PowerSourceAndUserIdleFollowTheirCodes) {
  States states;
  states.add(test::powerChange(0), 0);
  states.add(test::idle(0, 1), 30);
  states.add(test::powerChange(1), 50);
  states.add(test::idle(0, 0), 70);
  states.add(test::powerChange(std::uint64_t{1} << 32), 80);  // compared as 32 bits: external power
  states.finish(100);
  EXPECT_EQ(states["A/C"], (Ranges{{0, 50}, {80, 20}}));
  EXPECT_EQ(states["Battery"], (Ranges{{50, 30}}));
  EXPECT_EQ(states["Active"], (Ranges{{0, 30}, {70, 30}}));
  EXPECT_EQ(states["Idle"], (Ranges{{30, 40}}));
}

TEST(PowerStates, DevicesFollowTheirOwnTypeOnly) {
  States states;
  for (auto [type, connected, position] : {std::tuple{5u, 1u, 10u},
                                           {6u, 1u, 20u},
                                           {5u, 0u, 30u},
                                           {5u, 0u, 40u},  // Wi-Fi already off: nothing changes
                                           {9u, 2u, 50u},  // any non-zero state turns it on
                                           {6u, 0u, 60u},
                                           {9u, 0u, 70u}}) {
    states.add(test::device(type, connected), position);
  }
  states.finish(100);
  EXPECT_EQ(states["Wi-Fi"], (Ranges{{10, 20}}));
  EXPECT_EQ(states["Bluetooth"], (Ranges{{20, 40}}));
  EXPECT_EQ(states["DiscreteGraphics"], (Ranges{{50, 20}}));
}

}  // namespace
}  // namespace bw
