#include "LogGenerator/Radios/Channels.h"

#include <algorithm>
#include <iterator>

namespace varnel::channels {

namespace {

/// Channel numbers, both ends included.
struct Range {
  std::uint32_t first = 1, last = 0;

  constexpr bool contains(std::uint32_t number) const { return first <= number && number <= last; }
  constexpr std::uint32_t steps() const { return last - first; }
  constexpr bool empty() const { return last < first; }
};

// ---- LTE ----

/// A carrier's frequency is the lowest of its direction and 100 kHz for each number behind the first one.
struct LTEBand {
  std::uint16_t number;
  std::int32_t downlinkLow_khz;
  Range downlink;
  std::int32_t uplinkLow_khz;
  Range uplink;  // empty where the band has none, the same as the downlink where both share a carrier
};

// 3GPP TS 36.101, table 5.7.3-1. The offsets N_Offs-DL and N_Offs-UL are the first numbers of the ranges.
// Bands from 107 on, and those of satellites (TS 36.102), are left out.
// clang-format off
constexpr LTEBand lteBands[] = {
    // Band  F_DL_low    N_DL              F_UL_low    N_UL
    {    1, 2'110'000, {    0,   599}, 1'920'000, { 18000,  18599}},
    {    2, 1'930'000, {  600,  1199}, 1'850'000, { 18600,  19199}},
    {    3, 1'805'000, { 1200,  1949}, 1'710'000, { 19200,  19949}},
    {    4, 2'110'000, { 1950,  2399}, 1'710'000, { 19950,  20399}},
    {    5,   869'000, { 2400,  2649},   824'000, { 20400,  20649}},
    {    6,   875'000, { 2650,  2749},   830'000, { 20650,  20749}},
    {    7, 2'620'000, { 2750,  3449}, 2'500'000, { 20750,  21449}},
    {    8,   925'000, { 3450,  3799},   880'000, { 21450,  21799}},
    {    9, 1'844'900, { 3800,  4149}, 1'749'900, { 21800,  22149}},
    {   10, 2'110'000, { 4150,  4749}, 1'710'000, { 22150,  22749}},
    {   11, 1'475'900, { 4750,  4949}, 1'427'900, { 22750,  22949}},
    {   12,   729'000, { 5010,  5179},   699'000, { 23010,  23179}},
    {   13,   746'000, { 5180,  5279},   777'000, { 23180,  23279}},
    {   14,   758'000, { 5280,  5379},   788'000, { 23280,  23379}},
    {   17,   734'000, { 5730,  5849},   704'000, { 23730,  23849}},
    {   18,   860'000, { 5850,  5999},   815'000, { 23850,  23999}},
    {   19,   875'000, { 6000,  6149},   830'000, { 24000,  24149}},
    {   20,   791'000, { 6150,  6449},   832'000, { 24150,  24449}},
    {   21, 1'495'900, { 6450,  6599}, 1'447'900, { 24450,  24599}},
    {   22, 3'510'000, { 6600,  7399}, 3'410'000, { 24600,  25399}},
    {   23, 2'180'000, { 7500,  7699}, 2'000'000, { 25500,  25699}},
    {   24, 1'525'000, { 7700,  8039}, 1'626'500, { 25700,  26039}},
    {   25, 1'930'000, { 8040,  8689}, 1'850'000, { 26040,  26689}},
    {   26,   859'000, { 8690,  9039},   814'000, { 26690,  27039}},
    {   27,   852'000, { 9040,  9209},   807'000, { 27040,  27209}},
    {   28,   758'000, { 9210,  9659},   703'000, { 27210,  27659}},
    {   29,   717'000, { 9660,  9769},         0, {}},
    {   30, 2'350'000, { 9770,  9869}, 2'305'000, { 27660,  27759}},
    {   31,   462'500, { 9870,  9919},   452'500, { 27760,  27809}},
    {   32, 1'452'000, { 9920, 10359},         0, {}},
    {   33, 1'900'000, {36000, 36199}, 1'900'000, { 36000,  36199}},
    {   34, 2'010'000, {36200, 36349}, 2'010'000, { 36200,  36349}},
    {   35, 1'850'000, {36350, 36949}, 1'850'000, { 36350,  36949}},
    {   36, 1'930'000, {36950, 37549}, 1'930'000, { 36950,  37549}},
    {   37, 1'910'000, {37550, 37749}, 1'910'000, { 37550,  37749}},
    {   38, 2'570'000, {37750, 38249}, 2'570'000, { 37750,  38249}},
    {   39, 1'880'000, {38250, 38649}, 1'880'000, { 38250,  38649}},
    {   40, 2'300'000, {38650, 39649}, 2'300'000, { 38650,  39649}},
    {   41, 2'496'000, {39650, 41589}, 2'496'000, { 39650,  41589}},
    {   42, 3'400'000, {41590, 43589}, 3'400'000, { 41590,  43589}},
    {   43, 3'600'000, {43590, 45589}, 3'600'000, { 43590,  45589}},
    {   44,   703'000, {45590, 46589},   703'000, { 45590,  46589}},
    {   45, 1'447'000, {46590, 46789}, 1'447'000, { 46590,  46789}},
    {   46, 5'150'000, {46790, 54539}, 5'150'000, { 46790,  54539}},
    {   47, 5'855'000, {54540, 55239}, 5'855'000, { 54540,  55239}},
    {   48, 3'550'000, {55240, 56739}, 3'550'000, { 55240,  56739}},
    {   49, 3'550'000, {56740, 58239}, 3'550'000, { 56740,  58239}},
    {   50, 1'432'000, {58240, 59089}, 1'432'000, { 58240,  59089}},
    {   51, 1'427'000, {59090, 59139}, 1'427'000, { 59090,  59139}},
    {   52, 3'300'000, {59140, 60139}, 3'300'000, { 59140,  60139}},
    {   53, 2'483'500, {60140, 60254}, 2'483'500, { 60140,  60254}},
    {   54, 1'670'000, {60255, 60304}, 1'670'000, { 60255,  60304}},
    {   65, 2'110'000, {65536, 66435}, 1'920'000, {131072, 131971}},
    {   66, 2'110'000, {66436, 67335}, 1'710'000, {131972, 132671}},
    {   67,   738'000, {67336, 67535},         0, {}},
    {   68,   753'000, {67536, 67835},   698'000, {132672, 132971}},
    {   69, 2'570'000, {67836, 68335},         0, {}},
    {   70, 1'995'000, {68336, 68585}, 1'695'000, {132972, 133121}},
    {   71,   617'000, {68586, 68935},   663'000, {133122, 133471}},
    {   72,   461'000, {68936, 68985},   451'000, {133472, 133521}},
    {   73,   460'000, {68986, 69035},   450'000, {133522, 133571}},
    {   74, 1'475'000, {69036, 69465}, 1'427'000, {133572, 134001}},
    {   75, 1'432'000, {69466, 70315},         0, {}},
    {   76, 1'427'000, {70316, 70365},         0, {}},
    {   85,   728'000, {70366, 70545},   698'000, {134002, 134181}},
    {   87,   420'000, {70546, 70595},   410'000, {134182, 134231}},
    {   88,   422'000, {70596, 70645},   412'000, {134232, 134281}},
    {  103,   757'000, {70646, 70655},   787'000, {134282, 134291}},
    {  106,   935'000, {70656, 70705},   896'000, {134292, 134341}},
};
// clang-format on

constexpr std::int32_t lteRaster_khz = 100;

constexpr std::int32_t lteFrequency_khz(std::int32_t low_khz, const Range& range, std::uint32_t earfcn) {
  return low_khz + lteRaster_khz * static_cast<std::int32_t>(earfcn - range.first);
}

// The search for a downlink number halves the table.
static_assert(std::is_sorted(std::begin(lteBands), std::end(lteBands),
                             [](const LTEBand& a, const LTEBand& b) {
                               return a.downlink.last < b.downlink.first;
                             }));

const LTEBand* lteBandOfDownlink(std::uint32_t earfcn) {
  const LTEBand* const band =
      std::partition_point(std::begin(lteBands), std::end(lteBands),
                           [earfcn](const LTEBand& candidate) { return candidate.downlink.last < earfcn; });
  return band != std::end(lteBands) && band->downlink.contains(earfcn) ? band : nullptr;
}

// ---- NR ----

/// A part of the global frequency raster: a frequency is the offset and one step for each number behind the
/// first one.
struct NRRaster {
  std::int32_t step_khz, offset_khz;
  Range numbers;
};

// 3GPP TS 38.104, table 5.4.2.1-1. The offsets N_REF-Offs are the first numbers of the ranges.
// clang-format off
constexpr NRRaster nrRaster[] = {
    // ΔF  F_REF-Offs         N_REF
    {   5,          0, {      0,  599999}},
    {  15,  3'000'000, { 600000, 2016666}},
    {  60, 24'250'080, {2016667, 3279165}},
};
// clang-format on

/// Frequencies, both edges included.
struct Span {
  std::int32_t low_khz = 1, high_khz = 0;

  constexpr bool contains(std::int32_t frequency_khz) const {
    return low_khz <= frequency_khz && frequency_khz <= high_khz;
  }
  constexpr std::int32_t width_khz() const { return high_khz - low_khz; }
};

struct NRBand {
  std::uint16_t number;
  Span uplink, downlink;  // empty where the band has none, the same where both share a carrier
};

// 3GPP TS 38.104, tables 5.2-1 and 5.2-2; band 47, which has no base stations: TS 38.101-1, table 5.2-1. The
// ranges of table 5.4.2.3-1 are these in channel numbers. Bands 68, 87, 88 and 109 to 112, of later releases,
// and those of satellites (TS 38.108) are left out.
// clang-format off
constexpr NRBand nrBands[] = {
    // Band  Uplink                   Downlink
    {    1, { 1'920'000,  1'980'000}, { 2'110'000,  2'170'000}},
    {    2, { 1'850'000,  1'910'000}, { 1'930'000,  1'990'000}},
    {    3, { 1'710'000,  1'785'000}, { 1'805'000,  1'880'000}},
    {    5, {   824'000,    849'000}, {   869'000,    894'000}},
    {    7, { 2'500'000,  2'570'000}, { 2'620'000,  2'690'000}},
    {    8, {   880'000,    915'000}, {   925'000,    960'000}},
    {   12, {   699'000,    716'000}, {   729'000,    746'000}},
    {   13, {   777'000,    787'000}, {   746'000,    756'000}},
    {   14, {   788'000,    798'000}, {   758'000,    768'000}},
    {   18, {   815'000,    830'000}, {   860'000,    875'000}},
    {   20, {   832'000,    862'000}, {   791'000,    821'000}},
    {   24, { 1'626'500,  1'660'500}, { 1'525'000,  1'559'000}},
    {   25, { 1'850'000,  1'915'000}, { 1'930'000,  1'995'000}},
    {   26, {   814'000,    849'000}, {   859'000,    894'000}},
    {   28, {   703'000,    748'000}, {   758'000,    803'000}},
    {   29, {                      }, {   717'000,    728'000}},
    {   30, { 2'305'000,  2'315'000}, { 2'350'000,  2'360'000}},
    {   31, {   452'500,    457'500}, {   462'500,    467'500}},
    {   34, { 2'010'000,  2'025'000}, { 2'010'000,  2'025'000}},
    {   38, { 2'570'000,  2'620'000}, { 2'570'000,  2'620'000}},
    {   39, { 1'880'000,  1'920'000}, { 1'880'000,  1'920'000}},
    {   40, { 2'300'000,  2'400'000}, { 2'300'000,  2'400'000}},
    {   41, { 2'496'000,  2'690'000}, { 2'496'000,  2'690'000}},
    {   46, { 5'150'000,  5'925'000}, { 5'150'000,  5'925'000}},
    {   47, { 5'855'000,  5'925'000}, { 5'855'000,  5'925'000}},
    {   48, { 3'550'000,  3'700'000}, { 3'550'000,  3'700'000}},
    {   50, { 1'432'000,  1'517'000}, { 1'432'000,  1'517'000}},
    {   51, { 1'427'000,  1'432'000}, { 1'427'000,  1'432'000}},
    {   53, { 2'483'500,  2'495'000}, { 2'483'500,  2'495'000}},
    {   54, { 1'670'000,  1'675'000}, { 1'670'000,  1'675'000}},
    {   65, { 1'920'000,  2'010'000}, { 2'110'000,  2'200'000}},
    {   66, { 1'710'000,  1'780'000}, { 2'110'000,  2'200'000}},
    {   67, {                      }, {   738'000,    758'000}},
    {   70, { 1'695'000,  1'710'000}, { 1'995'000,  2'020'000}},
    {   71, {   663'000,    698'000}, {   617'000,    652'000}},
    {   72, {   451'000,    456'000}, {   461'000,    466'000}},
    {   74, { 1'427'000,  1'470'000}, { 1'475'000,  1'518'000}},
    {   75, {                      }, { 1'432'000,  1'517'000}},
    {   76, {                      }, { 1'427'000,  1'432'000}},
    {   77, { 3'300'000,  4'200'000}, { 3'300'000,  4'200'000}},
    {   78, { 3'300'000,  3'800'000}, { 3'300'000,  3'800'000}},
    {   79, { 4'400'000,  5'000'000}, { 4'400'000,  5'000'000}},
    {   80, { 1'710'000,  1'785'000}, {                      }},
    {   81, {   880'000,    915'000}, {                      }},
    {   82, {   832'000,    862'000}, {                      }},
    {   83, {   703'000,    748'000}, {                      }},
    {   84, { 1'920'000,  1'980'000}, {                      }},
    {   85, {   698'000,    716'000}, {   728'000,    746'000}},
    {   86, { 1'710'000,  1'780'000}, {                      }},
    {   89, {   824'000,    849'000}, {                      }},
    {   90, { 2'496'000,  2'690'000}, { 2'496'000,  2'690'000}},
    {   91, {   832'000,    862'000}, { 1'427'000,  1'432'000}},
    {   92, {   832'000,    862'000}, { 1'432'000,  1'517'000}},
    {   93, {   880'000,    915'000}, { 1'427'000,  1'432'000}},
    {   94, {   880'000,    915'000}, { 1'432'000,  1'517'000}},
    {   95, { 2'010'000,  2'025'000}, {                      }},
    {   96, { 5'925'000,  7'125'000}, { 5'925'000,  7'125'000}},
    {   97, { 2'300'000,  2'400'000}, {                      }},
    {   98, { 1'880'000,  1'920'000}, {                      }},
    {   99, { 1'626'500,  1'660'500}, {                      }},
    {  100, {   874'400,    880'000}, {   919'400,    925'000}},
    {  101, { 1'900'000,  1'910'000}, { 1'900'000,  1'910'000}},
    {  102, { 5'925'000,  6'425'000}, { 5'925'000,  6'425'000}},
    {  104, { 6'425'000,  7'125'000}, { 6'425'000,  7'125'000}},
    {  105, {   663'000,    703'000}, {   612'000,    652'000}},
    {  106, {   896'000,    901'000}, {   935'000,    940'000}},
    {  257, {26'500'000, 29'500'000}, {26'500'000, 29'500'000}},
    {  258, {24'250'000, 27'500'000}, {24'250'000, 27'500'000}},
    {  259, {39'500'000, 43'500'000}, {39'500'000, 43'500'000}},
    {  260, {37'000'000, 40'000'000}, {37'000'000, 40'000'000}},
    {  261, {27'500'000, 28'350'000}, {27'500'000, 28'350'000}},
    {  262, {47'200'000, 48'200'000}, {47'200'000, 48'200'000}},
    {  263, {57'000'000, 71'000'000}, {57'000'000, 71'000'000}},
};
// clang-format on

constexpr BandNumbers nrBandsWith(Span NRBand::*direction, std::int32_t frequency_khz) {
  BandNumbers bands;
  for (const NRBand& band : nrBands)
    if (const Span& span = band.*direction; span.contains(frequency_khz))
      bands.add(band.number, span.width_khz());
  return bands;
}

// Wherever bands meet there is room for all of them: what they share begins where one of them begins.
static_assert(std::all_of(std::begin(nrBands), std::end(nrBands), [](const NRBand& band) {
  return nrBandsWith(&NRBand::uplink, band.uplink.low_khz).size() <= BandNumbers::capacity &&
         nrBandsWith(&NRBand::downlink, band.downlink.low_khz).size() <= BandNumbers::capacity;
}));

// ---- UMTS ----

/// Channels of a band that follow each other at equal steps. A carrier's frequency is the offset of its
/// direction and 200 kHz for each number from 0 on.
struct UMTSChannels {
  std::uint16_t band;
  std::uint32_t step;
  std::int32_t downlinkOffset_khz;
  Range downlink;
  std::int32_t uplinkOffset_khz;
  Range uplink;  // empty where the band has none
};

// 3GPP TS 25.101, tables 5.1 and 5.2 (general channels, one by one) and 5.1A and 5.2 (additional channels,
// which lie 100 kHz beside them, 25 numbers apart).
// clang-format off
constexpr UMTSChannels umtsChannels[] = {
    // Band Step  F_DL_Offset  N_D           F_UL_Offset  N_U
    {  1,    1,          0, {10562, 10838},          0, { 9612,  9888}},
    {  2,    1,          0, { 9662,  9938},          0, { 9262,  9538}},
    {  2,   25,  1'850'100, {  412,   687},  1'850'100, {   12,   287}},
    {  3,    1,  1'575'000, { 1162,  1513},  1'525'000, {  937,  1288}},
    {  4,    1,  1'805'000, { 1537,  1738},  1'450'000, { 1312,  1513}},
    {  4,   25,  1'735'100, { 1887,  2087},  1'380'100, { 1662,  1862}},
    {  5,    1,          0, { 4357,  4458},          0, { 4132,  4233}},
    {  5,   25,    670'100, { 1007,  1032},    670'100, {  782,   807}},
    {  5,   25,    670'100, { 1012,  1087},    670'100, {  787,   862}},
    {  6,    1,          0, { 4387,  4413},          0, { 4162,  4188}},
    {  6,   25,    670'100, { 1037,  1062},    670'100, {  812,   837}},
    {  7,    1,  2'175'000, { 2237,  2563},  2'100'000, { 2012,  2338}},
    {  7,   25,  2'105'100, { 2587,  2912},  2'030'100, { 2362,  2687}},
    {  8,    1,    340'000, { 2937,  3088},    340'000, { 2712,  2863}},
    {  9,    1,          0, { 9237,  9387},          0, { 8762,  8912}},
    { 10,    1,  1'490'000, { 3112,  3388},  1'135'000, { 2887,  3163}},
    { 10,   25,  1'430'100, { 3412,  3687},  1'075'100, { 3187,  3462}},
    { 11,    1,    736'000, { 3712,  3787},    733'000, { 3487,  3562}},
    { 12,    1,    -37'000, { 3842,  3903},    -22'000, { 3617,  3678}},
    { 12,   25,    -54'900, { 3932,  3957},    -39'900, { 3707,  3732}},
    { 12,   25,    -54'900, { 3962,  3987},    -39'900, { 3737,  3762}},
    { 12,   25,    -54'900, { 3992,  3992},    -39'900, { 3767,  3767}},
    { 13,    1,    -55'000, { 4017,  4043},     21'000, { 3792,  3818}},
    { 13,   25,    -64'900, { 4067,  4092},     11'100, { 3842,  3867}},
    { 14,    1,    -63'000, { 4117,  4143},     12'000, { 3892,  3918}},
    { 14,   25,    -72'900, { 4167,  4192},      2'100, { 3942,  3967}},
    { 19,    1,    735'000, {  712,   763},    770'000, {  312,   363}},
    { 19,   25,    720'100, {  787,   837},    755'100, {  387,   437}},
    { 20,    1,   -109'000, { 4512,  4638},    -23'000, { 4287,  4413}},
    { 21,    1,  1'326'000, {  862,   912},  1'358'000, {  462,   512}},
    { 22,    1,  2'580'000, { 4662,  5038},  2'525'000, { 4437,  4813}},
    { 25,    1,    910'000, { 5112,  5413},    875'000, { 4887,  5188}},
    { 25,   25,    674'100, { 6292,  6592},    639'100, { 6067,  6367}},
    { 26,    1,   -291'000, { 5762,  5913},   -291'000, { 5537,  5688}},
    { 26,   25,   -325'900, { 5937,  6087},   -325'900, { 5712,  5862}},
    { 26,   25,   -325'900, { 5992,  6067},   -325'900, { 5767,  5842}},
    { 32,    1,    131'000, { 6617,  6813},          0, {}},
    { 32,   25,     87'100, { 6837,  7012},          0, {}},
};
// clang-format on

// A channel and the one that it is paired with stand at the same place of their ranges.
static_assert(std::all_of(std::begin(umtsChannels), std::end(umtsChannels), [](const UMTSChannels& row) {
  return row.uplink.empty() || row.uplink.steps() == row.downlink.steps();
}));

constexpr std::int32_t umtsRaster_khz = 200;

/// The numbers and the offset of a direction.
using UMTSNumbers = Range UMTSChannels::*;
using UMTSOffset = std::int32_t UMTSChannels::*;

constexpr bool hasChannel(const UMTSChannels& row, const Range& numbers, std::uint32_t uarfcn) {
  return numbers.contains(uarfcn) && (uarfcn - numbers.first) % row.step == 0;
}

std::optional<UMTSChannel> umtsChannel(UMTSNumbers numbers, UMTSOffset offset_khz, std::uint32_t uarfcn) {
  std::optional<UMTSChannel> channel;
  for (const UMTSChannels& row : umtsChannels) {
    const Range& range = row.*numbers;
    if (!hasChannel(row, range, uarfcn)) continue;
    // Bands that share a number agree on its frequency.
    if (!channel)
      channel = {.bands = {},
                 .frequency_khz = row.*offset_khz + umtsRaster_khz * static_cast<std::int32_t>(uarfcn)};
    channel->bands.add(row.band, umtsRaster_khz * static_cast<std::int32_t>(range.steps()));
  }
  return channel;
}

// ---- GSM ----

/// Channels of a band, 200 kHz apart.
struct GSMChannels {
  GSMBand band;
  Range numbers;
  std::int32_t uplink_khz;          // of the first number
  std::int32_t duplexDistance_khz;  // from the uplink to the downlink
};

// 3GPP TS 45.005, section 2. A 900 MHz band also has the numbers of the rows above its own. In GSM 750 the
// phone has the upper carrier. Bands whose numbers each network chooses (T-GSM 380, T-GSM 410, GSM 710, T-GSM
// 810) are left out.
// clang-format off
constexpr GSMChannels gsmChannels[] = {
    // Band                            ARFCN         Uplink    Duplex distance
    {GSMBand::PrimaryGSM900,         {  1,  124},   890'200,  45'000},
    {GSMBand::ExtendedGSM900,        {  0,    0},   890'000,  45'000},
    {GSMBand::ExtendedGSM900,        {975, 1023},   880'200,  45'000},
    {GSMBand::RailwayGSM900,         {955,  974},   876'200,  45'000},
    {GSMBand::ExtendedRailwayGSM900, {940,  954},   873'200,  45'000},
    {GSMBand::GSM850,                {128,  251},   824'200,  45'000},
    {GSMBand::GSM450,                {259,  293},   450'600,  10'000},
    {GSMBand::GSM480,                {306,  340},   479'000,  10'000},
    {GSMBand::GSM750,                {438,  511},   777'200, -30'000},
    {GSMBand::DCS1800,               {512,  885}, 1'710'200,  95'000},
    {GSMBand::PCS1900,               {512,  810}, 1'850'200,  80'000},
};
// clang-format on

constexpr std::int32_t gsmRaster_khz = 200;
constexpr Range gsmSharedNumbers{512, 810};

/// Whether a number that DCS 1800 and PCS 1900 share is one of this band in this cell.
constexpr bool isMeant(GSMBand band, GSMBandIndicator indicator) {
  switch (indicator) {
    case GSMBandIndicator::DCS1800:
      return band == GSMBand::DCS1800;
    case GSMBandIndicator::PCS1900:
      return band == GSMBand::PCS1900;
    case GSMBandIndicator::Unknown:
      break;
  }
  return false;
}

}  // namespace

std::optional<LTEChannel> lteDownlink(std::uint32_t earfcn) {
  const LTEBand* const band = lteBandOfDownlink(earfcn);
  if (!band) return std::nullopt;
  return LTEChannel{band->number, lteFrequency_khz(band->downlinkLow_khz, band->downlink, earfcn)};
}

std::optional<LTEChannel> lteUplink(std::uint32_t earfcn) {
  for (const LTEBand& band : lteBands)
    if (band.uplink.contains(earfcn))
      return LTEChannel{band.number, lteFrequency_khz(band.uplinkLow_khz, band.uplink, earfcn)};
  return std::nullopt;
}

std::optional<std::uint32_t> lteUplinkOf(std::uint32_t downlinkEarfcn) {
  const LTEBand* const band = lteBandOfDownlink(downlinkEarfcn);
  if (!band) return std::nullopt;
  const std::uint32_t uplink = band->uplink.first + (downlinkEarfcn - band->downlink.first);
  if (!band->uplink.contains(uplink)) return std::nullopt;
  return uplink;
}

std::optional<std::int32_t> nrFrequency_khz(std::uint32_t nrArfcn) {
  for (const NRRaster& part : nrRaster)
    if (part.numbers.contains(nrArfcn))
      return part.offset_khz + part.step_khz * static_cast<std::int32_t>(nrArfcn - part.numbers.first);
  return std::nullopt;
}

BandNumbers nrDownlinkBands(std::int32_t frequency_khz) {
  return nrBandsWith(&NRBand::downlink, frequency_khz);
}

BandNumbers nrUplinkBands(std::int32_t frequency_khz) { return nrBandsWith(&NRBand::uplink, frequency_khz); }

std::optional<UMTSChannel> umtsDownlink(std::uint32_t uarfcn) {
  return umtsChannel(&UMTSChannels::downlink, &UMTSChannels::downlinkOffset_khz, uarfcn);
}

std::optional<UMTSChannel> umtsUplink(std::uint32_t uarfcn) {
  return umtsChannel(&UMTSChannels::uplink, &UMTSChannels::uplinkOffset_khz, uarfcn);
}

std::optional<std::uint32_t> umtsUplinkOf(std::uint32_t downlinkUarfcn) {
  for (const UMTSChannels& row : umtsChannels)
    if (hasChannel(row, row.downlink, downlinkUarfcn) && !row.uplink.empty())
      return row.uplink.first + (downlinkUarfcn - row.downlink.first);
  return std::nullopt;
}

std::string_view nameOf(GSMBand band) {
  switch (band) {
    case GSMBand::GSM450:
      return "GSM 450";
    case GSMBand::GSM480:
      return "GSM 480";
    case GSMBand::GSM750:
      return "GSM 750";
    case GSMBand::GSM850:
      return "GSM 850";
    case GSMBand::PrimaryGSM900:
      return "P-GSM 900";
    case GSMBand::ExtendedGSM900:
      return "E-GSM 900";
    case GSMBand::RailwayGSM900:
      return "R-GSM 900";
    case GSMBand::ExtendedRailwayGSM900:
      return "ER-GSM 900";
    case GSMBand::DCS1800:
      return "DCS 1800";
    case GSMBand::PCS1900:
      return "PCS 1900";
  }
  return {};
}

std::optional<GSMChannel> gsmChannel(std::uint32_t arfcn, GSMBandIndicator indicator) {
  for (const GSMChannels& row : gsmChannels) {
    if (!row.numbers.contains(arfcn)) continue;
    if (gsmSharedNumbers.contains(arfcn) && !isMeant(row.band, indicator)) continue;
    const std::int32_t uplink_khz =
        row.uplink_khz + gsmRaster_khz * static_cast<std::int32_t>(arfcn - row.numbers.first);
    return GSMChannel{row.band, uplink_khz + row.duplexDistance_khz, uplink_khz};
  }
  return std::nullopt;
}

}  // namespace varnel::channels
