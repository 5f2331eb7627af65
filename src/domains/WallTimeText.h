#pragma once
// Wall times as people read them: "yyyy-MM-dd HH:mm:ss" in the process's
// time zone, or "yyyy-MM-dd HH:mm:ss ZZ" (with the offset, "+0100") while
// the debug flag is set. Shared by the domains' announcements and the event
// listing so both print dates alike.
#include <cstdint>
#include <string>

namespace bw {

// `ms` is milliseconds since 1970 UTC.
std::string formatWallTime(std::uint64_t ms);

}  // namespace bw
