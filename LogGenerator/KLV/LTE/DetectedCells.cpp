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

std::span<const PacketHandler<DetectedCells>> DetectedCells::handlers() {
  static constexpr PacketHandler<DetectedCells> table[] = {
      {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize, &DetectedCells::update},
  };
  return table;
}

void DetectedCells::update(const Packet& packet) {
  using namespace connectedModeMeasurement;
  clearElementsInArray(list());
  const Records records{firstDetectedCell(packet), detectedCellSize, detectedCellCount(packet)};
  replaceArray_With(list(), recordRows(packet, records, detectedCell));
}

}  // namespace varnel
