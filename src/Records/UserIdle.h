#pragma once
// UserIdle: the user became idle (`change` non-zero) or active (0).
#include "Records/RecordFields.h"

namespace bw {

#define BW_USER_IDLE_FIELDS(F)                                       \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absoluteTime") \
  F(change, Change, 2, UInt32, Required, "change")

class UserIdle final : public Record {
 public:
  BW_RECORD_INTERFACE(UserIdle, BW_USER_IDLE_FIELDS, BW_NO_REPEATED_FIELDS)

  // The `change` codes (the one-line text takes any other value as idle).
  static constexpr std::uint64_t kActive = 0;
  static constexpr std::uint64_t kIdle = 1;

  // "UserIdle\tIdle" when change is non-zero, "UserIdle\tActive" when 0.
  std::optional<std::string> prettyPrint() const override;

 private:
  BW_RECORD_STORAGE(BW_USER_IDLE_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
