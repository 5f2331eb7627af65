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

// The derived `bootUUID` / `lastBootUUID` of the log-start records: the boot
// named by the byte field, or the value given by the setter, which wins while
// it holds one. Placed last in the class body.
#define BW_LOG_START_BOOT_UUIDS                                                                     \
 public:                                                                                            \
  std::optional<Uuid> bootUUID() const {                                                            \
    return bootUUID_ ? bootUUID_ : uuidFromBootUuidBytes(bootUuid_, hasBootUuid());                 \
  }                                                                                                 \
  void setBootUUID(std::optional<Uuid> uuid) { bootUUID_ = uuid; }                                  \
  std::optional<Uuid> lastBootUUID() const {                                                        \
    return lastBootUUID_ ? lastBootUUID_ : uuidFromBootUuidBytes(lastBootUuid_, hasLastBootUuid()); \
  }                                                                                                 \
  void setLastBootUUID(std::optional<Uuid> uuid) { lastBootUUID_ = uuid; }                          \
                                                                                                    \
 private:                                                                                           \
  std::optional<Uuid> bootUUID_;                                                                    \
  std::optional<Uuid> lastBootUUID_;
