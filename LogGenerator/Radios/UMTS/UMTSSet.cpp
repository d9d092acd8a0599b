#include "LogGenerator/Radios/UMTS/UMTSSet.h"

#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"
#include "LogGenerator/Radios/CorrectedHandlers.h"

namespace varnel::radios {

namespace {

constexpr Field cell[] = {
    {u16(2), "Scrambling Code"},
    {s8(4), "RSCP", integer("%d dBm", 1, -21)},
    {s8(7), "Energy Per Chip", real("%f dB", 0.5)},
    {u16(0), "Downlink Frequency"},
    {s16(8), "Ranking Value"},
    {s16(5), "Rank Cell RSCP", integer("%d dB")},
};
static_assert(extent(cell) <= cellRanking::umtsRecordSize);

void showRanking(Section& section, const Packet& packet) {
  using namespace cellRanking;
  section.refill([&](Array& cells) {
    addRecords(cells, packet, {minimumSize, umtsRecordSize, packet.u8(umtsCountOffset)}, cell);
  });
}

constexpr PacketHandler corrections[] = {
    {cellRanking::logCode, cellRanking::minimumSize, showRanking, cell},
};

std::span<const PacketHandler> withCorrections(std::span<const PacketHandler> handlers) {
  static const auto all = correctedHandlers(handlers, corrections);
  return all;
}

}  // namespace

UMTSSet::UMTSSet(CellMonitorReader& cellMonitor)
    : varnel::UMTSSet(cellMonitor, withCorrections(ownHandlers())) {}

}  // namespace varnel::radios
