#include "LogGenerator/KLV/GSMUMTS/GSMSet.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/CellRanking.h"
#include "LogGenerator/NumberFormats.h"

namespace varnel {

namespace {

constexpr std::size_t recordSize = 7;

constexpr Field cell[] = {
    {u16(0), "ARFCN"},
    {u16(2), "BSIC"},
    {s8(4), "RSSI", integer("%d dBm")},
    {s16(5), "Ranking Value"},
};
static_assert(within(cell, recordSize));

}  // namespace

constinit const PacketHandlers<GSMSet> GSMSet::handlers = {
    {cellRanking::logCode, cellRanking::minimumSize, &GSMSet::update},
};

void GSMSet::listNumberFormats(SectionFormats& formats) const { formats.add(cell); }

void GSMSet::update(const Packet& packet) {
  using namespace cellRanking;
  clearElementsInArray(list());
  const Records cells = {firstRecord, recordSize, packet.u8(gsmCountOffset)};
  replaceArray_With(list(), countedRows(packet, cells, cell));
}

}  // namespace varnel
