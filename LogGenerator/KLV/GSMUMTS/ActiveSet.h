#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The UMTS cells of the active set, one record per cell.
class ActiveSet final : public SectionDecoder {
 public:
  ActiveSet();

  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel
