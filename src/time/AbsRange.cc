#include "time/AbsRange.h"

#include "base/Console.h"
#include "base/Exception.h"

namespace bw {

AbsRange AbsRange::rangeWithBoot(const Uuid& boot, std::uint64_t start, std::uint64_t end) {
  if (end < start) {
    throw Exception(kInvalidArgumentException, "end < start",
                    {{"start", std::uint64_t(end)}, {"end", std::uint64_t(start)}, {"boot", boot}});
  }
  return AbsRange(boot, start, end - start);
}

AbsRange AbsRange::rangeWithBootLocation(const Uuid& boot, std::uint64_t location, std::uint64_t length) {
  return AbsRange(boot, location, length);
}

std::optional<AbsRange> AbsRange::rangeFromTime(const AbsTime* start, const AbsTime* end) {
  if (start == nullptr || end == nullptr) return std::nullopt;
  if (start->boot != end->boot) {
    throw Exception(kInvalidArgumentException, "start.boot != end.boot", {{"start", *start}, {"end", *end}});
  }
  return rangeWithBoot(start->boot, start->time, end->time);
}

std::string AbsRange::description() const {
  return format("AbsRange: %s { %lld, %lld }", boot_.string().c_str(), static_cast<long long>(location_),
                static_cast<long long>(length_));
}

std::string AbsRange::debugDescription() const {
  return format("<AbsRange: %p, boot: %s, start: %llu, end; %llu>", static_cast<const void*>(this),
                boot_.string().c_str(), static_cast<unsigned long long>(location_),
                static_cast<unsigned long long>(location_ + length_));
}

}  // namespace bw
