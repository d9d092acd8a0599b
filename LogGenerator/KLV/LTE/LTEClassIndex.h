#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurementMisc.h"
#include "LogGenerator/KLV/LTE/DetectedCells.h"
#include "LogGenerator/KLV/LTE/LTEServingCellInfo.h"
#include "LogGenerator/KLV/LTE/MeasuredNeighborCells.h"
#include "LogGenerator/KLV/LTE/NeighborCellsList.h"
#include "LogGenerator/KLV/LTE/NeighborMeasurementMisc.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/KLV/LTE/ReselectionCandidatesMisc.h"
#include "LogGenerator/KLV/LTE/ServingCellMeasurement.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"

namespace varnel {

/// The section decoders of the LTE technology, in the order in which they are created and receive packets.
class LTEClassIndex final : public ClassIndex {
 public:
  explicit LTEClassIndex(std::ostream& standardOutput);
  /// Writes "Deallocing LTEClassIndex" to standard output.
  ~LTEClassIndex() override;

 private:
  std::unique_ptr<LTEServingCellInfo> objServingCellInfo = create<LTEServingCellInfo>();
  std::unique_ptr<ConnectedModeMeasurementMisc> objConnectedModeMeasurementMisc =
      create<ConnectedModeMeasurementMisc>();
  std::unique_ptr<MeasuredNeighborCells> objMeasuredNeighborCells = create<MeasuredNeighborCells>();
  std::unique_ptr<DetectedCells> objDetectedCells = create<DetectedCells>();
  std::unique_ptr<ServingCellMeasurement> objServingCellMeasurement = create<ServingCellMeasurement>();
  std::unique_ptr<NeighborMeasurementMisc> objNeighborMeasurementMisc = create<NeighborMeasurementMisc>();
  std::unique_ptr<NeighborCellsList> objNeighborCellsList = create<NeighborCellsList>();
  std::unique_ptr<ReselectionCandidatesMisc> objReselectionCandidatesMisc =
      create<ReselectionCandidatesMisc>();
  std::unique_ptr<ReselectionCandidatesList> objReselectionCandidatesList =
      create<ReselectionCandidatesList>();
  std::unique_ptr<SimInfo> objSimInfo = create<SimInfo>();
  std::unique_ptr<PDPContextList> objPDPContextList = create<PDPContextList>();
};

}  // namespace varnel
