#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel::radios {

/// The UMTS cells of the active set, one record per cell. Other than `varnel::ActiveSet`, it shows powers in
/// dBm, no level for a cell that is too weak for one, and no cell that lies past the packet's end.
class ActiveSet final : public SectionDecoder {
 public:
  ActiveSet();

  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::radios
