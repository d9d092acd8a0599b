#pragma once

#include "LogGenerator/Radios/VersionedDecoder.h"

namespace varnel::lte {

/// The bearers that carry the phone's data (EPS bearer contexts, 3GPP TS 24.301), a record for each that is
/// not inactive, in the order of their identities. The quality of service comes from one packet, the
/// connection from another.
class Bearers final : public VersionedDecoder {
 public:
  Bearers();

  void listNumberFormats(SectionFormats& formats) const override;
};

}  // namespace varnel::lte
