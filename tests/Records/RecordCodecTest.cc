// The generic operations of the records: decoding and encoding (round trips
// for every class, exact bytes where the wire form matters, unknown and
// malformed input) and the copy the decoder makes. Equality, hashing and
// copyTo serve no caller outside the records; the round trips use the first two
// only as the comparison.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <new>

#include "RecordTestSupport.h"

namespace bw {
namespace {

using C = RecordClass;
using W = test::WireBytes;

void expectSameRecord(const Record& actual, const Record& expected, const std::string& bytes) {
  EXPECT_TRUE(actual.isEqual(expected)) << expected.description() << "\n" << actual.description();
  EXPECT_TRUE(expected.isEqual(actual));
  EXPECT_EQ(actual.hash(), expected.hash());
  EXPECT_EQ(actual.dictionaryRepresentation(), expected.dictionaryRepresentation());
  EXPECT_EQ(actual.serialize(), bytes);
}

class EveryRecordClass : public ::testing::TestWithParam<RecordClass> {};

TEST_P(EveryRecordClass, RandomRecordsSurviveEncodingAndCopying) {
  const RecordClass c = GetParam();
  EXPECT_EQ(makeRecord(c)->recordClass(), c);
  EXPECT_EQ(recordSchema(c).recordClass, c);
  std::unique_ptr<Record> fromNothing = test::decode(c, "");
  ASSERT_NE(fromNothing, nullptr);
  EXPECT_TRUE(fromNothing->isEqual(*makeRecord(c)));

  std::mt19937_64 random(static_cast<std::uint64_t>(c) * 7919 + 1);
  for (int i = 0; i < 300; ++i) {
    std::unique_ptr<Record> original = makeRecord(c);
    test::fillRandomly(*original, random);
    const std::string bytes = original->serialize();
    ASSERT_EQ(original->byteSize(), bytes.size());
    std::unique_ptr<Record> decoded = test::decode(c, bytes);
    ASSERT_NE(decoded, nullptr) << original->description();
    expectSameRecord(*decoded, *original, bytes);
    expectSameRecord(*original->copy(), *original, bytes);
  }

  // Constructed in place, in storage of exactly the size the layout gives.
  const RecordLayout layout = recordLayout(c);
  void* storage = ::operator new(layout.size, std::align_val_t(layout.alignment));
  Record* placed = constructRecord(c, storage);
  EXPECT_EQ(placed->recordClass(), c);
  test::fillRandomly(*placed, random);
  EXPECT_EQ(placed->serialize().size(), placed->byteSize());
  placed->~Record();
  ::operator delete(storage, std::align_val_t(layout.alignment));
}

INSTANTIATE_TEST_SUITE_P(Records, EveryRecordClass, ::testing::ValuesIn(test::allRecordClasses()),
                         [](const auto& info) { return std::string(recordClassName(info.param)); });

// A record with `fields` writes `canonical`; `input` (the canonical bytes when
// empty) decodes to the same record.
struct WireCase {
  const char* name;
  RecordClass recordClass;
  Dictionary fields;
  std::string canonical;
  std::string input;
};

TEST(RecordCodec, WireFormsAreWrittenAndReadAsExpected) {
  const std::string element = W().varint(1, 3).groupEnd(7).varint(2, 99).str();
  const std::string key = W().bytes(1, "TB0T").str();
  const WireCase cases[] = {
      {"required scalars are written unset", C::UserIdle, {}, std::string("\x08\x00\x10\x00", 4)},
      {"an absent optional field is not", C::BatteryChargeLevel, {}, std::string("\x10\x00\x18\x00\x20\x00", 6)},
      {"a present optional zero is",
       C::SystemIO,
       {{"absoluteTime", 3}, {"diskReadOps", 0}},
       W().varint(1, 3).varint(2, 0).str()},
      {"Interrupts without vectors writes only field 1", C::Interrupts, {{"absoluteTime", 1234}}, "\x08\xd2\x09"},
      {"DisplayBrightness skips a field 2",
       C::DisplayBrightness,
       {{"absoluteTime", 77}, {"brightness", 40}},
       W().varint(1, 77).varint(3, 40).str(),
       W().varint(1, 77).varint(2, 5).varint(3, 40).str()},
      {"unknown fields of every wire type and field 0 are skipped",
       C::SystemIO,
       {{"absoluteTime", 9}, {"diskReadOps", 5}},
       W().varint(1, 9).varint(2, 5).str(),
       W().varint(1, 9)
           .varint(40, 123456789)
           .fixed64(41, 42)
           .bytes(42, "ignored")
           .fixed32(44, 7)
           .groupStart(43)
           .varint(1, 1)
           .bytes(2, "nested")
           .groupEnd(43)
           .key(0)
           .raw("\x05")
           .key(2)
           .raw("\x02xy")
           .key(3)
           .varint(1, 1)
           .key(4)  // field 0, each wire type
           .key(std::uint64_t{1} << 35)
           .raw("\x01")  // a key wider than 32 bits
           .varint(2, 5)
           .str()},
      {"an end-group key stops the record",
       C::UserIdle,
       {{"absoluteTime", 5}},
       W().varint(1, 5).varint(2, 0).str(),
       W().varint(1, 5).groupEnd(9).varint(2, 7).str()},
      {"an element that ends early has its rest skipped",
       C::Cstates,
       {{"absolute_time", 1}, {"core", 4}, {"states", Array{Dictionary{{"level", 3}}}}},
       W().varint(1, 1).sint(3, 4).bytes(65, W().varint(1, 3).str()).str(),
       W().varint(1, 1).bytes(65, element).sint(3, 4).str()},
      {"a known field is read as its declared type whatever the wire type",
       C::UserIdle,
       {{"absoluteTime", 1}, {"change", 5}},
       W().varint(1, 1).varint(2, 5).str(),
       W().varint(1, 1).key(2 << 3 | 1).raw("\x05").str()},
      {"repeated fields append across occurrences",
       C::SmcKeys,
       {{"absolute_time", 3}, {"keys", Array{Dictionary{{"key", "TB0T"}}, Dictionary{{"key", "TB0T"}}}}},
       W().varint(1, 3).bytes(66, key).bytes(66, key).str(),
       W().bytes(66, key).varint(1, 3).bytes(66, key).str()}};
  for (const WireCase& c : cases) {
    SCOPED_TRACE(c.name);
    std::unique_ptr<Record> record = test::build(c.recordClass, c.fields);
    EXPECT_EQ(record->serialize(), c.canonical);
    std::unique_ptr<Record> decoded = test::decode(c.recordClass, c.input.empty() ? c.canonical : c.input);
    ASSERT_NE(decoded, nullptr);
    expectSameRecord(*decoded, *record, c.canonical);
  }
}

std::string cut(const std::string& bytes, std::size_t n = 1) { return bytes.substr(0, bytes.size() - n); }

TEST(RecordCodec, MalformedInputFailsToDecode) {
  const std::tuple<const char*, RecordClass, std::string> cases[] = {
      {"KeyCutShort", C::UserIdle, "\x80"},
      {"VarintCutShort", C::UserIdle, cut(W().varint(1, 300).str())},
      {"SignedVarintCutShort", C::BatteryChargeLevel, cut(W().sint(2, -300).str())},
      {"StringCutShort", C::DeviceChange, cut(W().bytes(3, "abcdef").str())},
      {"StringLengthMissing", C::DeviceChange, W().key(3 << 3 | 2).str()},
      {"DoubleCutShort", C::SmcKey, cut(W().fixed64(4, 1).str(), 3)},
      {"ElementLongerThanTheData", C::Cstates, W().key(65 << 3 | 2).raw("\x0a\x08\x01").str()},
      {"ElementWithACutValue", C::Cstates, W().bytes(65, cut(W().varint(2, 1000).str())).str()},
      {"UnknownFieldCutShort", C::SystemIO, cut(W().bytes(40, "xyz").str())},
      {"UnknownFixed32CutShort", C::SystemIO, cut(W().fixed32(40, 1).str())},
      {"UnterminatedGroup", C::SystemIO, W().groupStart(43).varint(1, 1).str()},
      {"GroupEndedByAnotherNumber", C::SystemIO, W().groupStart(43).groupEnd(44).str()},
      {"WireTypeSix", C::SystemIO, W().key(40 << 3 | 6).raw("\x01").str()},
      {"WireTypeSeven", C::SystemIO, W().key(40 << 3 | 7).raw("\x01").str()},
  };
  for (const auto& [what, c, bytes] : cases) EXPECT_EQ(test::decode(c, bytes), nullptr) << what;
}

}  // namespace
}  // namespace bw
