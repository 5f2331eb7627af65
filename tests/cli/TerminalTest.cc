// The real binary with standard error on a pseudo-terminal and on a file:
// the notes for a person (system-log echo, damage summary, empty results)
// appear only on the terminal, and standard output and the
// exit status are the same either way.
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>

#include "cli/RecordModesStore.h"
#include "support/RunTool.h"

namespace bw {
namespace {

namespace fs = std::filesystem;

struct Pair {
  test::ToolResult pipe;
  test::ToolResult tty;
};

Pair runBoth(const std::vector<std::string>& args) {
  test::RunSettings settings;
  settings.env["TZ"] = "UTC";
  Pair p;
  p.pipe = test::runTool(args, settings);
  settings.stderrOnTerminal = true;
  p.tty = test::runTool(args, settings);
  EXPECT_EQ(p.pipe.out, p.tty.out) << args.back();
  EXPECT_EQ(p.pipe.status, p.tty.status) << args.back();
  return p;
}

class Terminal : public ::testing::Test {
 protected:
  void SetUp() override { test::writeRecordModesStore(store); }
  // Cuts the last bytes off boot B's file, inside its last record.
  std::string cutBootB() {
    const std::string path = store / "var/db/brindlewick/B.stats";
    fs::resize_file(path, fs::file_size(path) - 3);
    return path;
  }
  test::TempDir store;
};

TEST_F(Terminal, ACutFileIsReportedOnlyOnTheTerminal) {
  const std::string cut = cutBootB();
  for (const char* mode : {"--show-events", "--dump"}) {
    Pair p = runBoth({"--from", store.path(), mode});
    EXPECT_EQ(p.pipe.status, 0);
    EXPECT_EQ(p.pipe.err, "") << mode;
    EXPECT_EQ(p.pipe.out.find("BBBBBBBB-0000-0000-0000-000000000002\t\n"), std::string::npos);
    EXPECT_EQ(p.tty.err,
              "brindlewick:  ** Caught an exception while reading file: " + cut +
                  "\n"
                  "brindlewick:  ** exception: message length runs past the end of the data\n"
                  "brindlewick:  ** All data from boot BBBBBBBB-0000-0000-0000-000000000002 will be dropped.\n"
                  "brindlewick: store damage: 1 of 4 files could not be read, boot "
                  "BBBBBBBB-0000-0000-0000-000000000002 dropped\n")
        << mode;
  }
}

TEST_F(Terminal, AnUnknownStateEndsTheRunBeforeAnythingIsRead) {
  cutBootB();  // reading it would echo the reader's messages
  const std::string uncaught = "brindlewick: *** uncaught exception NSInvalidArgumentException: no such summarizer: ";
  for (const char* mode : {"--show-events", "--show-battery"}) {
    Pair p = runBoth({"--from", store.path(), "-S", "Sleep,Napping", mode});
    EXPECT_EQ(p.pipe.status, 70);
    EXPECT_EQ(p.pipe.out, "");
    EXPECT_EQ(p.pipe.err, uncaught + "Napping\n");
    EXPECT_EQ(p.tty.err, p.pipe.err);
  }
  // Known names pass, and the dump ignores -S altogether.
  EXPECT_EQ(runBoth({"--from", store.path(), "-S", "Battery,Sleep", "--show-events"}).pipe.status, 0);
  EXPECT_EQ(runBoth({"--from", store.path(), "-S", "Napping", "--dump"}).pipe.status, 0);
}

TEST_F(Terminal, EmptyResultsSayWhatWasAskedAndWhatTheDataCovers) {
  const std::string covers = "; the data covers 2024-01-01 00:00:01 to 2024-01-01 01:36:40\n";
  const struct {
    std::vector<std::string> args;
    std::string note;
  } cases[] = {
      {{"-d", "20200101", "--show-events"}, "nothing to show: no records on 2020-01-01" + covers},
      {{"-s", "2025-01-01 00:00:00", "--show-battery"},
       "nothing to show: no records from 2025-01-01 00:00:00 on" + covers},
      {{"-b", "99Z9", "--show-events"}, "nothing to show: no stats file is of build 99Z9\n"},
      {{"-S", "DiscreteGraphics", "--show-events"},
       "nothing to show: the states DiscreteGraphics never held together in all the data" + covers},
  };
  for (const auto& c : cases) {
    std::vector<std::string> args{"--from", store.path()};
    args.insert(args.end(), c.args.begin(), c.args.end());
    Pair p = runBoth(args);
    EXPECT_EQ(p.pipe.status, 0);
    EXPECT_EQ(p.pipe.out, "") << c.note;
    EXPECT_EQ(p.pipe.err, "");
    EXPECT_EQ(p.tty.err, "brindlewick: " + c.note);
  }
}

}  // namespace
}  // namespace bw
