#pragma once
// Which boot the recorder writes for, and which boot came before it. The
// running boot comes from /proc/sys/kernel/random/boot_id and its build from
// the kernel release; the previous boot is remembered in a small state file
// in the store ("recorder.state": four lines, boot, build, previous boot,
// previous build), rewritten atomically when a new boot is first seen.
#include <optional>
#include <string>

#include "base/Uuid.h"
#include "recorder/MachineFiles.h"

namespace bw::recorder {

struct BootIdentity {
  Uuid boot;
  std::string build;
  std::optional<Uuid> lastBoot;
  std::string lastBuild;
  bool firstStartOfBoot = false;  // no earlier start of the recorder in this boot
};

// Reads the running boot and the state file `statePath`, and records the
// running boot there. None when the boot's UUID can't be read.
std::optional<BootIdentity> loadBootIdentity(const MachineFiles& machine, const std::string& statePath);

}  // namespace bw::recorder
