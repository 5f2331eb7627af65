#pragma once
// Interrupts: interrupt counts per processor and vector, as InterruptVector
// sub-messages.
#include "Records/InterruptVector.h"
#include "Records/RecordFields.h"

namespace bw {

#define BW_INTERRUPTS_FIELDS(F) F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime")

#define BW_INTERRUPTS_REPEATED(R) R(vectors, Vectors, 64, InterruptVector, "vectors")

class Interrupts final : public Record {
 public:
  BW_RECORD_INTERFACE(Interrupts, BW_INTERRUPTS_FIELDS, BW_INTERRUPTS_REPEATED)

  // "Interrupts\n", then per processor "CPU %lu\n" and one
  // "\tVector %@:\t%llu interrupts\n" per vector of that processor, in record
  // order. Processors come in ascending number.
  std::optional<std::string> prettyPrint() const override;
  bool appendPrettyPrint(std::string& out) const override;

 private:
  BW_RECORD_STORAGE(BW_INTERRUPTS_FIELDS, BW_INTERRUPTS_REPEATED)
};

}  // namespace bw
