#pragma once
// Feeding summarizers at positions of one boot or another.
#include <cstdint>

#include "framework/Summarizer.h"
#include "support/Records.h"

namespace bw::test {

inline void feed(Summarizer& s, const Record& r, std::uint64_t position, std::uint8_t bootNumber = 1) {
  s.addEvent(r, position, AbsTime{bootNamed(bootNumber), position}, 0);
}

}  // namespace bw::test
