#pragma once
// The power daemon's records: sleeps and wakes with their timings, the
// power source, the battery gauge, the user's idle state, and the clock
// records (time zone at boot and when travelling, the local date at
// midnight). The battery is one battery for the whole store: it charges and
// drains across sleeps and boots.
#include <cstddef>
#include <cstdint>

#include "MachinePlan.h"
#include "Random.h"
#include "RecordSink.h"

namespace bw::samplestore {

class PowerEvents {
 public:
  explicit PowerEvents(const MachinePlan& plan);
  // Adds the records of boot `index` to `sink`.
  void boot(std::size_t index, RecordSink& sink);

 private:
  struct Battery {
    double charge = 0;     // mAh
    double maxCharge = 0;  // mAh, fades a little with every cycle
    std::int64_t cycles = 0;
    double drained = 0;  // mAh discharged since the last cycle was counted
    bool full = false;
    std::uint64_t unpluggedAt = 0;  // wall time the battery began to discharge
    double smoothedMinutes = 0;
  };

  void run(const Boot& boot, const Run& run, RecordSink& sink);
  void wake(const Run& run, RecordSink& sink);
  void calendarEvents(const Run& run, std::uint64_t fromAbs, RecordSink& sink);
  void idleEvents(const Run& run, RecordSink& sink);
  void powerSourceEvents(const Run& run, std::uint64_t fromAbs, RecordSink& sink);
  void batterySample(const Run& run, std::uint64_t abs, RecordSink& sink);
  // Lets the battery rest from `lastWall_` to `wall` (asleep or off).
  void rest(std::uint64_t wall, bool off);
  void timeChange(const Run& run, std::uint64_t abs, std::uint32_t reason, RecordSink& sink);
  void dateChange(const Run& run, std::uint64_t abs, std::uint32_t reason, RecordSink& sink);
  void powerStateChange(const Run& run, std::uint64_t abs, bool onAC, RecordSink& sink);

  const MachinePlan& plan_;
  Random rng_;
  Battery battery_;
  std::uint64_t lastWall_ = 0;  // how far the battery has been simulated
  std::int64_t lastDay_ = 0;    // the local day last announced
  std::size_t nextSwitch_ = 0;  // the next zone switch to announce
  bool fullAnnounced_ = false;  // the current full charge was reported
};

}  // namespace bw::samplestore
