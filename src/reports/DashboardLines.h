#pragma once
// The groups of lines that several dashboard sections print from one
// summary: CPU, power, battery usage, C-state residency, display, I/O and
// the processes of a range. Lines whose figure is missing (a zero
// denominator, NaN) are left out where noted; a NaN that reaches a line
// printed unconditionally prints as printf's "nan".
#include <cstddef>
#include <ostream>
#include <string>
#include <vector>

#include "base/Range.h"

namespace bw {

class CPUSummary;
class IOSummary;
class Model;
class PowerSummary;
class Summary;

// "Avg. Frequency" (GHz, when above 0), "Interrupt Rate" (Hz, when above
// 0), "C-State Res" with each level's share (when the residency has a
// denominator), "BG QoS Ratio" (when it has a denominator and a number).
void printCPULines(std::ostream& o, const CPUSummary& cpu);
// "Power": average mW and the charge used per hour over the summary's range.
void printPowerLine(std::ostream& o, const PowerSummary& power);
// "LABEL\t%/hr\t mAh\tmW" for the time in all of `states` within `ranges`.
void printBatteryUsageLine(std::ostream& o, const Model& model, const std::string& label,
                           const std::vector<std::string>& states, const std::vector<Range>& ranges);
// The package C-state residency while all `states` held, when it has one.
void printCStateResidencyLine(std::ostream& o, const Model& model, const std::string& label,
                              const std::vector<std::string>& states, const std::vector<Range>& ranges);
// "Display Brightness" and "PSR on" from the "Backlight" and
// "PanelSelfRefresh" summaries, each when it has a number.
void printDisplayLines(std::ostream& o, const Summary& backlight, const Summary& panel);
// Disk and network counts and bytes with their rates per second of the
// summary's duration.
void printIOLines(std::ostream& o, const IOSummary& io);
// The interrupts and CPU time of `range` and its `count` busiest jobs.
void printProcessLines(std::ostream& o, const Model& model, bool includingSubjobs, const Range& range,
                       std::size_t count);

}  // namespace bw
