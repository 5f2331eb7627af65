#include "reports/Dashboard.h"

#include "base/RangeList.h"
#include "model/Model.h"
#include "reports/DashboardSections.h"

namespace bw {

void printDashboard(std::ostream& o, const DashboardSettings& settings, const Model& model,
                    const std::vector<Range>& ranges) {
  DashboardInputs in{o, model, ranges, settings};
  const std::uint64_t batteryTime = totalLength(model.rangesForSubstates({"Battery"}, ranges).value_or(ranges));
  in.showBattery = batteryTime != 0 || settings.showAll;
  in.total = totalLength(ranges);

  printSummarySection(in);
  printUsageSection(in);
  printBatterySection(in);
  printCPUSection(in);
  printIOSection(in);
  printFanSection(in);
  printMemorySection(in);
  printProcessesSection(in);
  printBatteryUseSection(in);
  printCPUUseSection(in);
  printDevicesSection(in);
}

}  // namespace bw
