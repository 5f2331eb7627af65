#include "base/Exception.h"

#include <cstdio>
#include <cstdlib>

namespace bw {

Exception::Exception(std::string name, std::string reason, UserInfo userInfo)
    : std::runtime_error(reason), name_(std::move(name)), reason_(std::move(reason)), userInfo_(std::move(userInfo)) {}

void terminateUnsupported(const char* what) {
  std::fprintf(stderr, "brindlewick: unsupported operation: %s\n", what);
  std::abort();
}

}  // namespace bw
