#pragma once
// Runs the real `brindlewick` binary (or a companion tool) as a child
// process and captures what it prints.
#include <map>
#include <string>
#include <vector>

namespace bw::test {

struct ToolResult {
  std::string out;
  std::string err;
  int status = -1;  // exit status, or 128 + signal
};

struct RunSettings {
  std::map<std::string, std::string> env;  // added to (or replacing in) the environment
  bool asUnprivilegedUser = false;         // drop to uid/gid 65534 when running as root
  // Standard error on a pseudo-terminal (raw, so its bytes arrive unchanged)
  // instead of a file; standard output stays a file either way.
  bool stderrOnTerminal = false;
};

ToolResult runBinary(const std::string& binary, const std::vector<std::string>& args, const RunSettings& settings = {});
ToolResult runTool(const std::vector<std::string>& args, const RunSettings& settings = {});

// The usage text with the standard error of getopt's own complaint before it.
std::string usageText();

}  // namespace bw::test
