// The recorder killed with SIGKILL at random moments while it writes, 200
// times: every file stays readable by the project's reader, and each restart
// cuts at most the one record a kill tore.
#include <fcntl.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <map>
#include <random>

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

// 200 kills; the sanitizer build, where every start takes a second, asks for fewer.
int killCount() {
  const char* wanted = std::getenv("BRINDLEWICK_RECORDER_KILLS");
  return wanted && std::atoi(wanted) > 0 ? std::atoi(wanted) : 200;
}

TEST(RecorderCrash, SigkillWhileWritingLosesAtMostTheLastRecord) {
  const int rounds = killCount();
  TempDir store;
  TempDir scratch;
  std::mt19937 random(18);
  std::uniform_int_distribution<int> delayUs(0, 40000);
  std::map<std::string, std::uint64_t> whole;  // each file's whole records, counted on a repaired copy
  int kills = 0;
  for (int i = 0; i < rounds; ++i) {
    const pid_t pid = startRecorder(store.path());
    ASSERT_GT(pid, 0);
    // Kill it anywhere in what it writes next.
    ::usleep(static_cast<useconds_t>(delayUs(random)));
    ::kill(pid, SIGKILL);
    int status = 0;
    ::waitpid(pid, &status, 0);
    kills += WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL;
    for (const auto& e : std::filesystem::directory_iterator(store.path())) {
      if (e.path().extension() != ".stats") continue;
      std::filesystem::copy_file(e.path(), scratch / "copy.stats", std::filesystem::copy_options::overwrite_existing);
      whole[e.path().string()] = recorder::trimTornTail(scratch / "copy.stats").records;
    }
  }
  // One last start repairs what the last kill left, and stops cleanly.
  const pid_t last = startRecorder(store.path());
  ::kill(last, SIGTERM);
  int status = 0;
  ::waitpid(last, &status, 0);
  EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);

  for (const auto& [path, count] : whole) {
    SCOPED_TRACE(path);
    const FileRecords read = readStatsFile(path, StoreQuery{});
    EXPECT_FALSE(read.damaged);
    EXPECT_EQ(read.records.size(), count);                     // every whole record survived its repair
    EXPECT_EQ(recorder::trimTornTail(path).trimmedBytes, 0u);  // nothing torn is left
  }
  EXPECT_EQ(kills, rounds);
  EXPECT_GE(whole.size(), static_cast<std::size_t>(rounds));  // a new file at every start
}

}  // namespace
}  // namespace bw::test
