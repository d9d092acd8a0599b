#include "LogGenerator/KLV/UTRAN/UTRANServingCellInfo.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace varnel {

namespace {

constexpr Choice access[] = {{0, "All Calls"}};

constexpr Field servingCell[] = {
    {u8(14), "Cell Access Restrictions"},
    {u32(21), "Cell ID"},
    {u16(19), "Downlink UARFCN"},
    {u16(17), "Uplink UARFCN"},
    {u8(15), "URA ID"},
    {bits(25, 0, 1), "Allowed Access", choice(access, "Emergency Calls Only")},
};

constexpr CellMonitorEntry cellMonitorEntries[] = {
    {cellMonitor::lac, "Local Area Code", "Serving Cell Info: Failed to retrieve LAC\n"},
    {cellMonitor::cellIdentity, "Cell ID", "Serving Cell Info: Failed to retrieve Cell ID\n"},
    {cellMonitor::bandInfo, "Freq Band Indicator",
     "Serving Cell Info: Failed to retrieve Freq Band Indicator\n"},
    {cellMonitor::scramblingCode, "Cell Scrambling Code",
     "Serving Cell Info: Failed to retrieve Cell Scrambling Code\n"},
    {cellMonitor::uarfcn, "Uplink UARFCN", "Serving Cell Info: Failed to retrieve UARFCN\n"},
};

void showCells(Section& section, const Array& cells) {
  // Shows every serving cell in turn, so the last one stays.
  for (const Value& record : cells) {
    const Dictionary* cell = cellOfKind(record, cellMonitor::utran, cellMonitor::serving);
    if (!cell) continue;
    showCell(section, *cell, cellMonitorEntries);
    // Kept: the same channel number goes into both entries.
    if (const auto channel = cell->get(cellMonitor::uarfcn).int32())
      section.setText("Downlink UARFCN", std::to_string(*channel));
  }
}

}  // namespace

constexpr PacketHandler UTRANServingCellInfo::packets[] = {
    {0xD0E2, 26, servingCell},
    {cellMonitorLogCode, 0, calling<&UTRANServingCellInfo::showCellMonitor>},
};

UTRANServingCellInfo::UTRANServingCellInfo(CellMonitorReader* cellMonitor)
    : SectionDecoder("Serving Cell Info", "Serving Cell Info", packets, UnknownCodes::Ignored),
      _cellMonitor(cellMonitor) {}

void UTRANServingCellInfo::showCellMonitor(const Packet& packet) {
  if (_cellMonitor) {
    if (const Array* const cells = _cellMonitor->parse(packet)) showCells(sectionRef, *cells);
  } else if (const auto cells = readCellMonitorArray(packet)) {
    showCells(sectionRef, *cells->array());
  }
}

}  // namespace varnel
