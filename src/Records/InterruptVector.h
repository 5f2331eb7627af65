#pragma once
// InterruptVector: the interrupt count of one vector on one processor, only
// ever inside an Interrupts record.
#include "Records/RecordFields.h"

namespace bw {

#define BW_INTERRUPT_VECTOR_FIELDS(F)                                      \
  F(cpuNumber, CpuNumber, 1, UInt32, Optional, "cpuNumber")                \
  F(interruptCount, InterruptCount, 2, UInt64, Optional, "interruptCount") \
  F(vectorName, VectorName, 3, String, Optional, "vectorName")

class InterruptVector final : public Record {
 public:
  BW_RECORD_INTERFACE(InterruptVector, BW_INTERRUPT_VECTOR_FIELDS, BW_NO_REPEATED_FIELDS)

  // A sub-message has no time of its own: 0.
  std::uint64_t absoluteTime() const override { return 0; }

 private:
  BW_RECORD_STORAGE(BW_INTERRUPT_VECTOR_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
