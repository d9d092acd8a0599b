#include "LogGenerator/KLV/LTE/MeasuredNeighborCells.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/ConnectedModeMeasurement.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

namespace {

constexpr Field neighbor[] = {
    {u16(0), "Physical Cell ID"},
    {u16(2), "Filtered RSRP", real("%4.2f dBm", 0.25, -140.0)},
    {u16(4), "Filtered RSRQ", real("%4.2f dB", 0.125, -20.0)},
};
static_assert(within(neighbor, connectedModeMeasurement::neighborSize));

}  // namespace

constinit const PacketHandlers<MeasuredNeighborCells> MeasuredNeighborCells::handlers = {
    {connectedModeMeasurement::logCode, connectedModeMeasurement::minimumSize,
     &MeasuredNeighborCells::update},
};

void MeasuredNeighborCells::listNumberFormats(SectionFormats& formats) const { formats.add(neighbor); }

void MeasuredNeighborCells::update(const Packet& packet) {
  using namespace connectedModeMeasurement;
  clearElementsInArray(list());
  const std::uint8_t count = neighborCount(packet);
  // Kept: both sizes are cut to 8 bits, and the actual one counts the header of the packet too.
  const auto expected = static_cast<std::uint8_t>(count * neighborSize);
  const auto actual = static_cast<std::uint8_t>(packet.size() - detectedCellSize * detectedCellCount(packet));
  if (count == 0 || expected > actual) {
    logError("Unexpected log packet bytes size: expected=%d actual=%d", expected, actual);
    return;
  }
  replaceArray_With(list(), recordRows(packet, {firstNeighbor, neighborSize, count}, neighbor));
}

}  // namespace varnel
