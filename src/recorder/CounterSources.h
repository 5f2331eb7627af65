#pragma once
// The kernel's system-wide counters, each read whole on every call:
// - InterruptSource: /proc/interrupts, one vector per line and CPU with a
//   non-zero count (name = the line's label: "24", "LOC", "NMI");
// - IoSource: /proc/diskstats over whole disks only (a /sys/block entry with
//   a device behind it: partitions, loop, RAM and mapper devices would count
//   the same bytes twice or not at all; 512-byte sectors) and /proc/net/dev
//   without the loopback;
// - MemorySource: /proc/meminfo and /proc/vmstat as SystemMemory (counts in
//   pages, sizes in bytes; the swap device is solid state when its disk's
//   queue/rotational is 0).
// Each answers none when its files are absent.
#include <optional>

#include "Records/Interrupts.h"
#include "Records/SystemIO.h"
#include "Records/SystemMemory.h"
#include "recorder/MachineFiles.h"

namespace bw::recorder {

class InterruptSource {
 public:
  explicit InterruptSource(const MachineFiles& machine) : machine_(machine) {}
  std::optional<Interrupts> read(std::uint64_t absolute) const;

 private:
  const MachineFiles& machine_;
};

class IoSource {
 public:
  explicit IoSource(const MachineFiles& machine) : machine_(machine) {}
  std::optional<SystemIO> read(std::uint64_t absolute) const;

 private:
  const MachineFiles& machine_;
};

class MemorySource {
 public:
  explicit MemorySource(const MachineFiles& machine, std::uint64_t pageSize);
  std::optional<SystemMemory> read(std::uint64_t absolute) const;

 private:
  std::optional<bool> swapIsSolidState() const;

  const MachineFiles& machine_;
  std::uint64_t pageSize_;
};

}  // namespace bw::recorder
