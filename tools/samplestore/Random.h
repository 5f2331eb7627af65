#pragma once
// The generator's only source of chance: xoshiro256** seeded through
// splitmix64, with our own mappings to ranges and reals, so that a seed gives
// the same store on every machine and every standard library.
#include <cstdint>

#include "base/Uuid.h"

namespace bw::samplestore {

// splitmix64: one step, used for seeding and for hashing small keys.
inline std::uint64_t mix64(std::uint64_t x) {
  x += 0x9E3779B97F4A7C15ULL;
  x = (x ^ (x >> 30)) * 0xBF58476D1CE4E5B9ULL;
  x = (x ^ (x >> 27)) * 0x94D049BB133111EBULL;
  return x ^ (x >> 31);
}

// A stable 64-bit hash of a text (FNV-1a, then mixed).
inline std::uint64_t hashText(const char* text) {
  std::uint64_t h = 0xCBF29CE484222325ULL;
  for (; *text; ++text) h = (h ^ static_cast<unsigned char>(*text)) * 0x100000001B3ULL;
  return mix64(h);
}

class Random {
 public:
  // Streams with different `stream` numbers are independent for one seed.
  explicit Random(std::uint64_t seed, std::uint64_t stream = 0) {
    std::uint64_t x = mix64(seed) ^ mix64(stream + 0x5EED);
    for (auto& word : s_) {
      x = mix64(x);
      word = x;
    }
  }

  std::uint64_t next() {
    const std::uint64_t result = rotl(s_[1] * 5, 7) * 9;
    const std::uint64_t t = s_[1] << 17;
    s_[2] ^= s_[0];
    s_[3] ^= s_[1];
    s_[1] ^= s_[2];
    s_[0] ^= s_[3];
    s_[2] ^= t;
    s_[3] = rotl(s_[3], 45);
    return result;
  }

  // A whole number in [0, n); 0 when n is 0. Multiply-high, so the mapping
  // is the same everywhere.
  std::uint64_t below(std::uint64_t n) {
    return static_cast<std::uint64_t>((static_cast<unsigned __int128>(next()) * n) >> 64);
  }
  // A whole number in [lo, hi], both included.
  std::int64_t between(std::int64_t lo, std::int64_t hi) {
    return lo + static_cast<std::int64_t>(below(static_cast<std::uint64_t>(hi - lo) + 1));
  }
  // A real in [0, 1) with 53 random bits.
  double unit() { return static_cast<double>(next() >> 11) * 0x1.0p-53; }
  double uniform(double lo, double hi) { return lo + (hi - lo) * unit(); }
  bool chance(double p) { return unit() < p; }
  // Roughly normal (sum of four uniforms), clipped to mean +- 2 sd.
  double around(double mean, double sd) {
    double sum = unit() + unit() + unit() + unit() - 2.0;  // variance 1/3
    return mean + sd * sum * 1.7320508075688772;
  }
  // A random (version 4) UUID.
  Uuid uuid() {
    Uuid::Bytes b;
    std::uint64_t a = next(), c = next();
    for (int i = 0; i < 8; ++i) {
      b[i] = static_cast<std::uint8_t>(a >> (8 * i));
      b[8 + i] = static_cast<std::uint8_t>(c >> (8 * i));
    }
    b[6] = static_cast<std::uint8_t>((b[6] & 0x0F) | 0x40);
    b[8] = static_cast<std::uint8_t>((b[8] & 0x3F) | 0x80);
    return Uuid(b);
  }

 private:
  static std::uint64_t rotl(std::uint64_t x, int k) { return (x << k) | (x >> (64 - k)); }
  std::uint64_t s_[4];
};

}  // namespace bw::samplestore
