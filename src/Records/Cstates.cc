#include "Records/Cstates.h"

#include "Records/RecordCodec.h"
#include "base/DecimalText.h"

namespace bw {

BW_RECORD_DEFINE(Cstates, BW_CSTATES_FIELDS, BW_CSTATES_REPEATED)

std::optional<std::string> Cstates::prettyPrint() const {
  std::string text;
  appendPrettyPrint(text);
  return text;
}

bool Cstates::appendPrettyPrint(std::string& out) const {
  if (core() == -1) {
    out += "Package";
  } else {
    out += "Core ";
    appendDecimal(out, static_cast<long long>(core()));
  }
  out += " C-state detail: ";
  for (const Cstate& state : states()) {
    out += 'C';
    appendDecimal(out, static_cast<unsigned long long>(state.level()));
    out += ' ';
    appendDecimal(out, static_cast<unsigned long long>(state.residency()), 7);
    out += "   ";
  }
  return true;
}

}  // namespace bw
