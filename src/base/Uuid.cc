#include "base/Uuid.h"

#include <cstring>

namespace bw {

Uuid Uuid::fromBytes(const std::uint8_t* data) {
  Bytes b;
  std::memcpy(b.data(), data, b.size());
  return Uuid(b);
}

namespace {
int hexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}
bool isHyphenPosition(std::size_t i) { return i == 8 || i == 13 || i == 18 || i == 23; }
}  // namespace

std::optional<Uuid> Uuid::parse(std::string_view text) {
  if (text.size() != 36) return std::nullopt;
  Bytes b{};
  std::size_t out = 0;
  for (std::size_t i = 0; i < 36;) {
    if (isHyphenPosition(i)) {
      if (text[i] != '-') return std::nullopt;
      ++i;
      continue;
    }
    int hi = hexValue(text[i]);
    int lo = hexValue(text[i + 1]);
    if (hi < 0 || lo < 0) return std::nullopt;
    b[out++] = static_cast<std::uint8_t>(hi << 4 | lo);
    i += 2;
  }
  return Uuid(b);
}

std::string Uuid::string() const {
  static const char kDigits[] = "0123456789ABCDEF";
  std::string s;
  s.reserve(36);
  for (std::size_t i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) s.push_back('-');
    s.push_back(kDigits[bytes_[i] >> 4]);
    s.push_back(kDigits[bytes_[i] & 0xF]);
  }
  return s;
}

}  // namespace bw

std::size_t std::hash<bw::Uuid>::operator()(const bw::Uuid& u) const noexcept {
  std::uint64_t a, b;
  std::memcpy(&a, u.bytes().data(), 8);
  std::memcpy(&b, u.bytes().data() + 8, 8);
  return static_cast<std::size_t>(a * 0x9E3779B97F4A7C15ULL ^ b);
}
