#pragma once
// Disk and network I/O from the cumulative SystemIO counters: one
// interpolator per counter per boot, so that the amount within a range is
// the counter's change between its ends. Counters are never differenced
// across a reboot: each boot has its own context, starting at 0.
//
// Each SystemIO record closes the open range and opens the next (discrete
// ranges); a reboot drops the open range.
//
//   diskReadOps "Disk Reads"        diskWriteOps "Disk Writes"
//   diskBytesRead "Bytes Read"      diskBytesWritten "Bytes Written"
//   networkPacketsIn "Packets Received"   networkPacketsOut "Packets Sent"
//   networkBytesIn "Bytes Received"       networkBytesOut "Bytes Sent"
#include <memory>

#include "framework/Summarizer.h"
#include "framework/SummarizerContext.h"
#include "summarizers/IOSummary.h"

namespace bw {

// One boot's counters: an interpolator holding (0, 0) for each of the
// eight keys.
class IOContext : public InterpolatorContext {
 public:
  static constexpr const char* kClassName = "IOContext";
  IOContext();
  const char* className() const override { return kClassName; }
};

class IOSummarizer : public Summarizer {
 public:
  IOSummarizer();

  std::unique_ptr<Summary> newSummary() const override { return std::make_unique<IOSummary>(); }
  // By total bytes; on a tie within the double epsilon the summary of the
  // earlier range ranks greater, so the model's lists (greatest first) keep
  // equal totals in time order.
  SummaryComparator comparator() const override { return &compareTotalBytes; }
  static int compareTotalBytes(const Summary& a, const Summary& b);

  // Adds the range's length to `duration` and, per key, the counter's
  // change over the range of its boot (0 for a boot never seen).
  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;
};

}  // namespace bw
