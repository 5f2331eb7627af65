#pragma once
// The modes that print records rather than summaries: the record dump, the
// event listing and the battery plot.
namespace bw {

class Options;

// Every record of the sample range, grouped under "===== Boot UUID =====",
// each as its class name and its dictionary in the property-list text form.
void runRecordDump(const Options& options);
// One line per record of the sample range: date and one-line text.
void runEventListing(const Options& options);
// Charge samples, the interpolated charge every second, sleeps and power
// source changes, as "seconds<TAB>value" lines in four sections.
void runBatteryPlot(const Options& options);

}  // namespace bw
