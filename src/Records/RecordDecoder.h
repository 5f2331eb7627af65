#pragma once
// Decodes records into one reused value per class, so that walking a run's
// records allocates nothing once every class has been seen. A decoded record
// is valid until the next record of its class is decoded by the same decoder.
//
// A walk over records takes a WalkDecoder: each thread keeps a stack of
// decoders, and a walk started inside another walk's callback gets the next
// one, so that it cannot overwrite the record the outer walk handed out.
#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>

#include "Records/Record.h"
#include "Records/RecordRef.h"

namespace bw {

class RecordDecoder {
 public:
  RecordDecoder();
  ~RecordDecoder();
  RecordDecoder(const RecordDecoder&) = delete;
  RecordDecoder& operator=(const RecordDecoder&) = delete;

  // `body` decoded as a record of class `c`, or null when the bytes do not
  // decode (the message is too long, malformed or truncated).
  const Record* decode(RecordClass c, std::span<const std::uint8_t> body);
  // The record behind `ref`: the kept record itself, or its body decoded.
  // The body decoded once before, so a failure now means the bytes changed
  // under the run, which raises kInternalInconsistencyException.
  const Record& record(const RecordRef& ref);

 private:
  std::array<std::unique_ptr<Record>, kRecordClassCount> values_;
};

class WalkDecoder {
 public:
  WalkDecoder();
  ~WalkDecoder();
  WalkDecoder(const WalkDecoder&) = delete;
  WalkDecoder& operator=(const WalkDecoder&) = delete;

  const Record& operator()(const RecordRef& ref) { return decoder_->record(ref); }

 private:
  RecordDecoder* decoder_;
};

// The record's own wall time (0 for none): read from the record for the few
// classes that have one, decoding it with `decoder` when it is encoded.
std::uint64_t wallTimeOf(const RecordRef& ref, RecordDecoder& decoder);

// An empty record of class `c`: what a reader that looks at no field of the
// class may be given instead of the decoded record.
const Record& blankRecord(RecordClass c);

// A decoded copy of the record behind `ref`, owned by the caller.
std::unique_ptr<Record> copyRecord(const RecordRef& ref);

}  // namespace bw
