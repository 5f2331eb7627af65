#pragma once
// The dashboard: the default report, printed once per model over the
// ranges that the sample domain selected (already masked by states and
// with post-install time cut out). Every figure comes from the model's
// summaries; the dashboard only chooses, orders and formats them.
//
// Sections in order: Summary, Usage, Battery, CPU Summary, I/O, fan
// activity, memory, Processes, battery usage, CPU activity, Connected
// Devices. A machine that was never on battery in the ranges prints no
// battery figures unless `showAll` is set; ranked lists print their top 3
// (processes of a range 5, whole-range process lists and resident sizes 10)
// or, with `showAll`, everything.
#include <ostream>
#include <vector>

#include "base/Range.h"

namespace bw {

class Model;

struct DashboardSettings {
  bool showAll = false;           // --all
  bool includingSubjobs = false;  // -J: jobs count what they own
};

void printDashboard(std::ostream& o, const DashboardSettings& settings, const Model& model,
                    const std::vector<Range>& ranges);

}  // namespace bw
