#pragma once
// ProcessUsage records for the process-accounting tests, fed at their own
// absolute time on boot 1 unless told otherwise.
#include <cstdint>
#include <optional>
#include <string>

#include "Events.h"
#include "Records/ProcessUsage.h"

namespace bw::test {

struct Sample {
  std::uint64_t uniqueid = 0;  // also the pid
  std::uint64_t at = 0;        // the record's time: now, or the exit
  std::int64_t status = -1;    // -1 still running
  const char* name = "job";    // nullptr: no name
  std::uint64_t parent = 1;
  std::uint64_t responsible = 0;
  double cpuMs = 0;  // cumulative user + system time
  std::uint64_t idle = 0;
  std::uint64_t interrupts = 0;
  std::uint64_t start = 0;
  const char* displayName = nullptr;
  std::uint64_t resident = 0;
  std::optional<Uuid> uuid;
};

inline ProcessUsage processUsage(const Sample& s) {
  ProcessUsage r;
  if (s.name) r.setName(s.name);
  if (s.displayName) r.setDisplayName(s.displayName);
  r.setPid(s.uniqueid);
  r.setUniqueid(s.uniqueid);
  r.setParentUniqueid(s.parent);
  r.setResponsibleUniqueid(s.responsible);
  r.setExitStatus(s.status);
  r.setProcStartAbstime(s.start);
  if (s.status == -1 || s.status == -3) {
    r.setNowAbstime(s.at);
  } else {
    r.setProcExitAbstime(s.at);
  }
  const auto cpu = static_cast<std::uint64_t>(s.cpuMs * 1e6);
  r.setUserTime(cpu / 4 * 3);
  r.setSystemTime(cpu - cpu / 4 * 3);
  r.setPkgIdleWkups(s.idle);
  r.setInterruptWkups(s.interrupts);
  r.setResidentSize(s.resident);
  r.setWiredSize(4096);  // never read: the wired curve keeps its initial 0
  if (s.uuid) r.setUuid(std::string(s.uuid->bytes().begin(), s.uuid->bytes().end()));
  return r;
}

inline void feed(Summarizer& summarizer, const Sample& s, std::uint8_t bootNumber = 1) {
  const ProcessUsage r = processUsage(s);
  summarizer.addEvent(r, r.absoluteTime(), AbsTime{boot(bootNumber), r.absoluteTime()}, 0);
}

}  // namespace bw::test
