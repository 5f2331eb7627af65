// The recorder's files: headers and the boot chain, rotation, clock and
// date records, whole-record writes and the repair of torn tails.
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "RecorderFixture.h"
#include "Records/DateChange.h"
#include "Records/LogStartsV1.h"
#include "Records/TimeChange.h"
#include "Records/UserIdle.h"
#include "recorder/StatsLog.h"
#include "store/StatsFileWriter.h"
#include "support/Records.h"

namespace bw::test {
namespace {

using recorder::StatsLog;

const Uuid kBoot = *Uuid::parse("AAAAAAAA-BBBB-CCCC-DDDD-000000000001");
const Uuid kPrevious = *Uuid::parse("AAAAAAAA-BBBB-CCCC-DDDD-000000000000");

std::vector<std::string> statsFiles(const std::string& dir) {
  std::vector<std::string> names;
  for (const auto& e : std::filesystem::directory_iterator(dir)) {
    if (e.path().extension() == ".stats") names.push_back(e.path().filename().string());
  }
  std::sort(names.begin(), names.end());
  return names;
}

TEST(RecorderStatsLog, HeadersChainTheBootsAndMarkTheBootsFirstFile) {
  MachineTree machine;
  machine.put("/proc/sys/kernel/random/boot_id", "aaaaaaaa-bbbb-cccc-dddd-000000000001\n");
  machine.put("/proc/sys/kernel/osrelease", "6.1.0-18-amd64\n");
  TempDir store;
  store.write("recorder.state", kPrevious.string() + "\n6.1.0-17-amd64\n\n\n");
  const recorder::MachineFiles files(machine.dir.path());
  FakeClock clock;
  for (int start = 0; start < 2; ++start) {  // a restart within the boot
    const auto boot = recorder::loadBootIdentity(files, store / "recorder.state");
    ASSERT_TRUE(boot);
    EXPECT_EQ(boot->firstStartOfBoot, start == 0);
    StatsLog log(store.path(), *boot, clock);
    ASSERT_TRUE(log.start());
    clock.advance(1000);
  }
  EXPECT_EQ(statsFiles(store.path()), (std::vector<std::string>{kBoot.string() + ".recorder.0001.stats",
                                                                kBoot.string() + ".recorder.0002.stats"}));
  const StoreContents contents(store.path());
  const auto headers = contents.all<LogStartsV1>();
  ASSERT_EQ(headers.size(), 2u);
  for (std::size_t i = 0; i < 2; ++i) {
    SCOPED_TRACE(i);
    const LogStartsV1& h = *headers[i];
    EXPECT_EQ(std::tuple(*h.bootUUID(), *h.lastBootUUID(), h.systemVersion(), h.lastSystemVersion()),
              std::tuple(kBoot, kPrevious, "6.1.0-18-amd64", "6.1.0-17-amd64"));
    EXPECT_EQ(std::tuple(h.isFirst(), h.absoluteTime(), h.wallTime()),
              std::tuple(i == 0 ? 1u : 0u, 5'000'000u + 1000 * i, 1'790'000'000'000u + 1000 * i));
    EXPECT_NE(h.writer(), 5u);  // several files per boot
  }
  // Each header is followed by the zone.
  const auto zones = contents.all<TimeChange>();
  ASSERT_EQ(zones.size(), 2u);
  EXPECT_EQ(contents.records[1], zones[0]);
  EXPECT_EQ(std::tuple(zones[0]->zoneName(), zones[0]->gmtoff(), zones[0]->yday(), zones[0]->year()),
            std::tuple("CET", 3600, 300, 2026));
}

TEST(RecorderStatsLog, RotatesAndAnnouncesClockZoneAndDateChanges) {
  TempDir store;
  FakeClock clock;
  StatsLog log(store.path(), recorder::BootIdentity{kBoot, "6.1.0"}, clock, /*rotateMs=*/60'000);
  ASSERT_TRUE(log.start());
  for (int i = 0; i < 3; ++i) {
    ASSERT_TRUE(log.write(idle(log.now())));
    clock.advance(30'000);
  }
  // 90 s in: the third record began a second file.
  clock.localTime.yday = 301;  // midnight passed
  log.checkClock();
  clock.localTime = {7200, "CEST", 301, 2026};
  log.checkClock();
  clock.wall += 3'600'000;  // the clock was set an hour ahead
  log.checkClock();
  log.checkClock();  // nothing new
  ASSERT_TRUE(log.write(idle(log.now())));
  log.flush();

  EXPECT_EQ(statsFiles(store.path()).size(), 2u);
  const StoreContents contents(store.path());
  std::vector<std::string> classes;
  for (const Record* r : contents.records) classes.push_back(r->className());
  EXPECT_EQ(classes,
            (std::vector<std::string>{"LogStartsV1", "TimeChange", "UserIdle", "UserIdle", "LogStartsV1", "TimeChange",
                                      "UserIdle", "DateChange", "TimeChange", "TimeChange", "UserIdle"}));
  const auto date = contents.all<DateChange>();
  EXPECT_EQ(date[0]->newYday(), 301u);
  const auto times = contents.all<TimeChange>();
  EXPECT_EQ(std::tuple(times[2]->reason(), times[2]->zoneName(), times[2]->gmtoff()),
            std::tuple(StatsLog::kZoneChanged, "CEST", 7200));
  EXPECT_EQ(times[3]->reason(), StatsLog::kClockSet);
  EXPECT_EQ(times[3]->wallTime() - times[3]->absoluteTime(), 1'790'000'000'000u - 5'000'000u + 3'600'000u);
  EXPECT_EQ(log.wallAt(log.now()), clock.wall);
}

TEST(RecorderStatsLog, ASlowBatchBeginsOneFileNotOnePerRecord) {
  TempDir store;
  FakeClock clock;
  StatsLog log(store.path(), recorder::BootIdentity{kBoot, "6.1.0"}, clock, /*rotateMs=*/60'000);
  ASSERT_TRUE(log.start());
  const std::uint64_t stamp = log.now();
  clock.advance(70'000);  // the batch, stamped at its start, took longer than a file lasts
  for (int i = 0; i < 5; ++i) ASSERT_TRUE(log.write(idle(stamp)));
  log.flush();
  EXPECT_EQ(statsFiles(store.path()).size(), 2u);
  const StoreContents contents(store.path());
  EXPECT_EQ(contents.all<UserIdle>().size(), 5u);  // none stamped before its file's header
}

// The encoded bytes of a few records, as the recorder writes them.
std::string encodedRecords(int count) {
  StatsFileWriter w;
  w.append(logStart(kBoot, 100, 1'790'000'000'000));
  for (int i = 0; i < count; ++i) w.append(idle(200 + i));
  return w.bytes();
}

TEST(RecorderStatsLog, TornTailsAreCutToTheLastWholeRecord) {
  const std::string whole = encodedRecords(3);
  const std::string last = encodedRecords(3).substr(encodedRecords(2).size());
  ASSERT_GT(last.size(), 3u);
  const struct {
    const char* what;
    std::string tail;
    std::uint64_t records;
  } cases[] = {
      {"intact", "", 4},
      {"key only", last.substr(0, 1), 4},
      {"key and length", last.substr(0, 2), 4},
      {"body cut short", last.substr(0, last.size() - 1), 4},
      {"zeros from a power loss", std::string(64, '\0'), 4},
      {"an unknown type", std::string("\x2a\x01\x00", 3), 4},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    TempDir store;
    const std::string path = store.write(kBoot.string() + ".recorder.0001.stats", whole + c.tail);
    const std::string other = store.write("00000000-0000-0000-0000-000000000000.recorder.0001.stats", whole + c.tail);
    FakeClock clock;
    const auto repaired = StatsLog(store.path(), recorder::BootIdentity{kBoot, "6.1.0"}, clock).repairBootFiles();
    EXPECT_EQ(repaired.files, 1u);  // another boot's files are left alone
    EXPECT_EQ(repaired.tornFiles, c.tail.empty() ? 0u : 1u);
    EXPECT_EQ(repaired.trimmedBytes, c.tail.size());
    EXPECT_EQ(std::filesystem::file_size(path), whole.size());
    EXPECT_EQ(std::filesystem::file_size(other), whole.size() + c.tail.size());
    std::filesystem::remove(other);
    const StoreContents contents(store.path());
    EXPECT_EQ(contents.records.size(), c.records);
  }
}

TEST(RecorderStatsLog, EveryRecordIsOneWholeWrite) {
  TempDir store;
  FakeClock clock;
  StatsLog log(store.path(), recorder::BootIdentity{kBoot, "6.1.0"}, clock);
  ASSERT_TRUE(log.start());
  const auto before = std::filesystem::file_size(log.currentPath());
  ASSERT_TRUE(log.write(idle(log.now())));
  // Visible to a reader at once, before any flush: nothing is buffered.
  StatsFileWriter w;
  w.append(idle(clock.absolute));
  EXPECT_EQ(std::filesystem::file_size(log.currentPath()), before + w.bytes().size());
}

}  // namespace
}  // namespace bw::test
