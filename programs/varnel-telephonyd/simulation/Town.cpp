#include "programs/varnel-telephonyd/simulation/Town.h"

#include <utility>

namespace varnel::simulation {

namespace {

constexpr int siteCount = 12;
constexpr int sitesPerArea = 4;
constexpr std::int64_t siteSpacing_cm = 180'00;

struct Carrier {
  int band, channel, resourceBlocks, antennas;
};
// The carrier of every LTE site, and those of which a site may have one more.
constexpr Carrier commonCarrier{3, 1300, 100, 2};
constexpr Carrier furtherCarriers[] = {
    {7, 2850, 75, 4},
    {8, 3625, 25, 1},
    {20, 6300, 50, 2},
    {38, 37900, 100, 2},
};
constexpr int umtsBand = 1, umtsChannel = 10588;
// The carriers of the time-division mode. Sites use them in turn.
constexpr int utranBand = 34, utranChannels[] = {10054, 10062, 10070};
constexpr int cdmaBandClass = 0, cdma1xRTTChannel = 283, hrpdChannel = 78, pilotIncrement = 4;
constexpr int gsmBand = 900, firstGSMChannel = 10, lastGSMChannel = 50;

// The directions of a site's two sectors.
constexpr int directions[] = {1, -1};

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
    std::vector<Site> sites;
    for (int number = 0; number < siteCount; ++number) {
      const Site site{number, _firstArea + number / sitesPerArea,
                      number * siteSpacing_cm + _random.between(-20'00, 20'00),
                      _random.between(15'00, 50'00)};
      addLTE(site, commonCarrier, 1);
      addLTE(site, furtherCarriers[_random.between(0, std::ssize(furtherCarriers) - 1)], 11);
      addUMTS(site);
      if (number % 2 == 0) addGSM(site);
      sites.push_back(site);
    }
    // The newest networks come last, so that the older ones stay as they were.
    for (const Site& site : sites) {
      addUTRAN(site);
      if (site.number % 2 == 1) addCDMA(site);
    }
    return {siteCount * siteSpacing_cm, std::move(_cells)};
  }

 private:
  void add(const Site& site, Cell cell) {
    cell.area = site.area;
    cell.position_cm = site.position_cm;
    cell.setback_cm = site.setback_cm;
    _cells.push_back(cell);
  }

  // Two sectors, one per direction of the street.
  void addLTE(const Site& site, const Carrier& carrier, std::uint32_t firstSector) {
    const auto group = static_cast<int>(_random.between(0, 167));
    for (int sector = 0; sector < 2; ++sector) {
      add(site, {.access = Access::LTE,
                 .band = carrier.band,
                 .channel = carrier.channel,
                 .resourceBlocks = carrier.resourceBlocks,
                 .antennas = carrier.antennas,
                 .code = 3 * group + sector,
                 .identity = (_firstSite + static_cast<std::uint32_t>(site.number)) << 8 |
                             (firstSector + static_cast<std::uint32_t>(sector)),
                 .direction = directions[sector],
                 .power_cdbm = power(-15'00)});
    }
  }
  void addUMTS(const Site& site) {
    add(site, {.access = Access::UMTS,
               .band = umtsBand,
               .channel = umtsChannel,
               .code = static_cast<int>(_random.between(0, 511)),
               .identity = 0x10000u + _firstSite + static_cast<std::uint32_t>(site.number),
               .power_cdbm = power(-12'00)});
  }
  void addGSM(const Site& site) {
    add(site, {.access = Access::GSM,
               .band = gsmBand,
               .channel = static_cast<int>(_random.between(firstGSMChannel, lastGSMChannel)),
               .code = static_cast<int>(_random.between(0, 63)),
               .network = partnerNetwork,
               .identity = 12000u + static_cast<std::uint32_t>(site.number),
               .power_cdbm = power(-4'00)});
  }
  // Two sectors on one carrier.
  void addUTRAN(const Site& site) {
    const auto firstSector = static_cast<std::uint32_t>(site.number) * 2;
    // The steps keep the codes of the town apart.
    const auto code = static_cast<int>(_random.between(0, 3)) + 10 * site.number;
    for (int sector = 0; sector < 2; ++sector) {
      add(site, {.access = Access::UTRAN,
                 .band = utranBand,
                 .channel = utranChannels[site.number % std::ssize(utranChannels)],
                 .code = code + 4 * sector,
                 .identity = 0x20000u + _firstSite + firstSector + static_cast<std::uint32_t>(sector),
                 .direction = directions[sector],
                 .power_cdbm = power(-12'00)});
    }
  }
  // The voice network and the data network share masts and pilots.
  void addCDMA(const Site& site) {
    const int pilot = pilotIncrement * static_cast<int>(_random.between(1, 511 / pilotIncrement));
    const std::uint32_t identity = 100 + static_cast<std::uint32_t>(site.number);
    for (const auto& [access, channel] :
         {std::pair(Access::CDMA1xRTT, cdma1xRTTChannel), std::pair(Access::HRPD, hrpdChannel)}) {
      add(site, {.access = access,
                 .band = cdmaBandClass,
                 .channel = channel,
                 .code = pilot,
                 .identity = identity,
                 .power_cdbm = power(-6'00)});
    }
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
