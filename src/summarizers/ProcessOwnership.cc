// Jobs and ownership of one boot's processes.
#include <vector>

#include "base/Console.h"
#include "summarizers/ProcessBootContext.h"

namespace bw {
namespace {

void debugLine(const std::string& line) {
  if (gDebug) err() << line << "\n";
}

}  // namespace

void ProcessBootContext::createJobs(Jobs& jobs) {
  processes_.enumerateKeysAndObjectsUsingBlock([&](std::uint64_t, const std::shared_ptr<Process>& p, bool&) {
    const std::string* label = p->label();
    if (!label) {
      debugLine(format("Incomplete data: PID %u [%s] died before we could get its Mach-O UUID.", p->pid(),
                       textOrNull(label)));
      return;
    }
    std::string key = *label;
    if (key == "PluginProcess") key = format("<%s> (%s)", label->c_str(), textOrNull(p->displayName()));
    bool created = false;
    Job& job = jobs.objectForKey(key, &created);
    if (created) {
      job.setUuid(p->macho_uuid());
      job.setLabel(p->sharedLabel());
      job.setDisplayName(p->sharedDisplayName());
    }
    job.addProcess(p, uuid_);
  });
}

void ProcessBootContext::connectProcessesToOwners() {
  processes_.enumerateKeysAndObjectsUsingBlock([&](std::uint64_t, const std::shared_ptr<Process>& p, bool&) {
    const std::string* label = p->label();
    if (p->parent_uniqueid() == 1 && label && (*label == "com.vexil.launchd.peruser" || *label == "launchd")) {
      p->setOwner(p->job());
      launchds_.insert(p->uniqueid());
    }
    if (p->responsible_uniqueid() == p->uniqueid()) p->setOwner(p->job());
  });
  processes_.enumerateKeysAndObjectsUsingBlock(
      [&](std::uint64_t, const std::shared_ptr<Process>& p, bool&) { findOwnerForProcess(p); });
}

Job* ProcessBootContext::findOwnerForProcess(const std::shared_ptr<Process>& start) {
  // Walk up the chain until an owner is known or the chain ends, then hand
  // the answer back down, as the natural recursion would: debug lines about
  // the walk come on the way up, ownership lines on the way back.
  std::vector<std::shared_ptr<Process>> chain;
  std::unordered_set<const Process*> onChain;
  Job* found = nullptr;
  for (std::shared_ptr<Process> p = start; p;) {
    if (p->owner()) {
      found = p->owner();
      break;
    }
    std::uint64_t u = p->responsible_uniqueid();
    if (u == 0) u = p->parent_uniqueid();
    if (u == 0 && p->pid() != 0 && p->pid() != 1) {
      debugLine(
          format("Bad data: PID %u [%s] had responsible & parent process both 0", p->pid(), textOrNull(p->label())));
      p->setOwner(p->job());
      found = p->owner();
      break;
    }
    if (launchds_.count(u)) {
      // A top-level job of its own, in no umbrella.
      p->setOwner(p->job());
      found = p->owner();
      break;
    }
    if (p->responsible_uniqueid() == 0) {
      debugLine(format("Suspicious data: PID %u [%s] had responsible uniqueid 0 but its parent %u wasn't a launchd",
                       p->pid(), textOrNull(p->label()), p->ppid()));
    }
    chain.push_back(p);
    onChain.insert(p.get());
    std::shared_ptr<Process> next = processes_.objectForKeyedSubscript(u);
    // A chain that comes back to itself breaks like an unknown id.
    if (next && onChain.count(next.get())) next = nullptr;
    p = std::move(next);
  }
  for (auto it = chain.rbegin(); it != chain.rend(); ++it) {
    const std::shared_ptr<Process>& p = *it;
    Job* owner = found;
    if (!owner) {
      debugLine(
          format("Could not find an owner for PID %u [%s]; marking owned by itself", p->pid(), textOrNull(p->label())));
      owner = p->job();
    }
    if (owner) owner->addOwnedProcessToUmbrella(p, uuid_);
    found = p->owner();
  }
  return start ? start->owner() : nullptr;
}

}  // namespace bw
