#include "LogGenerator/KLV/LTE/DetectedCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"

namespace varnel {

namespace {

constexpr Field detectedCell[] = {
    {u16(0), "Physical Cell ID"},
};
static_assert(extent(detectedCell) <= connectedModeMeasurement::detectedCellSize);

void update(Section& section, const Packet& packet) {
  using namespace connectedModeMeasurement;
  section.refill([&](Array& cells) {
    addRecords(cells, packet, {firstDetectedCell(packet), detectedCellSize, detectedCellCount(packet)},
               detectedCell);
  });
}

constexpr PacketHandler packets[] = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize, update},
};

}  // namespace

DetectedCells::DetectedCells() : SectionDecoder("Detected Cells", "Detected Cells", packets) {}

}  // namespace varnel
