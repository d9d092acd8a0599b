#include "LogGenerator/KLV/GSMUMTS/BLER.h"

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::size_t minimumSize = 16;
constexpr std::size_t countOffset = 13;
constexpr std::size_t recordSize = 9;

constexpr Field window[] = {
    {u16(14), "Window Size"},
};
static_assert(extent(window) <= minimumSize);

constexpr Field channel[] = {
    {u8(0), "Transport Channel ID"},
    {u32(1), "CRC Received"},
    {u32(5), "CRC Received in Error"},
};
static_assert(extent(channel) <= recordSize);

void update(Section& section, const Packet& packet) {
  section.show(packet, window);
  Array channels;
  addCountedRecords(channels, packet, {minimumSize, recordSize, packet.u8(countOffset)}, channel);
  section.set("Transport Channels", Value::ofArray(std::move(channels)));
}

constexpr PacketHandler packets[] = {
    {0x4116, minimumSize, update},
};

}  // namespace

BLER::BLER() : SectionDecoder("BLER", "BLER", packets) {}

}  // namespace varnel
