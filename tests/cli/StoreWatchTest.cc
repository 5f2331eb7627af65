// The reading watch in-process: each damaged boot counted once, and the
// damage summary's wording (TerminalTest shows it at the end of real runs).
#include <gtest/gtest.h>

#include <sstream>

#include "Records/LogStartsV1.h"
#include "base/Console.h"
#include "base/Terminal.h"
#include "cli/StoreWatch.h"
#include "store/RecordReader.h"
#include "support/ConsoleCapture.h"
#include "support/FakePlatform.h"

namespace bw {
namespace {

class StoreWatchTest : public ::testing::Test {
 protected:
  void SetUp() override { setErrIsTerminal(true), resetRunDamage(); }
  void TearDown() override { setErrIsTerminal(std::nullopt), resetRunDamage(); }
  FileRecords records(std::size_t n) {
    FileRecords f;
    for (std::size_t i = 0; i < n; ++i) f.records.push_back(&header);
    return f;
  }
  test::FakePlatform platform;
  LogStartsV1 header;
  test::ConsoleCapture console{0};
  std::ostringstream &out = console.out, &err = console.err;
};

TEST_F(StoreWatchTest, DamageCountsEachBootOnceAndWordsTheSummary) {
  {
    StoreWatch watch;
    watch.begin(5);
    FileRecords damaged = records(1);
    damaged.damaged = true;
    watch.fileRead("a.stats", damaged);
    watch.fileRead("b.stats", damaged);  // the same boot again
    FileRecords undecodable;
    undecodable.undecodable = true;
    watch.fileRead("c.stats", undecodable);
    watch.fileRead("d.stats", records(2));
  }
  EXPECT_EQ(runDamage().filesNotRead, 3u);
  EXPECT_EQ(runDamage().bootsDropped.size(), 1u);

  const Uuid a = *Uuid::parse("AAAAAAAA-0000-0000-0000-000000000001");
  const Uuid b = *Uuid::parse("BBBBBBBB-0000-0000-0000-000000000002");
  const struct {
    RunDamage damage;
    std::string summary;
  } cases[] = {
      {RunDamage{3, 0, 0, {}}, ""},
      {RunDamage{9, 2, 1, {a, b}},
       "store damage: 1 folder could not be listed, 2 of 9 files could not be read, boots "
       "AAAAAAAA-0000-0000-0000-000000000001, BBBBBBBB-0000-0000-0000-000000000002 dropped"},
      {RunDamage{0, 0, 2, {}}, "store damage: 2 folders could not be listed"},
  };
  for (const auto& c : cases) EXPECT_EQ(damageSummary(c.damage), c.summary);
}

}  // namespace
}  // namespace bw
