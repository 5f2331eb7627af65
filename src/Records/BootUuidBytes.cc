#include "Records/BootUuidBytes.h"

#include <string_view>

namespace bw {

std::optional<Uuid> uuidFromBootUuidBytes(const std::string& bytes, bool present) {
  if (!present) return std::nullopt;
  if (bytes.size() >= 17) {
    std::string_view text(bytes);
    while (!text.empty() && text.back() == '\0') text.remove_suffix(1);
    return Uuid::parse(text);
  }
  if (bytes.size() == 16) return Uuid::fromBytes(reinterpret_cast<const std::uint8_t*>(bytes.data()));
  return std::nullopt;
}

}  // namespace bw
