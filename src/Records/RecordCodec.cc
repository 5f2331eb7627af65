#include "Records/RecordCodec.h"

#include <cstdio>
#include <cstdlib>

#include "base/Console.h"

namespace bw::record_codec {

void requiredFieldMissing(const char* assertion, const char* source) {
  std::fprintf(stderr, "brindlewick: assertion failed: %s (%s)\n", assertion, source);
  std::fflush(stderr);
  std::abort();
}

void copyTargetMismatch(const Record& source, const Record& target) {
  throw Exception(kInvalidArgumentException,
                  format("copyTo: a %s cannot be copied into a %s", source.className(), target.className()));
}

std::uint64_t hashDouble(double value) {
  if (!std::isfinite(value)) return 0;
  constexpr double kTwo64 = 18446744073709551616.0;
  double magnitude = std::fabs(value);
  double integral = std::floor(magnitude + 0.5);
  // Below 2^64 the reduction changes nothing; above it fmod keeps the
  // result in range for the conversion.
  double reduced = std::fmod(integral, kTwo64);
  std::uint64_t h = kHashMultiplier * static_cast<std::uint64_t>(reduced);
  double fraction = (magnitude - integral) * kTwo64;  // within [-2^63, 2^63]
  if (fraction > 0)
    h += static_cast<std::uint64_t>(fraction);
  else if (fraction < 0)
    h -= static_cast<std::uint64_t>(-fraction);
  return h;
}

std::string stringFromValue(const Value& v) {
  if (const std::string* s = v.getIf<std::string>()) return *s;
  if (const Data* d = v.getIf<Data>()) return std::string(d->begin(), d->end());
  return std::string();
}

}  // namespace bw::record_codec
