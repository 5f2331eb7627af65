#include <gtest/gtest.h>

#include <sstream>

#include "BootRecords.h"
#include "base/Console.h"
#include "base/Exception.h"
#include "time/BootSequencer.h"
#include "time/BootTimeline.h"

namespace bw {
namespace {

using test::kWall;

Uuid uuid(int n) { return *Uuid::parse("00000000-0000-0000-0000-0000000000" + format("%02d", n)); }
const Uuid kA = uuid(1), kB = uuid(2), kC = uuid(3), kD = uuid(4);

class BootSequencerTest : public testing::Test {
 protected:
  void SetUp() override { setConsole(&out_, &err_); }
  void TearDown() override { setConsole(nullptr, nullptr); }

  // A boot starting at `start` (wall), lasting `length` ms, naming `last`.
  void boot(const Uuid& id, std::uint64_t start, std::uint64_t length, std::optional<Uuid> last = std::nullopt,
            const char* version = "23A344") {
    boots_[id] = {store_.header(0, start, version, last), store_.idle(length)};
  }
  std::vector<Uuid> chain(const Timeline& t) {
    std::vector<Uuid> ids;
    for (const auto& child : t.objects()) ids.push_back(static_cast<const BootTimeline&>(*child).uuid());
    return ids;
  }
  static std::string warning(std::initializer_list<Uuid> left) {
    std::string text = "Warning: could not sequence some boots:\n";
    for (const Uuid& u : left) text += "\t" + u.string() + "\n";
    return text;
  }

  test::BootRecordStore store_;
  BootRecords boots_;
  std::ostringstream out_, err_;
};

TEST_F(BootSequencerTest, AChainEndingLatestIsKeptAndTheOtherBootsAreListed) {
  boot(kA, kWall, 1000);
  boot(kB, kWall + 10000, 1000, kA);
  boot(kC, kWall + 20000, 1000, kB);
  boot(kD, kWall + 5000, 500);  // unrelated, ends before C
  auto result = sequenceBoots(boots_);
  ASSERT_EQ(result.size(), 1u);
  EXPECT_EQ(chain(*result.at("23A344")), (std::vector<Uuid>{kA, kB, kC}));
  EXPECT_EQ(out_.str(), warning({kD}));
}

TEST_F(BootSequencerTest, ALoneBootEndingLaterBeatsALongerChain) {
  boot(kA, kWall, 1000);
  boot(kB, kWall + 10000, 1000, kA);
  boot(kC, kWall + 20000, 1000, kB);
  boot(kD, kWall + 5000, 100000);
  auto result = sequenceBoots(boots_);
  EXPECT_EQ(chain(*result.at("23A344")), (std::vector<Uuid>{kD}));
  EXPECT_EQ(out_.str(), warning({kA, kB, kC}));
}

TEST_F(BootSequencerTest, OnEqualEndsTheLongerChainWinsThenTheLowerUuid) {
  boot(kA, kWall, 1000);
  boot(kB, kWall + 10000, 1000, kA);
  boot(kD, kWall + 5000, 6000);  // ends with B
  EXPECT_EQ(chain(*sequenceBoots(boots_).at("23A344")), (std::vector<Uuid>{kA, kB}));
  EXPECT_EQ(out_.str(), warning({kD}));

  boots_.clear();
  out_.str("");
  boot(kD, kWall, 1000);
  boot(kC, kWall, 1000);
  EXPECT_EQ(chain(*sequenceBoots(boots_).at("23A344")), (std::vector<Uuid>{kC}));
  EXPECT_EQ(out_.str(), warning({kD}));
}

TEST_F(BootSequencerTest, EachSystemVersionGetsItsOwnChain) {
  boot(kA, kWall, 1000, std::nullopt, "23A344");
  boot(kB, kWall + 10000, 1000, kA, "23B74");  // its predecessor is of another version
  boot(kC, kWall + 20000, 1000, kB, nullptr);
  auto result = sequenceBoots(boots_);
  ASSERT_EQ(result.size(), 3u);
  EXPECT_EQ(chain(*result.at("23A344")), (std::vector<Uuid>{kA}));
  EXPECT_EQ(chain(*result.at("23B74")), (std::vector<Uuid>{kB}));
  EXPECT_EQ(chain(*result.at("<unknown>")), (std::vector<Uuid>{kC}));
  EXPECT_EQ(out_.str(), "");
}

TEST_F(BootSequencerTest, LoopingPreviousBootLinksRaise) {
  struct Case {
    const char* name;
    std::vector<std::pair<Uuid, Uuid>> links;  // boot, its previous boot
  };
  const Case cases[] = {
      {"two boots naming each other", {{kA, kB}, {kB, kA}}},
      {"a boot naming itself", {{kA, kA}}},
      {"a chain leading into a loop", {{kA, kB}, {kB, kC}, {kC, kB}, {kD, kA}}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    boots_.clear();
    for (auto [id, last] : c.links) boot(id, kWall, 1000, last);
    try {
      sequenceBoots(boots_);
      FAIL() << "no exception";
    } catch (const Exception& e) {
      EXPECT_EQ(e.name(), "NSInternalInconsistencyException");
      EXPECT_EQ(e.reason(), "boot uuid cycle detected");
    }
  }
}

TEST_F(BootSequencerTest, RecordsAreSortedByAbsoluteTimeKeepingTiesInOrder) {
  Record* early = store_.idle(300);
  Record* late = store_.idle(300);
  Record* header = store_.header(0, kWall);
  boots_[kA] = {store_.idle(500), early, header, late};
  auto result = sequenceBoots(boots_);
  EXPECT_EQ(boots_[kA][0], header);
  std::vector<const Record*> order;
  result.at("23A344")->enumerateEventsUsingBlock(
      [&](const Record& r, auto, auto, auto&, bool&) { order.push_back(&r); });
  ASSERT_EQ(order.size(), 4u);
  EXPECT_EQ(order[0], header);
  EXPECT_EQ(order[1], early);
  EXPECT_EQ(order[2], late);
}

TEST_F(BootSequencerTest, ABootWhoseEarliestRecordIsNotAHeaderRaises) {
  boots_[kA] = {store_.header(10, kWall), store_.idle(5)};
  EXPECT_THROW(sequenceBoots(boots_), Exception);
}

}  // namespace
}  // namespace bw
