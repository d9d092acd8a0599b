#include "LogGenerator/KLV/GSMUMTS/MobileAllocation.h"

#include <string>

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::size_t minimumSize = 15;
constexpr std::size_t countOffset = 14;
constexpr std::size_t channelSize = 2;

constexpr Field hopping[] = {
    {u8(13), "HSN"},
};
static_assert(extent(hopping) <= minimumSize);

void update(Section& section, const Packet& packet) {
  section.show(packet, hopping);
  Array channels;
  for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
    channels.emplace_back(std::to_string(packet.u16(minimumSize + channelSize * i)));
  }
  section.set("ARFCNs", Value::ofArray(std::move(channels)));
}

constexpr PacketHandler packets[] = {
    {0x51F8, minimumSize, update},
};

}  // namespace

MobileAllocation::MobileAllocation() : SectionDecoder("Mobile Allocation", "MobileAllocation", packets) {}

}  // namespace varnel
