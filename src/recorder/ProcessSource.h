#pragma once
// The running processes from /proc, named so that the job accounting sees
// the service managers:
// - unique id: (start time << 22) | pid, stable for a process across restarts
//   of the recorder and never reused within a boot; process 1 is 1;
// - name: the executable's file name (the command name when the executable
//   can't be read, as for kernel threads); process 1 is "launchd" and a user
//   manager (the service manager's binary running a user@ unit) is
//   "com.vexil.launchd.peruser";
// - unit: the systemd unit of the process's cgroup (last ".service" or
//   ".scope" component; a user manager's own scope is named by its user@
//   service), empty outside units;
// - responsible: the oldest process of the same unit's cgroup (0 outside units).
// CPU times in ns; start time in absolute ms (the kernel counts it with
// sleep included: `asleepMs` is taken off).
#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "recorder/MachineFiles.h"

namespace bw::recorder {

struct ProcessInfo {
  std::uint64_t pid = 0;
  std::uint64_t ppid = 0;
  std::uint64_t uniqueid = 0;
  std::uint64_t parentUniqueid = 0;
  std::uint64_t responsibleUniqueid = 0;
  std::uint64_t responsiblePid = 0;
  std::string name;
  std::string unit;
  std::uint64_t uid = 0;
  std::uint64_t userNs = 0;
  std::uint64_t systemNs = 0;
  std::uint64_t residentBytes = 0;
  std::uint64_t footprintBytes = 0;  // anonymous resident plus swapped
  std::uint64_t majorFaults = 0;
  std::uint64_t startAbsolute = 0;
};

inline constexpr const char* kUserManagerName = "com.vexil.launchd.peruser";
inline constexpr const char* kInitName = "launchd";

class ProcessSource {
 public:
  explicit ProcessSource(const MachineFiles& machine);
  // Every process readable now, keyed by unique id.
  std::unordered_map<std::uint64_t, ProcessInfo> scan(std::uint64_t asleepMs) const;
  // The pids present now: a cheap listing to notice exits between scans.
  std::vector<std::uint64_t> pids() const;

 private:
  const MachineFiles& machine_;
  std::uint64_t ticksPerSecond_;
};

}  // namespace bw::recorder
