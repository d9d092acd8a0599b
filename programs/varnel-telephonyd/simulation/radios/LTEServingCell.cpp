#include "programs/varnel-telephonyd/simulation/radios/LTEServingCell.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"

namespace varnel::simulation {

namespace {
constexpr std::uint16_t masterInformationCode = 0xB0C1, servingCellCode = 0xB0C2;
}  // namespace

Bytes lteMasterInformation(const Situation& situation, ChannelWidth width) {
  const Cell& cell = situation.serving;
  const FrameClock clock(cell, situation.now);
  if (width == ChannelWidth::Bits16)
    return PacketWriter(masterInformationCode, situation.now, 22)
        .u8(13, 1)  // version
        .u16(14, cell.code)
        .u16(16, cell.channel)
        .u16(18, clock.frame)
        .u8(20, cell.antennas)
        .u8(21, cell.resourceBlocks)
        .finish();
  return PacketWriter(masterInformationCode, situation.now, 24)
      .u8(13, 2)  // version
      .u16(14, cell.code)
      .u32(16, cell.channel)
      .u16(20, clock.frame)
      .u8(22, cell.antennas)
      .u8(23, cell.resourceBlocks)
      .finish();
}

Bytes lteServingCell(const Situation& situation, ChannelWidth width) {
  constexpr std::size_t narrowSize = 38, wideSize = 42;
  const Cell& cell = situation.serving;
  const bool isWide = width == ChannelWidth::Bits32;
  PacketWriter packet(servingCellCode, situation.now, isWide ? wideSize : narrowSize);
  packet.u8(13, isWide ? 3 : 2).u16(14, cell.code);
  if (isWide)
    packet.u32(16, cell.channel).u32(20, uplinkEARFCN(cell.channel));
  else
    packet.u16(16, cell.channel).u16(18, uplinkEARFCN(cell.channel));
  const std::size_t rest = isWide ? 24 : 20;
  return packet.u8(rest, cell.resourceBlocks)
      .u8(rest + 1, cell.resourceBlocks)
      .u32(rest + 2, cell.identity)
      .u16(rest + 6, cell.area)
      .u32(rest + 8, cell.band)
      .u16(rest + 12, cell.network.countryCode)
      .u8(rest + 14, cell.network.networkCodeDigits)
      .u16(rest + 15, cell.network.networkCode)
      .u8(rest + 17, 0)  // full access
      .finish();
}

}  // namespace varnel::simulation
