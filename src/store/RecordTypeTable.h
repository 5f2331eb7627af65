#pragma once
// The stats-file type numbers and the record class each one decodes as.
// Types 0 and 5 have no class; 7 and 8 are both SleepWake.
#include <cstdint>
#include <optional>

#include "Records/Record.h"

namespace bw {

inline constexpr std::uint64_t kRecordTypeCount = 23;
inline constexpr std::uint64_t kLogStartsV0Type = 1;
inline constexpr std::uint64_t kLogStartsV1Type = 12;

// The class for a type number below 23; none for 0, 5 and anything larger.
std::optional<RecordClass> recordClassForType(std::uint64_t type);

}  // namespace bw
