#pragma once
// SmcKey: one system-management-controller reading, only ever inside an
// SmcKeys record. The value sits in whichever of the four value fields fits
// it. Writing it without `key` is a programming error that aborts.
#include "Records/RecordFields.h"

namespace bw {

#define BW_SMC_KEY_FIELDS(F)                             \
  F(key, Key, 1, String, Required, "key")                \
  F(s64value, S64value, 2, SInt64, Optional, "s64value") \
  F(u64value, U64value, 3, UInt64, Optional, "u64value") \
  F(dvalue, Dvalue, 4, Double, Optional, "dvalue")       \
  F(bvalue, Bvalue, 5, Bytes, Optional, "bvalue")

class SmcKey final : public Record {
 public:
  BW_RECORD_INTERFACE(SmcKey, BW_SMC_KEY_FIELDS, BW_NO_REPEATED_FIELDS)

  // A sub-message has no time of its own: 0.
  std::uint64_t absoluteTime() const override { return 0; }

 private:
  BW_RECORD_STORAGE(BW_SMC_KEY_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
