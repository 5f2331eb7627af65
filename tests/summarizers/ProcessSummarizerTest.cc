#include "summarizers/ProcessSummarizer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "ProcessRecords.h"
#include "support/ConsoleCapture.h"
#include "support/FakePlatform.h"

namespace bw {
namespace {

using test::boot;
using test::feed;
using test::Sample;

constexpr double kMs = 1e6;  // nanoseconds

// Debug lines and the system log captured; the once-per-run messages armed.
class ProcessAccounting : public ::testing::Test {
 protected:
  ProcessAccounting() { ProcessSummarizer::resetLoggedMessages(); }
  std::vector<std::string> debugLines() const {
    std::vector<std::string> lines;
    std::istringstream in(console_.err.str());
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }
  bool logged(const std::string& line) const {
    const auto lines = debugLines();
    return std::find(lines.begin(), lines.end(), line) != lines.end();
  }
  std::shared_ptr<Process> process(ProcessSummarizer& s, std::uint64_t uniqueid, std::uint8_t b = 1) {
    return s.boots().objectForKeyedSubscript(boot(b))->processes().objectForKeyedSubscript(uniqueid);
  }
  static std::vector<std::string> jobKeys(ProcessSummarizer& s) {
    std::vector<std::string> keys;
    s.jobs().enumerateKeysAndObjectsUsingBlock([&](const std::string& k, auto&, bool&) { keys.push_back(k); });
    std::sort(keys.begin(), keys.end());
    return keys;
  }

  test::ConsoleCapture console_;
  test::FakePlatform platform_;
};

TEST(JobName, CleaningRemovesInstanceSuffixesAndLauncherSlotsOnly) {
  const struct {
    const char* name;
    const char* cleaned;
  } cases[] = {
      {"Foo.0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9", "Foo"},
      {"Foo.12345", "Foo"},
      {"[0x1f-0x2e].Foo", "Foo"},
      {"[0x0-0x1a01a].com.tidepool.mail.77", "com.tidepool.mail"},
      {"Foo.0a1b2c3d-4e5f-6071-8293-a4b5c6d7e8f9", "Foo.0a1b2c3d-4e5f-6071-8293-a4b5c6d7e8f9"},
      {"Foo.1.2", "Foo.1"},
      {"x.[0x1-0x2].Foo", "x.[0x1-0x2].Foo"},
      {"com.harbor.browser", "com.harbor.browser"},
      {"Foo", "Foo"},
  };
  for (const auto& c : cases)
    EXPECT_EQ(Process::stringByRemovingTrailingUUIDsAndLaunchServicesStuff(c.name), c.cleaned);
  JobNames names;  // one shared copy per cleaned name
  EXPECT_EQ(names.cleanedLabel("Foo"), names.cleanedLabel("Foo.34"));
}

TEST_F(ProcessAccounting, JobsGroupCleanedNamesAndPluginDisplayNamesAndLeaveOutGoneAndNamelessProcesses) {
  ProcessSummarizer s;
  feed(s, {.uniqueid = 10, .at = 100, .name = "Foo.12345"});
  feed(s, {.uniqueid = 11, .at = 100, .name = "[0x1f-0x2e].Foo"});
  feed(s, {.uniqueid = 12, .at = 100, .name = "PluginProcess", .displayName = "A"});
  feed(s, {.uniqueid = 13, .at = 100, .name = "PluginProcess", .displayName = "B"});
  feed(s, {.uniqueid = 14, .at = 100, .name = "PluginProcess", .displayName = "A"});
  feed(s, {.uniqueid = 15, .at = 100, .status = -2, .name = "gone"});
  feed(s, {.uniqueid = 16, .at = 100, .name = nullptr});
  s.setLastPosition(100);

  EXPECT_EQ(jobKeys(s), (std::vector<std::string>{"<PluginProcess> (A)", "<PluginProcess> (B)", "Foo"}));
  EXPECT_EQ(process(s, 15), nullptr);
  EXPECT_EQ(process(s, 10)->sharedLabel(), process(s, 11)->sharedLabel());  // one copy per job name
  Job& foo = s.jobs().objectForKey("Foo");
  EXPECT_EQ(*foo.label(), "Foo");
  EXPECT_EQ(foo.sharedLabel(), process(s, 10)->sharedLabel());
  EXPECT_EQ(process(s, 10)->job(), &foo);
  EXPECT_EQ(process(s, 12)->job(), process(s, 14)->job());
  EXPECT_TRUE(logged("Incomplete data: PID 16 [(null)] died before we could get its Mach-O UUID."));
}

TEST_F(ProcessAccounting, FeedingKeepsExitsAndUuidsAsRecordsAllow) {
  const Uuid executable = boot(0xEE);
  ProcessSummarizer s;
  feed(s, {.uniqueid = 20, .at = 100, .status = 0, .name = "late", .cpuMs = 5});
  feed(s, {.uniqueid = 20, .at = 200, .name = "late", .cpuMs = 9});
  feed(s, {.uniqueid = 21, .at = 150, .status = -3, .name = "snap", .cpuMs = 1, .uuid = executable});
  EXPECT_FALSE(process(s, 21)->macho_uuid());
  feed(s, {.uniqueid = 21, .at = 300, .name = "snap", .cpuMs = 2, .uuid = executable});
  EXPECT_EQ(process(s, 21)->macho_uuid(), executable);

  auto late = process(s, 20);
  EXPECT_TRUE(logged("Funny data - got a record about PID 20 [late] at 200 after it died"));
  EXPECT_EQ(std::pair(late->cpuTime().valueAtPosition(1000), late->exit_time()->time), std::pair(5 * kMs, 100ul));
  EXPECT_FALSE(process(s, 21)->exit_time());

  // A new boot ends every process of the previous one at its last record
  // time + 1, known exits included.
  feed(s, {.uniqueid = 5, .at = 50, .name = "next"}, 2);
  EXPECT_EQ(std::pair(process(s, 21)->exit_time()->time, late->exit_time()->time), std::pair(301ul, 301ul));
  EXPECT_EQ(late->exit_time()->boot, boot(1));
  EXPECT_FALSE(process(s, 5, 2)->exit_time());
}

// launchd (1) and the user's launchd (2); an application (10) with a
// helper (11) that runs a tool (12); a process responsible for itself under
// the helper (13); one whose parent is unknown (14); one with no parent at
// all (15); two whose parents name each other (16, 17).
class Ownership : public ProcessAccounting {
 protected:
  Ownership() {
    const Sample tree[] = {
        {.uniqueid = 1, .name = "launchd", .parent = 0, .responsible = 1, .cpuMs = 1},
        {.uniqueid = 2, .name = "launchd", .parent = 1, .responsible = 2, .cpuMs = 1},
        {.uniqueid = 10, .name = "App", .parent = 2, .responsible = 10, .cpuMs = 100},
        {.uniqueid = 11, .name = "App.Helper.123", .parent = 1, .responsible = 10, .cpuMs = 40},
        {.uniqueid = 12, .name = "sh", .parent = 11, .responsible = 0, .cpuMs = 7},
        {.uniqueid = 13, .name = "Self", .parent = 11, .responsible = 13, .cpuMs = 3},
        {.uniqueid = 14, .name = "Orphan", .parent = 99, .responsible = 0, .cpuMs = 5},
        {.uniqueid = 15, .name = "Zero", .parent = 0, .responsible = 0, .cpuMs = 2},
        {.uniqueid = 16, .name = "CycA", .parent = 17, .responsible = 0, .cpuMs = 1},
        {.uniqueid = 17, .name = "CycB", .parent = 16, .responsible = 0, .cpuMs = 1},
    };
    for (Sample sample : tree) {
      sample.at = 1000;
      feed(s, sample);
    }
    s.setLastPosition(1000);
  }
  Job* job(const char* key) { return &s.jobs().objectForKey(key); }
  double umbrellaCpuMs(const char* key) {
    return job(key)->umbrellaCPUTime().deltaAcrossAbsoluteRange(AbsRange::rangeWithBoot(boot(1), 0, 2000)) / kMs;
  }
  ProcessSummarizer s;
};

TEST_F(Ownership, OwnersFollowResponsibleThenParentIdsUpToALaunchd) {
  const struct {
    std::uint64_t uniqueid;
    const char* owner;
  } owners[] = {{1, "launchd"}, {2, "launchd"}, {10, "App"},    {11, "App"},
                {12, "App"},    {13, "Self"},   {14, "Orphan"}, {15, "Zero"}};
  for (const auto& o : owners) EXPECT_EQ(process(s, o.uniqueid)->owner(), job(o.owner)) << o.uniqueid;
  EXPECT_EQ(s.boots().objectForKeyedSubscript(boot(1))->launchds(), (std::unordered_set<std::uint64_t>{0, 1, 2}));
  // The helper and the tool count under the application; the orphan counts
  // twice in its own job; top-level jobs and self-responsible ones not at all.
  EXPECT_EQ(umbrellaCpuMs("App"), 47);
  EXPECT_EQ(umbrellaCpuMs("Orphan"), 5);
  EXPECT_EQ(umbrellaCpuMs("Self"), 0);
  EXPECT_EQ(umbrellaCpuMs("Zero"), 0);
  EXPECT_EQ(umbrellaCpuMs("launchd"), 0);

  for (const char* line : {
           "App.Helper[11] has owner App",
           "sh[12] has owner App",
           "Suspicious data: PID 12 [sh] had responsible uniqueid 0 but its parent 0 wasn't a launchd",
           "Could not find an owner for PID 14 [Orphan]; marking owned by itself",
           "Orphan[14] has owner Orphan",
           "Bad data: PID 15 [Zero] had responsible & parent process both 0",
       })
    EXPECT_TRUE(logged(line)) << line;
  EXPECT_FALSE(logged("Self[13] has owner App"));
}

TEST_F(Ownership, AParentIdCycleEndsWithOneOfItsProcessesOwningBoth) {
  Job* a = process(s, 16)->owner();
  ASSERT_NE(a, nullptr);
  EXPECT_EQ(process(s, 17)->owner(), a);
  EXPECT_TRUE(a == job("CycA") || a == job("CycB"));
  EXPECT_EQ(umbrellaCpuMs(a == job("CycA") ? "CycA" : "CycB"), 2);
  EXPECT_EQ(s.boots().objectForKeyedSubscript(boot(1))->findOwnerForProcess(nullptr), nullptr);
}

// App (10) owns Helper (11); Daemon (12) is its own. App and Helper exit at
// 1000, Daemon still runs.
class JobSummaries : public ProcessAccounting {
 protected:
  JobSummaries() {
    Sample app{.uniqueid = 10, .at = 500, .name = "App", .responsible = 10, .cpuMs = 50, .idle = 4, .start = 100};
    app.resident = 8192;
    feed(s, app);
    app.at = 1000, app.status = 0, app.cpuMs = 100, app.idle = 10, app.interrupts = 20, app.resident = 4096;
    feed(s, app);
    Sample helper{.uniqueid = 11, .at = 1000, .status = 0, .name = "Helper", .responsible = 10, .cpuMs = 40};
    helper.idle = 6, helper.interrupts = 8, helper.start = 200;
    feed(s, helper);
    Sample daemon{.uniqueid = 12, .at = 1500, .name = "Daemon", .responsible = 12, .cpuMs = 10, .idle = 1};
    daemon.interrupts = 3, daemon.start = 50;
    feed(s, daemon);
    s.setLastPosition(1500);
  }
  std::unique_ptr<ProcessSummary> summarize(std::vector<AbsRange> ranges = {
                                                AbsRange::rangeWithBoot(boot(1), 0, 2000)}) {
    return s.summarizeJobs(false, ranges);
  }
  ProcessSummarizer s;
};

TEST_F(JobSummaries, SpawnsRuntimeSizesAndStillRunningPerJob) {
  auto root = summarize();
  const ProcessSummary& app = *root->subprocesses().at("App");
  // Launch counts and resident sizes are in the dashboard run, still-running
  // counts in the service's job replies.
  EXPECT_EQ(std::pair(app.runtime(), app.maxResidentSize()), std::pair(900.0, 8192.0));

  // Split ranges add up; a later range sees no new spawn.
  auto split = summarize({AbsRange::rangeWithBoot(boot(1), 0, 600), AbsRange::rangeWithBoot(boot(1), 600, 2000)});
  EXPECT_DOUBLE_EQ(split->cpuTime(), root->cpuTime());
  EXPECT_EQ(split->spawns(), 3);
  auto late = summarize({AbsRange::rangeWithBoot(boot(1), 1200, 1500)});
  EXPECT_EQ(late->spawns(), 0);
  EXPECT_EQ(late->subprocesses().at("App")->runtime(), 0);
}

TEST_F(ProcessAccounting, ANegativeSpawnCountLeavesItsJobOutAndEachProblemIsLoggedOnce) {
  ProcessSummarizer s;
  feed(s, {.uniqueid = 40, .at = 500, .name = "Flat", .responsible = 40, .start = 50});
  feed(s, {.uniqueid = 30, .at = 20, .name = "Elsewhere", .responsible = 30, .cpuMs = 1}, 2);
  s.setLastPosition(20);
  // Ends before it starts (it wraps past the clock's end): Flat's curves
  // stay level over it, but its spawn count is negative.
  const AbsRange wrapped = AbsRange::rangeWithBootLocation(boot(1), (1ULL << 63) + 10, (1ULL << 63) - 1);
  const AbsRange negative = AbsRange::rangeWithBootLocation(boot(1), 10, ~0ULL);
  for (int run = 0; run < 2; ++run) {
    auto root = s.summarizeJobs(false, {negative, wrapped, AbsRange::rangeWithBoot(boot(2), 0, 100)});
    EXPECT_EQ(root->subprocesses().count("Flat"), 0u);
    ASSERT_EQ(root->subprocesses().count("Elsewhere"), 1u);
    EXPECT_EQ(root->cpuTime(), 1 * kMs);
  }
  EXPECT_EQ(platform_.systemLogLines,
            (std::vector<std::string>{ProcessSummarizer::kNegativeRangeMessage, ProcessSummarizer::kExceptionMessage}));
  // Over sound ranges the job is back.
  EXPECT_EQ(s.summarizeJobs(false, {AbsRange::rangeWithBoot(boot(1), 0, 1000)})->subprocesses().count("Flat"), 1u);
}

}  // namespace
}  // namespace bw
