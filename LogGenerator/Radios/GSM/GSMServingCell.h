#pragma once

#include "LogGenerator/KLV/GSMUMTS/GSMServingCell.h"

namespace varnel::radios {

/// The GSM serving cell. Other than `varnel::GSMServingCell`, it shows the whole number of the dedicated
/// channel, and the path loss criteria with their sign.
class GSMServingCell final : public varnel::GSMServingCell {
 public:
  explicit GSMServingCell(CellMonitorReader& cellMonitor);
};

}  // namespace varnel::radios
