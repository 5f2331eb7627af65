#pragma once
// A boot or process UUID: 16 raw bytes with value equality, ordering and
// hashing. Its text form is the upper-case hyphenated 36-character string
// used in every message.
#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace bw {

class Uuid {
 public:
  using Bytes = std::array<std::uint8_t, 16>;

  Uuid() : bytes_{} {}
  explicit Uuid(const Bytes& bytes) : bytes_(bytes) {}
  // Takes the first 16 bytes of `data`; `size` must be at least 16.
  static Uuid fromBytes(const std::uint8_t* data);

  // Parses "XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX" in either letter case.
  // Anything else (other length, missing hyphens, non-hex digits) gives none.
  static std::optional<Uuid> parse(std::string_view text);

  const Bytes& bytes() const { return bytes_; }
  std::string string() const;  // upper-case hyphenated text

  friend bool operator==(const Uuid&, const Uuid&) = default;
  friend auto operator<=>(const Uuid&, const Uuid&) = default;

 private:
  Bytes bytes_;
};

}  // namespace bw

template <>
struct std::hash<bw::Uuid> {
  std::size_t operator()(const bw::Uuid& u) const noexcept;
};
