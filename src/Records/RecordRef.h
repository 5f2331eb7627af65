#pragma once
// A compact handle on one record of a run: its class, its absolute time, its
// own wall time (0 for none), and where the record is. Most records stay
// encoded in the mapped stats file and are decoded only while something reads
// them (see RecordDecoder.h); a few, such as file headers, are kept decoded
// and the handle points at the record itself. Handles are 32 bytes and never
// own what they point at.
#include <cstdint>
#include <span>

#include "Records/Record.h"

namespace bw {

class RecordRef {
 public:
  RecordRef() = default;
  // A record kept decoded elsewhere; it must outlive the handle.
  RecordRef(const Record* record)  // NOLINT(google-explicit-constructor): records convert freely
      : where_(record),
        absoluteTime_(record->absoluteTime()),
        wallTime_(record->wallTime()),
        class_(record->recordClass()),
        decoded_(true) {}
  // A record still encoded in `body`, whose times are already known.
  RecordRef(RecordClass c, std::uint64_t absoluteTime, std::uint64_t wallTime, std::span<const std::uint8_t> body)
      : where_(body.data()),
        absoluteTime_(absoluteTime),
        wallTime_(wallTime),
        length_(static_cast<std::uint32_t>(body.size())),
        class_(c) {}

  RecordClass recordClass() const { return class_; }
  const char* className() const { return recordClassName(class_); }
  std::uint64_t absoluteTime() const { return absoluteTime_; }
  std::uint64_t wallTime() const { return wallTime_; }

  // The record itself when it is kept decoded, else null.
  const Record* decoded() const { return decoded_ ? static_cast<const Record*>(where_) : nullptr; }
  // The encoded body; empty for a record kept decoded.
  std::span<const std::uint8_t> body() const {
    return decoded_ ? std::span<const std::uint8_t>() : std::span(static_cast<const std::uint8_t*>(where_), length_);
  }

 private:
  const void* where_ = nullptr;
  std::uint64_t absoluteTime_ = 0;
  std::uint64_t wallTime_ = 0;
  std::uint32_t length_ = 0;
  RecordClass class_{};
  bool decoded_ = false;
};

static_assert(sizeof(RecordRef) == 32);

}  // namespace bw
