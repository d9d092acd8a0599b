#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::nr {

/// Fills the section "MIB": the cell whose master information block (MIB) the modem decoded last, and what
/// the block says.
class MasterInformation final : public VersionedDecoder {
 public:
  MasterInformation();
  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::nr
