#pragma once
// A compact handle on one record of a run: its class, its absolute time, and
// where the record is. Most records stay encoded in the mapped stats file and
// are decoded only while something reads them (see RecordDecoder.h); a few,
// such as file headers, are kept decoded and the handle points at the record
// itself. Handles are 16 bytes and never own what they point at; a wall time
// is read from the record itself (see wallTimeOf).
#include <cstdint>
#include <span>
#include <vector>

#include "Records/Record.h"
#include "base/HugePageAllocator.h"

namespace bw {

// Reads a frame's body length: a varint of at most ten bytes in [p, end),
// kept to its low 32 bits. The bytes it took, or 0 when it does not end
// before `end` or within ten bytes.
inline std::size_t readFrameLength(const std::uint8_t* p, const std::uint8_t* end, std::uint32_t* length) {
  std::uint64_t value = 0;
  for (unsigned i = 0; i < 10 && p + i < end; ++i) {
    value |= static_cast<std::uint64_t>(p[i] & 0x7F) << (7 * i);
    if (p[i] < 0x80) {
      *length = static_cast<std::uint32_t>(value);
      return i + 1;
    }
  }
  return 0;
}

class RecordRef {
 public:
  RecordRef() = default;
  // A record kept decoded elsewhere; it must outlive the handle.
  RecordRef(const Record* record)  // NOLINT(google-explicit-constructor): records convert freely
      : absoluteTime_(record->absoluteTime()), bits_(pack(record, record->recordClass(), true)) {}
  // A record still encoded: `frame` is its length prefix, already checked to
  // lie, with the body after it, inside the bytes.
  RecordRef(RecordClass c, std::uint64_t absoluteTime, const std::uint8_t* frame)
      : absoluteTime_(absoluteTime), bits_(pack(frame, c, false)) {}

  RecordClass recordClass() const { return static_cast<RecordClass>(bits_ & kClassMask); }
  const char* className() const { return recordClassName(recordClass()); }
  std::uint64_t absoluteTime() const { return absoluteTime_; }

  // The record itself when it is kept decoded, else null.
  const Record* decoded() const { return (bits_ & kDecodedBit) != 0 ? static_cast<const Record*>(where()) : nullptr; }
  // The encoded body; empty for a record kept decoded.
  std::span<const std::uint8_t> body() const {
    if ((bits_ & kDecodedBit) != 0) return {};
    const auto* frame = static_cast<const std::uint8_t*>(where());
    std::uint32_t length = 0;
    const std::size_t prefix = readFrameLength(frame, frame + 10, &length);
    return std::span(frame + prefix, length);
  }

 private:
  static constexpr std::uint64_t kClassMask = 0x1F;
  static constexpr std::uint64_t kDecodedBit = 0x20;
  static constexpr unsigned kAddressShift = 6;
  static_assert(kRecordClassCount <= 32);

  // User-space addresses take at most 57 bits, so the class and the flag fit
  // below them.
  static std::uint64_t pack(const void* p, RecordClass c, bool decoded) {
    return (static_cast<std::uint64_t>(reinterpret_cast<std::uintptr_t>(p)) << kAddressShift) |
           (decoded ? kDecodedBit : 0) | static_cast<std::uint64_t>(c);
  }
  const void* where() const {
    return reinterpret_cast<const void*>(static_cast<std::uintptr_t>(bits_ >> kAddressShift));
  }

  std::uint64_t absoluteTime_ = 0;
  std::uint64_t bits_ = 0;
};

static_assert(sizeof(RecordRef) == 16);

// A list of handles: a boot's records run to millions, so large lists sit on
// huge pages.
using RecordList = std::vector<RecordRef, HugePageAllocator<RecordRef>>;

}  // namespace bw
