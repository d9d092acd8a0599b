#include "LogGenerator/KLV/UTRAN/GSMNeighbhorMeasurements.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0xD00E;
constexpr std::size_t minimumSize = 17;
constexpr std::size_t countOffset = 16;
constexpr std::size_t recordSize = 8;

constexpr Field cell[] = {
    {bits(0, 0, 14), "Cell ID"},
    {bits(1, 6, 1), "Band Indicator"},
    {bits(1, 7, 1), "BSIC Valid"},
    {u8(2), "NCC"},
    {u8(3), "BCC"},
    {u16(4), "ARFCN"},
    {s16(6), "RSSI"},
};
static_assert(within(cell, recordSize));

}  // namespace

constinit const PacketHandlers<GSMNeighbhorMeasurements> GSMNeighbhorMeasurements::handlers = {
    {logCode, minimumSize, &GSMNeighbhorMeasurements::update},
};

void GSMNeighbhorMeasurements::update(const Packet& packet) {
  clearElementsInArray(list());
  replaceArray_With(list(), recordRows(packet, {minimumSize, recordSize, packet.u8(countOffset)}, cell));
}

}  // namespace varnel
