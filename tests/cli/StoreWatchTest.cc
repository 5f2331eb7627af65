// The reading watch in-process, with a settable clock and a captured
// standard error: when the progress line appears, how it erases itself, and
// the damage summary's wording.
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

TEST_F(StoreWatchTest, ProgressShowsAfterASecondAndErasesItself) {
  StoreWatch watch;  // starts at the fake clock's 1000 ms
  watch.begin(4);
  platform.absoluteMs = 1999;
  watch.fileRead("a.stats", records(3));
  EXPECT_EQ(err.str(), "");  // under a second: silent
  platform.absoluteMs = 2000;
  watch.fileRead("b.stats", records(2));
  EXPECT_EQ(err.str(), "\rreading the store: 2/4 files, 5 records, 1 s\033[K");
  platform.absoluteMs = 2050;  // too soon to redraw
  watch.fileRead("c.stats", records(1));
  platform.absoluteMs = 3500;
  watch.fileRead("d.stats", records(0));
  EXPECT_EQ(err.str(),
            "\rreading the store: 2/4 files, 5 records, 1 s\033[K"
            "\rreading the store: 4/4 files, 6 records, 2 s\033[K");
  err.str("");
  watch.step("feeding model 1 of 2");  // later steps keep the line up
  EXPECT_EQ(err.str(), "\rreading the store: 4/4 files, 6 records, 2 s, feeding model 1 of 2\033[K");
  err.str("");
  terminalNote("a note");  // a note first erases the line
  EXPECT_EQ(err.str(), "\r\033[Kbrindlewick: a note\n");
  err.str("");
  watch.end();
  EXPECT_EQ(err.str(), "");  // already erased
  EXPECT_EQ(out.str(), "");
}

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
