#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::nr {

/// Fills the section "Serving Cell" of NR: the cell that the modem camps on, its channels, and its network.
class ServingCell final : public VersionedDecoder {
 public:
  ServingCell();
  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::nr
