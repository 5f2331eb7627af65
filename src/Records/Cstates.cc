#include "Records/Cstates.h"

#include "Records/RecordCodec.h"
#include "base/Console.h"

namespace bw {

BW_RECORD_DEFINE(Cstates, BW_CSTATES_FIELDS, BW_CSTATES_REPEATED)

std::optional<std::string> Cstates::prettyPrint() const {
  std::string text = core() == -1 ? std::string("Package") : format("Core %lld", static_cast<long long>(core()));
  text += " C-state detail: ";
  for (const Cstate& state : states())
    text += format("C%llu %7llu   ", static_cast<unsigned long long>(state.level()),
                   static_cast<unsigned long long>(state.residency()));
  return text;
}

}  // namespace bw
