#include "summarizers/IOSummarizer.h"

#include "Records/SystemIO.h"

namespace bw {

IOContext::IOContext() {
  for (const std::string& key : IOSummary::keys()) (*this)[key].addValue(0, 0);
}

IOSummarizer::IOSummarizer() {
  setResetAtReboot(true);
  setDiscreteRanges(true);
  setEventClass(RecordClass::SystemIO);
  setContextClass(IOContext::kClassName, [] { return std::make_shared<IOContext>(); });
  setEventHandler([](const Record& event, SummarizerContext* context) {
    const auto& record = static_cast<const SystemIO&>(event);
    auto& counters = static_cast<IOContext&>(*context);
    const std::uint64_t p = record.absoluteTime();
    const std::uint64_t values[] = {record.diskReadOps(),      record.diskWriteOps(),     record.diskBytesRead(),
                                    record.diskBytesWritten(), record.networkPacketsIn(), record.networkPacketsOut(),
                                    record.networkBytesIn(),   record.networkBytesOut()};
    for (std::size_t k = 0; k < IOSummary::keys().size(); ++k) {
      counters[IOSummary::keys()[k]].addValue(static_cast<double>(values[k]), p);
    }
    return 1;
  });
}

int IOSummarizer::compareTotalBytes(const Summary& a, const Summary& b) {
  const int order = compareWithTolerance(static_cast<const IOSummary&>(a).totalBytes(),
                                         static_cast<const IOSummary&>(b).totalBytes());
  if (order != 0) return order;
  if (a.range().location == b.range().location) return 0;
  return a.range().location < b.range().location ? 1 : -1;
}

void IOSummarizer::summarize(Summary& summary, const AbsRange& range) {
  summary.setDuration(summary.duration() + range.length());
  const auto* counters = dynamic_cast<const IOContext*>(contextForBoot(range.boot()));
  for (const std::string& key : IOSummary::keys()) {
    const Interpolator* counter = counters ? counters->find(key) : nullptr;
    summary[key].push_back(Value(counter ? counter->deltaInRange(range.range()) : 0.0));
  }
}

}  // namespace bw
