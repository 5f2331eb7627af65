#pragma once
// Process usage as launchd records it: for every boot, launchd (pid 1) and
// the user's launchd, daemons and agents that run for the whole boot (a few
// restart), applications opened and quit, their helper services and plug-in
// processes, and short-lived tools. Running processes are sampled every five
// minutes of machine time (exit status -1, and -3 snapshots as the machine
// goes to sleep); every exit is recorded (0, a failure code, 15 when killed
// at shutdown, -2 for tools that were gone before they could be looked at).
// CPU times are cumulative nanoseconds that follow the plan's load.
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "MachinePlan.h"
#include "ProcessCatalog.h"
#include "Random.h"
#include "RecordSink.h"

namespace bw::samplestore {

class Processes {
 public:
  Processes(const MachinePlan& plan, int scale);
  void boot(std::size_t index, RecordSink& sink);

  // How many process instances the last boot had.
  std::size_t lastBootInstances() const { return instances_.size(); }

 private:
  static constexpr std::uint64_t kNever = ~std::uint64_t{0};
  static constexpr int kLaunchd = 0;
  static constexpr int kUserLaunchd = 1;

  struct Instance {
    int program = -1;  // catalog index; -1 for launchd and tools
    std::string name;
    std::string displayName;
    std::array<std::uint8_t, 16> executableUuid{};
    std::uint32_t uid = 0;
    std::uint64_t start = 0;
    std::uint64_t end = kNever;
    std::int64_t exitStatus = 0;
    int parent = kLaunchd;  // instance index
    int responsible = -1;   // instance index; -1 for itself
    std::uint64_t pid = 0;
    std::uint64_t uniqueid = 0;
    double cpuWeight = 0;
    double wakeRate = 0;
    std::uint64_t residentMB = 0;
    bool gui = false;
    bool sampled = true;  // tools that live for a moment are only seen at exit
    bool system = true;   // recorded by the system's launchd
    // running totals
    std::uint64_t lastAbs = 0;
    double userNs = 0, systemNs = 0, idleWakeups = 0, interruptWakeups = 0, pageins = 0;
    double childUserNs = 0, childSystemNs = 0, childIdle = 0, childInterrupt = 0, childPageins = 0, childElapsed = 0;
  };

  void planInstances(const Boot& boot);
  void planOwned(const Boot& boot, int program, const std::vector<int>& ownerInstances);
  void planTools(const Boot& boot);
  void assignIds();
  int add(Instance instance);
  // A start time for an application: within a run the user is at.
  std::uint64_t userStart(const Boot& boot, std::uint64_t notBefore);
  void advance(Instance& p, std::uint64_t abs, double load);
  void emit(const Instance& p, std::uint64_t abs, std::int64_t status, RecordSink& sink);
  void exit(Instance& p, const Boot& boot, RecordSink& sink);

  const MachinePlan& plan_;
  Random rng_;
  std::vector<Program> catalog_;
  std::vector<Instance> instances_;
  int scale_;
};

}  // namespace bw::samplestore
