#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// Fills the section "Random Access": how the modem asked a cell for a connection last, and what came of it.
/// Several packets tell of one procedure, each a part of it.
class RandomAccess final : public VersionedDecoder {
 public:
  RandomAccess();
  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::lte
