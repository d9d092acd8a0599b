#include "programs/varnel-telephonyd/simulation/radios/Towns.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

constexpr int mastBand = 3;
// TS 38.104: 3486.72 MHz, a place for synchronization signals.
constexpr int nrBand = 78, nrChannel = 632448;
// NR reaches less far than LTE.
constexpr std::int64_t nrLoss_cdb = 6'00;

struct PartnerCarrier {
  int band, channel, resourceBlocks;
};
// None of them touches a carrier of the home network.
constexpr PartnerCarrier partnerCarriers[] = {
    {3, 1750, 75}, {7, 3200, 50}, {8, 3700, 25}, {20, 6200, 25}, {38, 38100, 100},
};
constexpr int partnerCodeShift = 123, partnerAreaShift = 1000;
constexpr std::uint32_t partnerIdentityShift = 50'000u << 8;

Cell nrCellBeside(const Cell& mast) {
  constexpr int physicalCells = 1008;
  Cell cell = mast;
  cell.access = Access::NR;
  cell.band = nrBand;
  cell.channel = nrChannel;
  cell.resourceBlocks = 0;
  cell.code = (2 * mast.code + 11) % physicalCells;
  cell.identity = mast.identity << 4;
  cell.power_cdbm -= nrLoss_cdb;
  return cell;
}

}  // namespace

Town townOfHome(Random random) {
  Town town = Town::build(random);
  std::vector<Cell> masts;
  std::ranges::copy_if(town.cells, std::back_inserter(masts),
                       [](const Cell& cell) { return cell.access == Access::LTE && cell.band == mastBand; });
  for (const Cell& mast : masts) town.cells.push_back(nrCellBeside(mast));
  return town;
}

Town townOfPartner(Random random) {
  constexpr int physicalCells = 504;
  Town town = townOfHome(random);
  for (Cell& cell : town.cells) {
    if (cell.access != Access::LTE) continue;
    const PartnerCarrier& carrier = *std::ranges::find(partnerCarriers, cell.band, &PartnerCarrier::band);
    cell.channel = carrier.channel;
    cell.resourceBlocks = carrier.resourceBlocks;
    cell.code = (cell.code + partnerCodeShift) % physicalCells;
    cell.area += partnerAreaShift;
    cell.identity += partnerIdentityShift;
    cell.network = partnerNetwork;
  }
  return town;
}

}  // namespace varnel::simulation
