#pragma once
// Panel self refresh: how much of the panel's time was spent with self
// refresh on. The PanelSelfRefresh records carry cumulative milliseconds
// per panel state; ranges run from one record to the next (discrete ranges,
// reset at reboot).
//
// Per summarized absolute range the summary gains one entry in "PSR on"
// (the delta of psrOn) and one in "PSR total" (the delta of off + transit +
// on + sleep), and the range's length in its duration; the share with self
// refresh on is the sum of "PSR on" over the sum of "PSR total".
#include "framework/Summarizer.h"
#include "summarizers/CounterContext.h"

namespace bw {

class PanelSelfRefresh;

class PSRContext : public CounterContext {
 public:
  static constexpr const char* kClassName = "PSRContext";
  const char* className() const override { return kClassName; }

  // "PSR on" when psrOn is present; "PSR total" from the state counters
  // present (none present: no total sample).
  void addRecord(const PanelSelfRefresh& record);
};

class PSRSummarizer : public Summarizer {
 public:
  PSRSummarizer();

  void summarize(Summary& summary, const AbsRange& range) override;
  using Summarizer::summarize;
};

}  // namespace bw
