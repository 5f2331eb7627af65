#include "store/AtomicFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <vector>

namespace bw {
namespace {

bool writeAll(int fd, const std::string& bytes) {
  std::size_t done = 0;
  while (done < bytes.size()) {
    const ssize_t n = ::write(fd, bytes.data() + done, bytes.size() - done);
    if (n < 0) {
      if (errno == EINTR) continue;
      return false;
    }
    done += static_cast<std::size_t>(n);
  }
  return true;
}

std::string directoryOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) return ".";
  if (slash == 0) return "/";
  return path.substr(0, slash);
}

// A fresh temporary name beside `path` (the file is created empty).
std::string newTemporaryName(const std::string& path, int* fd) {
  std::string name = path + ".XXXXXX";
  std::vector<char> buffer(name.begin(), name.end());
  buffer.push_back('\0');
  *fd = ::mkstemp(buffer.data());
  return buffer.data();
}

// Writes and flushes the bytes into a file that gets a name only once it is
// complete: an unnamed file in the directory, linked under a temporary name
// at the end, so that a writer killed while writing leaves nothing behind.
// Where the file system has no unnamed files, a named temporary file.
bool writeTemporary(const std::string& path, const std::string& bytes, std::string* temp) {
  int fd = ::open(directoryOf(path).c_str(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0644);
  const bool unnamed = fd >= 0;
  if (!unnamed) {
    *temp = newTemporaryName(path, &fd);
    if (fd < 0) return false;
  }
  bool ok = ::fchmod(fd, 0644) == 0 && writeAll(fd, bytes) && ::fsync(fd) == 0;
  if (ok && unnamed) {
    // linkat cannot replace a name: link under a fresh name (made and freed
    // by mkstemp), then rename that over the target.
    int placeholder = -1;
    *temp = newTemporaryName(path, &placeholder);
    ok = placeholder >= 0 && ::close(placeholder) == 0 && ::unlink(temp->c_str()) == 0;
    const std::string self = "/proc/self/fd/" + std::to_string(fd);
    ok = ok && ::linkat(AT_FDCWD, self.c_str(), AT_FDCWD, temp->c_str(), AT_SYMLINK_FOLLOW) == 0;
  }
  const int saved = errno;
  if (::close(fd) != 0 && ok) return false;
  errno = saved;
  return ok;
}

}  // namespace

bool writeFileAtomically(const std::string& path, const std::string& bytes) {
  std::string temp;
  bool ok = writeTemporary(path, bytes, &temp) && ::rename(temp.c_str(), path.c_str()) == 0;
  if (!ok) {
    const int saved = errno;
    if (!temp.empty()) ::unlink(temp.c_str());
    errno = saved;
    return false;
  }
  const int dir = ::open(directoryOf(path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (dir < 0) return false;
  ok = ::fsync(dir) == 0;
  const int saved = errno;
  ::close(dir);
  errno = saved;
  return ok;
}

}  // namespace bw
