#include "Records/Interrupts.h"

#include <map>

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(Interrupts, BW_INTERRUPTS_FIELDS, BW_INTERRUPTS_REPEATED)

std::optional<std::string> Interrupts::prettyPrint() const {
  std::map<std::uint32_t, std::vector<const InterruptVector*>> byCpu;
  for (const InterruptVector& v : vectors()) byCpu[v.cpuNumber()].push_back(&v);
  std::string text = "Interrupts\n";
  for (const auto& [cpu, group] : byCpu) {
    text += format("CPU %lu\n", static_cast<unsigned long>(cpu));
    for (const InterruptVector* v : group)
      text += "\tVector " + v->vectorName() +
              format(":\t%llu interrupts\n", static_cast<unsigned long long>(v->interruptCount()));
  }
  return text;
}

}  // namespace bw
