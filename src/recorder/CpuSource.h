#pragma once
// Processor counters for PackageEnergyStatistics and Cstates, all cumulative:
// - energy: RAPL package energy from /sys/class/powercap ("package-*" zones),
//   in mJ, carried across the counter's wrap;
// - frequency: the CPUs' average current frequency and the nominal one
//   (base_frequency, else cpuinfo_max_freq), in MHz, from cpufreq;
// - package idle: from the package C-state MSRs (/dev/cpu/0/msr, counting at
//   the nominal frequency) when readable; otherwise from cpuidle, where the
//   package counts as idle in a level only as long as every CPU was (the
//   smallest per-CPU increase of each interval), an approximation;
// - QoS: the "nice" and idle time of /proc/stat divided by the CPU count, ms.
// Per-CPU Cstates come from cpuidle (level = state index, residency in ms);
// the package record has core -1. The first read starts the derived
// counters at 0.
#include <cstdint>
#include <map>
#include <optional>
#include <vector>

#include "Records/Cstates.h"
#include "Records/PackageEnergyStatistics.h"
#include "recorder/MachineFiles.h"

namespace bw::recorder {

struct CpuSample {
  std::optional<PackageEnergyStatistics> package;  // none when no source gave anything
  std::vector<Cstates> cstates;                    // package (core -1) first, then each CPU
};

class CpuSource {
 public:
  explicit CpuSource(const MachineFiles& machine);
  // Reads every counter; records are stamped `absolute`.
  CpuSample read(std::uint64_t absolute);

 private:
  using Residencies = std::map<std::uint64_t, std::uint64_t>;  // level -> ms
  std::optional<std::uint64_t> energyMillijoules();
  void frequencies(PackageEnergyStatistics& package) const;
  bool msrResidency(PackageEnergyStatistics& package, Cstates& cstates, std::uint64_t nominalMhz) const;
  void cpuidleResidency(PackageEnergyStatistics& package, CpuSample& sample, std::uint64_t absolute);
  bool statTimes(PackageEnergyStatistics& package) const;

  const MachineFiles& machine_;
  std::vector<std::string> cpus_;                    // "cpu0", "cpu1", ...
  std::map<std::string, std::uint64_t> lastEnergy_;  // µJ per zone
  std::uint64_t energyTotal_ = 0;                    // mJ
  bool energySeen_ = false;
  std::vector<Residencies> lastCpuIdle_;
  Residencies packageLevels_;
  std::uint64_t packageAny_ = 0;
  std::uint64_t packageMax_ = 0;
  bool idleSeen_ = false;
};

}  // namespace bw::recorder
