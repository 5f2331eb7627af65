#include "summarizers/IOSummarizer.h"

#include <gtest/gtest.h>

#include <vector>

#include "Events.h"
#include "Records/SystemIO.h"

namespace bw {
namespace {

using test::boot;
using test::make;
using Entries = std::vector<Value>;

// Every counter of the record is `base` times its place in the key order
// (1 for "Disk Reads" to 8 for "Bytes Sent").
SystemIO io(std::uint64_t absoluteTime, std::uint64_t base) {
  return make<SystemIO>([&](SystemIO& r) {
    r.setAbsoluteTime(absoluteTime);
    r.setDiskReadOps(base), r.setDiskWriteOps(2 * base), r.setDiskBytesRead(3 * base);
    r.setDiskBytesWritten(4 * base), r.setNetworkPacketsIn(5 * base), r.setNetworkPacketsOut(6 * base);
    r.setNetworkBytesIn(7 * base), r.setNetworkBytesOut(8 * base);
  });
}

void feed(IOSummarizer& s, const SystemIO& r, std::uint64_t position, std::uint8_t bootNumber) {
  s.addEvent(r, position, AbsTime{boot(bootNumber), r.absoluteTime()}, 0);
}

TEST(IOSummary, EachAbsoluteRangeAddsOneEntryPerKeyAndRebootsStartAfresh) {
  IOSummarizer s;
  feed(s, io(1000, 100), 1000, 1);
  feed(s, io(3000, 300), 3000, 1);
  feed(s, io(4000, 900), 4000, 1);  // the range it opens is dropped at the reboot
  feed(s, io(500, 10), 10000, 2);   // counters restart low in the new boot
  feed(s, io(1500, 30), 11000, 2);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{1000, 2000}, {3000, 1000}, {10000, 1000}}));

  IOSummary summary;
  s.summarize(summary, AbsRange::rangeWithBoot(boot(1), 1000, 3000));
  s.summarize(summary, AbsRange::rangeWithBoot(boot(2), 0, 1500));  // from the context's 0 at boot
  EXPECT_EQ(summary.duration(), 3500u);
  ASSERT_EQ(summary.storage().size(), 8u);
  for (std::size_t k = 0; k < 8; ++k) {
    const double place = static_cast<double>(k + 1);
    EXPECT_EQ(summary[IOSummary::keys()[k]], (Entries{200 * place, 30 * place})) << IOSummary::keys()[k];
  }
  EXPECT_EQ(summary.totalBytes(), (3 + 4 + 7 + 8) * 230.0);
}

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
