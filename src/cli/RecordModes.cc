#include "cli/RecordModes.h"

#include <cstdio>
#include <cstdlib>
#include <limits>
#include <optional>

#include "Records/BatteryChargeLevel.h"
#include "Records/PowerStateChange.h"
#include "Records/RecordDecoder.h"
#include "Records/SleepWake.h"
#include "base/Console.h"
#include "base/DecimalText.h"
#include "cli/EmptyResult.h"
#include "cli/ModelLoader.h"
#include "cli/ModelRunner.h"
#include "cli/Options.h"
#include "cli/OutputBuffer.h"
#include "cli/StoreWatch.h"
#include "domains/Domain.h"
#include "domains/WallTimeText.h"
#include "model/Model.h"
#include "summarizers/BatterySummarizer.h"

namespace bw {

void runRecordDump(const Options& options) {
  std::ostream& o = out();
  StoreWatch watch;
  const std::vector<std::unique_ptr<Model>> models = loadModels(options, &watch);
  EmptyStage reached = EmptyStage::kNoRecords;
  bool printed = false;
  std::size_t fed = 0;
  for (const std::unique_ptr<Model>& model : models) {
    if (!printed) watch.step(format("feeding model %zu of %zu", ++fed, models.size()));
    std::unique_ptr<Domain> domain = Domain::domainWithChoice(domainChoice(options));
    model->processEventsWithDomains({domain.get()}, summarizerFeed(options));
    reached = EmptyStage::kNoRange;
    if (domain->ranges().empty()) continue;
    std::optional<Uuid> shownBoot;  // starts afresh for every model
    OutputBuffer buffer(o);
    std::string& text = buffer.text();
    model->timeline().enumerateEventsInRelativeRanges(
        domain->ranges(), [&](const Record& event, std::uint64_t, std::uint64_t, const AbsTime& absTime, bool&) {
          if (!printed) watch.end();
          printed = true;
          if (shownBoot != absTime.boot) {
            shownBoot = absTime.boot;
            text += "===== Boot ";
            text += absTime.boot.string();
            text += " =====\n";
          }
          text += event.className();
          text += ' ';
          event.appendDictionaryText(text);
          text += '\n';
          buffer.lineDone();
        });
  }
  watch.end();
  if (!printed) noteEmptyResult(options, models, reached);
}

void runEventListing(const Options& options) {
  std::ostream& o = out();
  runPerModel(options, [&](const Model& model, const std::vector<Range>& ranges) {
    OutputBuffer buffer(o);
    std::string& text = buffer.text();
    model.timeline().enumerateEventsInRelativeRanges(
        ranges, [&](const Record& event, std::uint64_t position, std::uint64_t wallTime, const AbsTime&, bool&) {
          if (gDebug) {
            appendDecimal(text, static_cast<unsigned long long>(position));
            text += '\t';
            appendDecimal(text, static_cast<unsigned long long>(event.absoluteTime()));
            text += '\t';
            text += event.answersWallTime() ? '*' : ' ';
          }
          text += formatWallTime(wallTime);  // made once per second
          text += '\t';
          if (!event.appendPrettyPrint(text)) text += event.className();
          text += '\n';
          buffer.lineDone();
        });
  });
}

namespace {

void plotLine(std::ostream& o, std::uint64_t position, double value) {
  o << format("%llu\t%.03g\n", static_cast<unsigned long long>(position / 1000), value);
}

// Calls `block` with each record of class `c`, passing over the others
// undecoded.
template <class Block>
void forEachOfClass(const Timeline& timeline, RecordClass c, Block block) {
  WalkDecoder decode;
  timeline.enumerateRecordsUsingBlock(
      [&](const RecordRef& record, std::uint64_t position, std::uint64_t, const AbsTime&, bool&) {
        if (record.recordClass() == c) block(decode(record), position);
      });
}

void plotModel(const Model& model) {
  std::ostream& o = out();
  const Timeline& timeline = model.timeline();
  std::uint64_t first = std::numeric_limits<std::uint64_t>::max();
  std::uint64_t last = 0;
  WalkDecoder decode;
  timeline.enumerateRecordsUsingBlock(
      [&](const RecordRef& record, std::uint64_t position, std::uint64_t, const AbsTime&, bool&) {
        first = std::min(first, position);
        last = std::max(last, position);
        if (record.recordClass() != RecordClass::BatteryChargeLevel) return;
        const auto& level = static_cast<const BatteryChargeLevel&>(decode(record));
        plotLine(o, position, static_cast<double>(level.charge()) * 100 / static_cast<double>(level.maxCharge()));
      });

  o << '\n';
  const auto* battery = dynamic_cast<const BatterySummarizer*>(model.summarizer("Power"));
  if (battery && first <= last) {
    for (std::uint64_t p = first; p <= last; p += 1000) {
      plotLine(o, p, battery->percentChargeAtPosition(p));
      if (last - p < 1000) break;
    }
  }

  o << '\n';
  forEachOfClass(timeline, RecordClass::SleepWake, [&](const Record& event, std::uint64_t position) {
    switch (static_cast<const SleepWake&>(event).reason()) {
      case SleepWake::kSleep:
        plotLine(o, position, 100);
        break;
      case SleepWake::kDarkWake:
        plotLine(o, position, 50);
        break;
      case SleepWake::kWake:
        plotLine(o, position, 0);
        break;
      default:
        // Any other reason means the plot's assumptions are wrong: stop hard.
        o.flush();
        std::fprintf(stderr, "brindlewick: unexpected sleep/wake reason %u\n",
                     static_cast<const SleepWake&>(event).reason());
        std::abort();
    }
  });

  o << '\n';
  forEachOfClass(timeline, RecordClass::PowerStateChange, [&](const Record& event, std::uint64_t position) {
    plotLine(o, position, static_cast<const PowerStateChange&>(event).change() != PowerStateChange::kOnAC ? 0 : 100);
  });
}

}  // namespace

void runBatteryPlot(const Options& options) {
  runPerModel(options, [](const Model& model, const std::vector<Range>&) { plotModel(model); });
}

}  // namespace bw
