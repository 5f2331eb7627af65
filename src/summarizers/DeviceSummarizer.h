#pragma once
// Devices: which devices were connected when. Each DeviceChange record
// connects (nowConnected non-zero) or disconnects one device, known by its
// type and id (its name when it has no id). A device's connected intervals
// run from its connection to its disconnection; a boot change ends every
// open interval at the previous boot's last record, and the end of the data
// at the last record. A repeated connection while connected changes nothing.
//
// A device counts in a range when one of its intervals overlaps it, also
// when it was connected before the range began or stays after it ends.
//
// Type names: 1 "Storage", 2 "Input", 3 "Audio", 4 "Display", 5 "Wi-Fi",
// 6 "Bluetooth", 7 "Network", 8 "Camera", 9 "Discrete GPU", 10 "USB", any
// other "Type %u"; telemetry keys are the names lower-cased without blanks
// ("discretegpu", "wi-fi", "type12").
#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "framework/Summarizer.h"

namespace bw {

class DeviceSummarizer : public Summarizer {
 public:
  // One connected stretch of one device, in positions [start, end).
  struct Interval {
    std::uint32_t type = 0;
    std::string name;
    std::uint64_t start = 0;
    std::optional<std::uint64_t> end;  // none while connected
  };
  using NameBlock = std::function<void(const std::string& name, bool& stop)>;

  DeviceSummarizer() = default;

  // Takes DeviceChange records; other records only mark boots.
  void addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t wallTime) override;
  // Ends the intervals still open at `position`.
  void setLastPosition(std::uint64_t position) override;

  // The types with a device connected at some moment of `ranges`, ascending.
  std::vector<std::uint32_t> typesOfDevicesConnectedInRanges(const std::vector<Range>& ranges) const;
  // Calls `block` with the name of each device of `type` connected at some
  // moment of `range`, each name once, in order of connection, until the
  // block sets stop.
  void enumerateDevicesConnectedInRange(const Range& range, std::uint32_t type, const NameBlock& block) const;

  static std::string nameOfDeviceType(std::uint32_t type);
  // The type's name lower-cased, blanks removed.
  static std::string telemetryKeyOfDeviceType(std::uint32_t type);

  // Every interval, in order of connection.
  const std::vector<Interval>& intervals() const { return intervals_; }

 private:
  void endAll(std::uint64_t position);
  static bool overlaps(const Interval& interval, const Range& range);

  std::vector<Interval> intervals_;
  // (type, id) of each connected device -> its open interval's index.
  std::map<std::pair<std::uint32_t, std::string>, std::size_t> open_;
  std::optional<Uuid> prevBoot_;
  std::uint64_t lastInBoot_ = 0;
};

}  // namespace bw
