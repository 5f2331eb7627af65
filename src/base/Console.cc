#include "base/Console.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <iostream>
#include <vector>

namespace bw {

int gDebug = 0;

namespace {
std::ostream* gOut = nullptr;
std::ostream* gErr = nullptr;
}  // namespace

std::ostream& out() { return gOut ? *gOut : std::cout; }
std::ostream& err() { return gErr ? *gErr : std::cerr; }

void setConsole(std::ostream* o, std::ostream* e) {
  gOut = o;
  gErr = e;
}

std::string vformat(const char* fmt, va_list args) {
  va_list copy;
  va_copy(copy, args);
  char small[256];
  int n = std::vsnprintf(small, sizeof small, fmt, copy);
  va_end(copy);
  if (n < 0) return {};
  if (static_cast<std::size_t>(n) < sizeof small) return std::string(small, static_cast<std::size_t>(n));
  std::vector<char> big(static_cast<std::size_t>(n) + 1);
  std::vsnprintf(big.data(), big.size(), fmt, args);
  return std::string(big.data(), static_cast<std::size_t>(n));
}

std::string format(const char* fmt, ...) {
  va_list args;
  va_start(args, fmt);
  std::string s = vformat(fmt, args);
  va_end(args);
  return s;
}

void exitWithMessage(int status, const std::string& message) {
  err() << "brindlewick: " << message << "\n";
  err().flush();
  throw ProcessExit{status};
}

void exitWithError(int status, const std::string& message) {
  int saved = errno;
  err() << "brindlewick: " << message << ": " << std::strerror(saved) << "\n";
  err().flush();
  throw ProcessExit{status};
}

}  // namespace bw
