#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel::radios {

/// The ranked GSM cells, one record per cell. Other than `varnel::GSMSet`, it reads them behind the UMTS
/// cells of the packet, and shows none that lies past the packet's end.
class GSMSet final : public SectionDecoder {
 public:
  GSMSet();
};

}  // namespace varnel::radios
