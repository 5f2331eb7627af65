#include "recorder/CpuSource.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <limits>

namespace bw::recorder {

namespace {

constexpr const char* kCpus = "/sys/devices/system/cpu/";
constexpr const char* kPowercap = "/sys/class/powercap/";

// Package C-state residency MSRs (C2, C3, C6, C7, C8, C9, C10).
constexpr struct {
  std::uint64_t level;
  off_t address;
} kPackageMsrs[] = {{2, 0x60D}, {3, 0x3F8}, {6, 0x3F9}, {7, 0x3FA}, {8, 0x630}, {9, 0x631}, {10, 0x632}};

bool isCpuName(const std::string& name) {
  return name.size() > 3 && name.compare(0, 3, "cpu") == 0 && parseNumber(name.substr(3)).has_value();
}

}  // namespace

CpuSource::CpuSource(const MachineFiles& machine) : machine_(machine) {
  for (const auto& name : machine_.list(kCpus)) {
    if (isCpuName(name)) cpus_.push_back(name);
  }
  std::sort(cpus_.begin(), cpus_.end(), [](const std::string& a, const std::string& b) {
    return *parseNumber(a.substr(3)) < *parseNumber(b.substr(3));
  });
}

CpuSample CpuSource::read(std::uint64_t absolute) {
  CpuSample sample;
  PackageEnergyStatistics package;
  package.setAbsoluteTime(absolute);
  bool any = false;
  if (const auto energy = energyMillijoules()) {
    package.setEnergyModelMillijoules(*energy);
    any = true;
  }
  frequencies(package);
  any = any || package.hasPkgFreq();
  Cstates msrStates;
  if (msrResidency(package, msrStates, package.pkgFreqNominal())) {
    msrStates.setAbsoluteTime(absolute);
    sample.cstates.push_back(std::move(msrStates));
    any = true;
    // Per-CPU records still come from cpuidle; the package ones stay the MSRs'.
    PackageEnergyStatistics ignored;
    CpuSample perCpu;
    cpuidleResidency(ignored, perCpu, absolute);
    for (auto& c : perCpu.cstates) {
      if (c.isCore()) sample.cstates.push_back(std::move(c));
    }
  } else {
    cpuidleResidency(package, sample, absolute);
    any = any || package.hasPkgCanyResidency();
  }
  any = statTimes(package) || any;
  if (any) sample.package = package;
  return sample;
}

std::optional<std::uint64_t> CpuSource::energyMillijoules() {
  bool found = false;
  for (const auto& zone : machine_.list(kPowercap)) {
    const std::string dir = kPowercap + zone + "/";
    if (machine_.line(dir + "name").value_or("").rfind("package", 0) != 0) continue;
    const auto now = machine_.number(dir + "energy_uj");
    if (!now) continue;
    found = true;
    const auto last = lastEnergy_.find(zone);
    if (last == lastEnergy_.end()) {
      energyTotal_ += energySeen_ ? 0 : *now / 1000;
    } else {
      const std::uint64_t range = machine_.number(dir + "max_energy_range_uj").value_or(0);
      const std::uint64_t delta = *now >= last->second ? *now - last->second : *now + range - last->second;
      energyTotal_ += delta / 1000;
      // Keep the sub-millijoule remainder for the next reading.
      lastEnergy_[zone] = *now - delta % 1000;
      continue;
    }
    lastEnergy_[zone] = *now;
  }
  if (!found) return std::nullopt;
  energySeen_ = true;
  return energyTotal_;
}

void CpuSource::frequencies(PackageEnergyStatistics& package) const {
  std::uint64_t sum = 0;
  std::uint64_t count = 0;
  std::uint64_t nominal = 0;
  for (const auto& cpu : cpus_) {
    const std::string dir = kCpus + cpu + "/cpufreq/";
    if (const auto khz = machine_.number(dir + "scaling_cur_freq")) {
      sum += *khz;
      ++count;
    }
    if (nominal == 0) {
      nominal = machine_.number(dir + "base_frequency").value_or(machine_.number(dir + "cpuinfo_max_freq").value_or(0));
    }
  }
  if (count > 0) package.setPkgFreq(sum / count / 1000);
  if (nominal > 0) package.setPkgFreqNominal(nominal / 1000);
}

bool CpuSource::msrResidency(PackageEnergyStatistics& package, Cstates& cstates, std::uint64_t nominalMhz) const {
  if (nominalMhz == 0) return false;  // the counters tick at the nominal rate
  const int fd = ::open(machine_.path("/dev/cpu/0/msr").c_str(), O_RDONLY | O_CLOEXEC);
  if (fd < 0) return false;
  const std::uint64_t ticksPerMs = nominalMhz * 1000;
  std::uint64_t anyMs = 0;
  std::uint64_t maxMs = 0;
  bool read = false;
  cstates.setIsCore(false);
  cstates.setCore(-1);
  for (const auto& msr : kPackageMsrs) {
    std::uint64_t value = 0;
    if (::pread(fd, &value, sizeof value, msr.address) != static_cast<ssize_t>(sizeof value)) continue;
    read = true;
    const std::uint64_t ms = value / ticksPerMs;
    anyMs += ms;
    if (ms > 0) maxMs = ms;
    Cstate state;
    state.setLevel(msr.level);
    state.setResidency(ms);
    cstates.addStates(state);
  }
  ::close(fd);
  if (!read) return false;
  package.setPkgCanyResidency(anyMs);
  package.setPkgCmaxResidency(maxMs);
  return true;
}

void CpuSource::cpuidleResidency(PackageEnergyStatistics& package, CpuSample& sample, std::uint64_t absolute) {
  std::vector<Residencies> now;
  for (std::size_t i = 0; i < cpus_.size(); ++i) {
    const std::string dir = kCpus + cpus_[i] + "/cpuidle/";
    Residencies levels;
    for (const auto& state : machine_.list(dir)) {
      if (state.rfind("state", 0) != 0) continue;
      const auto level = parseNumber(state.substr(5));
      const auto micros = machine_.number(dir + state + "/time");
      if (level && micros) levels[*level] = *micros / 1000;
    }
    if (levels.empty()) continue;
    Cstates core;
    core.setAbsoluteTime(absolute);
    core.setIsCore(true);
    core.setCore(static_cast<std::int64_t>(*parseNumber(cpus_[i].substr(3))));
    for (const auto& [level, ms] : levels) {
      Cstate s;
      s.setLevel(level);
      s.setResidency(ms);
      core.addStates(s);
    }
    sample.cstates.push_back(std::move(core));
    now.push_back(std::move(levels));
  }
  if (now.empty()) return;

  if (idleSeen_ && now.size() == lastCpuIdle_.size()) {
    // The package idles in a level only while every CPU does: credit the
    // smallest increase among the CPUs.
    const auto smallest = [&](auto increase) {
      std::uint64_t least = std::numeric_limits<std::uint64_t>::max();
      for (std::size_t i = 0; i < now.size(); ++i) least = std::min(least, increase(now[i], lastCpuIdle_[i]));
      return least;
    };
    const auto delta = [](const Residencies& a, const Residencies& b, std::uint64_t level) -> std::uint64_t {
      const auto x = a.find(level);
      const auto y = b.find(level);
      if (x == a.end() || y == b.end() || x->second < y->second) return 0;
      return x->second - y->second;
    };
    std::uint64_t deepest = 0;
    for (const auto& [level, ms] : now.front()) {
      if (level == 0) continue;  // polling, not idle
      deepest = level;
      packageLevels_[level] += smallest([&](const Residencies& a, const Residencies& b) { return delta(a, b, level); });
    }
    packageAny_ += smallest([&](const Residencies& a, const Residencies& b) {
      std::uint64_t sum = 0;
      for (const auto& [level, ms] : a) {
        if (level > 0) sum += delta(a, b, level);
      }
      return sum;
    });
    if (deepest > 0) {
      packageMax_ += smallest([&](const Residencies& a, const Residencies& b) { return delta(a, b, deepest); });
    }
  } else {
    for (const auto& [level, ms] : now.front()) {
      if (level > 0) packageLevels_[level] += 0;
    }
  }
  idleSeen_ = true;
  lastCpuIdle_ = std::move(now);

  Cstates pkg;
  pkg.setAbsoluteTime(absolute);
  pkg.setIsCore(false);
  pkg.setCore(-1);
  for (const auto& [level, ms] : packageLevels_) {
    Cstate s;
    s.setLevel(level);
    s.setResidency(ms);
    pkg.addStates(s);
  }
  sample.cstates.insert(sample.cstates.begin(), std::move(pkg));
  package.setPkgCanyResidency(packageAny_);
  package.setPkgCmaxResidency(packageMax_);
}

bool CpuSource::statTimes(PackageEnergyStatistics& package) const {
  const auto first = machine_.line("/proc/stat");
  if (!first) return false;
  const auto words = splitWords(*first);
  if (words.size() < 5 || words[0] != "cpu") return false;
  const auto nice = parseNumber(words[2]);
  const auto idle = parseNumber(words[4]);
  if (!nice || !idle) return false;
  const long hz = ::sysconf(_SC_CLK_TCK);
  const std::uint64_t cpus = std::max<std::uint64_t>(1, cpus_.size());
  const auto ms = [&](std::uint64_t ticks) {
    return ticks * 1000 / static_cast<std::uint64_t>(hz > 0 ? hz : 100) / cpus;
  };
  package.setQosBgTime(ms(*nice));
  package.setQosIdleTime(ms(*idle));
  return true;
}

}  // namespace bw::recorder
