#include "Records/InterruptVector.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(InterruptVector, BW_INTERRUPT_VECTOR_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
