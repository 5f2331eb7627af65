#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <random>
#include <thread>

#include "base/Console.h"
#include "cli/ReportState.h"
#include "store/AtomicFile.h"
#include "store/PropertyListReader.h"
#include "support/FakePlatform.h"
#include "support/MachineFixture.h"
#include "support/TempDir.h"

namespace bw {
namespace {

class ReportState : public test::MachineFixture {};

TEST_F(ReportState, ValuesOfTheWrongTypeCountAsAbsentAndOtherKeysAreKept) {
  EXPECT_FALSE(copyLastReportYMD());
  EXPECT_FALSE(copyLastReportBuild());
  ASSERT_TRUE(writePropertyListFile(
      stateFilePath(),
      Value(Dictionary{{"LastReportDate", "yesterday"}, {"LastReportBuild", 7}, {"Keep", Array{1, 2}}})));
  EXPECT_FALSE(copyLastReportYMD());
  EXPECT_FALSE(copyLastReportBuild());
  saveLastReportYMD({2024, 2, 29});
  saveLastReportBuild("B2");
  saveLastReportBuild(std::nullopt);  // none sets nothing
  EXPECT_EQ(copyLastReportYMD(), (YearMonthDay{2024, 2, 29}));
  EXPECT_EQ(copyLastReportBuild(), "B2");
  EXPECT_EQ(readPropertyList(stateFilePath())->get<Dictionary>().at("Keep"), Value(Array{1, 2}));
}

// A child rewrites the file in a loop, alternating two contents, and is
// killed at a random moment; the file must always hold one of them whole.
TEST_F(ReportState, AKilledWriterLeavesTheOldOrTheNewFile) {
  const std::string path = stateFilePath();
  const Value first(Dictionary{{"LastReportBuild", "A1"}, {"Pad", std::string(4000, 'a')}});
  const Value second(Dictionary{{"LastReportBuild", "B2"}, {"Pad", std::string(9000, 'b')}});
  ASSERT_TRUE(writePropertyListFile(path, first));
  std::mt19937 random(20240101);
  std::uniform_int_distribution<int> delay(0, 3000);
  for (int i = 0; i < 200; ++i) {
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
      for (int n = 0;; ++n) writePropertyListFile(path, n % 2 ? first : second);
    }
    std::this_thread::sleep_for(std::chrono::microseconds(delay(random)));
    ASSERT_EQ(kill(child, SIGKILL), 0);
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL);
    const std::optional<Value> read = readPropertyList(path);
    ASSERT_TRUE(read) << "kill " << i;
    ASSERT_TRUE(*read == first || *read == second) << "kill " << i;
  }
}

}  // namespace
}  // namespace bw
