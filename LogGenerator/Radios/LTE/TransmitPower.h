#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// Fills the section "Transmit Power": the power of the last transmissions on the shared channel (PUSCH) and
/// on the control channel (PUCCH) of the uplink.
class TransmitPower : public VersionedDecoder {
 public:
  TransmitPower();
  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::lte
