#include "summarizers/DeviceSummarizer.h"

#include <algorithm>
#include <cctype>
#include <set>

#include "Records/DeviceChange.h"
#include "base/Console.h"

namespace bw {

void DeviceSummarizer::addEvent(const Record& event, std::uint64_t position, const AbsTime& absTime, std::uint64_t) {
  if (prevBoot_ != absTime.boot) {
    endAll(lastInBoot_);
    prevBoot_ = absTime.boot;
  }
  lastInBoot_ = position;
  if (event.recordClass() != RecordClass::DeviceChange) return;

  const auto& r = static_cast<const DeviceChange&>(event);
  const std::string& id = r.deviceId().empty() ? r.deviceName() : r.deviceId();
  const auto key = std::make_pair(r.deviceType(), id);
  const auto it = open_.find(key);
  if (r.nowConnected() != 0) {
    if (it != open_.end()) return;
    std::string name = !r.deviceName().empty() ? r.deviceName() : !id.empty() ? id : nameOfDeviceType(r.deviceType());
    open_.emplace(key, intervals_.size());
    intervals_.push_back(Interval{r.deviceType(), std::move(name), position, std::nullopt});
  } else if (it != open_.end()) {
    intervals_[it->second].end = position;
    open_.erase(it);
  }
}

void DeviceSummarizer::setLastPosition(std::uint64_t position) { endAll(position); }

void DeviceSummarizer::endAll(std::uint64_t position) {
  for (const auto& [key, index] : open_) intervals_[index].end = std::max(position, intervals_[index].start);
  open_.clear();
}

bool DeviceSummarizer::overlaps(const Interval& interval, const Range& range) {
  const bool startsBeforeRangeEnds = interval.start < range.end();
  const bool endsAfterRangeStarts = !interval.end || *interval.end > range.location;
  return startsBeforeRangeEnds && endsAfterRangeStarts;
}

std::vector<std::uint32_t> DeviceSummarizer::typesOfDevicesConnectedInRanges(const std::vector<Range>& ranges) const {
  std::set<std::uint32_t> types;
  for (const Interval& interval : intervals_) {
    if (types.count(interval.type)) continue;
    for (const Range& range : ranges) {
      if (overlaps(interval, range)) {
        types.insert(interval.type);
        break;
      }
    }
  }
  return {types.begin(), types.end()};
}

void DeviceSummarizer::enumerateDevicesConnectedInRange(const Range& range, std::uint32_t type,
                                                        const NameBlock& block) const {
  std::set<std::string> seen;
  bool stop = false;
  for (const Interval& interval : intervals_) {
    if (interval.type != type || !overlaps(interval, range) || !seen.insert(interval.name).second) continue;
    block(interval.name, stop);
    if (stop) return;
  }
}

std::string DeviceSummarizer::nameOfDeviceType(std::uint32_t type) {
  static const char* const kNames[] = {"Storage",   "Input",   "Audio",  "Display",      "Wi-Fi",
                                       "Bluetooth", "Network", "Camera", "Discrete GPU", "USB"};
  if (type >= 1 && type <= 10) return kNames[type - 1];
  return format("Type %u", type);
}

std::string DeviceSummarizer::telemetryKeyOfDeviceType(std::uint32_t type) {
  std::string key;
  for (char c : nameOfDeviceType(type)) {
    if (c != ' ') key += static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  }
  return key;
}

}  // namespace bw
