#pragma once
// The whole program behind `main`: parse, check, dispatch on the mode, and
// turn exits and escaped exceptions into the process's exit status.
namespace bw {

class Options;

// Runs the program and returns its exit status. Escaped exceptions print
// "brindlewick: *** uncaught exception NAME: REASON" and give 70.
int runMain(int argc, char** argv);

// Runs the mode chosen in `options` (after parsing).
void dispatch(const Options& options);

}  // namespace bw
