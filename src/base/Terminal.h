#pragma once
// Notes for a person watching standard error at a terminal: the system log's
// echo, the reading progress, the damage summary, why nothing was printed.
// None of them is written to a pipe or a file, so scripts see exactly what
// they saw before; standard output never carries them.
//
// One transient line (the progress) may stand at the bottom of the terminal;
// every note first erases it, so notes and progress never run together.
#include <optional>
#include <string>

namespace bw {

// Whether standard error is a terminal (isatty), unless a test forced it.
bool errIsTerminal();
// Forces the answer for in-process tests (none: ask the file descriptor).
void setErrIsTerminal(std::optional<bool> forced);

// "brindlewick: TEXT" and a newline on err(), only when it is a terminal.
void terminalNote(const std::string& text);

// Shows `line` in place of the current transient line (carriage return, the
// line, erase to the end of the line), only when err() is a terminal.
void showTransientLine(const std::string& line);
// Erases the transient line, if one is showing.
void clearTransientLine();

}  // namespace bw
