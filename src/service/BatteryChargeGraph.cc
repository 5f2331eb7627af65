#include "service/BatteryChargeGraph.h"

#include <algorithm>

#include "Records/PowerStateChange.h"
#include "Records/SleepWake.h"
#include "base/Exception.h"
#include "base/Platform.h"
#include "domains/AllDomain.h"
#include "model/Model.h"
#include "service/StoreModels.h"
#include "summarizers/BatterySummarizer.h"

namespace bw {

namespace {

// Clock skew up to this much (milliseconds) between the data and now is
// taken as no skew.
constexpr std::uint64_t kWallTimeTolerance = 5000;

}  // namespace

MessageDictionary batteryChargeGraph(StoreQuery query) {
  if (!query.onlySystemVersion) query.onlySystemVersion = platform().currentSystemVersion();
  std::vector<std::unique_ptr<Model>> models = loadStoreModels(query);
  if (models.size() != 1) throw Exception(kInternalInconsistencyException, "multiple system versions detected");
  Model& model = *models.front();
  AllDomain domain;
  model.processEventsWithDomains({&domain}, SummarizerFeed::only({"Power"}));  // the graph reads no other
  const auto* battery = dynamic_cast<const BatterySummarizer*>(model.summarizer("Power"));
  if (!battery) throw Exception(kInvalidArgumentException, "BatterySummarizer is nil");

  const Timeline& timeline = model.timeline();
  std::uint64_t now = static_cast<std::uint64_t>(platform().nowMicroseconds() / 1000);
  const std::uint64_t end = timeline.endWallTime();
  if (now < end) {
    if (end - now >= kWallTimeTolerance)
      throw Exception(kInternalInconsistencyException, "wall time was less than last wall time in data");
    now = end;
  }
  const std::uint64_t nowPosition = (now - end) + timeline.duration();
  auto secondsBeforeNow = [nowPosition](std::uint64_t position) { return (nowPosition - position) / 1000; };

  std::vector<std::uint64_t> points = battery->graphPoints();
  std::sort(points.begin(), points.end());
  std::vector<double> chargeLevels;
  std::vector<std::uint64_t> chargeTimes;
  for (std::uint64_t p : points) {
    chargeTimes.push_back(secondsBeforeNow(p));
    chargeLevels.push_back(battery->percentChargeAtPosition(p));
  }

  std::vector<std::uint64_t> sleepTimes, batteryTimes;
  std::vector<std::int64_t> sleepStates;
  std::vector<bool> batteryStates;
  timeline.enumerateEventsUsingBlock(
      [&](const Record& event, std::uint64_t position, std::uint64_t, const AbsTime&, bool&) {
        if (const auto* s = recordCast<SleepWake>(&event)) {
          sleepTimes.push_back(secondsBeforeNow(position));
          sleepStates.push_back(s->reason());
        }
      });
  timeline.enumerateEventsUsingBlock(
      [&](const Record& event, std::uint64_t position, std::uint64_t, const AbsTime&, bool&) {
        if (const auto* c = recordCast<PowerStateChange>(&event)) {
          batteryTimes.push_back(secondsBeforeNow(position));
          batteryStates.push_back(c->change() == 1);
        }
      });

  return MessageDictionary{
      {"charge_levels", std::move(chargeLevels)},
      {"charge_times", std::move(chargeTimes)},
      {"sleep_times", std::move(sleepTimes)},
      {"sleep_states", std::move(sleepStates)},
      {"battery_times", std::move(batteryTimes)},
      {"battery_states", std::move(batteryStates)},
      {"time_since_full_charge", secondsBeforeNow(battery->last_fully_charged_time())},
  };
}

}  // namespace bw
