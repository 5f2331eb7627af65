#include "service/AnalysisService.h"

#include <csignal>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <memory>
#include <utility>

#include "base/Console.h"
#include "base/Platform.h"
#include "service/BatteryChargeGraph.h"
#include "service/BusCodec.h"
#include "service/CallerCredentials.h"
#include "service/RequestDispatch.h"
#include "service/SamplerPair.h"

namespace bw {

namespace {

struct BusCloser {
  void operator()(sd_bus* bus) const { sd_bus_flush_close_unref(bus); }
};
using BusPtr = std::unique_ptr<sd_bus, BusCloser>;

BusPtr openBus() {
  sd_bus* bus = nullptr;
  const char* starter = std::getenv("DBUS_STARTER_BUS_TYPE");
  int r = starter && std::strcmp(starter, "session") == 0 ? sd_bus_open_user(&bus) : sd_bus_open_system(&bus);
  return BusPtr(r < 0 ? nullptr : bus);
}

class Server {
 public:
  Server(const ServiceSettings& settings, sd_bus* bus, sd_bus* waitBus) : settings_(settings), sampler_(bus, waitBus) {}

  static int onRequest(sd_bus_message* message, void* self, sd_bus_error*) {
    return static_cast<Server*>(self)->answer(message);
  }

  // Rethrows what a request left uncaught.
  void rethrowPending() {
    if (pending_) std::rethrow_exception(std::exchange(pending_, nullptr));
  }

 private:
  int answer(sd_bus_message* message) {
    try {
      MessageDictionary request;
      int r = readDictionary(message, request);
      if (r < 0) return r;  // sd-bus answers with the error
      RequestContext context;
      context.fromPath = settings_.fromPath;
      context.callerMayReadJobs = [message] { return senderMayReadProcessUsage(message); };
      context.sampleProcesses = [this] { sampler_.sampleProcesses(); };
      const MessageDictionary reply = handleRequest(request, context);

      sd_bus_message* out = nullptr;
      r = sd_bus_message_new_method_return(message, &out);
      if (r >= 0) r = appendDictionary(out, reply);
      // A caller that has left gets nothing; that is not an error here.
      if (r >= 0) sd_bus_send(nullptr, out, nullptr);
      sd_bus_message_unref(out);
      return r < 0 ? r : 1;  // sd-bus answers a failed reply with the error
    } catch (...) {
      // Unwinding through sd-bus is not allowed: the request is dropped
      // unanswered and the exception leaves the main loop instead.
      pending_ = std::current_exception();
      return 1;
    }
  }

  const ServiceSettings& settings_;
  SamplerPair sampler_;
  std::exception_ptr pending_;
};

const sd_bus_vtable kVtable[] = {
    SD_BUS_VTABLE_START(0),
    SD_BUS_METHOD_WITH_ARGS("Request", SD_BUS_ARGS("a{sv}", request), SD_BUS_RESULT("a{sv}", reply), Server::onRequest,
                            SD_BUS_VTABLE_UNPRIVILEGED),
    SD_BUS_SIGNAL("SampleProcessesNow", "", 0),
    SD_BUS_VTABLE_END,
};

}  // namespace

void runAnalysisService(const ServiceSettings& settings) {
  std::signal(SIGPIPE, SIG_IGN);
  BusPtr bus = openBus();
  if (!bus) exitWith(1);
  BusPtr waitBus = openBus();  // without it the service does not wait for the sampler
  Server server(settings, bus.get(), waitBus.get());
  if (sd_bus_add_object_vtable(bus.get(), nullptr, kAnalysisPath, kAnalysisInterface, kVtable, &server) < 0)
    exitWith(1);
  if (sd_bus_request_name(bus.get(), kAnalysisName, 0) < 0) exitWith(1);
  for (;;) {
    int r = sd_bus_process(bus.get(), nullptr);
    server.rethrowPending();
    if (r < 0) {
      platform().systemLog(std::string("The analysis service lost its bus: ") + std::strerror(-r));
      exitWith(1);
    }
    if (r > 0) continue;
    r = sd_bus_wait(bus.get(), UINT64_MAX);
    if (r < 0 && r != -EINTR) {
      platform().systemLog(std::string("The analysis service lost its bus: ") + std::strerror(-r));
      exitWith(1);
    }
  }
}

void runServiceDebug(const StoreQuery& query) {
  const std::string text = busText(batteryChargeGraph(query));
  platform().systemLog(text);
  out() << text << '\n';
}

}  // namespace bw
