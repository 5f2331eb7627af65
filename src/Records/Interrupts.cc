#include "Records/Interrupts.h"

#include <algorithm>

#include "Records/RecordCodec.h"
#include "base/DecimalText.h"

namespace bw {

BW_RECORD_DEFINE(Interrupts, BW_INTERRUPTS_FIELDS, BW_INTERRUPTS_REPEATED)

std::optional<std::string> Interrupts::prettyPrint() const {
  std::string text;
  appendPrettyPrint(text);
  return text;
}

bool Interrupts::appendPrettyPrint(std::string& out) const {
  // Grouped by processor, each group in record order: a stable sort.
  std::vector<const InterruptVector*> byCpu;
  byCpu.reserve(vectors().size());
  for (const InterruptVector& v : vectors()) byCpu.push_back(&v);
  std::stable_sort(byCpu.begin(), byCpu.end(),
                   [](const InterruptVector* a, const InterruptVector* b) { return a->cpuNumber() < b->cpuNumber(); });
  out += "Interrupts\n";
  for (std::size_t i = 0; i < byCpu.size(); ++i) {
    if (i == 0 || byCpu[i - 1]->cpuNumber() != byCpu[i]->cpuNumber()) {
      out += "CPU ";
      appendDecimal(out, static_cast<unsigned long long>(byCpu[i]->cpuNumber()));
      out += '\n';
    }
    out += "\tVector ";
    out += byCpu[i]->vectorName();
    out += ":\t";
    appendDecimal(out, static_cast<unsigned long long>(byCpu[i]->interruptCount()));
    out += " interrupts\n";
  }
  return true;
}

}  // namespace bw
