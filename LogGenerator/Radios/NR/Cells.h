#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::nr {

/// Fills the section "Cells": what the modem measured last. The list "Layers" has a record per channel, each
/// with a list of its cells, and each cell with a list of its beams.
class Cells final : public VersionedDecoder {
 public:
  Cells();
  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::nr
