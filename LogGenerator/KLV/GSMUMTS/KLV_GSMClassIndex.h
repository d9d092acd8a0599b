#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/KLV/GSMUMTS/ActiveSet.h"
#include "LogGenerator/KLV/GSMUMTS/BLER.h"
#include "LogGenerator/KLV/GSMUMTS/CellChangeCounters.h"
#include "LogGenerator/KLV/GSMUMTS/CodingScheme.h"
#include "LogGenerator/KLV/GSMUMTS/DetectedSet.h"
#include "LogGenerator/KLV/GSMUMTS/EquivalentPLMNList.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSInformation.h"
#include "LogGenerator/KLV/GSMUMTS/GSMRRInfo.h"
#include "LogGenerator/KLV/GSMUMTS/GSMServingCell.h"
#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"
#include "LogGenerator/KLV/GSMUMTS/HSDPAInformation.h"
#include "LogGenerator/KLV/GSMUMTS/MobileAllocation.h"
#include "LogGenerator/KLV/GSMUMTS/MonitoredSet.h"
#include "LogGenerator/KLV/GSMUMTS/NeighboringCells.h"
#include "LogGenerator/KLV/GSMUMTS/NonRankedGSMSet.h"
#include "LogGenerator/KLV/GSMUMTS/NonRankedUMTSSet.h"
#include "LogGenerator/KLV/GSMUMTS/ProcessCO.h"
#include "LogGenerator/KLV/GSMUMTS/ProcessCS.h"
#include "LogGenerator/KLV/GSMUMTS/ProcessPS.h"
#include "LogGenerator/KLV/GSMUMTS/ServingPLMN.h"
#include "LogGenerator/KLV/GSMUMTS/UMTSRRInfo.h"
#include "LogGenerator/KLV/GSMUMTS/UMTSRRMeasurement.h"
#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"
#include "LogGenerator/KLV/GSMUMTS/VirtualActiveSet.h"
#include "LogGenerator/KLV/Subscriber/PDPContextList.h"
#include "LogGenerator/KLV/Subscriber/SimInfo.h"

namespace varnel {

/// The section decoders of the GSM/UMTS technology, in the order in which they are created and receive
/// packets.
class KLV_GSMClassIndex final : public ClassIndex {
 public:
  explicit KLV_GSMClassIndex(std::ostream& standardOutput);
  /// With a reader of cell-monitor packets that decoders of other indexes use too.
  KLV_GSMClassIndex(std::ostream& standardOutput, CellMonitorReader& cellMonitor);
  /// Writes "Deallocing KLV_GSMClassIndex" to standard output.
  ~KLV_GSMClassIndex() override;

 private:
  CellMonitorReader _ownCellMonitor;
  CellMonitorReader& _cellMonitor;

  std::unique_ptr<ActiveSet> objActiveSet = create<ActiveSet>();
  std::unique_ptr<CodingScheme> objCodingScheme = create<CodingScheme>();
  std::unique_ptr<GPRSInformation> objGPRSInformation = create<GPRSInformation>();
  std::unique_ptr<GSMServingCell> objGSMServingCell = create<GSMServingCell>(_cellMonitor);
  std::unique_ptr<MobileAllocation> objMobileAllocation = create<MobileAllocation>();
  std::unique_ptr<NeighboringCells> objNeighboringCells = create<NeighboringCells>(_cellMonitor);
  std::unique_ptr<PDPContextList> objPDPContextList = create<PDPContextList>();
  std::unique_ptr<ProcessPS> objProcessPS = create<ProcessPS>();
  std::unique_ptr<UMTSRRMeasurement> objUMTSRRMeasurement = create<UMTSRRMeasurement>();
  // Kept: the name lacks its last s.
  std::unique_ptr<CellChangeCounters> objCellChangeCounter = create<CellChangeCounters>();
  std::unique_ptr<DetectedSet> objDetectedSet = create<DetectedSet>();
  std::unique_ptr<GSMSet> objGSMSet = create<GSMSet>();
  std::unique_ptr<NonRankedGSMSet> objNonRankedGSMSet = create<NonRankedGSMSet>();
  std::unique_ptr<ProcessCO> objProcessCO = create<ProcessCO>();
  std::unique_ptr<ServingPLMN> objServingPLMN = create<ServingPLMN>(_cellMonitor);
  std::unique_ptr<UMTSSet> objUMTSSet = create<UMTSSet>(_cellMonitor);
  std::unique_ptr<EquivalentPLMNList> objEquivalentPLMNList = create<EquivalentPLMNList>();
  std::unique_ptr<GSMRRInfo> objGSMRRInfo = create<GSMRRInfo>();
  std::unique_ptr<MonitoredSet> objMonitoredSet = create<MonitoredSet>();
  std::unique_ptr<NonRankedUMTSSet> objNonRankedUMTSSet = create<NonRankedUMTSSet>();
  std::unique_ptr<ProcessCS> objProcessCS = create<ProcessCS>();
  std::unique_ptr<UMTSRRInfo> objUMTSRRInfo = create<UMTSRRInfo>(_cellMonitor);
  std::unique_ptr<BLER> objBLER = create<BLER>();
  std::unique_ptr<VirtualActiveSet> objVirtualActiveSet = create<VirtualActiveSet>();
  std::unique_ptr<SimInfo> objSimInfo = create<SimInfo>();
  std::unique_ptr<HSDPAInformation> objHSDPAInformation = create<HSDPAInformation>();
};

}  // namespace varnel
