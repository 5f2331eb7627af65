// The real recorder killed while it writes, then started again.
#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "RecorderFixture.h"
#include "recorder/StatsFile.h"

namespace bw::test {
namespace {

std::size_t countFiles(const std::string& dir) {
  std::size_t n = 0;
  for (const auto& e : std::filesystem::directory_iterator(dir)) n += e.path().extension() == ".stats";
  return n;
}

// Starts the recorder and waits until it has begun its file.
pid_t startRecorder(const std::string& store) {
  const std::size_t before = countFiles(store);
  const pid_t pid = fork();
  if (pid == 0) {
    const int null = ::open("/dev/null", O_WRONLY);
    dup2(null, STDERR_FILENO);
    // A fast cadence and frequent rotation keep it writing all the time.
    execl(BRINDLEWICK_RECORDER_BINARY, "brindlewick-recorder", "--store", store.c_str(), "--interval", "0.002",
          "--process-every", "2", "--rotate", "0.5", "--no-bus", static_cast<char*>(nullptr));
    _exit(127);
  }
  for (int wait = 0; wait < 5000 && countFiles(store) == before; ++wait) ::usleep(1000);
  return pid;
}

// Killed while writing, the recorder leaves at most one torn record; the
// next start cuts it before writing again. Where a tail may tear and what is
// cut is StatsLogTest's, and so is each record being one write.
TEST(RecorderCrash, TheNextStartCutsWhatAKillTore) {
  TempDir store;
  const pid_t killed = startRecorder(store.path());
  ASSERT_GT(killed, 0);
  ::usleep(20000);
  ::kill(killed, SIGKILL);
  ::waitpid(killed, nullptr, 0);
  std::string path;
  for (const auto& e : std::filesystem::directory_iterator(store.path())) {
    if (e.path().extension() == ".stats") path = e.path().string();
  }
  ASSERT_FALSE(path.empty());
  std::ofstream(path, std::ios::app | std::ios::binary) << std::string("\x5a\x10\x08", 3);  // a record cut short
  const pid_t next = startRecorder(store.path());
  ::kill(next, SIGTERM);
  int status = 0;
  ::waitpid(next, &status, 0);
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
  EXPECT_FALSE(readStatsFile(path, StoreQuery{}).damaged);
  EXPECT_EQ(recorder::trimTornTail(path).trimmedBytes, 0u);
}

}  // namespace
}  // namespace bw::test
