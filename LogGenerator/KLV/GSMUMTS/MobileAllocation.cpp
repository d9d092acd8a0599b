#include "LogGenerator/KLV/GSMUMTS/MobileAllocation.h"

#include <string>

#include "LogGenerator/Field.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0x51F8;
constexpr std::size_t minimumSize = 15;
constexpr std::size_t countOffset = 14;
constexpr std::size_t channelSize = 2;

constexpr Field hopping[] = {
    {u8(13), "HSN"},
};
static_assert(within(hopping, minimumSize));

}  // namespace

constinit const PacketHandlers<MobileAllocation> MobileAllocation::handlers = {
    {logCode, minimumSize, &MobileAllocation::update},
};

void MobileAllocation::update(const Packet& packet) {
  setFields(rows(), packet, hopping);
  Array channels;
  for (std::size_t i = 0; i < packet.u8(countOffset); ++i) {
    channels.emplace_back(std::to_string(packet.u16(minimumSize + channelSize * i)));
  }
  rows().set("ARFCNs", Value::ofArray(std::move(channels)));
}

}  // namespace varnel
