#include "programs/varnel-telephonyd/simulation/GSMCells.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t connectionStateCode = 0x512C, servingCellCode = 0x5134, measurementsCode = 0x5137,
                        neighborIdentitiesCode = 0x51FF, mobileAllocationCode = 0x51F8,
                        dedicatedChannelCode = 0x5076, discontinuousTransmissionCode = 0x5072;

constexpr std::int64_t weakestNeighbor_cdbm = -106'00, weakestIdentified_cdbm = -95'00;
constexpr std::size_t mostNeighbors = 6;
// Broadcast by the network.
constexpr std::int64_t minimumLevel_cdbm = -102'00, reselectionOffset_db = 4;

// TS 45.008: the level in decibels above -110 dBm, the path loss criterion, and the quality from the error
// rate.
std::int64_t receiveLevel(std::int64_t level_cdbm) {
  return std::clamp<std::int64_t>(level_cdbm / 100 + 110, 0, 63);
}
std::int64_t pathLossCriterion_db(std::int64_t level_cdbm) {
  return receiveLevel(level_cdbm) - receiveLevel(minimumLevel_cdbm);
}
std::int64_t receiveQuality(std::int64_t level_cdbm) {
  constexpr std::int64_t perfect_cdbm = -80'00, step_cdb = 4'00;
  return std::clamp<std::int64_t>((perfect_cdbm - level_cdbm) / step_cdb, 0, 7);
}

// The strongest first. Only the strongest cell on a channel is received.
std::vector<ReceivedCell> neighbors(const Situation& situation) {
  std::vector<ReceivedCell> heard;
  for (const ReceivedCell& received : situation.walk.cells(Access::GSM)) {
    const bool isDrowned = received.cell->channel == situation.serving.channel ||
                           std::ranges::any_of(heard, [&](const ReceivedCell& stronger) {
                             return stronger.cell->channel == received.cell->channel;
                           });
    if (!isDrowned && received.level_cdbm >= weakestNeighbor_cdbm && heard.size() < mostNeighbors)
      heard.push_back(received);
  }
  return heard;
}

constexpr int hoppingChannels = 6, hoppingStep = 5;
// The first of the channels over which a cell's calls hop. No cell broadcasts on these.
int firstHoppingChannel(const Cell& cell) { return 60 + static_cast<int>(cell.identity % 5); }

}  // namespace

Bytes gsmConnectionState(const Situation& situation, const GSMConnection& connection) {
  constexpr std::size_t size = 17;
  return PacketWriter(connectionStateCode, situation.now, size)
      .u8(13, static_cast<std::int64_t>(connection.state()))
      .u8(14, connection.state() == GSMConnection::State::Transfer ? 1 : 0)
      .u8(15, 0)
      .u8(16, connection.traffic() == GSMConnection::Traffic::Data)
      .finish();
}

Bytes gsmServingCell(const Situation& situation) {
  constexpr std::size_t size = 26;
  const Cell& cell = situation.serving;
  return PacketWriter(servingCellCode, situation.now, size)
      .u16(13, cell.channel)
      .u16(15, cell.code)
      .u16(17, cell.identity)
      .finish();
}

Bytes gsmMeasurements(const Situation& situation, const GSMConnection& connection) {
  constexpr std::size_t headSize = 29, recordSize = 14;
  const auto cells = neighbors(situation);
  const std::int64_t level_cdbm = situation.walk.level_cdbm(situation.serving);
  const bool isTransferring = connection.state() == GSMConnection::State::Transfer;
  const bool isTransferringData = isTransferring && !connection.isSpeaking();

  PacketWriter packet(measurementsCode, situation.now, headSize);
  packet.u8(15, receiveLevel(level_cdbm));
  if (connection.isSpeaking()) {
    const std::int64_t quality = receiveQuality(level_cdbm);
    packet.u32(16, quality).u32(20, std::min<std::int64_t>(quality + 1, 7));
  } else {
    const std::int64_t criterion_db = std::max<std::int64_t>(pathLossCriterion_db(level_cdbm), 0);
    packet.u32(16, criterion_db).u32(20, criterion_db + reselectionOffset_db);
  }
  // A phone that transfers data should rarely change its cell.
  packet.u8(26, isTransferringData).u8(28, std::ssize(cells));
  for (const auto& [cell, neighborLevel_cdbm] : cells)
    packet.record(recordSize)
        .u16(0, cell->channel)
        .u8(2, receiveLevel(neighborLevel_cdbm))
        .u32(3, pathLossCriterion_db(neighborLevel_cdbm));
  return packet.finish();
}

Bytes gsmNeighborIdentities(const Situation& situation) {
  constexpr std::size_t headSize = 15, recordSize = 4;
  auto cells = neighbors(situation);
  std::erase_if(cells,
                [](const ReceivedCell& received) { return received.level_cdbm < weakestIdentified_cdbm; });
  PacketWriter packet(neighborIdentitiesCode, situation.now, headSize);
  packet.u8(14, std::ssize(cells));
  for (const ReceivedCell& received : cells)
    packet.record(recordSize).u16(0, received.cell->channel).u8(2, received.cell->code);
  return packet.finish();
}

Bytes gsmMobileAllocation(const Situation& situation) {
  constexpr std::size_t headSize = 15, entrySize = 2;
  constexpr int sequences = 64;
  PacketWriter packet(mobileAllocationCode, situation.now, headSize);
  packet.u8(13, situation.serving.identity % sequences).u8(14, hoppingChannels);
  for (int i = 0; i < hoppingChannels; ++i)
    packet.record(entrySize).u16(0, firstHoppingChannel(situation.serving) + hoppingStep * i);
  return packet.finish();
}

Bytes gsmDedicatedChannel(const Situation& situation, Random& random) {
  constexpr std::size_t size = 17;
  const std::int64_t hop = random.between(0, hoppingChannels - 1);
  return PacketWriter(dedicatedChannelCode, situation.now, size)
      .u16(13, firstHoppingChannel(situation.serving) + hoppingStep * hop)
      .finish();
}

Bytes gsmDiscontinuousTransmission(const Situation& situation, Random& random) {
  constexpr std::size_t size = 20;
  return PacketWriter(discontinuousTransmissionCode, situation.now, size).u8(19, random.oneIn(2)).finish();
}

}  // namespace varnel::simulation
