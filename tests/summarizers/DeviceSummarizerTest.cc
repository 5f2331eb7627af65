#include "summarizers/DeviceSummarizer.h"

#include <gtest/gtest.h>

#include "Events.h"

namespace bw {
namespace {

using test::feed;

DeviceChange device(std::uint32_t type, const std::string& name, const std::string& id, bool on) {
  return test::device(type, on ? 1 : 0, 0, name, id);
}

std::vector<std::string> names(const DeviceSummarizer& s, Range range, std::uint32_t type) {
  std::vector<std::string> found;
  s.enumerateDevicesConnectedInRange(range, type, [&](const std::string& name, bool&) { found.push_back(name); });
  return found;
}

class Devices : public ::testing::Test {
 protected:
  Devices() {
    feed(s, device(1, "Stick", "s1", true), 100);
    feed(s, device(1, "Stick", "s1", true), 120);  // already connected: nothing changes
    feed(s, device(4, "Monitor", "m1", true), 250);
    feed(s, device(1, "Stick", "s1", false), 300);
    feed(s, device(1, "Card", "c1", true), 310);
    feed(s, device(1, "Stick", "s2", true), 320);  // another stick of the same name
    feed(s, device(12, "", "x", true), 330);
    feed(s, device(3, "Headset", "h1", true), 400);
    feed(s, device(3, "Headset", "h1", false), 450, 2);  // a new boot: the headset was gone at 400
    feed(s, device(2, "", "", true), 460, 2);
    s.setLastPosition(500);
  }
  DeviceSummarizer s;
};

TEST_F(Devices, ADeviceConnectedAcrossARangeEdgeCountsInIt) {
  struct Case {
    Range range;
    std::vector<std::uint32_t> types;
  };
  for (const Case& c : {Case{{200, 20}, {1}}, Case{{280, 20}, {1, 4}}, Case{{300, 5}, {4}}, Case{{0, 100}, {}},
                        Case{{401, 50}, {}}, Case{{480, 100}, {2}}}) {
    SCOPED_TRACE(c.range.location);
    EXPECT_EQ(s.typesOfDevicesConnectedInRanges({c.range}), c.types);
  }
  EXPECT_EQ(s.typesOfDevicesConnectedInRanges({{0, 150}, {350, 60}}), (std::vector<std::uint32_t>{1, 3, 4, 12}));
}

TEST_F(Devices, NamesComeOnceInOrderOfConnection) {
  EXPECT_EQ(names(s, {0, 1000}, 1), (std::vector<std::string>{"Stick", "Card"}));
  EXPECT_EQ(names(s, {315, 10}, 1), (std::vector<std::string>{"Card", "Stick"}));
  EXPECT_EQ(names(s, {0, 1000}, 12), (std::vector<std::string>{"x"}));     // no name: the id
  EXPECT_EQ(names(s, {0, 1000}, 2), (std::vector<std::string>{"Input"}));  // neither: the type
  EXPECT_EQ(names(s, {0, 1000}, 7), (std::vector<std::string>{}));
}

// Wi-Fi, Bluetooth, the GPU and audio are in the dashboard and telemetry runs.
TEST(DeviceTypes, NamesAndTelemetryKeys) {
  const std::tuple<std::uint32_t, const char*, const char*> table[] = {
      {1, "Storage", "storage"}, {2, "Input", "input"}, {4, "Display", "display"}, {7, "Network", "network"},
      {8, "Camera", "camera"},   {10, "USB", "usb"},    {0, "Type 0", "type0"},    {12, "Type 12", "type12"}};
  for (auto [type, name, key] : table) {
    EXPECT_EQ(DeviceSummarizer::nameOfDeviceType(type), name);
    EXPECT_EQ(DeviceSummarizer::telemetryKeyOfDeviceType(type), key);
  }
}

}  // namespace
}  // namespace bw
