#include "LogGenerator/KLV/LTE/MeasuredNeighborCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"

namespace varnel {

namespace {

constexpr Field neighbor[] = {
    {u16(0), "Physical Cell ID"},
    {u16(2), "Filtered RSRP", real("%4.2f dBm", 0.25, -140.0)},
    {u16(4), "Filtered RSRQ", real("%4.2f dB", 0.125, -20.0)},
};
static_assert(extent(neighbor) <= connectedModeMeasurement::neighborSize);

void update(Section& section, const Packet& packet) {
  using namespace connectedModeMeasurement;
  const std::uint8_t count = neighborCount(packet);
  // Kept: both sizes are cut to 8 bits, and the actual size includes the packet's header.
  const auto expected = static_cast<std::uint8_t>(count * neighborSize);
  const auto actual = static_cast<std::uint8_t>(packet.size() - detectedCellSize * detectedCellCount(packet));
  section.refill([&](Array& cells) {
    if (count == 0 || expected > actual) {
      logError("Unexpected log packet bytes size: expected=%d actual=%d", expected, actual);
    } else {
      addRecords(cells, packet, {firstNeighbor, neighborSize, count}, neighbor);
    }
  });
}

constexpr PacketHandler packets[] = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize, update, neighbor},
};

}  // namespace

MeasuredNeighborCells::MeasuredNeighborCells()
    : SectionDecoder("Measured Neighbor Cells", "Measured Neighbor Cells", packets) {}

}  // namespace varnel
