#include "LogGenerator/KLV/GSMUMTS/UMTSSet.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"
#include "LogGenerator/NumberFormats.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr std::size_t recordSize = 10;

constexpr Field cell[] = {
    {u16(2), "Scrambling Code"},
    {s8(4), "RSCP", integer("%d dB", 1, -21)},
    {s8(7), "Energy Per Chip", real("%f dB", 0.5)},
    // Kept: a channel number with a sign.
    {s16(0), "Downlink Frequency"},
    {s16(8), "Ranking Value"},
    {s16(5), "Rank Cell RSCP", integer("%d dB")},
};
static_assert(within(cell, recordSize));

using Width = CellMonitorColumn::Width;
constexpr CellMonitorColumn cellMonitorColumns[] = {
    {cellMonitor::uarfcn, "UARFCN", "UMTSSet: Failed to retrieve UARFCN\n", Width::Unsigned16},
    {cellMonitor::scramblingCode, "Scrambling Code", "UMTSSet: Failed to retrieve Scrambling Code\n",
     Width::Unsigned16},
    {cellMonitor::rscp, "RSCP", "UMTSSet: Failed to retrieve RSCP\n", Width::Signed16, integer("%d dBm")},
    {cellMonitor::ecN0, "Energy Per Chip", "UMTSSet: Failed to retrieve Energy Per Chip\n", Width::Signed16,
     integer("%d dB")},
};

}  // namespace

constinit const PacketHandlers<UMTSSet> UMTSSet::handlers = {
    {cellRanking::logCode, cellRanking::minimumSize, &UMTSSet::updateFromRanking},
    {cellMonitorLogCode, 0, &UMTSSet::updateFromCellMonitor},
};

void UMTSSet::listNumberFormats(SectionFormats& formats) const {
  formats.add(cell);
  formats.add(cellMonitorColumns);
}

void UMTSSet::updateFromRanking(const Packet& packet) {
  using namespace cellRanking;
  clearElementsInArray(list());
  const Records cells = {firstRecord, recordSize, packet.u8(umtsCountOffset)};
  replaceArray_With(list(), countedRows(packet, cells, cell));
}

void UMTSSet::updateFromCellMonitor(const Packet& packet) {
  const Array* records = _cellMonitor.read(packet);
  clearElementsInArray(list());
  if (!records) return;
  replaceArray_With(list(),
                    cellMonitorList(*records, cellMonitor::umts, cellMonitor::neighbor, cellMonitorColumns));
}

}  // namespace varnel
