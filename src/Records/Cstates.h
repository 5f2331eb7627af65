#pragma once
// Cstates: processor idle-state residencies, of the package (`isCore` false
// or absent) or of core number `core`. The one-line text decides "Package" by
// `core` -1 instead, deliberately.
#include "Records/Cstate.h"
#include "Records/RecordFields.h"

namespace bw {

#define BW_CSTATES_FIELDS(F)                                          \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absolute_time") \
  F(isCore, IsCore, 2, Bool, Optional, "is_core")                     \
  F(core, Core, 3, SInt64, Optional, "core")

#define BW_CSTATES_REPEATED(R) R(states, States, 65, Cstate, "states")

class Cstates final : public Record {
 public:
  BW_RECORD_INTERFACE(Cstates, BW_CSTATES_FIELDS, BW_CSTATES_REPEATED)

  // "Package C-state detail: " when core is -1, else "Core %lld C-state
  // detail: ", then "C%llu %7llu   " (level, residency) per state. No newline.
  std::optional<std::string> prettyPrint() const override;
  bool appendPrettyPrint(std::string& out) const override;

 private:
  BW_RECORD_STORAGE(BW_CSTATES_FIELDS, BW_CSTATES_REPEATED)
};

}  // namespace bw
