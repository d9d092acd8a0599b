#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"

#include <ostream>

namespace varnel {

KLV_GSMClassIndex::KLV_GSMClassIndex(std::ostream& standardOutput)
    : ClassIndex(standardOutput), _cellMonitor(_ownCellMonitor) {}

KLV_GSMClassIndex::KLV_GSMClassIndex(std::ostream& standardOutput, CellMonitorReader& cellMonitor)
    : ClassIndex(standardOutput), _cellMonitor(cellMonitor) {}

// Kept: "Deallocing" is no word.
KLV_GSMClassIndex::~KLV_GSMClassIndex() { standardOutput() << "Deallocing KLV_GSMClassIndex\n"; }

}  // namespace varnel
