#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"
#include "LogGenerator/KLV/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/KLV/UTRAN/GSMNeighbhorMeasurements.h"
#include "LogGenerator/KLV/UTRAN/RRC_State.h"
#include "LogGenerator/KLV/UTRAN/TRCHBLERMeasurement.h"
#include "LogGenerator/KLV/UTRAN/UTRANNeighbhorMeasurements.h"
#include "LogGenerator/KLV/UTRAN/UTRANServingCellInfo.h"

namespace varnel {

/// The section decoders of the UTRAN technology, in the order in which they are created and receive packets.
class UTRANClassIndex final : public ClassIndex {
 public:
  explicit UTRANClassIndex(std::ostream& standardOutput)
      : ClassIndex(standardOutput), servingCellInfo(create<UTRANServingCellInfo>()) {}
  /// With a reader of cell-monitor packets that decoders of other indexes use too.
  UTRANClassIndex(std::ostream& standardOutput, CellMonitorReader& cellMonitor)
      : ClassIndex(standardOutput), servingCellInfo(create<UTRANServingCellInfo>(cellMonitor)) {}

 private:
  std::unique_ptr<RRC_State> rrc_state = create<RRC_State>();
  std::unique_ptr<UTRANServingCellInfo> servingCellInfo;
  std::unique_ptr<UTRANNeighbhorMeasurements> tdMeasurements = create<UTRANNeighbhorMeasurements>();
  std::unique_ptr<GSMNeighbhorMeasurements> gsmMeasurements = create<GSMNeighbhorMeasurements>();
  std::unique_ptr<TRCHBLERMeasurement> trchMeasurements = create<TRCHBLERMeasurement>();
  std::unique_ptr<CCTRCHSIRMeasurement> cctrchMeasurements = create<CCTRCHSIRMeasurement>();
  std::unique_ptr<PDPContextList> pdpList = create<PDPContextList>();
  std::unique_ptr<SimInfo> simInfo = create<SimInfo>();
};

}  // namespace varnel
