// How long `--from DIR -L` takes over a tree of 100,000 stats files: the
// file-list scan in-process, and the whole tool as a child process.
#include <benchmark/benchmark.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "store/StatsFileList.h"

namespace {

constexpr int kFiles = 100000;
constexpr int kPerDirectory = 500;

// Builds the tree once per process: 200 directories of 500 files, a tenth of
// them periodic, plus some files that do not match.
const std::string& tree() {
  static std::string root = [] {
    char pattern[] = "/tmp/brindlewick-bench-XXXXXX";
    std::string dir = mkdtemp(pattern);
    for (int i = 0; i < kFiles; ++i) {
      std::string sub = dir + "/boot" + std::to_string(i / kPerDirectory);
      if (i % kPerDirectory == 0) std::filesystem::create_directories(sub);
      std::string name = std::to_string(i) + (i % 10 == 0 ? ".periodic.stats" : ".stats");
      std::ofstream(sub + "/" + name).put('x');
      if (i % 100 == 0) std::ofstream(sub + "/" + std::to_string(i) + ".stats.bak").put('x');
    }
    std::atexit([] { std::filesystem::remove_all(root); });
    return dir;
  }();
  return root;
}

void BM_FileListFromTree(benchmark::State& state) {
  const bw::StoreQuery query{.fromPath = tree(), .periodicCutoff = bw::Date::distantPast()};
  std::size_t found = 0;
  for (auto _ : state) {
    found = bw::statsFileList(query).size();
    benchmark::DoNotOptimize(found);
  }
  state.counters["files"] = static_cast<double>(found);
  state.SetItemsProcessed(state.iterations() * static_cast<std::int64_t>(found));
}
BENCHMARK(BM_FileListFromTree)->Unit(benchmark::kMillisecond);

void BM_ListFilesCommand(benchmark::State& state) {
  const std::string& dir = tree();
  for (auto _ : state) {
    pid_t pid = fork();
    if (pid == 0) {
      std::freopen("/dev/null", "w", stdout);
      execl(BRINDLEWICK_BINARY, "brindlewick", "--from", dir.c_str(), "-L", static_cast<char*>(nullptr));
      _exit(127);
    }
    int status = 0;
    waitpid(pid, &status, 0);
    if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) state.SkipWithError("brindlewick -L failed");
  }
}
BENCHMARK(BM_ListFilesCommand)->Unit(benchmark::kMillisecond);

}  // namespace

BENCHMARK_MAIN();
