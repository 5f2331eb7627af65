#pragma once
// The processor sampler: once a minute while the machine runs, package
// energy and residency counters, package and per-core idle-state
// residencies, interrupt counts per processor and vector, the fan, and every
// few minutes a set of controller readings. Counters start at zero at boot
// and only grow within a boot; they follow the plan's load.
#include <cstddef>
#include <cstdint>
#include <vector>

#include "MachinePlan.h"
#include "Random.h"
#include "RecordSink.h"

namespace bw::samplestore {

class CpuSamples {
 public:
  explicit CpuSamples(const MachinePlan& plan);
  void boot(std::size_t index, RecordSink& sink);

  int cores() const { return cores_; }

 private:
  struct Counters {
    std::uint64_t c0 = 0, cany = 0, cmax = 0, energy = 0, qosBg = 0, qosIdle = 0;
    std::vector<std::uint64_t> package;            // per package level
    std::vector<std::vector<std::uint64_t>> core;  // per core, per core level
    std::vector<std::uint64_t> interrupts;         // per vector slot
    double temperature = 40;
  };
  void tick(const Run& run, std::uint64_t abs, std::uint64_t dt, Counters& c, RecordSink& sink);

  const MachinePlan& plan_;
  Random rng_;
  int cores_;
  std::uint64_t nominalMHz_;
  std::uint64_t turboMHz_;
};

}  // namespace bw::samplestore
