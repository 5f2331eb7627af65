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

using Ranges = std::vector<Range>;

// What a test feeds: a UserIdle answer, or a sleep, wake or dark wake record (another
// class, which the handler never sees).
enum Event : std::uint32_t { kEnd = 0, kHold = 1, kSleep = 100, kWake = 101, kDarkWake = 102, kNo = 0xFFFFFFFF };
struct Fed {
  std::uint64_t position;
  std::uint32_t event;
  const Uuid& boot = kBoot1;
};
enum Flag : unsigned { kDiscrete = 1, kStartAtBoot = 2, kEndAtShutdown = 4, kResetAtReboot = 8, kEndAtSleep = 16 };
constexpr std::uint64_t kNone = 0;  // no last position set

TEST(Summarizer, RangesFollowTheAnswersTheBootsSleepsAndTheLastPositionAsTheFlagsSay) {
  const struct {
    const char* what;
    unsigned flags;
    std::vector<Fed> events;
    std::uint64_t last;
    Ranges expected;
  } cases[] = {
      {"one range", 0, {{10, kHold}, {20, kHold}, {30, kEnd}}, kNone, {{10, 20}}},
      {"discrete", kDiscrete, {{10, kHold}, {20, kHold}, {30, kEnd}}, kNone, {{10, 10}, {20, 10}}},
      {"no change, other class", 0, {{10, kHold}, {20, kNo}, {25, kSleep}, {30, kEnd}}, kNone, {{10, 20}}},
      {"end at the open start", 0, {{10, kHold}, {10, kEnd}}, kNone, {}},
      {"a later end", 0, {{10, kHold}, {10, kEnd}, {15, kEnd}}, kNone, {{10, 5}}},
      {"last position closes", 0, {{10, kHold}}, 50, {{10, 40}}},
      {"not a discrete one", kDiscrete, {{10, kHold}, {20, kHold}}, 50, {{10, 10}}},
      {"closed stays closed", 0, {{10, kHold}, {20, kEnd}}, 50, {{10, 10}}},
      // Each boot from its first to its last record; a boot of one record has none.
      {"boot flags",
       kStartAtBoot | kEndAtShutdown | kResetAtReboot,
       {{0, kSleep}, {5, kSleep}, {9, kSleep}, {100, kSleep, kBoot2}, {200, kSleep}, {250, kSleep}},
       250,
       {{0, 9}, {200, 50}}},
      {"reboot drops", kResetAtReboot, {{10, kHold}, {20, kNo}, {100, kNo, kBoot2}}, 150, {}},
      {"shutdown ends first",
       kEndAtShutdown | kResetAtReboot,
       {{10, kHold}, {20, kNo}, {100, kNo, kBoot2}},
       kNone,
       {{10, 10}}},
      {"end at sleep", kEndAtSleep, {{10, kHold}, {15, kDarkWake}, {20, kWake}, {30, kSleep}}, kNone, {{10, 20}}},
  };
  for (const auto& c : cases) {
    IdleSummarizer s;
    s.setDiscreteRanges(c.flags & kDiscrete), s.setStartAtBoot(c.flags & kStartAtBoot);
    s.setEndAtShutdown(c.flags & kEndAtShutdown), s.setResetAtReboot(c.flags & kResetAtReboot);
    s.setEndAtSleep(c.flags & kEndAtSleep);
    for (const Fed& e : c.events) {
      if (e.event >= kSleep && e.event <= kDarkWake) {
        s.addEvent(test::sleepWake(0, 0, e.event - kSleep), e.position, AbsTime::timeWithBoot(e.boot, e.position), 0);
      } else {
        s.feed(e.position, e.event, e.boot);
      }
    }
    if (c.last != kNone) s.setLastPosition(c.last);
    EXPECT_EQ(s.ranges(), c.expected) << c.what;
  }
}

}  // namespace
}  // namespace bw
