#pragma once
// Standard output and error captured, and the debug flag set, while alive.
#include <sstream>

#include "base/Console.h"

namespace bw::test {

class ConsoleCapture {
 public:
  explicit ConsoleCapture(int debug = 1) {
    gDebug = debug;
    setConsole(&out, &err);
  }
  ~ConsoleCapture() {
    gDebug = 0;
    setConsole(nullptr, nullptr);
  }
  ConsoleCapture(const ConsoleCapture&) = delete;
  ConsoleCapture& operator=(const ConsoleCapture&) = delete;

  std::ostringstream out, err;
};

}  // namespace bw::test
