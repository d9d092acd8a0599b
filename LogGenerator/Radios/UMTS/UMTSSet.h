#pragma once

#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"

namespace varnel::radios {

/// The ranked UMTS cells, or the neighbors from the telephony server. Other than `varnel::UMTSSet`, it shows
/// powers in dBm and channel numbers without a sign, and no cell that lies past the packet's end.
class UMTSSet final : public varnel::UMTSSet {
 public:
  explicit UMTSSet(CellMonitorReader& cellMonitor);
};

}  // namespace varnel::radios
