#pragma once
// One analysis request in, one reply out, without any transport: the bus
// layer decodes the request, calls handleRequest and sends what it answers.
//
// "request_type" picks the answer: "battery_charge_graph" (for everyone),
// "top_launchd_jobs" or "process_usage" (the same job report, only for
// callers allowed to read process usage). Errors are replies with the one
// key "error": "Expected string request_type in request", "Unrecognized
// request_type in request", "Not permitted". The exceptions of the battery
// graph and the job report are not caught: they end the service.
#include <functional>
#include <optional>
#include <string>

#include "service/JobReport.h"
#include "service/Message.h"

namespace bw {

struct RequestContext {
  // The store every request reads (none: the local store).
  std::optional<std::string> fromPath;
  // Whether the caller may have the job report; asked only for job requests.
  std::function<bool()> callerMayReadJobs;
  // Asks the process sampler for a fresh sample (may be empty).
  SampleProcesses sampleProcesses;
};

MessageDictionary handleRequest(const MessageDictionary& request, const RequestContext& context);

}  // namespace bw
