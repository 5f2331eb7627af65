#include "Records/LogStartsV1.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(LogStartsV1, BW_LOG_STARTS_V1_FIELDS, BW_NO_REPEATED_FIELDS)

std::optional<std::string> LogStartsV1::prettyPrint() const {
  std::optional<Uuid> boot = bootUUID();
  std::optional<Uuid> lastBoot = lastBootUUID();
  return "LogStartsV1\t" + (hasSystemVersion() ? systemVersion() : std::string()) + "\t" +
         (boot ? boot->string() : std::string()) + "\t" + (lastBoot ? lastBoot->string() : std::string());
}

}  // namespace bw
