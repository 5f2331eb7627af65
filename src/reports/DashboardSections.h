#pragma once
// The dashboard's sections, each printing itself from the shared inputs
// below; Dashboard.cc calls them in order.
#include <cstddef>
#include <cstdint>
#include <ostream>
#include <vector>

#include "base/Range.h"
#include "reports/Dashboard.h"

namespace bw {

struct DashboardInputs {
  std::ostream& o;
  const Model& model;
  const std::vector<Range>& ranges;
  DashboardSettings settings;
  // Time on battery within the ranges is not 0, or --all.
  bool showBattery = false;
  // The ranges' total length, ms.
  std::uint64_t total = 0;

  std::size_t top(std::size_t count) const;
};

void printSummarySection(const DashboardInputs& in);
void printUsageSection(const DashboardInputs& in);
void printBatterySection(const DashboardInputs& in);
void printCPUSection(const DashboardInputs& in);
void printIOSection(const DashboardInputs& in);
void printFanSection(const DashboardInputs& in);
void printMemorySection(const DashboardInputs& in);
void printProcessesSection(const DashboardInputs& in);
void printBatteryUseSection(const DashboardInputs& in);
void printCPUUseSection(const DashboardInputs& in);
void printDevicesSection(const DashboardInputs& in);

}  // namespace bw
