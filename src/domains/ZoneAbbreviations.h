#pragma once
// The time-zone abbreviations that TimeChange records carry, mapped to the
// full zone names the calendar understands (zone lookup by name does not
// know abbreviations). "CET" -> "Europe/Paris"; unknown ones give none.
#include <optional>
#include <string_view>

namespace bw {

std::optional<std::string_view> zoneNameForAbbreviation(std::string_view abbreviation);

}  // namespace bw
