#pragma once
// The programs installed on the simulated laptop: system daemons, the
// user's agents and applications, the applications' helper services and
// plug-in processes, and short-lived command-line tools. All names are made
// up. The catalog is sized so that about `scale` processes run at once.
#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "Random.h"

namespace bw::samplestore {

enum class Role : std::uint8_t {
  Daemon,   // system daemon started by launchd, runs as root
  Agent,    // the user's background agent, started by the per-user launchd
  App,      // an application the user opens and quits
  Service,  // a helper service of an application or daemon, started by launchd
  Plugin,   // a plug-in process hosted for an application
};

struct Program {
  std::string name;         // the process name (services get an instance suffix)
  std::string displayName;  // applications and plug-ins
  Role role = Role::Daemon;
  int owner = -1;  // services and plug-ins: the program they work for
  std::uint32_t uid = 0;
  double cpuWeight = 0;  // share of one processor at full load
  double wakeRate = 0;   // idle wake-ups per second
  std::uint64_t residentMB = 0;
  bool gui = false;           // uses graphics memory
  bool uuidSuffix = false;    // each instance's name ends in a fresh UUID
  bool numberSuffix = false;  // each instance's name ends in a number
  std::array<std::uint8_t, 16> executableUuid{};
};

// The programs of a laptop running about `scale` processes at once.
std::vector<Program> makeCatalog(int scale, Random& rng);

// Short-lived command-line tools.
const std::vector<const char*>& toolNames();

// The executable UUID of a program name: the same for every instance.
std::array<std::uint8_t, 16> executableUuidOf(const std::string& name);

}  // namespace bw::samplestore
