#pragma once
// The texts and line shapes that every dashboard section shares: headings,
// right-aligned label lines, durations, dates, ranges and byte counts.
// Each printing helper writes one line ending in "\n" to the stream.
#include <cstdint>
#include <ostream>
#include <string>

#include "base/Range.h"

namespace bw {

class Model;

// A blank line, the title, then "=" once per character of the title.
void printHeading(std::ostream& o, const std::string& title);
// The label right-aligned in 20 columns (longer labels unpadded), ":\t",
// the value: "      Total Time:\t01:00:00".
void printLabelLine(std::ostream& o, const std::string& label, const std::string& value);
void printBlankLine(std::ostream& o);
// Any text as one line.
void printLine(std::ostream& o, const std::string& text);

// "yyyy-MM-dd HH:mm:ss" in the process's time zone (with the offset under
// --debug).
std::string dateText(std::uint64_t wallTime);
// "START to END (HH:MM:SS)": the wall times of the range's two ends on the
// model's timeline and its length.
std::string rangeText(const Model& model, const Range& range);
// "% 10.1f UNIT": GB above 1000 GiB (1.073741824e12 bytes, on purpose: 1 to
// 1000 GiB print in MB), MB above 1 MiB, KB otherwise. 2 GiB is
// "    2048.0 MB".
std::string byteText(double bytes);

// `value`, with a NaN made the plain one, so that printf writes "nan" and
// never "-nan" (0.0 / 0.0 carries the sign bit on this machine).
double plainNaN(double value);

// The number of entries a ranked list prints: `count`, or all of them with
// --all.
inline std::size_t topCount(bool showAll, std::size_t count) { return showAll ? SIZE_MAX : count; }
// "Top", or "All" with --all.
inline const char* topWord(bool showAll) { return showAll ? "All" : "Top"; }

}  // namespace bw
