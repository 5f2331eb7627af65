#pragma once
// The benchmarks' store: the sample-store generator's 30-day preset, made
// once per machine under /tmp and reused.
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>

namespace bw::bench {

inline const std::string& largeStore() {
  static const std::string path = [] {
    const std::string dir = "/tmp/brindlewick-large-store";
    struct stat st {};
    if (stat((dir + "/.complete").c_str(), &st) == 0) return dir;
    // Generate beside it and move into place, so concurrent runs never see half a store.
    const std::string scratch = dir + ".tmp-" + std::to_string(getpid());
    const std::string command = std::string(BRINDLEWICK_TOOLS_DIR) +
                                "/samplestore/brindlewick-samplestore --quiet --preset large --output " + scratch;
    if (std::system(command.c_str()) != 0) throw std::runtime_error("cannot generate " + dir);
    std::FILE* mark = std::fopen((scratch + "/.complete").c_str(), "w");
    if (mark) std::fclose(mark);
    if (rename(scratch.c_str(), dir.c_str()) != 0) {
      // Another run got there first.
      if (std::system(("rm -rf " + scratch).c_str()) != 0) std::perror("rm");
    }
    return dir;
  }();
  return path;
}

// Runs the tool with `args`, standard output to /dev/null; returns the
// child's peak resident size in kilobytes, or -1 when it failed.
inline long runToolQuietly(const char* const* args) {
  pid_t pid = fork();
  if (pid == 0) {
    if (!std::freopen("/dev/null", "w", stdout)) _exit(126);
    execv(BRINDLEWICK_BINARY, const_cast<char* const*>(args));
    _exit(127);
  }
  int status = 0;
  rusage usage{};
  wait4(pid, &status, 0, &usage);
  if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) return -1;
  return usage.ru_maxrss;
}

}  // namespace bw::bench
