#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The serving cell of the idle-mode reselection report.
class ReselectionCandidatesMisc final : public SectionDecoder {
 public:
  ReselectionCandidatesMisc();
};

}  // namespace varnel
