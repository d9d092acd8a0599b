#include "programs/varnel-telephonyd/simulation/Town.h"

namespace varnel::simulation {

namespace {

constexpr int siteCount = 12;
constexpr int sitesPerArea = 4;
constexpr std::int64_t siteSpacing_cm = 180'00;

struct Carrier {
  int band, channel, resourceBlocks, antennas;
};
// The carrier that every LTE site has, and those of which it may have one more.
constexpr Carrier commonCarrier{3, 1300, 100, 2};
constexpr Carrier furtherCarriers[] = {
    {7, 2850, 75, 4},
    {8, 3625, 25, 1},
    {20, 6300, 50, 2},
    {38, 37900, 100, 2},
};
constexpr int umtsBand = 1, umtsChannel = 10588;
constexpr int gsmBand = 900, firstGSMChannel = 10, lastGSMChannel = 50;

// What the cells of one site have in common.
struct Site {
  int number;
  int area;
  std::int64_t position_cm;
  std::int64_t setback_cm;
};

class Builder {
 public:
  explicit Builder(Random random) : _random(random) {
    _firstSite = static_cast<std::uint32_t>(_random.between(1000, 9000));
    _firstArea = static_cast<int>(_random.between(100, 60000));
  }

  Town build() {
    for (int number = 0; number < siteCount; ++number) {
      const Site site{number, _firstArea + number / sitesPerArea,
                      number * siteSpacing_cm + _random.between(-20'00, 20'00),
                      _random.between(15'00, 50'00)};
      addLTE(site, commonCarrier, 1);
      addLTE(site, furtherCarriers[_random.between(0, std::ssize(furtherCarriers) - 1)], 11);
      addUMTS(site);
      if (number % 2 == 0) addGSM(site);
    }
    return {siteCount * siteSpacing_cm, std::move(_cells)};
  }

 private:
  // Two sectors, one up the street and one down.
  void addLTE(const Site& site, const Carrier& carrier, std::uint32_t firstSector) {
    const auto group = static_cast<int>(_random.between(0, 167));
    for (int sector = 0; sector < 2; ++sector) {
      _cells.push_back({.access = Access::LTE,
                        .band = carrier.band,
                        .channel = carrier.channel,
                        .resourceBlocks = carrier.resourceBlocks,
                        .antennas = carrier.antennas,
                        .code = 3 * group + sector,
                        .area = site.area,
                        .identity = (_firstSite + static_cast<std::uint32_t>(site.number)) << 8 |
                                    (firstSector + static_cast<std::uint32_t>(sector)),
                        .position_cm = site.position_cm,
                        .setback_cm = site.setback_cm,
                        .direction = sector == 0 ? 1 : -1,
                        .power_cdbm = power(-15'00)});
    }
  }
  void addUMTS(const Site& site) {
    _cells.push_back({.access = Access::UMTS,
                      .band = umtsBand,
                      .channel = umtsChannel,
                      .resourceBlocks = 0,
                      .antennas = 1,
                      .code = static_cast<int>(_random.between(0, 511)),
                      .area = site.area,
                      .identity = 0x10000u + _firstSite + static_cast<std::uint32_t>(site.number),
                      .position_cm = site.position_cm,
                      .setback_cm = site.setback_cm,
                      .direction = 0,
                      .power_cdbm = power(-12'00)});
  }
  void addGSM(const Site& site) {
    _cells.push_back({.access = Access::GSM,
                      .band = gsmBand,
                      .channel = static_cast<int>(_random.between(firstGSMChannel, lastGSMChannel)),
                      .resourceBlocks = 0,
                      .antennas = 1,
                      .code = static_cast<int>(_random.between(0, 63)),
                      .area = site.area,
                      .identity = 20000u + static_cast<std::uint32_t>(site.number),
                      .position_cm = site.position_cm,
                      .setback_cm = site.setback_cm,
                      .direction = 0,
                      .power_cdbm = power(-4'00)});
  }

  std::int64_t power(std::int64_t usual_cdbm) { return usual_cdbm + _random.between(-1'50, 1'50); }

  Random _random;
  std::uint32_t _firstSite;
  int _firstArea;
  std::vector<Cell> _cells;
};

}  // namespace

Town Town::build(Random random) { return Builder(random).build(); }

}  // namespace varnel::simulation
