#pragma once
// Helpers for the record tests: encoding and decoding through the coded
// streams, a builder of raw wire bytes for hand-made inputs, and a random
// filler that sets any record's fields through its schema.
#include <cstdint>
#include <memory>
#include <random>
#include <string>

#include "Records/Record.h"
#include "Records/RecordFactory.h"

namespace bw::test {

// Decodes `bytes` into `record` from an in-memory stream; the result of
// readFrom.
bool decodeInto(Record& record, const std::string& bytes);

// A new record of class `c` decoded from `bytes`, or null when readFrom fails.
std::unique_ptr<Record> decode(RecordClass c, const std::string& bytes);

template <class T>
std::unique_ptr<T> decodeAs(const std::string& bytes) {
  auto record = std::make_unique<T>();
  if (!decodeInto(*record, bytes)) return nullptr;
  return record;
}

// Hand-made wire bytes, written with the protobuf library's writer.
class WireBytes {
 public:
  WireBytes& varint(std::uint32_t field, std::uint64_t value);
  WireBytes& sint(std::uint32_t field, std::int64_t value);
  WireBytes& fixed64(std::uint32_t field, std::uint64_t value);
  WireBytes& fixed32(std::uint32_t field, std::uint32_t value);
  WireBytes& bytes(std::uint32_t field, const std::string& value);
  WireBytes& groupStart(std::uint32_t field);
  WireBytes& groupEnd(std::uint32_t field);
  // Any key, with the wire type as given.
  WireBytes& key(std::uint64_t key);
  WireBytes& raw(const std::string& bytes);
  const std::string& str() const { return bytes_; }

 private:
  std::string bytes_;
};

// Sets every field of `record` at random: required ones always, optional
// ones about two times in three, repeated fields with 0 to 4 random
// elements. Strings are printable ASCII, bytes any value, doubles finite.
void fillRandomly(Record& record, std::mt19937_64& random);

// A random value of the kind, spread over small, large and extreme values.
std::uint64_t randomUnsigned(std::mt19937_64& random);
std::int64_t randomSigned(std::mt19937_64& random);
double randomDouble(std::mt19937_64& random);
std::string randomText(std::mt19937_64& random);
std::string randomBytes(std::mt19937_64& random);

// Every record class, for table-driven tests.
std::vector<RecordClass> allRecordClasses();

}  // namespace bw::test
