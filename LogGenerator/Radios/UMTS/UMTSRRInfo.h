#pragma once

#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"

namespace varnel::radios {

/// The UMTS radio resource control. Other than `varnel::UMTSRRInfo`, it shows no transmit power when there
/// are no samples of it.
class UMTSRRInfo final : public varnel::UMTSRRInfo {
 public:
  explicit UMTSRRInfo(CellMonitorReader& cellMonitor);
};

}  // namespace varnel::radios
