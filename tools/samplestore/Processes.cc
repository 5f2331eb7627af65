#include "Processes.h"

#include <algorithm>
#include <numeric>

#include "Records/ProcessUsage.h"

namespace bw::samplestore {

namespace {

constexpr std::uint64_t kSampleEvery = 5 * kMinute;
constexpr std::uint32_t kUserUid = 501;

}  // namespace

Processes::Processes(const MachinePlan& plan, int scale) : plan_(plan), rng_(plan.seed(), 5), scale_(scale) {
  catalog_ = makeCatalog(scale, rng_);
}

int Processes::add(Instance instance) {
  instance.lastAbs = instance.start;
  instance.system = instance.uid != kUserUid;
  instances_.push_back(std::move(instance));
  return static_cast<int>(instances_.size() - 1);
}

std::uint64_t Processes::userStart(const Boot& boot, std::uint64_t notBefore) {
  for (const Run& run : boot.runs) {
    if (run.dark || run.absEnd() < notBefore + 2 * kMinute) continue;
    const std::uint64_t first = run.start == RunStart::Boot ? boot.firstRecordAbs + 10'000 : run.absStart;
    const std::uint64_t t = std::max(notBefore, first + static_cast<std::uint64_t>(rng_.between(10'000, 120'000)));
    if (t + kMinute < run.absEnd()) return t;
  }
  return kNever;
}

void Processes::planInstances(const Boot& boot) {
  const std::uint64_t first = boot.firstRecordAbs;
  const std::uint64_t last = boot.lastAbs();
  Instance launchd;
  launchd.name = "launchd";
  launchd.executableUuid = executableUuidOf("launchd");
  launchd.parent = -1;
  launchd.cpuWeight = 0.004;
  launchd.wakeRate = 6;
  launchd.residentMB = 14;
  add(launchd);
  Instance userLaunchd = launchd;
  userLaunchd.uid = kUserUid;
  userLaunchd.parent = kLaunchd;
  userLaunchd.start = first + 6'000;  // the user logs in
  userLaunchd.residentMB = 9;
  add(userLaunchd);
  instances_[kUserLaunchd].system = true;  // the system's launchd reports on it

  std::vector<std::vector<int>> byProgram(catalog_.size());
  for (std::size_t i = 0; i < catalog_.size(); ++i) {
    const Program& program = catalog_[i];
    const auto instance = [&](std::uint64_t start) {
      Instance p;
      p.program = static_cast<int>(i);
      p.name = program.name;
      p.displayName = program.displayName;
      p.executableUuid = program.executableUuid;
      p.uid = program.uid;
      p.start = start;
      p.cpuWeight = program.cpuWeight;
      p.wakeRate = program.wakeRate;
      p.residentMB = program.residentMB;
      p.gui = program.gui;
      return p;
    };
    switch (program.role) {
      case Role::Daemon:
      case Role::Agent: {
        const bool agent = program.role == Role::Agent;
        std::uint64_t t = agent ? first + 8'000 + rng_.below(30'000) : first + 1'000 + rng_.below(39'000);
        while (true) {
          Instance p = instance(t);
          p.parent = agent ? kUserLaunchd : kLaunchd;
          // A few crash or exit on their own; launchd starts them again.
          if (rng_.chance(0.12)) {
            p.end = t + static_cast<std::uint64_t>(rng_.between(2 * kHour, 20 * kHour));
            p.exitStatus = rng_.chance(0.3) ? 1 : 0;
          }
          byProgram[i].push_back(add(std::move(p)));
          const std::uint64_t end = instances_.back().end;
          if (end >= last) break;
          t = end + static_cast<std::uint64_t>(rng_.between(2'000, 30'000));
        }
        break;
      }
      case Role::App: {
        if (!rng_.chance(0.75)) break;
        std::uint64_t t = userStart(boot, first + 10'000);
        while (t != kNever) {
          Instance p = instance(t);
          p.parent = kUserLaunchd;
          p.end = t + static_cast<std::uint64_t>(rng_.between(30 * kMinute, 10 * kHour));
          byProgram[i].push_back(add(std::move(p)));
          if (instances_.back().end >= last) break;
          t = userStart(boot,
                        instances_.back().end + static_cast<std::uint64_t>(rng_.between(20 * kMinute, 6 * kHour)));
        }
        break;
      }
      case Role::Service:
      case Role::Plugin:
        planOwned(boot, static_cast<int>(i), byProgram[static_cast<std::size_t>(program.owner)]);
        break;
    }
  }
  planTools(boot);

  // Beyond the boot's end nothing exits; at a shutdown everything is stopped.
  const bool shutdown = boot.runs.back().end == RunEnd::Shutdown;
  for (std::size_t i = 2; i < instances_.size(); ++i) {
    Instance& p = instances_[i];
    if (p.end != kNever && p.end >= last) p.end = kNever;
    if (p.end == kNever && shutdown) {
      p.end = std::max(p.start + 1, last - static_cast<std::uint64_t>(rng_.between(500, 4'000)));
      p.exitStatus = p.program >= 0 && catalog_[static_cast<std::size_t>(p.program)].role == Role::App ? 0 : 15;
    }
    // Exits are noticed while the machine runs, not while it sleeps.
    if (p.end != kNever) {
      const Run& run = boot.runAt(p.end);
      if (p.end > run.absEnd() && run.absEnd() > p.start) p.end = run.absEnd();
    }
  }
}

void Processes::planOwned(const Boot& boot, int program, const std::vector<int>& owners) {
  const Program& model = catalog_[static_cast<std::size_t>(program)];
  const bool plugin = model.role == Role::Plugin;
  const std::uint64_t last = boot.lastAbs();
  for (int o : owners) {
    const std::uint64_t ownerStart = instances_[static_cast<std::size_t>(o)].start;
    const std::uint64_t ownerEnd = instances_[static_cast<std::size_t>(o)].end;
    if (plugin && !rng_.chance(0.5)) continue;
    std::uint64_t t = ownerStart + static_cast<std::uint64_t>(rng_.between(2'000, 120'000));
    while (t + 10'000 < std::min(ownerEnd, last)) {
      Instance p;
      p.program = program;
      p.name = model.name;
      // Appended piecewise: "." + string trips GCC 12's -Wrestrict at -O3.
      if (model.uuidSuffix) p.name.append(".").append(rng_.uuid().string());
      if (model.numberSuffix) p.name.append(".").append(std::to_string(rng_.between(100, 99'999)));
      p.displayName = model.displayName;
      p.executableUuid = model.executableUuid;
      p.uid = model.uid;
      p.start = t;
      p.cpuWeight = model.cpuWeight;
      p.wakeRate = model.wakeRate;
      p.residentMB = model.residentMB;
      p.gui = model.gui;
      // Services are started by launchd on the owner's behalf; plug-ins by the owner.
      p.parent = plugin ? o : kLaunchd;
      p.responsible = o;
      const std::uint64_t life = static_cast<std::uint64_t>(plugin ? rng_.between(10 * kMinute, 90 * kMinute)
                                                                   : rng_.between(5 * kMinute, 120 * kMinute));
      p.end = t + life;
      p.exitStatus = rng_.chance(0.04) ? (plugin ? 11 : 1) : 0;
      if (p.end >= ownerEnd) {
        // The owner quits first and takes its helpers along.
        p.end = ownerEnd == kNever ? kNever : ownerEnd + static_cast<std::uint64_t>(rng_.between(100, 900));
        p.exitStatus = 0;
      }
      add(std::move(p));
      if (instances_.back().end >= std::min(ownerEnd, last)) break;
      t = instances_.back().end + static_cast<std::uint64_t>(rng_.between(kMinute, 30 * kMinute));
    }
  }
}

void Processes::planTools(const Boot& boot) {
  std::uint64_t awake = 0;
  for (const Run& run : boot.runs) awake += run.dark ? 0 : run.duration;
  const auto count = static_cast<std::uint64_t>(static_cast<double>(awake) / kHour * scale_ / 12.0);
  const auto& names = toolNames();
  const std::size_t programs = instances_.size();
  for (std::uint64_t n = 0; n < count; ++n) {
    // A moment the user is at the machine, any run weighted by its length.
    std::uint64_t pick = rng_.below(awake);
    const Run* run = nullptr;
    for (const Run& r : boot.runs) {
      if (r.dark) continue;
      if (pick < r.duration) {
        run = &r;
        break;
      }
      pick -= r.duration;
    }
    const std::uint64_t from = (run->start == RunStart::Boot ? boot.firstRecordAbs + 20'000 : run->absStart + 5'000);
    if (from + 60'000 >= run->absEnd()) continue;
    const std::uint64_t t = from + rng_.below(run->absEnd() - 60'000 - from);
    // The parent: some running program, or the user's launchd.
    int parent = kUserLaunchd;
    for (int tries = 0; tries < 4; ++tries) {
      const int candidate = static_cast<int>(2 + rng_.below(programs - 2));
      const Instance& c = instances_[static_cast<std::size_t>(candidate)];
      if (c.start < t && c.end > t) {
        parent = candidate;
        break;
      }
    }
    const Instance& par = instances_[static_cast<std::size_t>(parent)];
    Instance p;
    p.name = names[rng_.below(names.size())];
    p.executableUuid = executableUuidOf(p.name);
    p.uid = par.uid;
    p.start = t;
    p.parent = parent;
    p.responsible = par.responsible < 0 ? parent : par.responsible;
    p.cpuWeight = 0.3;
    p.wakeRate = 10;
    p.residentMB = static_cast<std::uint64_t>(rng_.between(2, 20));
    const double kind = rng_.unit();
    if (kind < 0.1) {
      p.end = t + static_cast<std::uint64_t>(rng_.between(5, 200));
      p.exitStatus = -2;
      p.sampled = false;
    } else if (kind < 0.95) {
      p.end = t + static_cast<std::uint64_t>(rng_.between(30, 20'000));
      p.exitStatus = rng_.chance(0.08) ? static_cast<std::int64_t>(rng_.between(1, 2)) : 0;
      p.sampled = false;
    } else {
      p.end = t + static_cast<std::uint64_t>(rng_.between(kMinute, 30 * kMinute));
    }
    add(std::move(p));
  }
}

void Processes::assignIds() {
  std::vector<int> order(instances_.size() - 1);
  std::iota(order.begin(), order.end(), 1);
  std::stable_sort(order.begin(), order.end(), [this](int a, int b) {
    return instances_[static_cast<std::size_t>(a)].start < instances_[static_cast<std::size_t>(b)].start;
  });
  instances_[kLaunchd].pid = 1;
  instances_[kLaunchd].uniqueid = 1;
  std::uint64_t pid = 60 + rng_.below(40);
  std::uint64_t uniqueid = 80 + rng_.below(40);
  for (int i : order) {
    pid += 1 + rng_.below(4);
    uniqueid += 1 + rng_.below(3);
    instances_[static_cast<std::size_t>(i)].pid = pid;
    instances_[static_cast<std::size_t>(i)].uniqueid = uniqueid;
  }
}

void Processes::advance(Instance& p, std::uint64_t abs, double load) {
  if (abs <= p.lastAbs) return;
  const double ms = static_cast<double>(abs - p.lastAbs);
  p.lastAbs = abs;
  const double cpuNs = ms * 1e6 * p.cpuWeight * (0.25 + load) * rng_.uniform(0.8, 1.2);
  p.userNs += cpuNs * 0.72;
  p.systemNs += cpuNs * 0.28;
  const double wakeups = ms / 1000 * p.wakeRate * (0.6 + load);
  p.idleWakeups += wakeups;
  p.interruptWakeups += wakeups * 1.35;
  p.pageins += ms / 1000 * 0.0004 * static_cast<double>(p.residentMB);
}

void Processes::emit(const Instance& p, std::uint64_t abs, std::int64_t status, RecordSink& sink) {
  const auto at = [this](int index) -> const Instance& { return instances_[static_cast<std::size_t>(index)]; };
  const Instance* parent = p.parent >= 0 ? &at(p.parent) : nullptr;
  const Instance& responsible = p.responsible >= 0 ? at(p.responsible) : p;
  ProcessUsage r;
  r.setName(p.name);
  r.setPid(p.pid);
  r.setExitStatus(status);
  const bool full = status != -2;  // a process gone before it was looked at tells little
  if (full) {
    r.setUuid(std::string(p.executableUuid.begin(), p.executableUuid.end()));
    r.setUserTime(static_cast<std::uint64_t>(p.userNs));
    r.setSystemTime(static_cast<std::uint64_t>(p.systemNs));
    r.setPkgIdleWkups(static_cast<std::uint64_t>(p.idleWakeups));
    r.setInterruptWkups(static_cast<std::uint64_t>(p.interruptWakeups));
    r.setPageins(static_cast<std::uint64_t>(p.pageins));
    const double swing = 0.85 + 0.3 * hashUnit(p.uniqueid, abs / kSampleEvery);
    const auto resident =
        static_cast<std::uint64_t>(static_cast<double>(p.residentMB << 20) * swing) & ~std::uint64_t{4095};
    r.setWiredSize(resident / 64 & ~std::uint64_t{4095});
    r.setResidentSize(resident);
    r.setPhysFootprint(resident / 5 * 4);
  }
  r.setProcStartAbstime(p.start);
  if (status == -1 || status == -3) {
    r.setNowAbstime(abs);
  } else {
    r.setProcExitAbstime(abs);
  }
  r.setPpid(parent ? parent->pid : 0);
  r.setResponsiblePid(responsible.pid);
  r.setUid(p.uid);
  if (full && p.childElapsed > 0) {
    r.setChildUserTime(static_cast<std::uint64_t>(p.childUserNs));
    r.setChildSystemTime(static_cast<std::uint64_t>(p.childSystemNs));
    r.setChildPkgIdleWkups(static_cast<std::uint64_t>(p.childIdle));
    r.setChildInterruptWkups(static_cast<std::uint64_t>(p.childInterrupt));
    r.setChildPageins(static_cast<std::uint64_t>(p.childPageins));
    r.setChildElapsedAbstime(static_cast<std::uint64_t>(p.childElapsed));
  }
  if (full && p.gui) {
    const std::uint64_t graphics = (p.residentMB << 20) / 4 & ~std::uint64_t{4095};
    r.setIoaccelAllocatedSize(graphics);
    r.setIoaccelResidentSize(graphics / 4 * 3);
    r.setIoaccelWiredSize(graphics / 8);
    r.setIoaccelDirtySize(graphics / 16);
    r.setIoaccelCachedSize(graphics / 8);
    r.setIoaccelPurgeableSize(graphics / 32);
  }
  if (!p.displayName.empty()) r.setDisplayName(p.displayName);
  r.setUniqueid(p.uniqueid);
  r.setParentUniqueid(parent ? parent->uniqueid : 0);
  r.setResponsibleUniqueid(responsible.uniqueid);
  sink.add(p.system ? Stream::SystemProcesses : Stream::UserProcesses, r);
}

void Processes::exit(Instance& p, const Boot& boot, RecordSink& sink) {
  advance(p, p.end, plan_.loadAt(boot.wallAt(p.end), boot.runAt(p.end).dark));
  emit(p, p.end, p.exitStatus, sink);
  if (p.parent >= 0) {
    // The parent reaps it and counts its usage among its children's.
    Instance& parent = instances_[static_cast<std::size_t>(p.parent)];
    parent.childUserNs += p.userNs;
    parent.childSystemNs += p.systemNs;
    parent.childIdle += p.idleWakeups;
    parent.childInterrupt += p.interruptWakeups;
    parent.childPageins += p.pageins;
    parent.childElapsed += static_cast<double>(p.end - p.start);
  }
}

void Processes::boot(std::size_t index, RecordSink& sink) {
  const Boot& boot = plan_.boots()[index];
  instances_.clear();
  planInstances(boot);
  assignIds();

  // Everything that happens, in time order: exits first at equal times, then
  // the snapshots taken as the machine goes to sleep, then the samples.
  enum Kind { kExit, kSnapshot, kSample };
  struct Moment {
    std::uint64_t abs;
    Kind kind;
    std::size_t index;  // instance for exits, run otherwise
  };
  std::vector<Moment> moments;
  for (std::size_t i = 0; i < instances_.size(); ++i) {
    if (instances_[i].end != kNever) moments.push_back({instances_[i].end, kExit, i});
  }
  for (std::size_t r = 0; r < boot.runs.size(); ++r) {
    const Run& run = boot.runs[r];
    if (!run.dark && run.end == RunEnd::Sleep) moments.push_back({run.absEnd() - 1'500, kSnapshot, r});
    const std::uint64_t first = run.start == RunStart::Boot ? boot.firstRecordAbs : run.absStart;
    for (std::uint64_t abs = first + 45'000; abs < run.absEnd(); abs += kSampleEvery)
      moments.push_back({abs, kSample, r});
  }
  std::sort(moments.begin(), moments.end(), [](const Moment& a, const Moment& b) {
    return a.abs != b.abs ? a.abs < b.abs : a.kind != b.kind ? a.kind < b.kind : a.index < b.index;
  });

  for (const Moment& m : moments) {
    if (m.kind == kExit) {
      exit(instances_[m.index], boot, sink);
      continue;
    }
    const Run& run = boot.runs[m.index];
    const std::uint64_t from = std::max(run.absStart, m.abs - std::min(m.abs, kSampleEvery));
    const double load = plan_.meanLoad(run.wallAt(from), run.wallAt(m.abs), run.dark);
    for (Instance& p : instances_) {
      if (!p.sampled || p.start >= m.abs || p.end <= m.abs) continue;
      if (m.kind == kSnapshot) {
        if (p.program < 0 || catalog_[static_cast<std::size_t>(p.program)].role != Role::App) continue;
      } else if (run.dark && !p.system) {
        continue;  // in a dark wake only the system works
      }
      advance(p, m.abs, load);
      emit(p, m.abs, m.kind == kSnapshot ? -3 : -1, sink);
    }
  }
}

}  // namespace bw::samplestore
