#include "base/Terminal.h"

#include <unistd.h>

#include "base/Console.h"

namespace bw {

namespace {
std::optional<bool> gForced;
bool gTransientShowing = false;
}  // namespace

bool errIsTerminal() {
  if (gForced) return *gForced;
  static const bool terminal = isatty(STDERR_FILENO) == 1;
  return terminal;
}

void setErrIsTerminal(std::optional<bool> forced) { gForced = forced; }

void clearTransientLine() {
  if (!gTransientShowing) return;
  gTransientShowing = false;
  err() << "\r\033[K";
  err().flush();
}

void showTransientLine(const std::string& line) {
  if (!errIsTerminal()) return;
  err() << "\r" << line << "\033[K";
  err().flush();
  gTransientShowing = true;
}

void terminalNote(const std::string& text) {
  if (!errIsTerminal()) return;
  clearTransientLine();
  err() << "brindlewick: " << text << "\n";
  err().flush();
}

}  // namespace bw
