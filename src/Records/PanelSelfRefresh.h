#pragma once
// PanelSelfRefresh: cumulative residency counters of the display panel's
// self-refresh and its backlight states.
#include "Records/RecordFields.h"

namespace bw {

#define BW_PANEL_SELF_REFRESH_FIELDS(F)                               \
  F(absoluteTime, AbsoluteTime, 1, UInt64, Required, "absolute_time") \
  F(psrOff, PsrOff, 2, UInt64, Optional, "psr_off")                   \
  F(psrTransit, PsrTransit, 3, UInt64, Optional, "psr_transit")       \
  F(psrOn, PsrOn, 4, UInt64, Optional, "psr_on")                      \
  F(psrSleep, PsrSleep, 5, UInt64, Optional, "psr_sleep")             \
  F(dpbOff, DpbOff, 6, UInt64, Optional, "dpb_off")                   \
  F(dpbOn, DpbOn, 7, UInt64, Optional, "dpb_on")

class PanelSelfRefresh final : public Record {
 public:
  BW_RECORD_INTERFACE(PanelSelfRefresh, BW_PANEL_SELF_REFRESH_FIELDS, BW_NO_REPEATED_FIELDS)

 private:
  BW_RECORD_STORAGE(BW_PANEL_SELF_REFRESH_FIELDS, BW_NO_REPEATED_FIELDS)
};

}  // namespace bw
