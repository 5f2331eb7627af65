// The real binary: one case per exit status (70 is in TerminalTest); the
// option values themselves are checked in-process.
#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "support/RunTool.h"
#include "support/TempDir.h"

namespace bw {
namespace {

using test::runTool;
using test::ToolResult;

class CommandLine : public ::testing::Test {
 protected:
  void SetUp() override {
    a = store.write("a.stats");
    b = store.write("nested/deeper/b.stats");
  }
  ToolResult run(std::vector<std::string> args, test::RunSettings settings = {}) {
    settings.env.emplace("TZ", "UTC");
    return runTool(args, settings);
  }
  test::TempDir store;
  std::string a, b;
};

TEST_F(CommandLine, ListFilesPrintsEveryStatsFileInPathOrderAndExits0) {
  // The sample range and the filters do not apply; arguments after the
  // first non-option are ignored.
  ToolResult r = run({"-d", "20240230", "-B", "11111111-2222-3333-4444-555555555555", "--from", store.path(), "-L",
                      "extra", "--frobnicate"});
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.err, "");
  EXPECT_EQ(r.out, a + "\n" + b + "\n");
  ToolResult nul = run({"-L", "-0", "-f", store.path()});
  EXPECT_EQ(nul.out, a + std::string(1, '\0') + b + std::string(1, '\0'));
}

TEST_F(CommandLine, UsageErrorsPrintTheComplaintThenTheUsageAndExit64) {
  ToolResult unknown = run({"--frobnicate"});
  EXPECT_EQ(unknown.status, 64);
  EXPECT_EQ(unknown.out, "");
  EXPECT_EQ(unknown.err, "brindlewick: unrecognized option '--frobnicate'\n" + test::usageText());
  ToolResult ambiguous = run({"--deb"});
  EXPECT_EQ(ambiguous.status, 64);
  EXPECT_EQ(ambiguous.err,
            "brindlewick: option '--deb' is ambiguous; possibilities: '--debug' '--debug-range' '--debug-states'\n" +
                test::usageText());
  ToolResult retired = run({"-p"});  // errno is still 0 at that point
  EXPECT_EQ(retired.status, 64);
  EXPECT_EQ(retired.err, "brindlewick: The -p option is no longer supported: Success\n");
  ToolResult daily = run({"--debug", "--daily", "-d", "20240210", "--from", store.path()});  // --debug: from a shell
  EXPECT_EQ(daily.status, 64);
  EXPECT_EQ(daily.err, "brindlewick: --daily mode should not have a specified domain\n");
}

TEST_F(CommandLine, StartIsReadInTheProcesssTimeZone) {
  test::RunSettings newYork;
  newYork.env["TZ"] = "America/New_York";
  ToolResult r = runTool({"--debug", "-s", "2024-07-02 03:04:05 EDT", "-L", "-f", store.path()}, newYork);
  EXPECT_EQ(r.status, 0);
  EXPECT_EQ(r.err.substr(0, r.err.find('\n')), "Looking for launchd files modified since 2024-07-02 07:04:00 +0000");
}

TEST_F(CommandLine, DailyFromAShellNeedsDebugBeforeIt) {
  ToolResult shell = run({"--daily", "--debug"});
  EXPECT_EQ(shell.status, 64);
  EXPECT_EQ(shell.err, "brindlewick: This mode should only be invoked by launchd.\n");
  ToolResult lifted = run({"--debug", "--daily", "-f", store.path()});
  EXPECT_NE(lifted.status, 64);
  EXPECT_EQ(lifted.err.find("should only be invoked by launchd"), std::string::npos);
}

TEST_F(CommandLine, LocalRecordsWithoutTheSuperUserExit77) {
  test::RunSettings user;
  user.asUnprivilegedUser = true;
  user.env.emplace("TZ", "UTC");
  namespace fs = std::filesystem;
  fs::permissions(store.path(), fs::perms::all);
  // A copy the unprivileged user can surely reach, wherever the build lives.
  test::TempDir bin;
  fs::permissions(bin.path(), fs::perms::all);
  const std::string tool = bin / "brindlewick";
  fs::copy_file(BRINDLEWICK_BINARY, tool);
  auto run = [&](const std::vector<std::string>& args, const test::RunSettings& settings) {
    return test::runBinary(tool, args, settings);
  };
  ToolResult r = run({"-L"}, user);
  EXPECT_EQ(r.status, 77);
  EXPECT_EQ(r.out, "");
  EXPECT_EQ(r.err,
            "brindlewick: When reading the local machine's Brindlewick records, this program must be invoked as "
            "the super-user.\n");
  EXPECT_EQ(run({"-L", "-f", store.path()}, user).status, 0);
}

TEST_F(CommandLine, FromADirectoryWithoutStatsFilesExits66) {
  test::TempDir empty;
  empty.write("notes.txt", "x");
  ToolResult r = run({"-f", empty.path(), "-L"});
  EXPECT_EQ(r.status, 66);
  EXPECT_EQ(r.out, "");
  EXPECT_EQ(r.err, "brindlewick: --from path contained no Brindlewick trace files.\n");
  EXPECT_EQ(run({"-f", empty / "missing", "-L"}).status, 66);
}

}  // namespace
}  // namespace bw
