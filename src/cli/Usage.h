#pragma once
// The usage text, printed on standard error for --help and usage errors.
namespace bw {

extern const char* const kUsageText;

// Prints the usage text and exits with `status` (64 for usage errors, 0 for
// --help).
[[noreturn]] void usage(int status);

}  // namespace bw
