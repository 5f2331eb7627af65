#include "CpuSamples.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <string>
#include <string_view>

#include "Records/Cstates.h"
#include "Records/FanState.h"
#include "Records/Interrupts.h"
#include "Records/PackageEnergyStatistics.h"
#include "Records/SmcKeys.h"

namespace bw::samplestore {

namespace {

constexpr std::uint64_t kPackageLevels[] = {2, 3, 6, 7, 8, 10};
constexpr double kPackageShares[] = {0.05, 0.08, 0.12, 0.15, 0.2, 0.4};
constexpr std::uint64_t kCoreLevels[] = {3, 6, 7};
constexpr double kCoreShares[] = {0.1, 0.3, 0.6};

// Interrupt sources: every processor has the first two; devices deliver to
// processor 0. Rates per second when idle and at full load.
struct VectorSource {
  const char* name;
  double idleRate;
  double busyRate;
  bool perCpu;
};
constexpr VectorSource kVectors[] = {
    {"timer", 180, 900, true}, {"ipi", 20, 600, true},   {"nvme0", 15, 260, false}, {"xhci0", 4, 12, false},
    {"wlan0", 25, 140, false}, {"gpu0", 30, 400, false}, {"hda0", 2, 40, false},    {"smc0", 2, 3, false},
};

std::size_t vectorSlots(int cores) {
  std::size_t n = 0;
  for (const VectorSource& v : kVectors) n += v.perCpu ? static_cast<std::size_t>(cores) : 1;
  return n;
}

}  // namespace

CpuSamples::CpuSamples(const MachinePlan& plan) : plan_(plan), rng_(plan.seed(), 3) {
  constexpr int kCores[] = {4, 8, 10};
  constexpr std::uint64_t kNominal[] = {1800, 2300, 2600, 3200};
  cores_ = kCores[rng_.below(3)];
  nominalMHz_ = kNominal[rng_.below(4)];
  turboMHz_ = nominalMHz_ * 17 / 10;
}

void CpuSamples::boot(std::size_t index, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  Counters c;
  c.package.assign(std::size(kPackageLevels), 0);
  c.core.assign(static_cast<std::size_t>(cores_), std::vector<std::uint64_t>(std::size(kCoreLevels), 0));
  c.interrupts.assign(vectorSlots(cores_), 0);
  std::uint64_t last = boot.firstRecordAbs;
  forEachTick(boot, 20'000, 60'000, [&](const Run& run, std::uint64_t abs) {
    tick(run, abs, abs - last, c, sink);
    last = abs;
  });
}

void CpuSamples::tick(const Run& run, std::uint64_t abs, std::uint64_t dt, Counters& c, RecordSink& sink) {
  const std::uint64_t wall = run.wallAt(abs);
  const double load = plan_.loadAt(wall, run.dark);
  const double busy = std::clamp(load * 0.9 + 0.03, 0.0, 1.0);
  const double ms = static_cast<double>(dt);
  const auto idleMs = static_cast<std::uint64_t>(ms * (1 - busy));
  c.c0 += dt - idleMs;
  c.cany += idleMs;
  c.cmax += static_cast<std::uint64_t>(static_cast<double>(idleMs) * (0.3 + 0.3 * (1 - load)));
  c.energy += static_cast<std::uint64_t>(ms * (1.2 + 16 * load));  // watts times ms
  c.qosBg += static_cast<std::uint64_t>(ms * (0.02 + 0.12 * hashUnit(plan_.seed() ^ 0xB6, abs / 60'000)));
  c.qosIdle += static_cast<std::uint64_t>(static_cast<double>(idleMs) * 0.7);

  PackageEnergyStatistics pkg;
  pkg.setAbsoluteTime(abs);
  pkg.setEnergyModelMillijoules(c.energy);
  pkg.setPkgC0Residency(c.c0);
  pkg.setPkgCanyResidency(c.cany);
  pkg.setPkgCmaxResidency(c.cmax);
  const double mhz =
      busy < 0.1 ? 800.0 : static_cast<double>(nominalMHz_) * (0.55 + 0.9 * load) * rng_.uniform(0.97, 1.03);
  pkg.setPkgFreq(std::min<std::uint64_t>(turboMHz_, static_cast<std::uint64_t>(mhz)));
  pkg.setPkgFreqNominal(nominalMHz_);
  pkg.setMaxbusdelay(static_cast<std::uint64_t>(rng_.below(4)) * 50);
  pkg.setQosBgTime(c.qosBg);
  pkg.setQosIdleTime(c.qosIdle);
  sink.add(Stream::Periodic, pkg);

  Cstates package;
  package.setAbsoluteTime(abs);
  package.setIsCore(false);
  package.setCore(-1);
  for (std::size_t i = 0; i < std::size(kPackageLevels); ++i) {
    c.package[i] += static_cast<std::uint64_t>(static_cast<double>(idleMs) * kPackageShares[i]);
    Cstate s;
    s.setLevel(kPackageLevels[i]);
    s.setResidency(c.package[i]);
    package.addStates(s);
  }
  sink.add(Stream::Periodic, package);
  for (int k = 0; k < cores_; ++k) {
    // Lower-numbered cores carry more of the work.
    const double coreBusy = std::clamp(busy * (1.4 - 0.8 * k / cores_), 0.0, 1.0);
    const double coreIdle = ms * (1 - coreBusy);
    Cstates core;
    core.setAbsoluteTime(abs);
    core.setIsCore(true);
    core.setCore(k);
    auto& levels = c.core[static_cast<std::size_t>(k)];
    for (std::size_t i = 0; i < std::size(kCoreLevels); ++i) {
      levels[i] += static_cast<std::uint64_t>(coreIdle * kCoreShares[i]);
      Cstate s;
      s.setLevel(kCoreLevels[i]);
      s.setResidency(levels[i]);
      core.addStates(s);
    }
    sink.add(Stream::Periodic, core);
  }

  Interrupts interrupts;
  interrupts.setAbsoluteTime(abs);
  std::size_t slot = 0;
  for (const VectorSource& v : kVectors) {
    double rate = v.idleRate + (v.busyRate - v.idleRate) * load;
    if (run.dark && std::string_view(v.name) == "gpu0") rate = 0;
    const int cpus = v.perCpu ? cores_ : 1;
    for (int cpu = 0; cpu < cpus; ++cpu, ++slot) {
      const double share = v.perCpu ? 1.0 - 0.5 * cpu / cpus : 1.0;
      c.interrupts[slot] += static_cast<std::uint64_t>(rate * share * ms / 1000);
      InterruptVector iv;
      iv.setCpuNumber(static_cast<std::uint32_t>(cpu));
      iv.setInterruptCount(c.interrupts[slot]);
      iv.setVectorName(v.name);
      interrupts.addVectors(std::move(iv));
    }
  }
  sink.add(Stream::Periodic, interrupts);

  // The package warms with load and cools slowly; the fan starts at 62 C.
  c.temperature += (38 + 55 * load - c.temperature) * 0.35;
  FanState fan;
  fan.setAbsoluteTime(abs + 150);
  const double rpm = c.temperature > 62 ? 1'200 + (c.temperature - 62) * 140 : 0;
  fan.setHighestRpm(static_cast<std::uint64_t>(rpm));
  fan.setLoudness(static_cast<std::int32_t>(rpm / 1'000));
  sink.add(Stream::Periodic, fan);

  if ((abs / 60'000) % 5 == 0) {
    SmcKeys keys;
    keys.setAbsoluteTime(abs + 300);
    const auto add = [&keys](const char* name, auto setter) {
      SmcKey k;
      k.setKey(name);
      setter(k);
      keys.addKeys(std::move(k));
    };
    const bool onAC = plan_.onACAt(wall);
    const double temperature = std::round(c.temperature * 100) / 100;
    add("TCPU", [&](SmcKey& k) { k.setDvalue(temperature); });
    add("TBAT", [&](SmcKey& k) { k.setDvalue(std::round((29 + 0.1 * c.temperature) * 100) / 100); });
    add("PSYS", [&](SmcKey& k) { k.setU64value(static_cast<std::uint64_t>(2'500 + 21'000 * load)); });
    add("VADP", [&](SmcKey& k) { k.setS64value(onAC ? 20'100 : 0); });
    add("FNUM", [&](SmcKey& k) { k.setU64value(1); });
    add("BSTA", [&](SmcKey& k) {
      k.setBvalue(std::string{static_cast<char>(onAC ? 3 : 1), static_cast<char>(busy * 255)});
    });
    sink.add(Stream::Periodic, keys);
  }
}

}  // namespace bw::samplestore
