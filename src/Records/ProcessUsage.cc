#include "Records/ProcessUsage.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"
#include "base/Duration.h"

namespace bw {

BW_RECORD_DEFINE(ProcessUsage, BW_PROCESS_USAGE_FIELDS, BW_NO_REPEATED_FIELDS)

std::uint64_t ProcessUsage::absoluteTime() const {
  return exitStatus() == -1 || exitStatus() == -3 ? nowAbstime() : procExitAbstime();
}

std::optional<Uuid> ProcessUsage::UUID() const {
  if (!hasUuid() || uuid().size() < 16) return std::nullopt;
  return Uuid::fromBytes(reinterpret_cast<const std::uint8_t*>(uuid().data()));
}

std::optional<std::string> ProcessUsage::prettyPrint() const {
  std::string status;
  std::uint64_t elapsed;
  if (exitStatus() == -3) {
    status = "S";
    elapsed = 0;
  } else if (exitStatus() == -1) {
    status = "-";
    elapsed = absoluteTime() - procStartAbstime();
  } else {
    status = format("%lld", static_cast<long long>(exitStatus()));
    elapsed = procExitAbstime() - procStartAbstime();
  }
  return "ProcessUsage\t" + status +
         format("\t% 5lld msec\t", static_cast<long long>((userTime() + systemTime()) / 1000000)) +
         durationText(static_cast<std::int64_t>(elapsed)) +
         format("\t% 6lld intr wkups\tresident % 8lld\t%llu [", static_cast<long long>(interruptWkups()),
                static_cast<long long>(residentSize()), static_cast<unsigned long long>(pid())) +
         name() + "]";
}

}  // namespace bw
