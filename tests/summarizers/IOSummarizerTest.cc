#include "summarizers/IOSummarizer.h"

#include <gtest/gtest.h>

namespace bw {
namespace {

TEST(IOSummary, MoreBytesRankAboveMorePacketsAndTiesGoByTime) {
  auto with = [](std::uint64_t location, double bytesRead, double packets) {
    IOSummary s;
    s.setRange(Range{location, 10});
    s["Bytes Read"].push_back(Value(bytesRead));
    s["Packets Received"].push_back(Value(packets));
    return s;
  };
  const IOSummary chatty = with(0, 100, 1e6), bulky = with(50, 200, 0);
  EXPECT_LT(IOSummarizer::compareTotalBytes(chatty, bulky), 0);
  EXPECT_GT(IOSummarizer::compareTotalBytes(bulky, chatty), 0);
  // Equal totals: the earlier range ranks greater, so it comes first.
  EXPECT_GT(IOSummarizer::compareTotalBytes(with(0, 200, 0), bulky), 0);
  EXPECT_EQ(IOSummarizer::compareTotalBytes(bulky, bulky), 0);
}

}  // namespace
}  // namespace bw
