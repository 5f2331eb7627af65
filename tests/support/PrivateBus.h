#pragma once
// A private dbus-daemon for the bus tests. By default it has the system
// bus's default-deny rules, the analysis service's policy file from dist/,
// and root allowed to own the sampler's name; an open bus lets anyone own any
// name and send anything (for stand-ins of system services). Plus a client
// call of Request and a service process started against it.
#include <sys/types.h>
#include <systemd/sd-bus.h>

#include <functional>
#include <string>

#include "service/Message.h"
#include "support/TempDir.h"

namespace bw::test {

class PrivateBus {
 public:
  // Whether a dbus-daemon is installed (the tests skip without one).
  static bool available();

  explicit PrivateBus(bool open = false);
  ~PrivateBus();
  PrivateBus(const PrivateBus&) = delete;
  PrivateBus& operator=(const PrivateBus&) = delete;

  const std::string& address() const { return address_; }
  // A new client connection (the caller unrefs it).
  sd_bus* connect() const;
  // Waits until `name` has an owner; false when `child` exits first.
  bool waitForName(const char* name, pid_t child) const;

 private:
  TempDir dir_;
  std::string address_;
  pid_t daemon_ = -1;
};

struct CallResult {
  MessageDictionary reply;
  std::string error;  // the D-Bus error name when the call failed
};

// Calls Request(a{sv}) on the analysis service.
CallResult callRequest(sd_bus* bus, const MessageDictionary& request);

// A process serving the bus: forks, points DBUS_SYSTEM_BUS_ADDRESS at `bus`,
// sends standard output and error to files and runs `body` (its return
// value is the exit status). Waits for the service's name unless told not to.
class ServiceProcess {
 public:
  ServiceProcess(const PrivateBus& bus, const std::function<int()>& body, bool waitForName = true);
  ~ServiceProcess();
  bool running() const { return running_; }
  // Waits for the exit; the status, or 128 + signal.
  int wait();
  std::string err() const;

 private:
  TempDir dir_;
  pid_t pid_ = -1;
  bool running_ = false;
  int status_ = -1;
};

}  // namespace bw::test
