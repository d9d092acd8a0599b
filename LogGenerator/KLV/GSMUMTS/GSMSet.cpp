#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"

namespace varnel {

namespace {

constexpr std::size_t recordSize = 7;

constexpr Field cell[] = {
    {u16(0), "ARFCN"},
    {u16(2), "BSIC"},
    {s8(4), "RSSI", integer("%d dBm")},
    {s16(5), "Ranking Value"},
};
static_assert(extent(cell) <= recordSize);

void update(Section& section, const Packet& packet) {
  using namespace cellRanking;
  section.refill([&](Array& cells) {
    addCountedRecords(cells, packet, {firstRecord, recordSize, packet.u8(gsmCountOffset)}, cell);
  });
}

constexpr PacketHandler packets[] = {
    {cellRanking::logCode, cellRanking::minimumSize, update, cell},
};

}  // namespace

GSMSet::GSMSet() : SectionDecoder("GSM Set", "GSMSet", packets) {}

}  // namespace varnel
