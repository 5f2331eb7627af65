#include "cli/Usage.h"

#include "base/Console.h"

namespace bw {

const char* const kUsageText =
    "usage: brindlewick [options] [command]\n"
    "\n"
    "OPTIONS:\n"
    "\n"
    "-f, --from <path>\n"
    "    Read stats files from the given path. This option is useful when analyzing\n"
    "    stats files contained in a crateshot(1) archive.\n"
    "\n"
    "-a, --all\n"
    "    Show all available statistics.\n"
    "\n"
    "-d, --day <YYYYMMDD>\n"
    "    Set the sample range to the given calendar day. The special values\n"
    "    \"today\", \"current\", or \"yesterday\" may be used.\n"
    "\n"
    "-s, --start <YYYY-MM-DD hh:mm:ss[ ZZZ]>\n"
    "-e, --end <YYYY-MM-DD hh:mm:ss[ ZZZ]>\n"
    "    Set the sample range to start/end at the specified time.\n"
    "\n"
    "-A, --ago <hh[:mm[:ss]]>\n"
    "    Set the sample range from the given time ago to the present. Times are in\n"
    "    hours, optionally with minutes, optionally with seconds.\n"
    "\n"
    "-b, --build <version>\n"
    "    Only read stats files from given system version (e.g. 13A500). The special\n"
    "    value \"current\" may be used in place of the system's current version.\n"
    "\n"
    "-B, --boot <UUID>\n"
    "    Only read stats files from the given boot, specified by UUID. The special\n"
    "    value \"current\" may be used in place of the system's current boot UUID.\n"
    "\n"
    "-0\n"
    "    Used in combination with the --list-files command. Separates file paths with\n"
    "    NUL characters instead of newlines. This option is useful with xargs(1).\n"
    "\n"
    "-J, --including-subjobs\n"
    "    Aggregate resource usage by per-application XPC services and child processes\n"
    "    with the parent process's resource usage.\n"
    "\n"
    "COMMANDS:\n"
    "\n"
    "--help\n"
    "    Show this summary of command-line options and usage.\n"
    "\n"
    "--dashboard\t(Default)\n"
    "    Show a selection of statistics about the system's power usage over the\n"
    "    sample range.\n"
    "\n"
    "-D, --dump\n"
    "    Dump all records from stats files in the sample range to standard output.\n"
    "\n"
    "-L, --list-files\n"
    "    Print the paths of all stats files in the local system store.\n";

void usage(int status) {
  err() << kUsageText;
  err().flush();
  exitWith(status);
}

}  // namespace bw
