#include "LogGenerator/KLV/LTE/DetectedCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"

namespace varnel {

namespace {

constexpr Field detectedCell[] = {
    {u16(0), "Physical Cell ID"},
};
static_assert(within(detectedCell, connectedModeMeasurement::detectedCellSize));

}  // namespace

constinit const PacketHandlers<DetectedCells> DetectedCells::handlers = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize, &DetectedCells::update},
};

void DetectedCells::update(const Packet& packet) {
  using namespace connectedModeMeasurement;
  clearElementsInArray(list());
  const Records records{firstDetectedCell(packet), detectedCellSize, detectedCellCount(packet)};
  replaceArray_With(list(), recordRows(packet, records, detectedCell));
}

}  // namespace varnel
