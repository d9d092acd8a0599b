#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr Field cell[] = {
    {u16(2), "Scrambling Code"},
    {s8(4), "RSCP", integer("%d dB", 1, -21)},
    {s8(7), "Energy Per Chip", real("%f dB", 0.5)},
    // Kept: a channel number is read as signed.
    {s16(0), "Downlink Frequency"},
    {s16(8), "Ranking Value"},
    {s16(5), "Rank Cell RSCP", integer("%d dB")},
};
static_assert(extent(cell) <= cellRanking::umtsRecordSize);

using Width = CellMonitorColumn::Width;
constexpr CellMonitorColumn cellMonitorColumns[] = {
    {cellMonitor::uarfcn, "UARFCN", "UMTSSet: Failed to retrieve UARFCN\n", Width::Unsigned16},
    {cellMonitor::scramblingCode, "Scrambling Code", "UMTSSet: Failed to retrieve Scrambling Code\n",
     Width::Unsigned16},
    {cellMonitor::rscp, "RSCP", "UMTSSet: Failed to retrieve RSCP\n", Width::Signed16, integer("%d dBm")},
    {cellMonitor::ecN0, "Energy Per Chip", "UMTSSet: Failed to retrieve Energy Per Chip\n", Width::Signed16,
     integer("%d dB")},
};

void showRanking(Section& section, const Packet& packet) {
  using namespace cellRanking;
  section.refill([&](Array& cells) {
    addCountedRecords(cells, packet, {firstRecord, umtsRecordSize, packet.u8(umtsCountOffset)}, cell);
  });
}

}  // namespace

constinit const PacketHandler UMTSSet::packets[] = {
    {cellRanking::logCode, cellRanking::minimumSize, showRanking, cell},
    {cellMonitorLogCode, 0, calling<&UMTSSet::updateFromCellMonitor>},
};

UMTSSet::UMTSSet(CellMonitorReader& cellMonitor) : UMTSSet(cellMonitor, packets) {}

UMTSSet::UMTSSet(CellMonitorReader& cellMonitor, std::span<const PacketHandler> handlers)
    : SectionDecoder("UMTS Set", "UMTSSet", handlers), _cellMonitor(cellMonitor) {}

std::span<const PacketHandler> UMTSSet::ownHandlers() { return packets; }

void UMTSSet::listNumberFormats(SectionFormats& formats) const {
  SectionDecoder::listNumberFormats(formats);
  formats.add(cellMonitorColumns);
}

void UMTSSet::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  sectionRef.refill([&](Array& cells) {
    if (records) addCells(cells, *records, cellMonitor::umts, cellMonitor::neighbor, cellMonitorColumns);
  });
}

}  // namespace varnel
