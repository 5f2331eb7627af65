#pragma once
// Millisecond counts as "HH:MM:SS" for the reports and record texts.
#include <cstdint>
#include <string>

namespace bw {

// "%02lld:%02lld:%02lld": whole hours (not limited to two digits), then the
// minutes and seconds of the remainder.
std::string durationText(std::int64_t milliseconds);
// The same text appended to `out`.
void appendDurationText(std::string& out, std::int64_t milliseconds);

}  // namespace bw
