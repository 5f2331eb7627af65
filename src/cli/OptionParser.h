#pragma once
// Turns argv into `Options`: getopt_long over the option table, each value
// parsed and checked, then the steps that follow parsing (mode default,
// periodic-file cutoff, super-user test, daily-domain test).
//
// Usage errors print the usage text and throw `ProcessExit{64}`; the other
// refusals print their message and throw their exit status.
#include "cli/Options.h"

namespace bw {

Options parseOptions(int argc, char** argv);

// The pieces of parsing that have rules of their own, exposed for tests.
// Each returns false where the command line is a usage error.
bool parseDayArgument(const char* arg, Options& options);
bool parseAgoArgument(const char* arg, Options& options);
bool parseDebugRangeArgument(const char* arg, Options& options);
// -s / -e: milliseconds since 1970 of a lenient "yyyy-MM-dd HH:mm:SS" read in
// the process's time zone; 0 when nothing parses.
std::uint64_t parseDateTimeArgument(const char* arg);

}  // namespace bw
