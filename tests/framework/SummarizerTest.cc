#include <gtest/gtest.h>

#include "framework/Summarizer.h"
#include "support/Records.h"

namespace bw {
namespace {

const Uuid kBoot1 = test::bootNamed(1);
const Uuid kBoot2 = test::bootNamed(2);

// A summarizer of UserIdle records whose handler answers the record's
// `change` (so 0 ends, 1 holds, 0xFFFFFFFF reads as -1: no change).
struct IdleSummarizer : Summarizer {
  IdleSummarizer() {
    setEventClass(RecordClass::UserIdle);
    setEventHandler([](const Record& r, SummarizerContext*) {
      return static_cast<std::int32_t>(static_cast<const UserIdle&>(r).change());
    });
  }
  void feed(std::uint64_t position, std::uint32_t change, const Uuid& boot = kBoot1) {
    addEvent(test::idle(0, change), position, AbsTime::timeWithBoot(boot, position), 0);
  }
};

TEST(Summarizer, AnswersOpenAndCloseOneRangeUnlessRangesAreDiscrete) {
  IdleSummarizer plain;
  plain.feed(10, 1);
  plain.feed(20, 1);
  plain.feed(30, 0);
  EXPECT_EQ(plain.ranges(), (std::vector<Range>{{10, 20}}));

  IdleSummarizer discrete;
  discrete.setDiscreteRanges(true);
  discrete.feed(10, 1);
  discrete.feed(20, 1);
  discrete.feed(30, 0);
  EXPECT_EQ(discrete.ranges(), (std::vector<Range>{{10, 10}, {20, 10}}));
}

TEST(Summarizer, NoChangeAnswersAndOtherClassesLeaveTheStateAlone) {
  IdleSummarizer s;
  s.feed(10, 1);
  s.feed(20, 0xFFFFFFFF);
  SleepWake sleep;
  s.addEvent(sleep, 25, AbsTime::timeWithBoot(kBoot1, 25), 0);
  s.feed(30, 0);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10, 20}}));
}

TEST(Summarizer, AnEndAtTheOpenRangesStartKeepsItOpen) {
  IdleSummarizer s;
  s.feed(10, 1);
  s.feed(10, 0);
  EXPECT_TRUE(s.ranges().empty());
  s.feed(15, 0);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10, 5}}));
}

TEST(Summarizer, TheLastPositionClosesAnOpenRangeOnlyWithoutDiscreteRanges) {
  IdleSummarizer plain;
  plain.feed(10, 1);
  plain.setLastPosition(50);
  EXPECT_EQ(plain.ranges(), (std::vector<Range>{{10, 40}}));

  IdleSummarizer discrete;
  discrete.setDiscreteRanges(true);
  discrete.feed(10, 1);
  discrete.feed(20, 1);
  discrete.setLastPosition(50);
  EXPECT_EQ(discrete.ranges(), (std::vector<Range>{{10, 10}}));

  IdleSummarizer closed;  // a range ended since the last begin is not reopened
  closed.feed(10, 1);
  closed.feed(20, 0);
  closed.setLastPosition(50);
  EXPECT_EQ(closed.ranges(), (std::vector<Range>{{10, 10}}));
}

TEST(Summarizer, BootFlagsCoverEachBootFromItsFirstToItsLastRecord) {
  IdleSummarizer s;
  s.setStartAtBoot(true);
  s.setEndAtShutdown(true);
  s.setResetAtReboot(true);
  SleepWake other;  // not accepted: only the boot handling acts
  auto feed = [&](std::uint64_t p, const Uuid& boot) { s.addEvent(other, p, AbsTime::timeWithBoot(boot, p), 0); };
  feed(0, kBoot1);
  feed(5, kBoot1);
  feed(9, kBoot1);
  feed(100, kBoot2);  // a boot of a single record yields no range
  feed(200, kBoot1);
  feed(250, kBoot1);
  s.setLastPosition(250);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{0, 9}, {200, 50}}));
}

TEST(Summarizer, ARebootDropsAnOpenRangeUnlessShutdownEndsItFirst) {
  IdleSummarizer reset;
  reset.setResetAtReboot(true);
  reset.feed(10, 1);
  reset.feed(20, 0xFFFFFFFF);
  reset.feed(100, 0xFFFFFFFF, kBoot2);
  reset.setLastPosition(150);
  EXPECT_TRUE(reset.ranges().empty());

  IdleSummarizer both;
  both.setResetAtReboot(true);
  both.setEndAtShutdown(true);
  both.feed(10, 1);
  both.feed(20, 0xFFFFFFFF);
  both.feed(100, 0xFFFFFFFF, kBoot2);
  EXPECT_EQ(both.ranges(), (std::vector<Range>{{10, 10}}));
}

TEST(Summarizer, EndAtSleepClosesTheRangeAtASleep) {
  IdleSummarizer s;
  s.setEndAtSleep(true);
  s.feed(10, 1);
  SleepWake wake;
  wake.setReason(1);
  s.addEvent(wake, 20, AbsTime::timeWithBoot(kBoot1, 20), 0);
  SleepWake sleep;
  sleep.setReason(0);
  s.addEvent(sleep, 30, AbsTime::timeWithBoot(kBoot1, 30), 0);
  EXPECT_EQ(s.ranges(), (std::vector<Range>{{10, 20}}));
}

struct CountingContext : SummarizerContext {
  const char* className() const override { return "CountingContext"; }
  int records = 0;
};

TEST(Summarizer, ContextsAreMadePerBootAndAFreshContextIsABootChange) {
  IdleSummarizer s;
  s.setStartAtBoot(true);
  s.setContextClass("CountingContext", [] { return std::make_shared<CountingContext>(); });
  s.setEventHandler([](const Record&, SummarizerContext* c) {
    ++static_cast<CountingContext*>(c)->records;
    return -1;
  });
  EXPECT_EQ(s.contextForBoot(kBoot1), nullptr);
  s.feed(10, 1);
  s.feed(20, 1);
  s.feed(30, 1, kBoot2);
  s.feed(40, 1);  // back on boot 1: its context exists, yet the last record was on boot 2
  ASSERT_NE(s.contextForBoot(kBoot1), nullptr);
  EXPECT_EQ(static_cast<CountingContext*>(s.contextForBoot(kBoot1))->records, 3);
  EXPECT_EQ(static_cast<CountingContext*>(s.contextForBoot(kBoot2))->records, 1);
  EXPECT_EQ(s.contextForBoot(test::bootNamed(9)), nullptr);
}

}  // namespace
}  // namespace bw
