#pragma once
// Asking the process sampler (the recorder, owner of
// "com.vexil.brindlewick.sampler") for a fresh sample before a job report:
// the service emits SampleProcessesNow on its interface and waits for
// SampleProcessesDone from the sampler's owner. With no owner it does not
// wait; a sampler that does not answer in time (or leaves the bus) is given
// up on, and the report goes on with the records at hand.
#include <systemd/sd-bus.h>

#include <chrono>

namespace bw {

class SamplerPair {
 public:
  enum class Outcome { Answered, NoSampler, TimedOut, SamplerLeft };

  static constexpr const char* kSamplerName = "com.vexil.brindlewick.sampler";
  static constexpr std::chrono::milliseconds kDefaultTimeout{30000};

  // Emits on `serviceBus` (the connection that owns the service's name) and
  // waits on `waitBus`, a second connection to the same bus that only this
  // uses, so that no other request is dispatched while waiting. Neither
  // connection is owned.
  SamplerPair(sd_bus* serviceBus, sd_bus* waitBus, std::chrono::milliseconds timeout = kDefaultTimeout);

  // Emits the request and waits as above. The first time the sampler does
  // not answer in time, one line goes to the system log.
  Outcome sampleProcesses();

 private:
  sd_bus* serviceBus_;
  sd_bus* waitBus_;
  std::chrono::milliseconds timeout_;
  bool loggedTimeout_ = false;
};

}  // namespace bw
