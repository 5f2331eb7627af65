#include "base/Duration.h"

#include "base/Console.h"

namespace bw {

std::string durationText(std::int64_t ms) {
  long long hours = ms / 3600000;
  long long seconds = ms / 1000 - hours * 3600;
  return format("%02lld:%02lld:%02lld", hours, seconds / 60, seconds % 60);
}

}  // namespace bw
