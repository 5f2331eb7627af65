// Decoding and encoding of the record bodies: round trips for every class,
// exact bytes where the wire form matters, unknown and malformed input.
#include <google/protobuf/io/coded_stream.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>
#include <gtest/gtest.h>

#include "RecordTestSupport.h"
#include "Records/BatteryChargeLevel.h"
#include "Records/Cstates.h"
#include "Records/DisplayBrightness.h"
#include "Records/FanState.h"
#include "Records/Interrupts.h"
#include "Records/SmcKeys.h"
#include "Records/SystemIO.h"
#include "Records/UserIdle.h"

namespace bw {
namespace {

using test::WireBytes;
namespace pbio = google::protobuf::io;

class EveryRecordClass : public ::testing::TestWithParam<RecordClass> {};

TEST_P(EveryRecordClass, RandomRecordsSurviveEncodeAndDecode) {
  std::mt19937_64 random(static_cast<std::uint64_t>(GetParam()) * 7919 + 1);
  for (int i = 0; i < 300; ++i) {
    std::unique_ptr<Record> original = makeRecord(GetParam());
    test::fillRandomly(*original, random);
    std::string bytes = original->serialize();
    ASSERT_EQ(original->byteSize(), bytes.size());

    std::unique_ptr<Record> decoded = test::decode(GetParam(), bytes);
    ASSERT_NE(decoded, nullptr) << original->description();
    EXPECT_TRUE(decoded->isEqual(*original)) << original->description() << "\n" << decoded->description();
    EXPECT_EQ(decoded->hash(), original->hash());
    EXPECT_EQ(decoded->dictionaryRepresentation(), original->dictionaryRepresentation());
    EXPECT_EQ(decoded->serialize(), bytes);
  }
}

TEST_P(EveryRecordClass, EmptyInputDecodesToAnEmptyRecord) {
  std::unique_ptr<Record> decoded = test::decode(GetParam(), "");
  ASSERT_NE(decoded, nullptr);
  EXPECT_TRUE(decoded->isEqual(*makeRecord(GetParam())));
}

INSTANTIATE_TEST_SUITE_P(Records, EveryRecordClass, ::testing::ValuesIn(test::allRecordClasses()),
                         [](const auto& info) { return std::string(recordClassName(info.param)); });

TEST(RecordCodec, NegativeSint64ValuesUseZigzagAndRoundTrip) {
  BatteryChargeLevel level;
  level.setCharge(-5);
  level.setMaxCharge(5000);
  level.setCycleCount(0);
  level.setInstantAmperage(-1500);
  const std::string bytes = level.serialize();
  EXPECT_EQ(bytes, std::string("\x10\x09\x18\x90\x4e\x20\x00\x28\xb7\x17", 10));

  auto decoded = test::decodeAs<BatteryChargeLevel>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->charge(), -5);
  EXPECT_EQ(decoded->instantAmperage(), -1500);
  EXPECT_FALSE(decoded->hasAbsoluteTime());
  EXPECT_FALSE(decoded->hasInstantVoltage());
}

TEST(RecordCodec, ExtremeSint64ValuesRoundTrip) {
  for (std::int64_t v : {INT64_MIN, INT64_MIN + 1, std::int64_t{-1}, INT64_MAX}) {
    BatteryChargeLevel level;
    level.setCharge(v);
    level.setTimeSinceLastCharge(v);
    auto decoded = test::decodeAs<BatteryChargeLevel>(level.serialize());
    ASSERT_NE(decoded, nullptr);
    EXPECT_EQ(decoded->charge(), v);
    EXPECT_EQ(decoded->timeSinceLastCharge(), v);
  }
}

TEST(RecordCodec, NegativeInt32IsATenByteVarintAndRoundTrips) {
  FanState fan;
  fan.setAbsoluteTime(1);
  fan.setLoudness(-2);
  const std::string bytes = fan.serialize();
  EXPECT_EQ(bytes.size(), 2u + 1 + 10);
  auto decoded = test::decodeAs<FanState>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->loudness(), -2);
}

TEST(RecordCodec, RequiredScalarsAreWrittenEvenWhenNeverSet) {
  UserIdle idle;
  EXPECT_EQ(idle.serialize(), std::string("\x08\x00\x10\x00", 4));
  BatteryChargeLevel level;  // absoluteTime optional, the gauge values required
  EXPECT_EQ(level.serialize(), std::string("\x10\x00\x18\x00\x20\x00", 6));
}

TEST(RecordCodec, OptionalFieldsAreWrittenOnlyWithTheirFlag) {
  SystemIO io;
  io.setAbsoluteTime(3);
  io.setDiskReadOps(0);
  io.setNetworkBytesOut(7);
  io.setHasNetworkBytesOut(false);
  EXPECT_EQ(io.serialize(), WireBytes().varint(1, 3).varint(2, 0).str());
}

TEST(RecordCodec, DisplayBrightnessSkipsAFieldTwo) {
  const std::string bytes = WireBytes().varint(1, 77).varint(2, 5).varint(3, 40).str();
  auto decoded = test::decodeAs<DisplayBrightness>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->absoluteTime(), 77u);
  EXPECT_EQ(decoded->brightness(), 40u);
  EXPECT_EQ(decoded->dictionaryRepresentation(),
            (Dictionary{{"absoluteTime", Value(77u)}, {"brightness", Value(40u)}}));
  EXPECT_EQ(decoded->serialize(), WireBytes().varint(1, 77).varint(3, 40).str());
}

TEST(RecordCodec, InterruptsWithoutVectorsWritesOnlyFieldOne) {
  Interrupts interrupts;
  interrupts.setAbsoluteTime(1234);
  EXPECT_EQ(interrupts.serialize(), std::string("\x08\xd2\x09", 3));
}

TEST(RecordCodec, RepeatedElementsAreLengthDelimitedInOrder) {
  Interrupts interrupts;
  interrupts.setAbsoluteTime(1);
  InterruptVector a;
  a.setCpuNumber(0);
  a.setInterruptCount(10);
  InterruptVector b;
  b.setVectorName("hpet");
  interrupts.addVectors(a);
  interrupts.addVectors(b);
  const std::string expected = WireBytes()
                                   .varint(1, 1)
                                   .bytes(64, WireBytes().varint(1, 0).varint(2, 10).str())
                                   .bytes(64, WireBytes().bytes(3, "hpet").str())
                                   .str();
  EXPECT_EQ(interrupts.serialize(), expected);
  auto decoded = test::decodeAs<Interrupts>(expected);
  ASSERT_NE(decoded, nullptr);
  ASSERT_EQ(decoded->vectorsCount(), 2u);
  EXPECT_EQ(decoded->vectorsAtIndex(0).interruptCount(), 10u);
  EXPECT_EQ(decoded->vectorsAtIndex(1).vectorName(), "hpet");
  EXPECT_FALSE(decoded->vectorsAtIndex(1).hasCpuNumber());
}

TEST(RecordCodec, UnknownFieldsOfEveryWireTypeAndFieldZeroAreSkipped) {
  const std::string bytes = WireBytes()
                                .varint(1, 9)
                                .varint(40, 123456789)
                                .fixed64(41, 42)
                                .bytes(42, "ignored")
                                .groupStart(43)
                                .varint(1, 1)
                                .bytes(2, "nested")
                                .groupEnd(43)
                                .fixed32(44, 7)
                                .key(0)  // field 0, varint
                                .raw("\x05")
                                .key(2)  // field 0, length-delimited
                                .raw("\x02xy")
                                .key(3)  // field 0, a group
                                .varint(1, 1)
                                .key(4)
                                .key(std::uint64_t{1} << 35)  // a key wider than 32 bits
                                .raw("\x01")
                                .varint(2, 5)
                                .str();
  auto decoded = test::decodeAs<SystemIO>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->absoluteTime(), 9u);
  EXPECT_EQ(decoded->diskReadOps(), 5u);
  EXPECT_EQ(decoded->serialize(), WireBytes().varint(1, 9).varint(2, 5).str());
}

TEST(RecordCodec, AnEndGroupKeyStopsTheRecord) {
  const std::string bytes = WireBytes().varint(1, 5).groupEnd(9).varint(2, 7).str();
  auto decoded = test::decodeAs<UserIdle>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->absoluteTime(), 5u);
  EXPECT_FALSE(decoded->hasChange());
}

TEST(RecordCodec, AnElementThatEndsEarlyHasItsRestSkipped) {
  const std::string element = WireBytes().varint(1, 3).groupEnd(7).varint(2, 99).str();
  const std::string bytes = WireBytes().varint(1, 1).bytes(65, element).sint(3, 4).str();
  auto decoded = test::decodeAs<Cstates>(bytes);
  ASSERT_NE(decoded, nullptr);
  ASSERT_EQ(decoded->statesCount(), 1u);
  EXPECT_EQ(decoded->statesAtIndex(0).level(), 3u);
  EXPECT_FALSE(decoded->statesAtIndex(0).hasResidency());
  EXPECT_EQ(decoded->core(), 4);
}

TEST(RecordCodec, AKnownFieldIsReadWithItsDeclaredTypeWhateverTheWireType) {
  // Field 2 of UserIdle under a fixed64 key, followed by a varint value.
  const std::string bytes = WireBytes().varint(1, 1).key(2 << 3 | 1).raw("\x05").str();
  auto decoded = test::decodeAs<UserIdle>(bytes);
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->change(), 5u);
}

TEST(RecordCodec, RepeatedFieldsAppendAcrossOccurrences) {
  SmcKeys keys;
  const std::string one = WireBytes().bytes(1, "TB0T").str();
  ASSERT_TRUE(test::decodeInto(keys, WireBytes().bytes(66, one).varint(1, 3).bytes(66, one).str()));
  EXPECT_EQ(keys.keysCount(), 2u);
  EXPECT_EQ(keys.absoluteTime(), 3u);
}

struct Malformed {
  const char* name;
  RecordClass recordClass;
  std::string bytes;
};

std::string cut(const std::string& bytes, std::size_t n = 1) { return bytes.substr(0, bytes.size() - n); }

class MalformedInput : public ::testing::TestWithParam<Malformed> {};

TEST_P(MalformedInput, FailsToDecode) {
  EXPECT_EQ(test::decode(GetParam().recordClass, GetParam().bytes), nullptr);
}

INSTANTIATE_TEST_SUITE_P(
    RecordCodec, MalformedInput,
    ::testing::Values(
        Malformed{"KeyCutShort", RecordClass::UserIdle, "\x80"},
        Malformed{"VarintCutShort", RecordClass::UserIdle, cut(WireBytes().varint(1, 300).str())},
        Malformed{"SignedVarintCutShort", RecordClass::BatteryChargeLevel,
                  cut(WireBytes().sint(2, -300).str())},
        Malformed{"StringCutShort", RecordClass::DeviceChange, cut(WireBytes().bytes(3, "abcdef").str())},
        Malformed{"StringLengthMissing", RecordClass::DeviceChange, WireBytes().key(3 << 3 | 2).str()},
        Malformed{"DoubleCutShort", RecordClass::SmcKey, cut(WireBytes().fixed64(4, 1).str(), 3)},
        Malformed{"ElementLongerThanTheData", RecordClass::Cstates,
                  WireBytes().key(65 << 3 | 2).raw("\x0a\x08\x01").str()},
        Malformed{"ElementWithACutValue", RecordClass::Cstates,
                  WireBytes().bytes(65, cut(WireBytes().varint(2, 1000).str())).str()},
        Malformed{"UnknownFieldCutShort", RecordClass::SystemIO, cut(WireBytes().bytes(40, "xyz").str())},
        Malformed{"UnknownFixed32CutShort", RecordClass::SystemIO, cut(WireBytes().fixed32(40, 1).str())},
        Malformed{"UnterminatedGroup", RecordClass::SystemIO, WireBytes().groupStart(43).varint(1, 1).str()},
        Malformed{"GroupEndedByAnotherNumber", RecordClass::SystemIO,
                  WireBytes().groupStart(43).groupEnd(44).str()},
        Malformed{"WireTypeSix", RecordClass::SystemIO, WireBytes().key(40 << 3 | 6).raw("\x01").str()},
        Malformed{"WireTypeSeven", RecordClass::SystemIO, WireBytes().key(40 << 3 | 7).raw("\x01").str()}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(RecordCodec, DecodesFromAChunkedStreamWithoutALimit) {
  SystemIO io;
  io.setAbsoluteTime(123456789);
  io.setNetworkBytesIn(987654321);
  const std::string bytes = io.serialize();
  pbio::ArrayInputStream chunks(bytes.data(), static_cast<int>(bytes.size()), 3);
  pbio::CodedInputStream input(&chunks);
  SystemIO decoded;
  ASSERT_TRUE(decoded.readFrom(input));
  EXPECT_TRUE(decoded.isEqual(io));

  const std::string truncated = cut(bytes);
  pbio::ArrayInputStream truncatedChunks(truncated.data(), static_cast<int>(truncated.size()), 3);
  pbio::CodedInputStream truncatedInput(&truncatedChunks);
  SystemIO partial;
  EXPECT_FALSE(partial.readFrom(truncatedInput));
}

TEST(RecordCodec, DecodesWithinALimitAndLeavesTheRestOfTheStream) {
  UserIdle first;
  first.setAbsoluteTime(10);
  first.setChange(1);
  UserIdle second;
  second.setAbsoluteTime(20);
  const std::string a = first.serialize();
  const std::string b = second.serialize();
  const std::string stream = a + b;
  pbio::CodedInputStream input(reinterpret_cast<const std::uint8_t*>(stream.data()),
                               static_cast<int>(stream.size()));

  UserIdle decoded;
  pbio::CodedInputStream::Limit limit = input.PushLimit(static_cast<int>(a.size()));
  ASSERT_TRUE(decoded.readFrom(input));
  input.PopLimit(limit);
  EXPECT_TRUE(decoded.isEqual(first));
  UserIdle next;
  ASSERT_TRUE(next.readFrom(input));
  EXPECT_TRUE(next.isEqual(second));
}

}  // namespace
}  // namespace bw
