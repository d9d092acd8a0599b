#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"

namespace varnel {

/// The section decoders of the UTRAN technology.
class UTRANClassIndex final : public ClassIndex {
 public:
  using ClassIndex::ClassIndex;

 private:
  std::unique_ptr<PDPContextList> pdpList = create<PDPContextList>();
  std::unique_ptr<SimInfo> simInfo = create<SimInfo>();
};

}  // namespace varnel
