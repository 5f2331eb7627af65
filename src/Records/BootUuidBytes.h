#pragma once
// How the log-start records' byte fields `bootUuid` and `lastBootUuid` name
// a boot. Writers have stored either the UUID's text or its raw bytes:
//   - absent or empty: no UUID;
//   - 17 bytes or more: the UUID's text, "XXXXXXXX-XXXX-XXXX-XXXX-XXXXXXXXXXXX"
//     in either case, trailing NUL bytes ignored; any other text gives none;
//   - exactly 16 bytes: the raw UUID;
//   - 1 to 15 bytes: a cut-off value that names no boot, so none (nothing is
//     read beyond the buffer, nor padded).
#include <optional>
#include <string>

#include "base/Uuid.h"

namespace bw {

std::optional<Uuid> uuidFromBootUuidBytes(const std::string& bytes, bool present);

}  // namespace bw
