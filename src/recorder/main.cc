// brindlewick-recorder: samples the running machine and writes its stats
// files into the local store. See Recorder.h for what is written and when.
#include <getopt.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/timerfd.h>
#include <systemd/sd-event.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>

#include "recorder/BootIdentity.h"
#include "recorder/BusLink.h"
#include "recorder/Clock.h"
#include "recorder/Recorder.h"
#include "recorder/StatsLog.h"

namespace {

using namespace bw::recorder;

struct Settings {
  std::string store = "/var/db/brindlewick";
  std::string root;
  double intervalSeconds = 60;
  double rotateSeconds = 3600;
  unsigned processEvery = 5;
  bool bus = true;
};

void usage(std::FILE* out) {
  std::fprintf(out,
               "usage: brindlewick-recorder [--store DIR] [--interval SECONDS] [--process-every N]\n"
               "                            [--rotate SECONDS] [--root DIR] [--no-bus]\n"
               "  --store DIR          where the stats files go (default /var/db/brindlewick)\n"
               "  --interval SECONDS   sampling cadence (default 60)\n"
               "  --process-every N    sample all processes every N intervals (default 5)\n"
               "  --rotate SECONDS     begin a new file this often (default 3600)\n"
               "  --root DIR           read /sys and /proc under DIR (for tests)\n"
               "  --no-bus             don't use the system bus\n");
}

bool positive(const char* text, double& out) {
  char* end = nullptr;
  out = std::strtod(text, &end);
  return end && *end == '\0' && out > 0;
}

struct Loop {
  StatsLog* log;
  Recorder* recorder;
  BusLink* bus;
  std::uint64_t intervalUs;
  int clockFd;
};

void armMidnight(int fd, const Clock& clock) {
  itimerspec timer{};
  const std::uint64_t midnight = nextLocalMidnight(clock.wallMs());
  timer.it_value.tv_sec = static_cast<time_t>(midnight / 1000);
  timerfd_settime(fd, TFD_TIMER_ABSTIME | TFD_TIMER_CANCEL_ON_SET, &timer, nullptr);
}

int onTick(sd_event_source* source, std::uint64_t, void* data) {
  auto* loop = static_cast<Loop*>(data);
  loop->recorder->tick();
  if (loop->bus) loop->bus->checkIdle();
  // The next tick counts from this one's due time, so the cadence doesn't drift.
  std::uint64_t due = 0;
  sd_event_source_get_time(source, &due);
  std::uint64_t now = 0;
  sd_event_now(sd_event_source_get_event(source), CLOCK_MONOTONIC, &now);
  // A tick that overran is not made up for.
  sd_event_source_set_time(source, std::max(due + loop->intervalUs, now));
  sd_event_source_set_enabled(source, SD_EVENT_ONESHOT);
  return 0;
}

// Local midnight, or the clock was set: the log compares and writes.
int onClock(sd_event_source*, int fd, std::uint32_t, void* data) {
  auto* loop = static_cast<Loop*>(data);
  std::uint64_t expirations;
  (void)!::read(fd, &expirations, sizeof expirations);  // ECANCELED when the clock was set
  loop->log->checkClock();
  SystemClock clock;
  armMidnight(fd, clock);
  return 0;
}

int onTerminate(sd_event_source* source, const signalfd_siginfo*, void* data) {
  static_cast<Loop*>(data)->recorder->flush();
  return sd_event_exit(sd_event_source_get_event(source), 0);
}

}  // namespace

int main(int argc, char** argv) {
  Settings settings;
  static const option options[] = {{"store", required_argument, nullptr, 's'},
                                   {"interval", required_argument, nullptr, 'i'},
                                   {"process-every", required_argument, nullptr, 'p'},
                                   {"rotate", required_argument, nullptr, 'r'},
                                   {"root", required_argument, nullptr, 'R'},
                                   {"no-bus", no_argument, nullptr, 'n'},
                                   {"help", no_argument, nullptr, 'h'},
                                   {nullptr, 0, nullptr, 0}};
  for (int c; (c = getopt_long(argc, argv, "h", options, nullptr)) != -1;) {
    double value = 0;
    switch (c) {
      case 's':
        settings.store = optarg;
        break;
      case 'R':
        settings.root = optarg;
        break;
      case 'n':
        settings.bus = false;
        break;
      case 'i':
      case 'r':
        if (!positive(optarg, value)) {
          std::fprintf(stderr, "brindlewick-recorder: not a positive number of seconds: %s\n", optarg);
          return 64;
        }
        (c == 'i' ? settings.intervalSeconds : settings.rotateSeconds) = value;
        break;
      case 'p':
        if (!positive(optarg, value) || value != static_cast<unsigned>(value)) {
          std::fprintf(stderr, "brindlewick-recorder: not a positive whole number: %s\n", optarg);
          return 64;
        }
        settings.processEvery = static_cast<unsigned>(value);
        break;
      case 'h':
        usage(stdout);
        return 0;
      default:
        usage(stderr);
        return 64;
    }
  }
  if (optind != argc) {
    usage(stderr);
    return 64;
  }

  // Termination is handled by the loop, also when it comes during start-up.
  sigset_t mask;
  sigemptyset(&mask);
  sigaddset(&mask, SIGTERM);
  sigaddset(&mask, SIGINT);
  sigprocmask(SIG_BLOCK, &mask, nullptr);

  ::mkdir(settings.store.c_str(), 0755);
  const MachineFiles machine(settings.root);
  const auto boot = loadBootIdentity(machine, settings.store + "/recorder.state");
  if (!boot) {
    std::fprintf(stderr, "brindlewick-recorder: cannot read the boot's UUID\n");
    return 69;
  }
  SystemClock clock;
  StatsLog log(settings.store, *boot, clock, static_cast<std::uint64_t>(settings.rotateSeconds * 1000));
  const RepairSummary repaired = log.repairBootFiles();
  std::fprintf(stderr, "brindlewick-recorder: boot %s, %llu earlier file(s), %llu torn tail(s) cut (%llu bytes)\n",
               boot->boot.string().c_str(), static_cast<unsigned long long>(repaired.files),
               static_cast<unsigned long long>(repaired.tornFiles),
               static_cast<unsigned long long>(repaired.trimmedBytes));
  if (!log.start()) {
    std::fprintf(stderr, "brindlewick-recorder: cannot create a stats file in %s: %s\n", settings.store.c_str(),
                 std::strerror(errno));
    return 73;
  }

  Recorder recorder(machine, clock, log, settings.processEvery);
  sd_event* event = nullptr;
  sd_event_default(&event);

  Loop loop{&log, &recorder, nullptr, static_cast<std::uint64_t>(settings.intervalSeconds * 1e6), -1};
  sd_event_add_signal(event, nullptr, SIGTERM, onTerminate, &loop);
  sd_event_add_signal(event, nullptr, SIGINT, onTerminate, &loop);
  std::unique_ptr<BusLink> bus;
  if (settings.bus) bus = BusLink::connect(event, recorder);
  loop.bus = bus.get();

  recorder.begin();
  sd_event_add_time_relative(event, nullptr, CLOCK_MONOTONIC, loop.intervalUs, loop.intervalUs / 100, onTick, &loop);
  loop.clockFd = timerfd_create(CLOCK_REALTIME, TFD_CLOEXEC | TFD_NONBLOCK);
  armMidnight(loop.clockFd, clock);
  sd_event_add_io(event, nullptr, loop.clockFd, EPOLLIN, onClock, &loop);

  const int r = sd_event_loop(event);
  recorder.flush();
  std::string counts;
  for (const auto& [name, n] : recorder.written()) counts += " " + name + "=" + std::to_string(n);
  std::fprintf(stderr, "brindlewick-recorder: stopping; records written:%s\n", counts.c_str());
  bus.reset();
  sd_event_unref(event);
  return r < 0 ? 1 : 0;
}
