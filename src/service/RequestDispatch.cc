#include "service/RequestDispatch.h"

#include "service/BatteryChargeGraph.h"

namespace bw {

namespace {

MessageDictionary errorReply(const char* text) { return MessageDictionary{{"error", text}}; }

}  // namespace

MessageDictionary handleRequest(const MessageDictionary& request, const RequestContext& context) {
  const std::string* type = stringForKey(request, "request_type");
  if (!type) return errorReply("Expected string request_type in request");
  if (*type == "battery_charge_graph") {
    StoreQuery query;
    query.fromPath = context.fromPath;
    return batteryChargeGraph(query);
  }
  if (*type != "top_launchd_jobs" && *type != "process_usage")
    return errorReply("Unrecognized request_type in request");
  if (!context.callerMayReadJobs || !context.callerMayReadJobs()) return errorReply("Not permitted");
  return jobReport(request, context.fromPath, context.sampleProcesses);
}

}  // namespace bw
