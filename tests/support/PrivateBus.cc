#include "support/PrivateBus.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include "service/AnalysisService.h"
#include "service/BusCodec.h"

namespace bw::test {

bool PrivateBus::available() { return access("/usr/bin/dbus-daemon", X_OK) == 0; }

PrivateBus::PrivateBus(bool open) {
  chmod(dir_.path().c_str(), 0755);  // reachable for the clients that drop root
  const std::string socket = dir_ / "bus";
  // The later default policy of an open bus overrides the denials before it.
  const std::string policy = R"(
  <policy context="default">
    <allow user="*"/>
    <deny own="*"/>
    <deny send_type="method_call"/>
    <allow send_type="signal"/>
    <allow send_requested_reply="true" send_type="method_return"/>
    <allow send_requested_reply="true" send_type="error"/>
    <allow receive_type="method_call"/>
    <allow receive_type="method_return"/>
    <allow receive_type="error"/>
    <allow receive_type="signal"/>
    <allow send_destination="org.freedesktop.DBus" send_interface="org.freedesktop.DBus"/>
    <allow send_destination="org.freedesktop.DBus" send_interface="org.freedesktop.DBus.Introspectable"/>
  </policy>
  <policy user="root">
    <allow own="com.vexil.brindlewick.sampler"/>
  </policy>
  <include>)" + std::string(BRINDLEWICK_SOURCE_DIR) +
                             "/dist/com.vexil.brindlewick.analysis.conf</include>" +
                             (open ? R"(
  <policy context="default">
    <allow own="*"/>
    <allow send_type="method_call"/>
  </policy>)"
                                   : "");
  dir_.write("bus.conf", R"(<!DOCTYPE busconfig PUBLIC "-//freedesktop//DTD D-Bus Bus Configuration 1.0//EN"
 "http://www.freedesktop.org/standards/dbus/1.0/busconfig.dtd">
<busconfig>
  <listen>unix:path=)" + socket +
                             "</listen>\n  <auth>EXTERNAL</auth>" + policy + "\n</busconfig>\n");
  int fds[2];
  if (pipe(fds) != 0) throw std::runtime_error("pipe failed");
  daemon_ = fork();
  if (daemon_ == 0) {
    close(fds[0]);
    const std::string config = "--config-file=" + (dir_ / "bus.conf");
    const std::string print = "--print-address=" + std::to_string(fds[1]);
    execl("/usr/bin/dbus-daemon", "dbus-daemon", config.c_str(), "--nofork", "--nopidfile", print.c_str(),
          static_cast<char*>(nullptr));
    _exit(127);
  }
  close(fds[1]);
  std::string line;
  char c;
  while (read(fds[0], &c, 1) == 1 && c != '\n') line += c;
  close(fds[0]);
  if (line.empty()) throw std::runtime_error("dbus-daemon did not start");
  chmod(socket.c_str(), 0666);
  address_ = "unix:path=" + socket;
}

PrivateBus::~PrivateBus() {
  if (daemon_ > 0) {
    kill(daemon_, SIGTERM);
    waitpid(daemon_, nullptr, 0);
  }
}

sd_bus* PrivateBus::connect() const {
  sd_bus* bus = nullptr;
  if (sd_bus_new(&bus) < 0 || sd_bus_set_address(bus, address_.c_str()) < 0 || sd_bus_set_bus_client(bus, 1) < 0 ||
      sd_bus_start(bus) < 0)
    throw std::runtime_error("cannot connect to the private bus");
  return bus;
}

bool PrivateBus::waitForName(const char* name, pid_t child) const {
  sd_bus* bus = connect();
  bool found = false;
  while (!found) {
    sd_bus_error error = SD_BUS_ERROR_NULL;
    sd_bus_message* reply = nullptr;
    int has = 0;
    if (sd_bus_call_method(bus, "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus", "NameHasOwner",
                           &error, &reply, "s", name) >= 0)
      sd_bus_message_read(reply, "b", &has);
    sd_bus_message_unref(reply);
    sd_bus_error_free(&error);
    found = has != 0;
    if (!found) {
      if (child > 0 && waitpid(child, nullptr, WNOHANG) != 0) break;
      usleep(10000);
    }
  }
  sd_bus_flush_close_unref(bus);
  return found;
}

CallResult callRequest(sd_bus* bus, const MessageDictionary& request) {
  CallResult result;
  sd_bus_message* call = nullptr;
  sd_bus_message* reply = nullptr;
  sd_bus_error error = SD_BUS_ERROR_NULL;
  sd_bus_message_new_method_call(bus, &call, kAnalysisName, kAnalysisPath, kAnalysisInterface, "Request");
  appendDictionary(call, request);
  if (sd_bus_call(bus, call, 0, &error, &reply) < 0) {
    result.error = error.name ? error.name : "unknown";
  } else if (readDictionary(reply, result.reply) < 0) {
    result.error = "unreadable reply";
  }
  sd_bus_error_free(&error);
  sd_bus_message_unref(call);
  sd_bus_message_unref(reply);
  return result;
}

ServiceProcess::ServiceProcess(const PrivateBus& bus, const std::function<int()>& body, bool waitForName) {
  const std::string out = dir_ / "out", err = dir_ / "err";
  pid_ = fork();
  if (pid_ == 0) {
    setenv("DBUS_SYSTEM_BUS_ADDRESS", bus.address().c_str(), 1);
    unsetenv("DBUS_STARTER_BUS_TYPE");
    int o = open(out.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    int e = open(err.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    dup2(o, 1);
    dup2(e, 2);
    _exit(body());
  }
  running_ = true;
  if (waitForName) running_ = bus.waitForName(kAnalysisName, pid_);
  if (!running_) wait();
}

ServiceProcess::~ServiceProcess() {
  if (status_ < 0 && pid_ > 0) {
    kill(pid_, SIGTERM);
    waitpid(pid_, nullptr, 0);
  }
}

int ServiceProcess::wait() {
  if (status_ >= 0) return status_;
  int status = 0;
  waitpid(pid_, &status, 0);
  running_ = false;
  status_ = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  return status_;
}

std::string ServiceProcess::err() const {
  std::ifstream in(dir_ / "err");
  std::stringstream s;
  s << in.rdbuf();
  return s.str();
}

}  // namespace bw::test
