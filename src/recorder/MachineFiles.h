#pragma once
// Small readers of the kernel's text files under a root prefix: "" on the
// machine, a fixture tree in tests ("<tree>/sys/...", "<tree>/proc/...").
// Every reader answers "nothing" for a file the machine lacks; none throws.
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace bw::recorder {

class MachineFiles {
 public:
  explicit MachineFiles(std::string root = "") : root_(std::move(root)) {}

  const std::string& root() const { return root_; }
  // The root joined with an absolute machine path ("/sys/class/...").
  std::string path(const std::string& machinePath) const { return root_ + machinePath; }

  // The whole file; none when it can't be read.
  std::optional<std::string> text(const std::string& machinePath) const;
  // The file's first line without its newline.
  std::optional<std::string> line(const std::string& machinePath) const;
  // The file's first token as an unsigned / signed decimal number.
  std::optional<std::uint64_t> number(const std::string& machinePath) const;
  std::optional<std::int64_t> signedNumber(const std::string& machinePath) const;
  // The names in a directory, sorted, without "." and ".."; empty when absent.
  std::vector<std::string> list(const std::string& machinePath) const;
  bool exists(const std::string& machinePath) const;
  // The target of a symbolic link; none when it is not one.
  std::optional<std::string> link(const std::string& machinePath) const;

 private:
  std::string root_;
};

// The text's lines, without their newlines.
std::vector<std::string> splitLines(const std::string& text);
// The line's blank-separated words.
std::vector<std::string> splitWords(const std::string& line);
// A decimal number, or none when `word` is not one.
std::optional<std::uint64_t> parseNumber(const std::string& word);

}  // namespace bw::recorder
