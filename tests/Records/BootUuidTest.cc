// The boot UUIDs of the log-start records, and the required-string
// assertions that stop a record from being written without its key field.
#include <gtest/gtest.h>

#include "RecordTestSupport.h"
#include "Records/LogStartsV0.h"
#include "Records/LogStartsV1.h"
#include "Records/SmcKeys.h"

namespace bw {
namespace {

const Uuid kBoot = *Uuid::parse("6A1C1D4E-0B7F-4E3A-9C2D-5F8E7A6B4C3D");
const std::string kRaw(kBoot.bytes().begin(), kBoot.bytes().end());

struct BytesCase {
  const char* name;
  std::optional<std::string> bytes;  // none: the field is absent
  std::optional<Uuid> expected;
};

class BootUuidBytes : public ::testing::TestWithParam<BytesCase> {};

TEST_P(BootUuidBytes, NamesTheExpectedBootInBothHeaderForms) {
  LogStartsV1 v1;
  LogStartsV0 v0;
  if (GetParam().bytes) {
    v1.setBootUuid(*GetParam().bytes);
    v1.setLastBootUuid(*GetParam().bytes);
    v0.setBootUuid(*GetParam().bytes);
    v0.setLastBootUuid(*GetParam().bytes);
  }
  EXPECT_EQ(v1.bootUUID(), GetParam().expected);
  EXPECT_EQ(v1.lastBootUUID(), GetParam().expected);
  EXPECT_EQ(v0.bootUUID(), GetParam().expected);
  EXPECT_EQ(v0.lastBootUUID(), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    LogStarts, BootUuidBytes,
    ::testing::Values(BytesCase{"Absent", std::nullopt, std::nullopt},
                      BytesCase{"Empty", std::string(), std::nullopt},
                      BytesCase{"RawSixteenBytes", kRaw, kBoot},
                      BytesCase{"UpperCaseText", kBoot.string(), kBoot},
                      BytesCase{"LowerCaseText", "6a1c1d4e-0b7f-4e3a-9c2d-5f8e7a6b4c3d", kBoot},
                      BytesCase{"TextWithATrailingNul", kBoot.string() + std::string(1, '\0'), kBoot},
                      BytesCase{"SeventeenBytesAreTakenAsText", kRaw + "x", std::nullopt},
                      BytesCase{"MalformedText", "6A1C1D4E+0B7F-4E3A-9C2D-5F8E7A6B4C3D", std::nullopt},
                      BytesCase{"CutShortRaw", kRaw.substr(0, 15), std::nullopt},
                      BytesCase{"OneByte", std::string(1, '\x7f'), std::nullopt}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(LogStarts, TextAndRawFormsDecodeToTheSameBoot) {
  LogStartsV1 text;
  text.setVersion("1");
  text.setBootUuid(kBoot.string());
  LogStartsV1 raw;
  raw.setVersion("1");
  raw.setBootUuid(kRaw);
  auto decodedText = test::decodeAs<LogStartsV1>(text.serialize());
  auto decodedRaw = test::decodeAs<LogStartsV1>(raw.serialize());
  ASSERT_NE(decodedText, nullptr);
  ASSERT_NE(decodedRaw, nullptr);
  EXPECT_EQ(decodedText->bootUUID(), kBoot);
  EXPECT_EQ(decodedText->bootUUID(), decodedRaw->bootUUID());
  EXPECT_FALSE(decodedText->isEqual(*decodedRaw));  // the fields themselves differ
}

TEST(LogStarts, AGivenUuidWinsUntilItIsCleared) {
  LogStartsV1 header;
  header.setBootUuid(kRaw);
  const Uuid other = *Uuid::parse("00000000-0000-0000-0000-0000000000AA");
  header.setBootUUID(other);
  header.setLastBootUUID(other);
  EXPECT_EQ(header.bootUUID(), other);
  EXPECT_EQ(header.lastBootUUID(), other);
  header.setBootUUID(std::nullopt);
  EXPECT_EQ(header.bootUUID(), kBoot);
  EXPECT_EQ(header.bootUuid(), kRaw);  // the byte field is untouched
}

TEST(LogStarts, BothHeaderFormsAnswerTheirWallTime) {
  LogStartsV1 v1;
  v1.setWallTime(1700000000000);
  LogStartsV0 v0;
  v0.setWallTime(5);
  const Record& r1 = v1;
  const Record& r0 = v0;
  EXPECT_TRUE(r1.answersWallTime());
  EXPECT_EQ(r1.wallTime(), 1700000000000u);
  EXPECT_TRUE(r0.answersWallTime());
  EXPECT_EQ(r0.wallTime(), 5u);
}

using RequiredStringDeathTest = ::testing::Test;

TEST_F(RequiredStringDeathTest, LogStartsV0WithoutVersionAborts) {
  LogStartsV0 header;
  EXPECT_DEATH(header.serialize(), "nil != self->_version.*Records/LogStartsV0");
}

TEST_F(RequiredStringDeathTest, LogStartsV1WithoutVersionAborts) {
  LogStartsV1 header;
  header.setBootUuid(kRaw);
  EXPECT_DEATH(header.serialize(), "nil != self->_version.*Records/LogStartsV1");
}

TEST_F(RequiredStringDeathTest, SmcKeyWithoutKeyAbortsEvenInsideSmcKeys) {
  SmcKeys keys;
  keys.addKeys(SmcKey());
  EXPECT_DEATH(keys.serialize(), "nil != self->_key.*Records/SmcKey");
}

TEST(LogStarts, AnEmptyVersionIsPresentAndWritten) {
  LogStartsV1 header;
  header.setVersion("");
  auto decoded = test::decodeAs<LogStartsV1>(header.serialize());
  ASSERT_NE(decoded, nullptr);
  EXPECT_TRUE(decoded->hasVersion());
  EXPECT_EQ(decoded->version(), "");
}

}  // namespace
}  // namespace bw
