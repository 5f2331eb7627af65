#pragma once
// Stores for the analysis service's tests, written with the record classes'
// own encoder. Both hold one boot of one build with a single segment (wall
// time = wallStart + absolute time − 1000), so position = absolute time − 1000.
//
// Battery store (last record at position 94000): 80 % at 1000, on battery
// from 2000, asleep from 69000 to 70000 (the second gauge sample after the
// wake extends the curve back to it), on A/C and fully charged at 94000.
// Job store (last record at position 49000): jobs from the table below,
// each one process starting at absolute time 1500, sampled at 2000 with no
// CPU time and at 50000 with its total (or at 40000 with its exit).
#include <stdexcept>
#include <string>
#include <vector>

#include "cli/RecordModesStore.h"
#include "service/Message.h"
#include "summarizers/ProcessRecords.h"

namespace bw::test {

// The reply's entry `key` as a T; throws naming the type it came as.
template <class T>
const T& get(const MessageDictionary& d, const std::string& key) {
  const T* v = d.at(key).getIf<T>();
  if (!v) throw std::runtime_error(key + " came as " + signatureOf(d.at(key)));
  return *v;
}

struct ServiceJob {
  const char* name;
  double cpuMs;
  std::uint64_t idleWakeups = 0;
  bool exits = false;
  const char* displayName = nullptr;
};

// alpha 100 ms; beta 50 ms and 20 idle wake-ups (power score 60e6) with a
// display name; gamma 30 ms, exited; j1..j9 with 1..9 ms.
inline std::vector<ServiceJob> serviceJobs() {
  std::vector<ServiceJob> jobs{{"alpha", 100}, {"beta", 50, 20, false, "Beta App"}, {"gamma", 30, 0, true}};
  static const char* const names[] = {"j1", "j2", "j3", "j4", "j5", "j6", "j7", "j8", "j9"};
  for (int i = 0; i < 9; ++i) jobs.push_back({names[i], static_cast<double>(i + 1)});
  return jobs;
}

inline void writeBatteryStore(const std::string& path, const Uuid& bootUuid, const std::string& version,
                              std::uint64_t wallStart) {
  const std::uint64_t skew = wallStart - 1000;
  auto batteryAt = [](std::uint64_t abs, std::int64_t charge) { return gaugeAt(abs, charge, 12000); };
  StatsFileWriter w;
  w.append(logStart(bootUuid, 1000, wallStart, version, nullptr));
  w.append(batteryAt(2000, 4000));
  w.append(powerChange(1, 3000, skew + 3000));
  w.append(batteryAt(62000, 3900));
  w.append(sleepWake(std::uint64_t{70000}, skew + 70000, 0u));
  w.append(sleepWake(std::uint64_t{71000}, skew + 71000, 1u));
  w.append(batteryAt(81000, 3800));
  w.append(batteryAt(91000, 3700));
  w.append(powerChange(0, 95000, skew + 95000, true));
  w.writeTo(path);
}

// Process unique ids count up from `firstId` + 1.
inline void writeJobStore(const std::string& path, const Uuid& bootUuid, const std::string& version,
                          std::uint64_t wallStart, const std::vector<ServiceJob>& jobs, std::uint64_t firstId = 100) {
  StatsFileWriter w;
  w.append(logStart(bootUuid, 1000, wallStart, version, nullptr));
  std::uint64_t id = firstId;
  for (const ServiceJob& job : jobs) {
    Sample s{.uniqueid = ++id, .at = 2000, .name = job.name, .start = 1500, .displayName = job.displayName};
    w.append(processUsage(s));
    s.at = job.exits ? 40000 : 50000;
    s.status = job.exits ? 0 : -1;
    s.cpuMs = job.cpuMs;
    s.idle = job.idleWakeups;
    w.append(processUsage(s));
  }
  w.writeTo(path);
}

}  // namespace bw::test
