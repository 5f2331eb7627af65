#include "summarizers/StandbySummarizer.h"

#include "Records/SleepWake.h"
#include "summarizers/SwapDisk.h"

namespace bw {

void StandbySummarizer::addEvent(const Record& event, std::uint64_t position, const AbsTime&, std::uint64_t) {
  if (event.recordClass() != RecordClass::SleepWake) return;
  const auto& record = static_cast<const SleepWake&>(event);
  if (record.reason() == SleepWake::kSleep) {
    beginRangeAtPosition(position);
    return;
  }
  if (!record.wakeFromStandby()) {
    resetRange();
    return;
  }
  endRangeAtPosition(position);
  const bool dark = record.reason() == SleepWake::kDarkWake;
  auto count = [&](const std::string& key) {
    StandbyContext& context = context_.objectForKey(key);
    context.wakes().addCreditAtPosition(position);
    if (dark) context.darkWakes().addCreditAtPosition(position);
  };
  count(kAllWakes);
  if (!record.wakeType().empty()) count(record.wakeType());
}

std::unique_ptr<Summary> StandbySummarizer::newSummary() const {
  auto summary = std::make_unique<StandbySummary>();
  fillSSDInfo(*summary);
  return summary;
}

void StandbySummarizer::fillSSDInfo(StandbySummary& summary) const {
  const SwapDiskInfo& disk = swapDiskInfo();
  if (disk.productName) ssdProductName_ = disk.productName;
  if (disk.productRevisionLevel) ssdProductRevisionLevel_ = disk.productRevisionLevel;
  summary.setSsdProductName(ssdProductName_);
  summary.setSsdProductRevisionLevel(ssdProductRevisionLevel_);
}

void StandbySummarizer::summarize(Summary& summary, const Range& range, const Timeline&) {
  summarize(dynamic_cast<StandbySummary&>(summary), range);
}

void StandbySummarizer::summarize(StandbySummary& summary, const Range& range) const {
  summary.setDuration(summary.duration() + range.length);
  context_.enumerateKeysAndObjectsUsingBlock(
      [&](const std::string& key, const std::shared_ptr<StandbyContext>& context, bool&) {
        auto countIn = [&](const Ledger& ledger) {
          return ledger.valueAtPosition(range.end()) - ledger.valueAtPosition(range.location);
        };
        if (key == kAllWakes) {
          summary.setWakesFromStandby(summary.wakesFromStandby() + countIn(context->wakes()));
          summary.setDarkWakesFromStandby(summary.darkWakesFromStandby() + countIn(context->darkWakes()));
        } else {
          summary.wakeTypes()[key] += countIn(context->wakes());
        }
      });
}

}  // namespace bw
