#include "time/BootTimeline.h"

#include "Records/LogStartsV1.h"
#include "Records/RecordDecoder.h"
#include "base/Exception.h"
#include "time/AbsoluteTimeline.h"

namespace bw {

BootTimeline::BootTimeline(const Uuid& uuid, std::optional<Uuid> lastUUID, RecordList events)
    : uuid_(uuid), lastUUID_(lastUUID), records_(std::move(events)) {
  if (records_.empty() || records_.front().recordClass() != RecordClass::LogStartsV1 || !records_.front().decoded()) {
    throw Exception(kInvalidArgumentException, "invalid event stream detected");
  }
  const auto& header = static_cast<const LogStartsV1&>(*records_.front().decoded());
  if (header.hasSystemVersion()) systemVersion_ = header.systemVersion();

  AbsoluteTimeline* current = nullptr;
  bool clockFixed = false;
  RecordDecoder decoder;
  for (const RecordRef& event : records_) {
    const std::uint64_t wall = wallTimeOf(event, decoder);
    if (wall == 0) {
      if (current == nullptr) current = &newSegment();
      current->addObjectInPlace(event, 0);
      continue;
    }
    const std::int64_t skew = std::int64_t(wall - event.absoluteTime());
    const std::int64_t currentSkew = current != nullptr ? current->skew() : 0;
    if (!clockFixed && wall > kClockSetWallTime) {
      // Everything so far ran on an unset clock: move it onto this reading.
      const std::int64_t delta = std::int64_t(std::uint64_t(skew) - std::uint64_t(currentSkew));
      for (std::size_t i = 0; i < segmentCount(); ++i) {
        static_cast<AbsoluteTimeline&>(*objects()[i]).adjustSkew(delta);
      }
      clockFixed = true;
    }
    if (current == nullptr || skew != current->skew()) current = &newSegment();
    current->addObjectInPlace(event, wall);
  }
  ensureIndex();
}

AbsoluteTimeline& BootTimeline::newSegment() {
  auto segment = std::make_unique<AbsoluteTimeline>(this);
  AbsoluteTimeline& result = *segment;
  addObject(std::move(segment));
  return result;
}

const AbsoluteTimeline& BootTimeline::segment(std::size_t index) const {
  return static_cast<const AbsoluteTimeline&>(*objects().at(index));
}

std::uint64_t BootTimeline::startWallTime() const { return objects().empty() ? 0 : objects().front()->startWallTime(); }

std::uint64_t BootTimeline::endWallTime() const { return objects().empty() ? 0 : objects().back()->endWallTime(); }

}  // namespace bw
