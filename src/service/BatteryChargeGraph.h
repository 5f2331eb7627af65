#pragma once
// The battery charge graph of the running build: every battery sample (and
// wake point) as a charge percentage, every sleep/wake and power-source
// change, each placed in whole seconds before now.
//
// Times are "seconds before now" on the timeline: now sits (now − the data's
// end wall time) past the timeline's end. A data end less than 5000 ms after
// now counts as now (clock skew); 5000 ms or more raises.
#include "service/Message.h"
#include "store/StoreQuery.h"

namespace bw {

// Builds the models of `query`, restricted to the running build unless it
// names a version, and answers "charge_levels" (ad), "charge_times" (at),
// "sleep_times" (at), "sleep_states" (ax, the reasons), "battery_times"
// (at), "battery_states" (ab, true on battery) and "time_since_full_charge"
// (t). Throws NSInternalInconsistencyException "multiple system versions
// detected" unless there is exactly one model, "wall time was less than last
// wall time in data" for a data end 5000 ms or more after now, and
// NSInvalidArgumentException "BatterySummarizer is nil" for a model without
// its "Power" summarizer.
MessageDictionary batteryChargeGraph(StoreQuery query);

}  // namespace bw
