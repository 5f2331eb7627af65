#include "time/AbsTime.h"

#include "base/Console.h"

namespace bw {

std::string AbsTime::description() const {
  return format("AbsTime: ( %s, %lld )", boot.string().c_str(), static_cast<long long>(time));
}

std::string AbsTime::debugDescription() const {
  return format("<AbsTime: %p, boot: %s, time: %llu>", static_cast<const void*>(this), boot.string().c_str(),
                static_cast<unsigned long long>(time));
}

}  // namespace bw
