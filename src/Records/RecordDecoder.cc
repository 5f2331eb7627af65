#include "Records/RecordDecoder.h"

#include <google/protobuf/io/coded_stream.h>

#include <climits>
#include <vector>

#include "Records/RecordFactory.h"
#include "base/Exception.h"

namespace bw {

RecordDecoder::RecordDecoder() = default;
RecordDecoder::~RecordDecoder() = default;

const Record* RecordDecoder::decode(RecordClass c, std::span<const std::uint8_t> body) {
  // The coded stream counts in int: a longer body cannot be read.
  if (body.size() > static_cast<std::size_t>(INT_MAX)) return nullptr;
  std::unique_ptr<Record>& value = values_[static_cast<std::size_t>(c)];
  if (!value) {
    value = makeRecord(c);
  } else {
    value->clear();
  }
  google::protobuf::io::CodedInputStream input(body.data(), static_cast<int>(body.size()));
  return value->readFrom(input) ? value.get() : nullptr;
}

const Record& RecordDecoder::record(const RecordRef& ref) {
  if (const Record* kept = ref.decoded()) return *kept;
  const Record* r = decode(ref.recordClass(), ref.body());
  if (r == nullptr) {
    throw Exception(kInternalInconsistencyException, std::string("a ") + ref.className() + " record no longer decodes");
  }
  return *r;
}

namespace {

// The decoders of this thread's walks, by nesting depth.
struct WalkStack {
  std::vector<std::unique_ptr<RecordDecoder>> decoders;
  std::size_t depth = 0;
};
thread_local WalkStack tWalks;

}  // namespace

WalkDecoder::WalkDecoder() {
  if (tWalks.depth == tWalks.decoders.size()) tWalks.decoders.push_back(std::make_unique<RecordDecoder>());
  decoder_ = tWalks.decoders[tWalks.depth++].get();
}

WalkDecoder::~WalkDecoder() { --tWalks.depth; }

std::uint64_t wallTimeOf(const RecordRef& ref, RecordDecoder& decoder) {
  if (const Record* kept = ref.decoded()) return kept->wallTime();
  if (!blankRecord(ref.recordClass()).answersWallTime()) return 0;
  return decoder.record(ref).wallTime();
}

const Record& blankRecord(RecordClass c) {
  static const auto blanks = [] {
    std::array<std::unique_ptr<Record>, kRecordClassCount> made;
    for (std::size_t i = 0; i < made.size(); ++i) made[i] = makeRecord(static_cast<RecordClass>(i));
    return made;
  }();
  return *blanks[static_cast<std::size_t>(c)];
}

std::unique_ptr<Record> copyRecord(const RecordRef& ref) {
  RecordDecoder decoder;
  return decoder.record(ref).copy();
}

}  // namespace bw
