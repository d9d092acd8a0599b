#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"

namespace varnel {

/// The section decoders of the GSM/UMTS technology.
class KLV_GSMClassIndex final : public ClassIndex {
 public:
  explicit KLV_GSMClassIndex(std::ostream& standardOutput);
  /// Writes "Deallocing KLV_GSMClassIndex" to standard output.
  ~KLV_GSMClassIndex() override;

 private:
  std::unique_ptr<PDPContextList> objPDPContextList = create<PDPContextList>();
  std::unique_ptr<SimInfo> objSimInfo = create<SimInfo>();
};

}  // namespace varnel
