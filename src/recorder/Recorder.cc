#include "recorder/Recorder.h"

#include <unistd.h>

#include <algorithm>
#include <set>

#include "Records/DeviceChange.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/PowerStateChange.h"
#include "Records/ProcessUsage.h"
#include "Records/SleepWake.h"
#include "Records/UserIdle.h"

namespace bw::recorder {

namespace {

constexpr std::int64_t kRunning = -1;
// An observer never learns another process's exit code: exits are written as 0.
constexpr std::int64_t kExited = 0;

ProcessUsage usageRecord(const ProcessInfo& p) {
  ProcessUsage r;
  r.setName(p.name);
  r.setPid(p.pid);
  r.setUserTime(p.userNs);
  r.setSystemTime(p.systemNs);
  r.setPageins(p.majorFaults);
  r.setResidentSize(p.residentBytes);
  r.setPhysFootprint(p.footprintBytes);
  r.setProcStartAbstime(p.startAbsolute);
  r.setPpid(p.ppid);
  r.setResponsiblePid(p.responsiblePid);
  r.setUid(p.uid);
  if (!p.unit.empty()) r.setDisplayName(p.unit);
  r.setUniqueid(p.uniqueid);
  r.setParentUniqueid(p.parentUniqueid);
  r.setResponsibleUniqueid(p.responsibleUniqueid);
  return r;
}

}  // namespace

Recorder::Recorder(const MachineFiles& machine, const Clock& clock, StatsLog& log, unsigned processEvery)
    : machine_(machine),
      clock_(clock),
      log_(log),
      processEvery_(std::max(1u, processEvery)),
      powerSupply_(machine),
      cpu_(machine),
      interrupts_(machine),
      io_(machine),
      memory_(machine, static_cast<std::uint64_t>(::sysconf(_SC_PAGESIZE))),
      processes_(machine),
      devices_(machine),
      panelAndFans_(machine) {}

void Recorder::write(const Record& record) {
  if (log_.write(record)) ++written_[record.className()];
}

void Recorder::begin() {
  tick();
  sampleProcesses();
}

void Recorder::tick() {
  log_.checkClock();
  const std::uint64_t now = log_.now();
  power(now);
  const CpuSample cpu = cpu_.read(now);
  if (cpu.package) write(*cpu.package);
  for (const auto& c : cpu.cstates) write(c);
  if (const auto r = interrupts_.read(now)) write(*r);
  if (const auto r = io_.read(now)) write(*r);
  if (const auto r = memory_.read(now)) write(*r);
  devices(now);
  panelAndFans(now);
  if (++ticks_ % processEvery_ == 0) {
    sampleProcesses();
  } else {
    noticeExits(now);
  }
}

void Recorder::power(std::uint64_t now) {
  PowerSupplyState state = powerSupply_.read();
  if (state.external && state.external != external_) {
    PowerStateChange change;
    change.setAbsoluteTime(now);
    change.setChange(*state.external ? 0 : 1);
    change.setWallTime(log_.wallAt(now));
    if (state.battery) change.setIsFullyCharged(state.battery->isFullyCharged());
    write(change);
    external_ = state.external;
  }
  if (state.battery) {
    state.battery->setAbsoluteTime(now);
    write(*state.battery);
  }
}

void Recorder::devices(std::uint64_t now) {
  std::set<std::string> present;
  const auto announce = [&](const DeviceState& d, bool on) {
    DeviceChange change;
    change.setAbsoluteTime(now);
    change.setDeviceType(d.type);
    change.setDeviceName(d.name);
    change.setDeviceId(d.id);
    change.setNowConnected(on ? 1 : 0);
    write(change);
  };
  for (const auto& d : devices_.read()) {
    present.insert(d.id);
    const auto seen = devicesSeen_.find(d.id);
    if (seen == devicesSeen_.end() || seen->second.on != d.on) announce(d, d.on);
    devicesSeen_[d.id] = d;
  }
  for (auto it = devicesSeen_.begin(); it != devicesSeen_.end();) {
    if (present.count(it->first)) {
      ++it;
      continue;
    }
    if (it->second.on) announce(it->second, false);
    it = devicesSeen_.erase(it);
  }
}

void Recorder::panelAndFans(std::uint64_t now) {
  const auto brightness = panelAndFans_.brightnessPercent();
  if (brightness && brightness != brightness_) {
    DisplayBrightness r;
    r.setAbsoluteTime(now);
    r.setBrightness(*brightness);
    write(r);
  }
  brightness_ = brightness;
  const auto rpm = panelAndFans_.highestFanRpm();
  if (rpm && rpm != fanRpm_) {
    FanState r;
    r.setAbsoluteTime(now);
    r.setHighestRpm(*rpm);
    r.setLoudness(static_cast<std::int32_t>(std::min<std::uint64_t>(6, *rpm / 1000)));
    write(r);
  }
  fanRpm_ = rpm;
}

void Recorder::writeExit(const ProcessInfo& p, std::uint64_t now) {
  ProcessUsage r = usageRecord(p);
  r.setExitStatus(kExited);
  r.setProcExitAbstime(now);
  r.setNowAbstime(now);
  write(r);
}

void Recorder::sampleProcesses() {
  const std::uint64_t now = log_.now();
  auto current = processes_.scan(clock_.asleepMs());
  for (const auto& [id, p] : live_) {
    if (!current.count(id)) writeExit(p, now);
  }
  for (const auto& [id, p] : current) {
    ProcessUsage r = usageRecord(p);
    r.setExitStatus(kRunning);
    r.setNowAbstime(now);
    write(r);
  }
  live_ = std::move(current);
  log_.flush();
}

void Recorder::noticeExits(std::uint64_t now) {
  const auto pids = processes_.pids();
  const std::set<std::uint64_t> present(pids.begin(), pids.end());
  for (auto it = live_.begin(); it != live_.end();) {
    if (present.count(it->second.pid)) {
      ++it;
      continue;
    }
    writeExit(it->second, now);
    it = live_.erase(it);
  }
}

void Recorder::willSleep() {
  const std::uint64_t now = log_.now();
  SleepWake r;
  r.setAbsoluteTime(now);
  r.setWallTime(log_.wallAt(now));
  r.setReason(0);
  write(r);
  log_.flush();
}

void Recorder::didWake() {
  log_.resyncClock();
  const std::uint64_t now = log_.now();
  SleepWake r;
  r.setAbsoluteTime(now);
  r.setWallTime(log_.wallAt(now));
  r.setReason(1);
  write(r);
  log_.checkClock();
}

void Recorder::userIdle(bool idle) {
  if (idle_ == idle) return;
  idle_ = idle;
  UserIdle r;
  r.setAbsoluteTime(log_.now());
  r.setChange(idle ? 1 : 0);
  write(r);
}

}  // namespace bw::recorder
