#include "programs/varnel-telephonyd/simulation/UMTSCells.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/UMTSCarrier.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t servingCellCode = 0x4127, cellSetsCode = 0x417A, rankingCode = 0x4005;
enum class CellSet { Active, Monitored, Detected };  // numbered as in the packets

constexpr std::int64_t weakestHeard_cdb = -20'00;  // the cell's share of the carrier's power
constexpr std::int64_t weakestGSM_cdbm = -104'00;
// The list of neighbors reaches to the next site.
constexpr std::int64_t listedDistance_cm = 260'00;
constexpr std::int64_t activeRange_cdb = 4'00;
constexpr int mostActive = 3;
constexpr std::size_t mostRanked = 8;
constexpr std::int64_t hysteresis_db = 4, offsetOfGSM_db = 6;

// The strongest first. The serving cell is always among them.
std::vector<ReceivedCell> heardCells(const Situation& situation) {
  auto cells = situation.walk.cells(Access::UMTS);
  std::erase_if(cells, [&](const ReceivedCell& received) {
    return received.cell != &situation.serving &&
           umtsEcN0_cdb(situation.walk, *received.cell) < weakestHeard_cdb;
  });
  return cells;
}

// The power on the carrier in tenths of a decibel. 0 stands for -54.8 dBm.
std::int64_t signalReading(std::int64_t rssi_cdbm) {
  constexpr std::int64_t weakest_cdbm = -106'00, atWeakest = -512;
  return (std::max(rssi_cdbm, weakest_cdbm) - weakest_cdbm) / 10 + atWeakest;
}

}  // namespace

Bytes umtsServingCell(const Situation& situation) {
  constexpr std::size_t size = 29;
  const Cell& cell = situation.serving;
  return PacketWriter(servingCellCode, situation.now, size)
      .u32(13, uplinkUARFCN(cell.channel))
      .u32(17, cell.channel)
      .u32(21, cell.identity)
      .u16(25, cell.area)  // each location area is a registration area
      .finish();
}

Bytes umtsCellSets(const Situation& situation, UTRANConnection::State state, Random& random) {
  constexpr std::size_t headSize = 16, cellSize = 15, energiesSize = 44;
  const auto cells = heardCells(situation);
  PacketWriter packet(cellSetsCode, situation.now, headSize);
  packet.u16(13, signalReading(umtsRSSI_cdbm(situation.walk))).u8(15, std::ssize(cells));

  int othersLeft = state == UTRANConnection::State::CellDCH ? mostActive - 1 : 0;
  for (const auto& [cell, level_cdbm] : cells) {
    CellSet set = CellSet::Detected;
    if (cell == &situation.serving ||
        (cells.front().level_cdbm - level_cdbm <= activeRange_cdb && othersLeft-- > 0))
      set = CellSet::Active;
    else if (situation.walk.distance_cm(*cell, situation.serving) <= listedDistance_cm)
      set = CellSet::Monitored;
    packet.record(cellSize).bits(7, 0, 13, cell->code).bits(8, 5, 3, static_cast<std::int64_t>(set));
  }
  for (const ReceivedCell& received : cells) {
    packet.record(energiesSize);
    // There are three searches after each other. The first ones may miss the cell.
    const std::int64_t energy = umtsEnergy(umtsEcN0_cdb(situation.walk, *received.cell));
    const std::int64_t firstFound = random.oneIn(5) ? random.between(1, 2) : 0;
    for (std::int64_t search = firstFound; search < 3; ++search)
      packet.u32(32 + 4 * static_cast<std::size_t>(search), energy);
  }
  return packet.finish();
}

Bytes umtsRanking(const Situation& situation) {
  constexpr std::size_t headSize = 15, recordSize = 10;
  constexpr std::int64_t rscpZero_dbm = -21;
  auto cells = heardCells(situation);
  cells.resize(std::min(cells.size(), mostRanked));

  PacketWriter packet(rankingCode, situation.now, headSize);
  packet.u8(13, std::ssize(cells)).u8(14, 0);
  for (const auto& [cell, level_cdbm] : cells) {
    const std::int64_t rscp_dbm = level_cdbm / 100;
    packet.record(recordSize)
        .u16(0, cell->channel)
        .u16(2, cell->code)
        .u8(4, rscp_dbm - rscpZero_dbm)
        .u16(5, rscp_dbm)
        .u8(7, umtsEcN0_cdb(situation.walk, *cell) / 50)  // in steps of half a decibel
        .u16(8, cell == &situation.serving ? rscp_dbm + hysteresis_db : rscp_dbm);
  }
  return packet.finish();
}

Bytes gsmRanking(const Situation& situation) {
  constexpr std::size_t headSize = 15, recordSize = 7;
  auto cells = situation.walk.cells(Access::GSM);
  std::erase_if(cells, [](const ReceivedCell& received) { return received.level_cdbm < weakestGSM_cdbm; });

  PacketWriter packet(rankingCode, situation.now, headSize);
  packet.u8(13, 0).u8(14, std::ssize(cells));
  for (const auto& [cell, level_cdbm] : cells) {
    const std::int64_t rssi_dbm = level_cdbm / 100;
    packet.record(recordSize)
        .u16(0, cell->channel)
        .u16(2, cell->code)
        .u8(4, rssi_dbm)
        .u16(5, rssi_dbm - offsetOfGSM_db);
  }
  return packet.finish();
}

}  // namespace varnel::simulation
