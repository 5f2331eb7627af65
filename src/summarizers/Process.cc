#include "summarizers/Process.h"

namespace bw {

void Process::setLabel(const std::string& name) {
  label_ = std::make_shared<const std::string>(stringByRemovingTrailingUUIDsAndLaunchServicesStuff(name));
}

std::optional<AbsTime> Process::exit_time() const {
  if (!hasExit_) return std::nullopt;
  return AbsTime{boot_, exit_};
}

Process::Process()
    : curves_{ProcessCurve(samples_, kCpuTime),      ProcessCurve(samples_, kIdleWakeups),
              ProcessCurve(samples_, kInterrupts),   ProcessCurve(samples_, kPageins),
              ProcessCurve(samples_, kResidentSize), ProcessCurve(samples_, kWired)} {}

Value Process::objectForKeyedSubscript(const std::string& key) const {
  if (!stats_) return Value();
  auto it = stats_->find(key);
  return it == stats_->end() ? Value() : it->second;
}

void Process::setStat(const std::string& key, Value value) {
  if (!stats_) stats_ = std::make_unique<std::map<std::string, Value>>();
  (*stats_)[key] = std::move(value);
}

}  // namespace bw
