#pragma once
// Helpers for the record tests: decoding from memory, hand-made wire bytes
// written without the project's codec, records built from a dictionary, and
// a random filler that sets any record's fields through its schema.
#include <cstdint>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "Records/Record.h"
#include "Records/RecordFactory.h"

namespace bw::test {

// A new record of class `c` decoded from `bytes`, or null when readFrom fails.
std::unique_ptr<Record> decode(RecordClass c, const std::string& bytes);

// A record of class `c` with each entry of `fields` set under its dictionary
// key; a repeated field takes an Array of the elements' dictionaries.
std::unique_ptr<Record> build(RecordClass c, const Dictionary& fields);

// Hand-made wire bytes. `key` takes a whole key, wire type included.
class WireBytes {
 public:
  WireBytes& raw(const std::string& bytes) { return bytes_ += bytes, *this; }
  WireBytes& key(std::uint64_t key) { return raw(varint(key)); }
  WireBytes& varint(std::uint32_t field, std::uint64_t v) { return key(field << 3).raw(varint(v)); }
  WireBytes& sint(std::uint32_t field, std::int64_t v) {
    return varint(field, (static_cast<std::uint64_t>(v) << 1) ^ static_cast<std::uint64_t>(v >> 63));
  }
  WireBytes& fixed64(std::uint32_t field, std::uint64_t v) { return key(field << 3 | 1).raw(little(v, 8)); }
  WireBytes& fixed32(std::uint32_t field, std::uint32_t v) { return key(field << 3 | 5).raw(little(v, 4)); }
  WireBytes& bytes(std::uint32_t field, const std::string& v) {
    return key(field << 3 | 2).raw(varint(v.size())).raw(v);
  }
  WireBytes& groupStart(std::uint32_t field) { return key(field << 3 | 3); }
  WireBytes& groupEnd(std::uint32_t field) { return key(field << 3 | 4); }
  const std::string& str() const { return bytes_; }

 private:
  static std::string varint(std::uint64_t v) {
    std::string s;
    for (; v > 0x7F; v >>= 7) s += static_cast<char>((v & 0x7F) | 0x80);
    return s += static_cast<char>(v);
  }
  static std::string little(std::uint64_t v, int n) {
    std::string s;
    for (int i = 0; i < n; ++i, v >>= 8) s += static_cast<char>(v & 0xFF);
    return s;
  }
  std::string bytes_;
};

// Sets every field of `record` at random: required ones always, optional
// ones about two times in three, repeated fields with 0 to 4 random elements.
// Integers spread over small, large and extreme values; strings are
// printable ASCII, bytes any value, doubles finite.
void fillRandomly(Record& record, std::mt19937_64& random);

// Every record class, for table-driven tests.
std::vector<RecordClass> allRecordClasses();

}  // namespace bw::test
