#pragma once
// What the recorder writes, step by step; the event loop (main) and the bus
// (logind, the process sampler) only call in. Each source reads under the
// machine root, so tests drive a Recorder over fixture trees.
//
// Cadence (every `tick`, a minute by default): clock and date checks, the
// power source (PowerStateChange when it changes, with a battery reading at
// once), the battery gauge, CPU energy and residencies, interrupts, disk and
// network, memory, devices, brightness and fans (the last three only when
// they change). Every `processEvery` ticks all processes are sampled; in
// between, a cheap pid listing notices processes that went away.
#include <cstdint>
#include <map>
#include <optional>
#include <unordered_map>

#include "recorder/Clock.h"
#include "recorder/CounterSources.h"
#include "recorder/CpuSource.h"
#include "recorder/DeviceSource.h"
#include "recorder/MachineFiles.h"
#include "recorder/PowerSupplySource.h"
#include "recorder/ProcessSource.h"
#include "recorder/StatsLog.h"

namespace bw::recorder {

class Recorder {
 public:
  Recorder(const MachineFiles& machine, const Clock& clock, StatsLog& log, unsigned processEvery = 5);

  // The first step after start: every source once, devices announced.
  void begin();
  void tick();
  // Samples every process, writes an exit record for each one gone since the
  // last sample, and flushes (the sampler's request waits for the disk).
  void sampleProcesses();
  // A SleepWake "sleep" record, flushed before the machine goes down.
  void willSleep();
  // After resume: the clock's new skew and a SleepWake "wake" record.
  void didWake();
  // A UserIdle record when the state changed (1 idle, 0 active).
  void userIdle(bool idle);
  void flush() { log_.flush(); }

  // Records written, by class name; for the closing log line and tests.
  const std::map<std::string, std::uint64_t>& written() const { return written_; }

 private:
  void write(const Record& record);
  void power(std::uint64_t now);
  void devices(std::uint64_t now);
  void panelAndFans(std::uint64_t now);
  void noticeExits(std::uint64_t now);
  void writeExit(const ProcessInfo& p, std::uint64_t now);

  const MachineFiles& machine_;
  const Clock& clock_;
  StatsLog& log_;
  unsigned processEvery_;
  unsigned ticks_ = 0;

  PowerSupplySource powerSupply_;
  CpuSource cpu_;
  InterruptSource interrupts_;
  IoSource io_;
  MemorySource memory_;
  ProcessSource processes_;
  DeviceSource devices_;
  PanelAndFanSource panelAndFans_;

  std::optional<bool> external_;
  std::map<std::string, DeviceState> devicesSeen_;
  std::optional<std::uint64_t> brightness_;
  std::optional<std::uint64_t> fanRpm_;
  std::optional<bool> idle_;
  std::unordered_map<std::uint64_t, ProcessInfo> live_;  // by unique id, as last sampled
  std::map<std::string, std::uint64_t> written_;
};

}  // namespace bw::recorder
