#include "cli/OptionParser.h"

#include <getopt.h>
#include <strings.h>
#include <time.h>

#include <cerrno>
#include <climits>
#include <cstdlib>
#include <cstring>

#include <unicode/smpdtfmt.h>

#include "base/Console.h"
#include "base/Platform.h"
#include "cli/Usage.h"
#include "time/Calendar.h"

namespace bw {

namespace {

// Values of the long-only options, above any character.
enum LongOnly : int {
  kOptDebug = 256,
  kOptShowEvents,
  kOptDashboard,
  kOptShowBattery,
  kOptDaily,
  kOptXpc,
  kOptXpcDebug,
  kOptHelp,
};

const option kLongOptions[] = {
    {"all", no_argument, nullptr, 'a'},
    {"dump", no_argument, nullptr, 'D'},
    {"from", required_argument, nullptr, 'f'},
    {"day", required_argument, nullptr, 'd'},
    {"start-time", required_argument, nullptr, 's'},
    {"end-time", required_argument, nullptr, 'e'},
    {"ago", required_argument, nullptr, 'A'},
    {"list-files", no_argument, nullptr, 'L'},
    {"list-files-with-null", no_argument, nullptr, '0'},
    {"debug", no_argument, nullptr, kOptDebug},
    {"debug-range", required_argument, nullptr, 'R'},
    {"show-events", no_argument, nullptr, kOptShowEvents},
    {"dashboard", no_argument, nullptr, kOptDashboard},
    {"show-battery", no_argument, nullptr, kOptShowBattery},
    {"daily", no_argument, nullptr, kOptDaily},
    {"xpc", no_argument, nullptr, kOptXpc},
    {"xpc-debug", no_argument, nullptr, kOptXpcDebug},
    {"including-subjobs", no_argument, nullptr, 'J'},
    {"plugins", no_argument, nullptr, 'p'},
    {"use-pids", no_argument, nullptr, 'P'},
    {"build", required_argument, nullptr, 'b'},
    {"boot", required_argument, nullptr, 'B'},
    {"help", no_argument, nullptr, kOptHelp},
    {"debug-states", required_argument, nullptr, 'S'},
    {"exclude-post-install", no_argument, nullptr, 'I'},
    {nullptr, 0, nullptr, 0},
};

const char kShortOptions[] = "aDf:d:s:e:A:L0JB:b:R:pPS:I";

std::uint64_t nowMilliseconds() { return static_cast<std::uint64_t>(platform().nowMicroseconds() / 1000); }

// strtoul over exactly `len` characters starting at `s`; false unless the
// field is all digits (no sign, no blanks: "2024-1-1" would otherwise read
// back as itself through negative fields).
bool parseField(const char* s, std::size_t len, unsigned long& value) {
  for (std::size_t i = 0; i < len; ++i) {
    if (s[i] < '0' || s[i] > '9') return false;
  }
  char buf[8] = {};
  std::memcpy(buf, s, len);
  char* end = nullptr;
  value = std::strtoul(buf, &end, 10);
  return end == buf + len;
}

// The integer value of a text the way a lenient string-to-int reads it:
// leading blanks, an optional sign, digits up to the first other character,
// clamped to the 32-bit range; 0 when there are no digits.
long long intValue(const std::string& s) {
  std::size_t i = 0;
  while (i < s.size() && (s[i] == ' ' || s[i] == '\t' || s[i] == '\n')) ++i;
  bool negative = false;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) negative = s[i++] == '-';
  long long v = 0;
  for (; i < s.size() && s[i] >= '0' && s[i] <= '9'; ++i) {
    v = v * 10 + (s[i] - '0');
    if (v > INT_MAX) {
      v = negative ? static_cast<long long>(INT_MAX) + 1 : INT_MAX;
      break;
    }
  }
  return negative ? -v : v;
}

void launchdTest() {
  if (gDebug == 0 && platform().parentProcessId() != 1) {
    exitWithMessage(64, "This mode should only be invoked by launchd.");
  }
}

std::vector<std::string> splitAt(const std::string& s, char sep) {
  std::vector<std::string> parts;
  std::size_t start = 0;
  while (true) {
    std::size_t at = s.find(sep, start);
    if (at == std::string::npos) {
      parts.push_back(s.substr(start));
      return parts;
    }
    parts.push_back(s.substr(start, at - start));
    start = at + 1;
  }
}

}  // namespace

bool parseDayArgument(const char* arg, Options& options) {
  std::uint32_t year, month, day;
  if (std::strcmp(arg, "today") == 0 || std::strcmp(arg, "current") == 0 || std::strcmp(arg, "yesterday") == 0) {
    Date now{static_cast<double>(platform().nowMicroseconds() / 1000000)};
    if (std::strcmp(arg, "yesterday") == 0) now = dateOneDayEarlier(now);
    const YearMonthDay local = yearMonthDayFromDate(now);
    year = static_cast<std::uint32_t>(local.year);
    month = static_cast<std::uint32_t>(local.month);
    day = static_cast<std::uint32_t>(local.day);
  } else {
    if (std::strlen(arg) != 8) return false;
    unsigned long y, m, d;
    if (!parseField(arg + 6, 2, d) || !parseField(arg + 4, 2, m) || !parseField(arg, 4, y)) return false;
    year = static_cast<std::uint32_t>(y);
    month = static_cast<std::uint32_t>(m);
    day = static_cast<std::uint32_t>(d);
    // The fields must read back exactly as given.
    tm back{};
    back.tm_year = static_cast<int>(year - 1900u);
    back.tm_mon = static_cast<int>(month - 1u);
    back.tm_mday = static_cast<int>(day);
    char buf[9] = {};
    if (strftime(buf, sizeof buf, "%Y%m%d", &back) == 0) return false;
    if (std::strcmp(buf, arg) != 0) return false;
  }
  options.setDomain_type(kDomainDate);
  options.setDomain_ymd_year(year);
  options.setDomain_ymd_month(month);
  options.setDomain_ymd_day(day);
  return true;
}

std::uint64_t parseDateTimeArgument(const char* arg) {
  UErrorCode status = U_ZERO_ERROR;
  icu::SimpleDateFormat formatter(icu::UnicodeString("yyyy-MM-dd HH:mm:SS"), status);
  if (U_FAILURE(status)) return 0;
  formatter.setLenient(true);
  icu::ParsePosition position(0);
  UDate date = formatter.parse(icu::UnicodeString::fromUTF8(arg), position);
  if (position.getIndex() == 0) return 0;
  // Seconds since 1970 times 1000; dates before 1970 wrap as a signed value.
  double ms = (date / 1000.0) * 1000.0;
  if (ms >= 1.8446744073709552e19) return ~std::uint64_t{0};
  if (ms >= 0) return static_cast<std::uint64_t>(ms);
  if (ms <= -9.2233720368547758e18) return std::uint64_t{1} << 63;
  return static_cast<std::uint64_t>(static_cast<std::int64_t>(ms));
}

bool parseAgoArgument(const char* arg, Options& options) {
  std::vector<std::string> pieces = splitAt(arg, ':');
  long long total = 0;
  static const long long kScale[] = {3600, 60, 1};
  if (pieces.size() <= 3) {
    for (std::size_t i = 0; i < pieces.size(); ++i) total += intValue(pieces[i]) * kScale[i];
  }
  if (total == 0) return false;
  std::uint64_t end = nowMilliseconds();
  options.setDomain_end(end);
  options.setDomain_start(end - static_cast<std::uint64_t>(total) * 1000);
  options.setDomain_type(kDomainWallTime);
  return true;
}

bool parseDebugRangeArgument(const char* arg, Options& options) {
  char* end = nullptr;
  unsigned long start = std::strtoul(arg, &end, 10);
  if (*end != '.') return false;
  char* lengthEnd = nullptr;
  unsigned long length = std::strtoul(end + 1, &lengthEnd, 10);
  if (*lengthEnd != '\0') return false;
  options.setDomain_start(start);
  options.setDomain_end(start + length);
  options.setDomain_type(kDomainRelative);
  return true;
}

Options parseOptions(int argc, char** argv) {
  setenv("POSIXLY_CORRECT", "yes", 1);
  Options options;
  options.setDomain_end(~std::uint64_t{0});
  optind = 0;  // full reinitialisation, so parsing can run more than once

  // getopt names the program in its own complaints; call it by its name, not
  // by the path it was started with.
  std::vector<char*> args(argv, argv + argc);
  static char kProgramName[] = "brindlewick";
  if (!args.empty()) args[0] = kProgramName;
  args.push_back(nullptr);

  int c;
  while ((c = getopt_long(argc, args.data(), kShortOptions, kLongOptions, nullptr)) != -1) {
    switch (c) {
      case 'a':
        options.setShow_all(true);
        break;
      case 'D':
        options.setMode(kModeDump);
        break;
      case 'f':
        options.setFrom_path(std::string(optarg));
        break;
      case 'd':
        if (!parseDayArgument(optarg, options)) usage(64);
        break;
      case 's':
        options.setDomain_start(parseDateTimeArgument(optarg));
        options.setDomain_type(kDomainWallTime);
        break;
      case 'e':
        options.setDomain_end(parseDateTimeArgument(optarg));
        options.setDomain_type(kDomainWallTime);
        break;
      case 'A':
        if (!parseAgoArgument(optarg, options)) usage(64);
        break;
      case 'L':
        options.setMode(kModeListFiles);
        break;
      case '0':
        options.setListfileswithnull(true);
        break;
      case kOptDebug:
        gDebug = 1;
        break;
      case 'R':
        if (!parseDebugRangeArgument(optarg, options)) usage(64);
        break;
      case kOptShowEvents:
        options.setMode(kModeShowEvents);
        break;
      case kOptDashboard:
        options.setMode(kModeDashboard);
        break;
      case kOptShowBattery:
        options.setMode(kModeShowBattery);
        break;
      case kOptDaily:
        launchdTest();
        options.setMode(kModeDaily);
        break;
      case kOptXpc:
        launchdTest();
        options.setMode(kModeService);
        break;
      case kOptXpcDebug:
        options.setMode(kModeServiceDebug);
        break;
      case 'J':
        options.setIncludingSubjobs(true);
        break;
      case 'p':
      case 'P':
        exitWithError(64, format("The -%c option is no longer supported", c));
      case 'b':
        if (options.only_boot_uuid()) usage(64);
        if (strcasecmp(optarg, "current") == 0) {
          options.setOnly_system_version(platform().currentSystemVersion());
        } else {
          options.setOnly_system_version(std::string(optarg));
        }
        break;
      case 'B':
        if (options.only_system_version()) usage(64);
        if (strcasecmp(optarg, "current") == 0) {
          options.setOnly_boot_uuid(platform().currentBootUuid());
        } else {
          std::optional<Uuid> uuid = Uuid::parse(optarg);
          if (!uuid) usage(64);
          options.setOnly_boot_uuid(uuid);
        }
        break;
      case kOptHelp:
        usage(0);
      case 'S':
        options.setDomain_mask_states(splitAt(optarg, ','));
        break;
      case 'I':
        options.setExclude_post_install(true);
        break;
      default:
        usage(64);
    }
  }

  if (options.mode() == kModeNone) options.setMode(kModeDashboard);

  Date cutoff = Date::distantPast();
  if (options.domain_type() == kDomainWallTime) {
    cutoff = Date{static_cast<double>(options.domain_start() / 1000)};
    if (gDebug) err() << "Looking for launchd files modified since " << describeDate(cutoff) << "\n";
  }
  options.setLoad_periodic_files_newer_than(cutoff);

  if (!options.from_path() && platform().effectiveUserId() != 0) {
    exitWithMessage(77,
                    "When reading the local machine's Brindlewick records, this program must be invoked as the "
                    "super-user.");
  }
  if (options.mode() == kModeDaily && options.domain_type() != kDomainAll) {
    exitWithMessage(64, "--daily mode should not have a specified domain");
  }
  return options;
}

}  // namespace bw
