// The derived properties of ProcessUsage: its time and its UUID.
#include <gtest/gtest.h>

#include "RecordTestSupport.h"
#include "Records/ProcessUsage.h"

namespace bw {
namespace {

struct StatusCase {
  const char* name;
  std::optional<std::int64_t> exitStatus;
  std::uint64_t expected;
};

class ProcessUsageTime : public ::testing::TestWithParam<StatusCase> {};

TEST_P(ProcessUsageTime, IsNowForRunningProcessesAndTheExitOtherwise) {
  ProcessUsage usage;
  usage.setNowAbstime(5000);
  usage.setProcExitAbstime(3000);
  usage.setProcStartAbstime(1000);
  if (GetParam().exitStatus) usage.setExitStatus(*GetParam().exitStatus);
  EXPECT_EQ(usage.absoluteTime(), GetParam().expected);
  EXPECT_EQ(static_cast<const Record&>(usage).absoluteTime(), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(ProcessUsage, ProcessUsageTime,
                         ::testing::Values(StatusCase{"Running", -1, 5000}, StatusCase{"Sampled", -3, 5000},
                                           StatusCase{"MinusTwo", -2, 3000}, StatusCase{"Zero", 0, 3000},
                                           StatusCase{"Failure", 1, 3000},
                                           StatusCase{"Absent", std::nullopt, 3000}),
                         [](const auto& info) { return std::string(info.param.name); });

TEST(ProcessUsage, TimeSurvivesEncoding) {
  ProcessUsage usage;
  usage.setExitStatus(-1);
  usage.setNowAbstime(77);
  usage.setProcExitAbstime(12);
  auto decoded = test::decodeAs<ProcessUsage>(usage.serialize());
  ASSERT_NE(decoded, nullptr);
  EXPECT_EQ(decoded->absoluteTime(), 77u);
}

TEST(ProcessUsage, UuidIsTheSixteenRawBytesOrNone) {
  const Uuid expected = *Uuid::parse("00112233-4455-6677-8899-AABBCCDDEEFF");
  const std::string raw(expected.bytes().begin(), expected.bytes().end());
  ProcessUsage usage;
  EXPECT_EQ(usage.UUID(), std::nullopt);
  usage.setUuid(raw);
  EXPECT_EQ(usage.UUID(), expected);
  usage.setUuid(raw.substr(0, 15));
  EXPECT_EQ(usage.UUID(), std::nullopt);
  usage.setUuid(expected.string());  // text is not accepted: its first 16 bytes are taken as they are
  EXPECT_NE(usage.UUID(), expected);
  usage.clearUuid();
  EXPECT_FALSE(usage.hasUuid());
  EXPECT_EQ(usage.UUID(), std::nullopt);
}

TEST(ProcessUsage, HasNoWallTime) {
  ProcessUsage usage;
  EXPECT_FALSE(static_cast<const Record&>(usage).answersWallTime());
}

}  // namespace
}  // namespace bw
