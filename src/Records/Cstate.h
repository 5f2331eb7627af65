#pragma once
// Cstate: the residency of one processor idle state, only ever inside a
// Cstates record.
#include "Records/RecordFields.h"

namespace bw {

#define BW_CSTATE_FIELDS(F)                     \
  F(level, Level, 1, UInt64, Optional, "level") \
  F(residency, Residency, 2, UInt64, Optional, "residency")

class Cstate final : public Record {
 public:
  BW_RECORD_INTERFACE(Cstate, BW_CSTATE_FIELDS, BW_NO_REPEATED_FIELDS)

  // A sub-message has no time of its own: 0.
  std::uint64_t absoluteTime() const override { return 0; }

 private:
  BW_RECORD_STORAGE(BW_CSTATE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
