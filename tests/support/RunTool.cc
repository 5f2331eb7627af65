#include "support/RunTool.h"

#include <fcntl.h>
#include <pty.h>
#include <sys/wait.h>
#include <termios.h>
#include <unistd.h>

#include <cerrno>

#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include "cli/Usage.h"

namespace bw::test {

namespace {

std::string slurp(int fd) {
  std::string data;
  char buf[65536];
  ssize_t n;
  while ((n = read(fd, buf, sizeof buf)) > 0) data.append(buf, static_cast<std::size_t>(n));
  return data;
}

// Everything written to the terminal until its last writer closes it (the
// master then reads EIO).
std::string drainTerminal(int master) {
  std::string data;
  char buf[4096];
  while (true) {
    ssize_t n = read(master, buf, sizeof buf);
    if (n > 0) {
      data.append(buf, static_cast<std::size_t>(n));
    } else if (n < 0 && errno == EINTR) {
      continue;
    } else {
      return data;
    }
  }
}

}  // namespace

ToolResult runBinary(const std::string& binary, const std::vector<std::string>& args, const RunSettings& settings) {
  char outPath[] = "/tmp/brindlewick-out-XXXXXX";
  char errPath[] = "/tmp/brindlewick-err-XXXXXX";
  int outFd = mkstemp(outPath);
  int errFd = mkstemp(errPath);
  if (outFd < 0 || errFd < 0) throw std::runtime_error("mkstemp failed");
  unlink(outPath);
  unlink(errPath);
  int master = -1, slave = -1;
  if (settings.stderrOnTerminal) {
    termios raw{};
    cfmakeraw(&raw);
    if (openpty(&master, &slave, nullptr, &raw, nullptr) != 0) throw std::runtime_error("openpty failed");
  }

  pid_t pid = fork();
  if (pid < 0) throw std::runtime_error("fork failed");
  if (pid == 0) {
    dup2(outFd, 1);
    dup2(settings.stderrOnTerminal ? slave : errFd, 2);
    if (settings.stderrOnTerminal) {
      close(master);
      close(slave);
    }
    int devNull = open("/dev/null", O_RDONLY);
    dup2(devNull, 0);
    for (const auto& [key, value] : settings.env) setenv(key.c_str(), value.c_str(), 1);
    if (settings.asUnprivilegedUser && geteuid() == 0) {
      if (setgid(65534) != 0 || setuid(65534) != 0) _exit(126);
    }
    std::vector<char*> argv;
    argv.push_back(const_cast<char*>(binary.c_str()));
    for (const std::string& a : args) argv.push_back(const_cast<char*>(a.c_str()));
    argv.push_back(nullptr);
    execv(binary.c_str(), argv.data());
    _exit(127);
  }
  ToolResult result;
  if (settings.stderrOnTerminal) {
    close(slave);
    result.err = drainTerminal(master);
    close(master);
  }
  int status = 0;
  waitpid(pid, &status, 0);
  lseek(outFd, 0, SEEK_SET);
  lseek(errFd, 0, SEEK_SET);
  result.out = slurp(outFd);
  if (!settings.stderrOnTerminal) result.err = slurp(errFd);
  close(outFd);
  close(errFd);
  result.status = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  return result;
}

ToolResult runTool(const std::vector<std::string>& args, const RunSettings& settings) {
  return runBinary(BRINDLEWICK_BINARY, args, settings);
}

std::string usageText() { return kUsageText; }

}  // namespace bw::test
