#pragma once
// Standard output and standard error as the program writes them. Tests that
// run code in-process swap in string streams; the process-wide debug flag
// (`--debug`) lives here too since it decides what goes to standard error.
#include <cstdarg>
#include <ostream>
#include <string>

namespace bw {

std::ostream& out();
std::ostream& err();
// Redirects the two streams (nullptr restores the process's own).
void setConsole(std::ostream* out, std::ostream* err);

// The process-wide debug flag, 0 or 1.
extern int gDebug;

// printf into a std::string.
std::string format(const char* fmt, ...) __attribute__((format(printf, 1, 2)));
std::string vformat(const char* fmt, va_list args);

// A request to end the process with a status: thrown so that in-process
// callers (tests, the service) can unwind; `main` turns it into exit().
struct ProcessExit {
  int status;
};

// "brindlewick: MESSAGE" on standard error, then exit with `status`.
[[noreturn]] void exitWithMessage(int status, const std::string& message);
// "brindlewick: MESSAGE: STRERROR(errno)" on standard error, then exit.
[[noreturn]] void exitWithError(int status, const std::string& message);
[[noreturn]] inline void exitWith(int status) { throw ProcessExit{status}; }

}  // namespace bw
