#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/LTE/LTEServingCellInfo.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"

namespace varnel {

/// The section decoders of the LTE technology.
class LTEClassIndex final : public ClassIndex {
 public:
  explicit LTEClassIndex(std::ostream& standardOutput);
  /// Writes "Deallocing LTEClassIndex" to standard output.
  ~LTEClassIndex() override;

 private:
  std::unique_ptr<LTEServingCellInfo> objServingCellInfo = create<LTEServingCellInfo>();
  std::unique_ptr<SimInfo> objSimInfo = create<SimInfo>();
  std::unique_ptr<PDPContextList> objPDPContextList = create<PDPContextList>();
};

}  // namespace varnel
