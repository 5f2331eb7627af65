#include "Records/ProcessUsage.h"

#include "Records/RecordCodec.h"
#include "base/DecimalText.h"
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
  std::string text;
  appendPrettyPrint(text);
  return text;
}

bool ProcessUsage::appendPrettyPrint(std::string& out) const {
  std::uint64_t elapsed;
  out += "ProcessUsage\t";
  if (exitStatus() == -3) {
    out += 'S';
    elapsed = 0;
  } else if (exitStatus() == -1) {
    out += '-';
    elapsed = absoluteTime() - procStartAbstime();
  } else {
    appendDecimal(out, static_cast<long long>(exitStatus()));
    elapsed = procExitAbstime() - procStartAbstime();
  }
  out += '\t';
  appendDecimal(out, static_cast<long long>((userTime() + systemTime()) / 1000000), 5, DecimalPad::kSignSpace);
  out += " msec\t";
  appendDurationText(out, static_cast<std::int64_t>(elapsed));
  out += '\t';
  appendDecimal(out, static_cast<long long>(interruptWkups()), 6, DecimalPad::kSignSpace);
  out += " intr wkups\tresident ";
  appendDecimal(out, static_cast<long long>(residentSize()), 8, DecimalPad::kSignSpace);
  out += '\t';
  appendDecimal(out, static_cast<unsigned long long>(pid()));
  out += " [";
  out += name();
  out += ']';
  return true;
}

}  // namespace bw
