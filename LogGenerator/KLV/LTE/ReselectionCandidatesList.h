#pragma once

#include "LogGenerator/SectionDecoder.h"

namespace varnel {

/// The candidates of the idle-mode reselection report, of any radio access technology, one record per
/// candidate.
class ReselectionCandidatesList final : public SectionDecoder {
 public:
  ReselectionCandidatesList();
};

}  // namespace varnel
