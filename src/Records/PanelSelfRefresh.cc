#include "Records/PanelSelfRefresh.h"

#include "Records/RecordCodec.h"

namespace bw {

BW_RECORD_DEFINE(PanelSelfRefresh, BW_PANEL_SELF_REFRESH_FIELDS, BW_NO_REPEATED_FIELDS)

}  // namespace bw
