#include "recorder/ProcessSource.h"

#include <unistd.h>

#include <map>

namespace bw::recorder {

namespace {

struct StatLine {
  std::string comm;
  std::uint64_t ppid = 0, utime = 0, stime = 0, majflt = 0, start = 0;
};

// /proc/<pid>/stat: "pid (comm) state ppid ..."; comm may hold blanks and ')'.
std::optional<StatLine> parseStat(const std::string& text) {
  const auto open = text.find('(');
  const auto close = text.rfind(')');
  if (open == std::string::npos || close == std::string::npos || close < open) return std::nullopt;
  const auto w = splitWords(text.substr(close + 1));
  // Fields after comm, counted from 0 at "state": ppid 1, majflt 9, utime 11, stime 12, starttime 19.
  if (w.size() < 20) return std::nullopt;
  StatLine s;
  s.comm = text.substr(open + 1, close - open - 1);
  s.ppid = parseNumber(w[1]).value_or(0);
  s.majflt = parseNumber(w[9]).value_or(0);
  s.utime = parseNumber(w[11]).value_or(0);
  s.stime = parseNumber(w[12]).value_or(0);
  s.start = parseNumber(w[19]).value_or(0);
  return s;
}

struct Cgroup {
  std::string path;          // the unified hierarchy's path, or the named systemd one
  std::string unit;          // its last ".service" or ".scope" component
  bool userManager = false;  // inside a user@ service
};

Cgroup cgroupOf(const std::string& cgroups) {
  Cgroup g;
  for (const auto& line : splitLines(cgroups)) {
    if (line.rfind("0::", 0) == 0) {
      g.path = line.substr(3);
    } else if (g.path.empty() && line.find(":name=systemd:") != std::string::npos) {
      g.path = line.substr(line.find(":/") + 1);
    }
  }
  std::string userService;
  std::size_t from = 0;
  while (from < g.path.size()) {
    std::size_t end = g.path.find('/', from);
    if (end == std::string::npos) end = g.path.size();
    const std::string part = g.path.substr(from, end - from);
    const auto endsWith = [&](const std::string& suffix) {
      return part.size() > suffix.size() && part.compare(part.size() - suffix.size(), suffix.size(), suffix) == 0;
    };
    if (endsWith(".service") || endsWith(".scope")) g.unit = part;
    if (part.rfind("user@", 0) == 0 && endsWith(".service")) userService = part;
    from = end + 1;
  }
  g.userManager = !userService.empty();
  // The user manager itself sits in its service's init.scope: name the service.
  if (g.unit == "init.scope" && !userService.empty()) g.unit = userService;
  return g;
}

std::uint64_t statusValue(const std::string& status, const char* key, bool kilobytes) {
  const std::string prefix = std::string(key) + ":";
  for (const auto& line : splitLines(status)) {
    if (line.rfind(prefix, 0) != 0) continue;
    const auto w = splitWords(line.substr(prefix.size()));
    if (w.empty()) return 0;
    const std::uint64_t v = parseNumber(w[0]).value_or(0);
    return kilobytes ? v * 1024 : v;
  }
  return 0;
}

}  // namespace

ProcessSource::ProcessSource(const MachineFiles& machine) : machine_(machine) {
  const long hz = ::sysconf(_SC_CLK_TCK);
  ticksPerSecond_ = hz > 0 ? static_cast<std::uint64_t>(hz) : 100;
}

std::vector<std::uint64_t> ProcessSource::pids() const {
  std::vector<std::uint64_t> out;
  for (const auto& name : machine_.list("/proc")) {
    if (const auto pid = parseNumber(name)) out.push_back(*pid);
  }
  return out;
}

std::unordered_map<std::uint64_t, ProcessInfo> ProcessSource::scan(std::uint64_t asleepMs) const {
  std::unordered_map<std::uint64_t, ProcessInfo> byId;
  std::unordered_map<std::uint64_t, std::uint64_t> idOfPid;
  std::unordered_map<std::uint64_t, std::uint64_t> startOf;  // unique id -> start ticks
  std::unordered_map<std::uint64_t, std::string> groupOf;    // unique id -> cgroup path
  for (const std::uint64_t pid : pids()) {
    const std::string dir = "/proc/" + std::to_string(pid) + "/";
    const auto statText = machine_.text(dir + "stat");
    if (!statText) continue;  // gone meanwhile
    const auto stat = parseStat(*statText);
    if (!stat) continue;
    ProcessInfo p;
    p.pid = pid;
    p.ppid = stat->ppid;
    p.uniqueid = pid == 1 ? 1 : (stat->start << 22 | pid);
    p.userNs = stat->utime * (1000000000 / ticksPerSecond_);
    p.systemNs = stat->stime * (1000000000 / ticksPerSecond_);
    p.majorFaults = stat->majflt;
    const std::uint64_t startMs = stat->start * 1000 / ticksPerSecond_;
    p.startAbsolute = startMs > asleepMs ? startMs - asleepMs : 0;
    const std::string status = machine_.text(dir + "status").value_or("");
    p.uid = statusValue(status, "Uid", false);  // the real user id comes first
    p.residentBytes = statusValue(status, "VmRSS", true);
    p.footprintBytes = statusValue(status, "RssAnon", true) + statusValue(status, "VmSwap", true);
    const Cgroup cgroup = cgroupOf(machine_.text(dir + "cgroup").value_or(""));
    p.unit = cgroup.unit;

    std::string name = stat->comm;
    if (auto exe = machine_.link(dir + "exe")) {
      const std::string deleted = " (deleted)";
      if (exe->size() > deleted.size() && exe->compare(exe->size() - deleted.size(), deleted.size(), deleted) == 0)
        exe->resize(exe->size() - deleted.size());
      name = exe->substr(exe->rfind('/') + 1);
    }
    if (pid == 1) {
      name = kInitName;
    } else if (name == "systemd" && cgroup.userManager) {
      name = kUserManagerName;
    }
    p.name = name;
    idOfPid[pid] = p.uniqueid;
    startOf[p.uniqueid] = stat->start;
    groupOf[p.uniqueid] = cgroup.path;
    byId.emplace(p.uniqueid, std::move(p));
  }

  // Parents, and the oldest process of each unit's cgroup as the responsible one.
  std::map<std::string, std::pair<std::pair<std::uint64_t, std::uint64_t>, std::uint64_t>> oldest;
  for (const auto& [id, p] : byId) {
    if (p.unit.empty()) continue;
    const auto age = std::make_pair(startOf[id], p.pid);
    const auto it = oldest.find(groupOf[id]);
    if (it == oldest.end() || age < it->second.first) oldest[groupOf[id]] = {age, id};
  }
  for (auto& [id, p] : byId) {
    const auto parent = idOfPid.find(p.ppid);
    p.parentUniqueid = parent == idOfPid.end() ? 0 : parent->second;
    if (!p.unit.empty()) {
      p.responsibleUniqueid = oldest[groupOf[id]].second;
      p.responsiblePid = byId.at(p.responsibleUniqueid).pid;
    }
  }
  return byId;
}

}  // namespace bw::recorder
