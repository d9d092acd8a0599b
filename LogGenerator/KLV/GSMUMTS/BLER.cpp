#include "LogGenerator/KLV/GSMUMTS/BLER.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0x4116;
constexpr std::size_t minimumSize = 16;
constexpr std::size_t countOffset = 13;
constexpr std::size_t recordSize = 9;

constexpr Field window[] = {
    {u16(14), "Window Size"},
};
static_assert(within(window, minimumSize));

constexpr Field channel[] = {
    {u8(0), "Transport Channel ID"},
    {u32(1), "CRC Received"},
    {u32(5), "CRC Received in Error"},
};
static_assert(within(channel, recordSize));

}  // namespace

constinit const PacketHandlers<BLER> BLER::handlers = {
    {logCode, minimumSize, &BLER::update},
};

void BLER::update(const Packet& packet) {
  setFields(rows(), packet, window);
  const Records channels = {minimumSize, recordSize, packet.u8(countOffset)};
  rows().set("Transport Channels", Value::ofArray(countedRows(packet, channels, channel)));
}

}  // namespace varnel
