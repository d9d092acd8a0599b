#include "LogGenerator/KLV/LTE/NeighborCellsList.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/LTE/NeighborMeasurement.h"

namespace varnel {

namespace {

constexpr std::size_t recordSize = 20;

// Kept: half a decibel per step. The serving cell's RSRP has a quarter.
constexpr Format level = real("%4.2f dBm", 0.5, -140.0);
constexpr Format quality = real("%4.2f dB", 0.25, -30.0);
constexpr Source antennaFrame = bits(12, 0, 11);
constexpr Source antennaSample = bits(13, 3, 19);

constexpr Field cell[] = {
    {bits(0, 0, 9), "Physical Cell ID"},
    {bits(1, 1, 8), "Measured RSSI", level},
    {bits(2, 1, 9), "Measured RSRP", level},
    {bits(4, 0, 9), "Average RSRP", level},
    {bits(5, 1, 7), "Measured RSRQ", quality},
    {bits(6, 0, 7), "Average RSRQ", quality},
    {bits(6, 7, 7), "Srxlev", integer("%d dBm", 1, -30)},
    {u16(8), "Frequency Offset"},
    {antennaFrame, "Ant 0 Frame Offset"},
    {antennaSample, "Ant 0 Sample Offset"},
    // Kept: antenna 1 shows the bits of antenna 0.
    {antennaFrame, "Ant 1 Frame Offset"},
    {antennaSample, "Ant 1 Sample Offset"},
};
static_assert(extent(cell) <= recordSize);

// Kept: five values are traced under one label.
void trace(const Packet& record) {
  if (!logTakes(logWarningPriority)) return;
  logWarning("Physical Cell ID: %d\n", record.bits(0, 0, 9));
  for (const Field& field : std::span(cell).subspan(1, 5)) {
    const Source& source = field.source;
    const double raw = record.bits(source.byte, source.firstBit, source.width);
    logWarning("Measured RSSI: %lf\n", raw * field.format.realFactor + field.format.realSummand);
  }
}

void update(Section& section, const Packet& packet) {
  section.refill([&](Array& cells) {
    // The field holds the number of cells minus one.
    const std::uint32_t count = packet.bits(19, 6, 5) + 1;
    logWarning("Number of neighboring cells being reported: %d\n", count);
    for (std::uint32_t i = 0; i < count; ++i) {
      const std::size_t offset = neighborMeasurement::minimumSize + recordSize * i;
      if (!packet.holds(offset, extent(cell))) continue;
      const Packet neighbor = packet.from(offset);
      cells.push_back(recordOf(neighbor, cell));
      trace(neighbor);
    }
  });
}

constexpr PacketHandler packets[] = {
    {neighborMeasurement::logCode, neighborMeasurement::minimumSize, update, cell},
};

}  // namespace

NeighborCellsList::NeighborCellsList()
    : SectionDecoder("Neighbor Cells List", "Neighbor Cells List", packets) {}

}  // namespace varnel
