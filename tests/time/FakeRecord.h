#pragma once
// A bare record for timeline tests: an absolute time and, optionally, a
// wall time, with no fields to encode.
#include <cstdint>
#include <memory>

#include "Records/Record.h"

namespace bw::test {

class FakeRecord : public Record {
 public:
  FakeRecord(std::uint64_t absoluteTime, std::uint64_t wallTime = 0)
      : Record(wallTime != 0 ? RecordClass::SleepWake : RecordClass::UserIdle),
        absoluteTime_(absoluteTime), wallTime_(wallTime) {}

  std::uint64_t absoluteTime() const override { return absoluteTime_; }
  bool answersWallTime() const override { return wallTime_ != 0; }
  std::uint64_t wallTime() const override { return wallTime_; }

  Dictionary dictionaryRepresentation() const override { return {}; }
  bool readFrom(google::protobuf::io::CodedInputStream&) override { return false; }
  void writeTo(google::protobuf::io::CodedOutputStream&) const override {}
  std::unique_ptr<Record> copy() const override { return std::make_unique<FakeRecord>(*this); }
  bool isEqual(const Record& other) const override { return &other == this; }
  std::uint64_t hash() const override { return absoluteTime_; }

 private:
  std::uint64_t absoluteTime_;
  std::uint64_t wallTime_;
};

}  // namespace bw::test
