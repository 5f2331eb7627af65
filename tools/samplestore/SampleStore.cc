#include "SampleStore.h"

#include <filesystem>
#include <numeric>
#include <stdexcept>

#include "CpuSamples.h"
#include "DeviceEvents.h"
#include "MachinePlan.h"
#include "PowerEvents.h"
#include "Processes.h"

namespace bw::samplestore {

StoreConfig largePreset() {
  StoreConfig config;
  config.days = 30;
  return config;
}

std::uint64_t StoreReport::totalRecords() const {
  return std::accumulate(records.begin(), records.end(), std::uint64_t{0});
}

std::uint64_t StoreReport::totalBytes() const {
  std::uint64_t sum = 0;
  for (const StoreFile& f : files) sum += f.bytes;
  return sum;
}

StoreReport generateSampleStore(const StoreConfig& config) {
  namespace fs = std::filesystem;
  std::error_code ec;
  if (fs::exists(config.output, ec) && !fs::is_empty(config.output, ec)) {
    throw std::runtime_error("output directory is not empty: " + config.output);
  }
  const MachinePlan plan(config.days, config.seed);
  PowerEvents power(plan);
  CpuSamples cpu(plan);
  DeviceEvents devices(plan);
  Processes processes(plan, config.scale);
  FileLayout layout(plan, config.output);
  RecordSink sink;

  StoreReport report;
  report.days = plan.days();
  // One boot at a time, so that memory holds one boot's records.
  for (std::size_t i = 0; i < plan.boots().size(); ++i) {
    power.boot(i, sink);
    cpu.boot(i, sink);
    devices.boot(i, sink);
    processes.boot(i, sink);
    layout.writeBoot(i, sink);
    sink.clear();
    const Boot& boot = plan.boots()[i];
    report.boots.push_back({boot.uuid, boot.lastUuid, boot.systemVersion, boot.lastSystemVersion, boot.runs.size(),
                            processes.lastBootInstances()});
  }
  report.files = layout.files();
  report.records = sink.counts();
  return report;
}

}  // namespace bw::samplestore
