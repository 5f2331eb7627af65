#pragma once
// Feeding summarizers at positions of one boot or another.
#include <cstdint>

#include "framework/Summarizer.h"
#include "support/Records.h"

namespace bw::test {

inline void feed(Summarizer& s, const Record& r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  s.addEvent(r, position, AbsTime{bootNamed(bootNumber), position}, 0);
}

// Feeds `r` with its own absolute time set to `position`, for summarizers
// that keep per-boot series by the record's time.
template <class R>
void feedAt(Summarizer& s, R r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  r.setAbsoluteTime(position);
  feed(s, r, position, bootNumber);
}

// A record of class R after `set` has filled it in.
template <class R, class F>
R make(F set) {
  R r;
  set(r);
  return r;
}

// Boot `n` as feed() names it.
inline Uuid boot(std::uint8_t n) { return bootNamed(n); }

// Records by their state codes alone, at absolute time 0.
inline SleepWake sleepWake(std::uint32_t reason, bool fromStandby = false, const std::string& wakeType = "") {
  return make<SleepWake>([&](SleepWake& r) {
    r.setReason(reason), r.setWakeFromStandby(fromStandby);
    if (!wakeType.empty()) r.setWakeType(wakeType);
  });
}

}  // namespace bw::test
