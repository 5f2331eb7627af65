#pragma once
// SmcKeys: a set of system-management-controller key readings taken at one
// moment; the readings are SmcKey sub-messages.
#include "Records/RecordFields.h"
#include "Records/SmcKey.h"

namespace bw {

#define BW_SMC_KEYS_FIELDS(F) F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absolute_time")

#define BW_SMC_KEYS_REPEATED(R) R(keys, Keys, 66, SmcKey, "keys")

class SmcKeys final : public Record {
 public:
  BW_RECORD_INTERFACE(SmcKeys, BW_SMC_KEYS_FIELDS, BW_SMC_KEYS_REPEATED)

 private:
  BW_RECORD_STORAGE(BW_SMC_KEYS_FIELDS, BW_SMC_KEYS_REPEATED)
};

}  // namespace bw
