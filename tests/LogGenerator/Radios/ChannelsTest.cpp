#include "LogGenerator/Radios/Channels.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <optional>
#include <ostream>
#include <utility>
#include <vector>

namespace varnel::channels {

void PrintTo(const LTEChannel& channel, std::ostream* out) {
  *out << "band " << channel.band << ", " << channel.frequency_khz << " kHz";
}
void PrintTo(const GSMChannel& channel, std::ostream* out) {
  *out << nameOf(channel.band) << ", down " << channel.downlink_khz << " kHz, up " << channel.uplink_khz
       << " kHz";
}

namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr std::uint32_t highest = 0xFFFFFFFF;

std::int32_t kilohertz(double frequency_mhz) {
  return static_cast<std::int32_t>(std::lround(frequency_mhz * 1000));
}

// The bands as a plain list, empty for no channel.
std::vector<int> numbersOf(const BandNumbers& bands) { return {bands.begin(), bands.end()}; }
std::vector<int> bandsOf(const std::optional<UMTSChannel>& channel) {
  return channel ? numbersOf(channel->bands) : std::vector<int>{};
}

TEST(Channels, MegahertzAreThousandsOfKilohertz) {
  EXPECT_EQ(megahertz(1844900), 1844.9);
  EXPECT_EQ(megahertz(3489420), 3489.42);
  EXPECT_EQ(megahertz(0), 0.0);
}

// ---- LTE ----

// The lowest and the highest number of a direction with its frequency, and whose the numbers beside these are
// (0: nobody's).
struct LTEEnds {
  std::uint32_t first;
  double first_mhz;
  std::uint32_t last;
  double last_mhz;
  int bandBelow, bandAbove;

  bool contain(std::uint32_t number) const { return first <= number && number <= last; }
};
struct LTERow {
  int band;
  std::optional<LTEEnds> downlink, uplink;
};

// Numbers: TS 36.101, table 5.7.3-1. Frequencies: the edges of table 5.5-1, the upper one less 0.1 MHz, so
// that the ranges are as wide as the bands.
// clang-format off
const LTERow lteRows[] = {
    {  1, LTEEnds{    0, 2110.0,   599, 2169.9,   0,   2}, LTEEnds{ 18000, 1920.0,  18599, 1979.9,   0,   2}},
    {  2, LTEEnds{  600, 1930.0,  1199, 1989.9,   1,   3}, LTEEnds{ 18600, 1850.0,  19199, 1909.9,   1,   3}},
    {  3, LTEEnds{ 1200, 1805.0,  1949, 1879.9,   2,   4}, LTEEnds{ 19200, 1710.0,  19949, 1784.9,   2,   4}},
    {  4, LTEEnds{ 1950, 2110.0,  2399, 2154.9,   3,   5}, LTEEnds{ 19950, 1710.0,  20399, 1754.9,   3,   5}},
    {  5, LTEEnds{ 2400,  869.0,  2649,  893.9,   4,   6}, LTEEnds{ 20400,  824.0,  20649,  848.9,   4,   6}},
    {  6, LTEEnds{ 2650,  875.0,  2749,  884.9,   5,   7}, LTEEnds{ 20650,  830.0,  20749,  839.9,   5,   7}},
    {  7, LTEEnds{ 2750, 2620.0,  3449, 2689.9,   6,   8}, LTEEnds{ 20750, 2500.0,  21449, 2569.9,   6,   8}},
    {  8, LTEEnds{ 3450,  925.0,  3799,  959.9,   7,   9}, LTEEnds{ 21450,  880.0,  21799,  914.9,   7,   9}},
    {  9, LTEEnds{ 3800, 1844.9,  4149, 1879.8,   8,  10}, LTEEnds{ 21800, 1749.9,  22149, 1784.8,   8,  10}},
    { 10, LTEEnds{ 4150, 2110.0,  4749, 2169.9,   9,  11}, LTEEnds{ 22150, 1710.0,  22749, 1769.9,   9,  11}},
    { 11, LTEEnds{ 4750, 1475.9,  4949, 1495.8,  10,   0}, LTEEnds{ 22750, 1427.9,  22949, 1447.8,  10,   0}},
    { 12, LTEEnds{ 5010,  729.0,  5179,  745.9,   0,  13}, LTEEnds{ 23010,  699.0,  23179,  715.9,   0,  13}},
    { 13, LTEEnds{ 5180,  746.0,  5279,  755.9,  12,  14}, LTEEnds{ 23180,  777.0,  23279,  786.9,  12,  14}},
    { 14, LTEEnds{ 5280,  758.0,  5379,  767.9,  13,   0}, LTEEnds{ 23280,  788.0,  23379,  797.9,  13,   0}},
    { 17, LTEEnds{ 5730,  734.0,  5849,  745.9,   0,  18}, LTEEnds{ 23730,  704.0,  23849,  715.9,   0,  18}},
    { 18, LTEEnds{ 5850,  860.0,  5999,  874.9,  17,  19}, LTEEnds{ 23850,  815.0,  23999,  829.9,  17,  19}},
    { 19, LTEEnds{ 6000,  875.0,  6149,  889.9,  18,  20}, LTEEnds{ 24000,  830.0,  24149,  844.9,  18,  20}},
    { 20, LTEEnds{ 6150,  791.0,  6449,  820.9,  19,  21}, LTEEnds{ 24150,  832.0,  24449,  861.9,  19,  21}},
    { 21, LTEEnds{ 6450, 1495.9,  6599, 1510.8,  20,  22}, LTEEnds{ 24450, 1447.9,  24599, 1462.8,  20,  22}},
    { 22, LTEEnds{ 6600, 3510.0,  7399, 3589.9,  21,   0}, LTEEnds{ 24600, 3410.0,  25399, 3489.9,  21,   0}},
    { 23, LTEEnds{ 7500, 2180.0,  7699, 2199.9,   0,  24}, LTEEnds{ 25500, 2000.0,  25699, 2019.9,   0,  24}},
    { 24, LTEEnds{ 7700, 1525.0,  8039, 1558.9,  23,  25}, LTEEnds{ 25700, 1626.5,  26039, 1660.4,  23,  25}},
    { 25, LTEEnds{ 8040, 1930.0,  8689, 1994.9,  24,  26}, LTEEnds{ 26040, 1850.0,  26689, 1914.9,  24,  26}},
    { 26, LTEEnds{ 8690,  859.0,  9039,  893.9,  25,  27}, LTEEnds{ 26690,  814.0,  27039,  848.9,  25,  27}},
    { 27, LTEEnds{ 9040,  852.0,  9209,  868.9,  26,  28}, LTEEnds{ 27040,  807.0,  27209,  823.9,  26,  28}},
    { 28, LTEEnds{ 9210,  758.0,  9659,  802.9,  27,  29}, LTEEnds{ 27210,  703.0,  27659,  747.9,  27,  30}},
    { 29, LTEEnds{ 9660,  717.0,  9769,  727.9,  28,  30}, {}},
    { 30, LTEEnds{ 9770, 2350.0,  9869, 2359.9,  29,  31}, LTEEnds{ 27660, 2305.0,  27759, 2314.9,  28,  31}},
    { 31, LTEEnds{ 9870,  462.5,  9919,  467.4,  30,  32}, LTEEnds{ 27760,  452.5,  27809,  457.4,  30,   0}},
    { 32, LTEEnds{ 9920, 1452.0, 10359, 1495.9,  31,   0}, {}},
    { 33, LTEEnds{36000, 1900.0, 36199, 1919.9,   0,  34}, LTEEnds{ 36000, 1900.0,  36199, 1919.9,   0,  34}},
    { 34, LTEEnds{36200, 2010.0, 36349, 2024.9,  33,  35}, LTEEnds{ 36200, 2010.0,  36349, 2024.9,  33,  35}},
    { 35, LTEEnds{36350, 1850.0, 36949, 1909.9,  34,  36}, LTEEnds{ 36350, 1850.0,  36949, 1909.9,  34,  36}},
    { 36, LTEEnds{36950, 1930.0, 37549, 1989.9,  35,  37}, LTEEnds{ 36950, 1930.0,  37549, 1989.9,  35,  37}},
    { 37, LTEEnds{37550, 1910.0, 37749, 1929.9,  36,  38}, LTEEnds{ 37550, 1910.0,  37749, 1929.9,  36,  38}},
    { 38, LTEEnds{37750, 2570.0, 38249, 2619.9,  37,  39}, LTEEnds{ 37750, 2570.0,  38249, 2619.9,  37,  39}},
    { 39, LTEEnds{38250, 1880.0, 38649, 1919.9,  38,  40}, LTEEnds{ 38250, 1880.0,  38649, 1919.9,  38,  40}},
    { 40, LTEEnds{38650, 2300.0, 39649, 2399.9,  39,  41}, LTEEnds{ 38650, 2300.0,  39649, 2399.9,  39,  41}},
    { 41, LTEEnds{39650, 2496.0, 41589, 2689.9,  40,  42}, LTEEnds{ 39650, 2496.0,  41589, 2689.9,  40,  42}},
    { 42, LTEEnds{41590, 3400.0, 43589, 3599.9,  41,  43}, LTEEnds{ 41590, 3400.0,  43589, 3599.9,  41,  43}},
    { 43, LTEEnds{43590, 3600.0, 45589, 3799.9,  42,  44}, LTEEnds{ 43590, 3600.0,  45589, 3799.9,  42,  44}},
    { 44, LTEEnds{45590,  703.0, 46589,  802.9,  43,  45}, LTEEnds{ 45590,  703.0,  46589,  802.9,  43,  45}},
    { 45, LTEEnds{46590, 1447.0, 46789, 1466.9,  44,  46}, LTEEnds{ 46590, 1447.0,  46789, 1466.9,  44,  46}},
    { 46, LTEEnds{46790, 5150.0, 54539, 5924.9,  45,  47}, LTEEnds{ 46790, 5150.0,  54539, 5924.9,  45,  47}},
    { 47, LTEEnds{54540, 5855.0, 55239, 5924.9,  46,  48}, LTEEnds{ 54540, 5855.0,  55239, 5924.9,  46,  48}},
    { 48, LTEEnds{55240, 3550.0, 56739, 3699.9,  47,  49}, LTEEnds{ 55240, 3550.0,  56739, 3699.9,  47,  49}},
    { 49, LTEEnds{56740, 3550.0, 58239, 3699.9,  48,  50}, LTEEnds{ 56740, 3550.0,  58239, 3699.9,  48,  50}},
    { 50, LTEEnds{58240, 1432.0, 59089, 1516.9,  49,  51}, LTEEnds{ 58240, 1432.0,  59089, 1516.9,  49,  51}},
    { 51, LTEEnds{59090, 1427.0, 59139, 1431.9,  50,  52}, LTEEnds{ 59090, 1427.0,  59139, 1431.9,  50,  52}},
    { 52, LTEEnds{59140, 3300.0, 60139, 3399.9,  51,  53}, LTEEnds{ 59140, 3300.0,  60139, 3399.9,  51,  53}},
    { 53, LTEEnds{60140, 2483.5, 60254, 2494.9,  52,  54}, LTEEnds{ 60140, 2483.5,  60254, 2494.9,  52,  54}},
    { 54, LTEEnds{60255, 1670.0, 60304, 1674.9,  53,   0}, LTEEnds{ 60255, 1670.0,  60304, 1674.9,  53,   0}},
    { 65, LTEEnds{65536, 2110.0, 66435, 2199.9,   0,  66}, LTEEnds{131072, 1920.0, 131971, 2009.9,   0,  66}},
    { 66, LTEEnds{66436, 2110.0, 67335, 2199.9,  65,  67}, LTEEnds{131972, 1710.0, 132671, 1779.9,  65,  68}},
    { 67, LTEEnds{67336,  738.0, 67535,  757.9,  66,  68}, {}},
    { 68, LTEEnds{67536,  753.0, 67835,  782.9,  67,  69}, LTEEnds{132672,  698.0, 132971,  727.9,  66,  70}},
    { 69, LTEEnds{67836, 2570.0, 68335, 2619.9,  68,  70}, {}},
    { 70, LTEEnds{68336, 1995.0, 68585, 2019.9,  69,  71}, LTEEnds{132972, 1695.0, 133121, 1709.9,  68,  71}},
    { 71, LTEEnds{68586,  617.0, 68935,  651.9,  70,  72}, LTEEnds{133122,  663.0, 133471,  697.9,  70,  72}},
    { 72, LTEEnds{68936,  461.0, 68985,  465.9,  71,  73}, LTEEnds{133472,  451.0, 133521,  455.9,  71,  73}},
    { 73, LTEEnds{68986,  460.0, 69035,  464.9,  72,  74}, LTEEnds{133522,  450.0, 133571,  454.9,  72,  74}},
    { 74, LTEEnds{69036, 1475.0, 69465, 1517.9,  73,  75}, LTEEnds{133572, 1427.0, 134001, 1469.9,  73,  85}},
    { 75, LTEEnds{69466, 1432.0, 70315, 1516.9,  74,  76}, {}},
    { 76, LTEEnds{70316, 1427.0, 70365, 1431.9,  75,  85}, {}},
    { 85, LTEEnds{70366,  728.0, 70545,  745.9,  76,  87}, LTEEnds{134002,  698.0, 134181,  715.9,  74,  87}},
    { 87, LTEEnds{70546,  420.0, 70595,  424.9,  85,  88}, LTEEnds{134182,  410.0, 134231,  414.9,  85,  88}},
    { 88, LTEEnds{70596,  422.0, 70645,  426.9,  87, 103}, LTEEnds{134232,  412.0, 134281,  416.9,  87, 103}},
    {103, LTEEnds{70646,  757.0, 70655,  757.9,  88, 106}, LTEEnds{134282,  787.0, 134291,  787.9,  88, 106}},
    {106, LTEEnds{70656,  935.0, 70705,  939.9, 103,   0}, LTEEnds{134292,  896.0, 134341,  900.9, 103,   0}},
};
// clang-format on

using LTELookup = std::optional<LTEChannel> (*)(std::uint32_t);

std::optional<LTEChannel> lteChannel(int band, double frequency_mhz) {
  return LTEChannel{static_cast<std::uint16_t>(band), kilohertz(frequency_mhz)};
}

int bandOf(const std::optional<LTEChannel>& channel) { return channel ? channel->band : 0; }

void expectEnds(const LTERow& row, const LTEEnds& ends, LTELookup lookup) {
  EXPECT_EQ(lookup(ends.first), lteChannel(row.band, ends.first_mhz)) << ends.first;
  EXPECT_EQ(lookup(ends.last), lteChannel(row.band, ends.last_mhz)) << ends.last;
  EXPECT_EQ(bandOf(lookup(ends.first - 1)), ends.bandBelow) << ends.first - 1;
  EXPECT_EQ(bandOf(lookup(ends.last + 1)), ends.bandAbove) << ends.last + 1;
}

TEST(LTEChannels, BothEndsOfEachBandsDownlink) {
  for (const LTERow& row : lteRows) expectEnds(row, *row.downlink, lteDownlink);
}

TEST(LTEChannels, BothEndsOfEachBandsUplink) {
  for (const LTERow& row : lteRows)
    if (row.uplink) expectEnds(row, *row.uplink, lteUplink);
}

// What a number stands for by the rows above, 100 kHz a number.
std::optional<LTEChannel> channelByRows(std::uint32_t earfcn, std::optional<LTEEnds> LTERow::*direction) {
  for (const LTERow& row : lteRows)
    if (const std::optional<LTEEnds>& ends = row.*direction; ends && ends->contain(earfcn))
      return lteChannel(row.band, ends->first_mhz + 0.1 * (earfcn - ends->first));
  return std::nullopt;
}

TEST(LTEChannels, EachNumberStandsForWhatItsRowSaysAndTheOthersForNothing) {
  constexpr std::uint32_t beyondEverything = 135000;
  for (std::uint32_t earfcn = 0; earfcn < beyondEverything; ++earfcn) {
    ASSERT_EQ(lteDownlink(earfcn), channelByRows(earfcn, &LTERow::downlink)) << earfcn;
    ASSERT_EQ(lteUplink(earfcn), channelByRows(earfcn, &LTERow::uplink)) << earfcn;
  }
  for (const std::uint32_t earfcn : {beyondEverything, 262143u, 262144u, highest}) {
    EXPECT_EQ(lteDownlink(earfcn), std::nullopt) << earfcn;
    EXPECT_EQ(lteUplink(earfcn), std::nullopt) << earfcn;
  }
}

TEST(LTEChannels, WellKnownChannels) {
  EXPECT_EQ(lteDownlink(300), lteChannel(1, 2140.0));
  EXPECT_EQ(lteDownlink(1300), lteChannel(3, 1815.0));
  EXPECT_EQ(lteDownlink(3100), lteChannel(7, 2655.0));
  EXPECT_EQ(lteDownlink(5230), lteChannel(13, 751.0));
  EXPECT_EQ(lteUplink(23230), lteChannel(13, 782.0));
  EXPECT_EQ(lteDownlink(6300), lteChannel(20, 806.0));
  EXPECT_EQ(lteDownlink(40620), lteChannel(41, 2593.0));
  EXPECT_EQ(lteDownlink(66786), lteChannel(66, 2145.0));
}

TEST(LTEChannels, UplinkNumbersAreNoDownlinkNumbers) {
  EXPECT_EQ(lteDownlink(18300), std::nullopt);
  EXPECT_EQ(lteUplink(300), std::nullopt);
}

// The first downlink number, the last one that has a partner, and the uplink numbers of both.
struct Pairing {
  std::uint32_t first, firstUplink, last, lastUplink;
};

TEST(LTEChannels, PairedUplinkOfBothEndsOfEachBand) {
  constexpr Pairing pairings[] = {
      {0, 18000, 599, 18599},         {600, 18600, 1199, 19199},      {1200, 19200, 1949, 19949},
      {1950, 19950, 2399, 20399},     {2400, 20400, 2649, 20649},     {2650, 20650, 2749, 20749},
      {2750, 20750, 3449, 21449},     {3450, 21450, 3799, 21799},     {3800, 21800, 4149, 22149},
      {4150, 22150, 4749, 22749},     {4750, 22750, 4949, 22949},     {5010, 23010, 5179, 23179},
      {5180, 23180, 5279, 23279},     {5280, 23280, 5379, 23379},     {5730, 23730, 5849, 23849},
      {5850, 23850, 5999, 23999},     {6000, 24000, 6149, 24149},     {6150, 24150, 6449, 24449},
      {6450, 24450, 6599, 24599},     {6600, 24600, 7399, 25399},     {7500, 25500, 7699, 25699},
      {7700, 25700, 8039, 26039},     {8040, 26040, 8689, 26689},     {8690, 26690, 9039, 27039},
      {9040, 27040, 9209, 27209},     {9210, 27210, 9659, 27659},     {9770, 27660, 9869, 27759},
      {9870, 27760, 9919, 27809},     {36000, 36000, 60304, 60304},  // all of time division
      {65536, 131072, 66435, 131971}, {66436, 131972, 67135, 132671}, {67536, 132672, 67835, 132971},
      {68336, 132972, 68485, 133121}, {68586, 133122, 68935, 133471}, {68936, 133472, 68985, 133521},
      {68986, 133522, 69035, 133571}, {69036, 133572, 69465, 134001}, {70366, 134002, 70545, 134181},
      {70546, 134182, 70595, 134231}, {70596, 134232, 70645, 134281}, {70646, 134282, 70655, 134291},
      {70656, 134292, 70705, 134341},
  };
  for (const Pairing& pairing : pairings) {
    EXPECT_EQ(lteUplinkOf(pairing.first), pairing.firstUplink) << pairing.first;
    EXPECT_EQ(lteUplinkOf(pairing.last), pairing.lastUplink) << pairing.last;
  }
}

TEST(LTEChannels, PairsOfABandAreOneDuplexDistanceApart) {
  // TS 36.101, table 5.7.4-1: from the uplink up to the downlink, in MHz.
  struct Distance {
    std::uint16_t band;
    double distance_mhz;
  };
  constexpr Distance distances[] = {
      {1, 190},  {2, 80},   {3, 95},   {4, 400},     {5, 45},   {6, 45},   {7, 120}, {8, 45},  {9, 95},
      {10, 400}, {11, 48},  {12, 30},  {13, -31},    {14, -30}, {17, 30},  {18, 45}, {19, 45}, {20, -41},
      {21, 48},  {22, 100}, {23, 180}, {24, -101.5}, {25, 80},  {26, 45},  {27, 45}, {28, 55}, {30, 45},
      {31, 10},  {65, 190}, {66, 400}, {68, 55},     {70, 300}, {71, -46}, {72, 10}, {73, 10}, {74, 48},
      {85, 30},  {87, 10},  {88, 10},  {103, -30},   {106, 39},
  };
  std::size_t pairs = 0;
  for (std::uint32_t earfcn = 0; earfcn < 71000; ++earfcn) {
    const std::optional<LTEChannel> downlink = lteDownlink(earfcn);
    const std::optional<std::uint32_t> partner = lteUplinkOf(earfcn);
    if (!partner) continue;
    const std::optional<LTEChannel> uplink = lteUplink(*partner);
    ASSERT_TRUE(downlink && uplink) << earfcn;
    ASSERT_EQ(downlink->band, uplink->band) << earfcn;
    double distance_mhz = 0;  // time division
    for (const Distance& row : distances)
      if (row.band == downlink->band) distance_mhz = row.distance_mhz;
    ASSERT_EQ(downlink->frequency_khz - uplink->frequency_khz, kilohertz(distance_mhz)) << earfcn;
    ++pairs;
  }
  // Bands 1 to 28 have 4950 + 370 + 1670 + 2160 numbers with a partner, 30 and 31 have 150, those of time
  // division 24305, 65 to 74 have 900 + 700 + 300 + 150 + 350 + 50 + 50 + 430, and 85 to 106 have 340.
  EXPECT_EQ(pairs, 36875u);
}

TEST(LTEChannels, WhereThereIsNoUplinkThereIsNoPartner) {
  // Bands 29, 32, 67, 69, 75 and 76, first and last.
  for (const std::uint32_t earfcn :
       {9660u, 9769u, 9920u, 10359u, 67336u, 67535u, 67836u, 68335u, 69466u, 70315u, 70316u, 70365u})
    EXPECT_EQ(lteUplinkOf(earfcn), std::nullopt) << earfcn;
  // The upper 20 MHz of band 66 and the upper 10 MHz of band 70.
  for (const std::uint32_t earfcn : {67136u, 67335u, 68486u, 68585u})
    EXPECT_EQ(lteUplinkOf(earfcn), std::nullopt) << earfcn;
  // Numbers of no band, and one of an uplink.
  for (const std::uint32_t earfcn : {4950u, 5009u, 18300u, 65535u, 70706u, highest})
    EXPECT_EQ(lteUplinkOf(earfcn), std::nullopt) << earfcn;
}

// ---- NR ----

TEST(NRChannels, BothEndsOfEachPartOfTheRaster) {
  EXPECT_EQ(nrFrequency_khz(0), 0);
  EXPECT_EQ(nrFrequency_khz(1), 5);
  EXPECT_EQ(nrFrequency_khz(599999), 2'999'995);
  EXPECT_EQ(nrFrequency_khz(600000), 3'000'000);
  EXPECT_EQ(nrFrequency_khz(600001), 3'000'015);
  EXPECT_EQ(nrFrequency_khz(2016666), 24'249'990);
  EXPECT_EQ(nrFrequency_khz(2016667), 24'250'080);
  EXPECT_EQ(nrFrequency_khz(2016668), 24'250'140);
  EXPECT_EQ(nrFrequency_khz(3279165), 99'999'960);
  EXPECT_EQ(nrFrequency_khz(3279166), std::nullopt);
  EXPECT_EQ(nrFrequency_khz(highest), std::nullopt);
}

// The lowest and the highest number of a direction with its frequency.
struct Ends {
  std::uint32_t first;
  double first_mhz;
  std::uint32_t last;
  double last_mhz;

  bool contain(std::uint32_t number) const { return first <= number && number <= last; }
};
struct NRRow {
  std::uint16_t band;
  std::optional<Ends> uplink, downlink;
};

// TS 38.104, table 5.4.2.3-1, and the edges of tables 5.2-1 and 5.2-2, or the numbers next to these inside
// the band. Band 41 ends one number later than in the first table, whose steps of 15 kHz miss its edge,
// and band 263 spans its edges, where that table leaves room for the widths of its carriers.
// clang-format off
const NRRow nrRows[] = {
    {  1, Ends{ 384000,  1920.0  ,  396000,  1980.0  }, Ends{ 422000,  2110.0  ,  434000,  2170.0  }},
    {  2, Ends{ 370000,  1850.0  ,  382000,  1910.0  }, Ends{ 386000,  1930.0  ,  398000,  1990.0  }},
    {  3, Ends{ 342000,  1710.0  ,  357000,  1785.0  }, Ends{ 361000,  1805.0  ,  376000,  1880.0  }},
    {  5, Ends{ 164800,   824.0  ,  169800,   849.0  }, Ends{ 173800,   869.0  ,  178800,   894.0  }},
    {  7, Ends{ 500000,  2500.0  ,  514000,  2570.0  }, Ends{ 524000,  2620.0  ,  538000,  2690.0  }},
    {  8, Ends{ 176000,   880.0  ,  183000,   915.0  }, Ends{ 185000,   925.0  ,  192000,   960.0  }},
    { 12, Ends{ 139800,   699.0  ,  143200,   716.0  }, Ends{ 145800,   729.0  ,  149200,   746.0  }},
    { 13, Ends{ 155400,   777.0  ,  157400,   787.0  }, Ends{ 149200,   746.0  ,  151200,   756.0  }},
    { 14, Ends{ 157600,   788.0  ,  159600,   798.0  }, Ends{ 151600,   758.0  ,  153600,   768.0  }},
    { 18, Ends{ 163000,   815.0  ,  166000,   830.0  }, Ends{ 172000,   860.0  ,  175000,   875.0  }},
    { 20, Ends{ 166400,   832.0  ,  172400,   862.0  }, Ends{ 158200,   791.0  ,  164200,   821.0  }},
    { 24, Ends{ 325300,  1626.5  ,  332100,  1660.5  }, Ends{ 305000,  1525.0  ,  311800,  1559.0  }},
    { 25, Ends{ 370000,  1850.0  ,  383000,  1915.0  }, Ends{ 386000,  1930.0  ,  399000,  1995.0  }},
    { 26, Ends{ 162800,   814.0  ,  169800,   849.0  }, Ends{ 171800,   859.0  ,  178800,   894.0  }},
    { 28, Ends{ 140600,   703.0  ,  149600,   748.0  }, Ends{ 151600,   758.0  ,  160600,   803.0  }},
    { 29, {}                                          , Ends{ 143400,   717.0  ,  145600,   728.0  }},
    { 30, Ends{ 461000,  2305.0  ,  463000,  2315.0  }, Ends{ 470000,  2350.0  ,  472000,  2360.0  }},
    { 31, Ends{  90500,   452.5  ,   91500,   457.5  }, Ends{  92500,   462.5  ,   93500,   467.5  }},
    { 34, Ends{ 402000,  2010.0  ,  405000,  2025.0  }, Ends{ 402000,  2010.0  ,  405000,  2025.0  }},
    { 38, Ends{ 514000,  2570.0  ,  524000,  2620.0  }, Ends{ 514000,  2570.0  ,  524000,  2620.0  }},
    { 39, Ends{ 376000,  1880.0  ,  384000,  1920.0  }, Ends{ 376000,  1880.0  ,  384000,  1920.0  }},
    { 40, Ends{ 460000,  2300.0  ,  480000,  2400.0  }, Ends{ 460000,  2300.0  ,  480000,  2400.0  }},
    { 41, Ends{ 499200,  2496.0  ,  538000,  2690.0  }, Ends{ 499200,  2496.0  ,  538000,  2690.0  }},
    { 46, Ends{ 743334,  5150.01 ,  795000,  5925.0  }, Ends{ 743334,  5150.01 ,  795000,  5925.0  }},
    { 47, Ends{ 790334,  5855.01 ,  795000,  5925.0  }, Ends{ 790334,  5855.01 ,  795000,  5925.0  }},
    { 48, Ends{ 636667,  3550.005,  646666,  3699.99 }, Ends{ 636667,  3550.005,  646666,  3699.99 }},
    { 50, Ends{ 286400,  1432.0  ,  303400,  1517.0  }, Ends{ 286400,  1432.0  ,  303400,  1517.0  }},
    { 51, Ends{ 285400,  1427.0  ,  286400,  1432.0  }, Ends{ 285400,  1427.0  ,  286400,  1432.0  }},
    { 53, Ends{ 496700,  2483.5  ,  499000,  2495.0  }, Ends{ 496700,  2483.5  ,  499000,  2495.0  }},
    { 54, Ends{ 334000,  1670.0  ,  335000,  1675.0  }, Ends{ 334000,  1670.0  ,  335000,  1675.0  }},
    { 65, Ends{ 384000,  1920.0  ,  402000,  2010.0  }, Ends{ 422000,  2110.0  ,  440000,  2200.0  }},
    { 66, Ends{ 342000,  1710.0  ,  356000,  1780.0  }, Ends{ 422000,  2110.0  ,  440000,  2200.0  }},
    { 67, {}                                          , Ends{ 147600,   738.0  ,  151600,   758.0  }},
    { 70, Ends{ 339000,  1695.0  ,  342000,  1710.0  }, Ends{ 399000,  1995.0  ,  404000,  2020.0  }},
    { 71, Ends{ 132600,   663.0  ,  139600,   698.0  }, Ends{ 123400,   617.0  ,  130400,   652.0  }},
    { 72, Ends{  90200,   451.0  ,   91200,   456.0  }, Ends{  92200,   461.0  ,   93200,   466.0  }},
    { 74, Ends{ 285400,  1427.0  ,  294000,  1470.0  }, Ends{ 295000,  1475.0  ,  303600,  1518.0  }},
    { 75, {}                                          , Ends{ 286400,  1432.0  ,  303400,  1517.0  }},
    { 76, {}                                          , Ends{ 285400,  1427.0  ,  286400,  1432.0  }},
    { 77, Ends{ 620000,  3300.0  ,  680000,  4200.0  }, Ends{ 620000,  3300.0  ,  680000,  4200.0  }},
    { 78, Ends{ 620000,  3300.0  ,  653333,  3799.995}, Ends{ 620000,  3300.0  ,  653333,  3799.995}},
    { 79, Ends{ 693334,  4400.01 ,  733333,  4999.995}, Ends{ 693334,  4400.01 ,  733333,  4999.995}},
    { 80, Ends{ 342000,  1710.0  ,  357000,  1785.0  }, {}                                          },
    { 81, Ends{ 176000,   880.0  ,  183000,   915.0  }, {}                                          },
    { 82, Ends{ 166400,   832.0  ,  172400,   862.0  }, {}                                          },
    { 83, Ends{ 140600,   703.0  ,  149600,   748.0  }, {}                                          },
    { 84, Ends{ 384000,  1920.0  ,  396000,  1980.0  }, {}                                          },
    { 85, Ends{ 139600,   698.0  ,  143200,   716.0  }, Ends{ 145600,   728.0  ,  149200,   746.0  }},
    { 86, Ends{ 342000,  1710.0  ,  356000,  1780.0  }, {}                                          },
    { 89, Ends{ 164800,   824.0  ,  169800,   849.0  }, {}                                          },
    { 90, Ends{ 499200,  2496.0  ,  538000,  2690.0  }, Ends{ 499200,  2496.0  ,  538000,  2690.0  }},
    { 91, Ends{ 166400,   832.0  ,  172400,   862.0  }, Ends{ 285400,  1427.0  ,  286400,  1432.0  }},
    { 92, Ends{ 166400,   832.0  ,  172400,   862.0  }, Ends{ 286400,  1432.0  ,  303400,  1517.0  }},
    { 93, Ends{ 176000,   880.0  ,  183000,   915.0  }, Ends{ 285400,  1427.0  ,  286400,  1432.0  }},
    { 94, Ends{ 176000,   880.0  ,  183000,   915.0  }, Ends{ 286400,  1432.0  ,  303400,  1517.0  }},
    { 95, Ends{ 402000,  2010.0  ,  405000,  2025.0  }, {}                                          },
    { 96, Ends{ 795000,  5925.0  ,  875000,  7125.0  }, Ends{ 795000,  5925.0  ,  875000,  7125.0  }},
    { 97, Ends{ 460000,  2300.0  ,  480000,  2400.0  }, {}                                          },
    { 98, Ends{ 376000,  1880.0  ,  384000,  1920.0  }, {}                                          },
    { 99, Ends{ 325300,  1626.5  ,  332100,  1660.5  }, {}                                          },
    {100, Ends{ 174880,   874.4  ,  176000,   880.0  }, Ends{ 183880,   919.4  ,  185000,   925.0  }},
    {101, Ends{ 380000,  1900.0  ,  382000,  1910.0  }, Ends{ 380000,  1900.0  ,  382000,  1910.0  }},
    {102, Ends{ 795000,  5925.0  ,  828333,  6424.995}, Ends{ 795000,  5925.0  ,  828333,  6424.995}},
    {104, Ends{ 828334,  6425.01 ,  875000,  7125.0  }, Ends{ 828334,  6425.01 ,  875000,  7125.0  }},
    {105, Ends{ 132600,   663.0  ,  140600,   703.0  }, Ends{ 122400,   612.0  ,  130400,   652.0  }},
    {106, Ends{ 179200,   896.0  ,  180200,   901.0  }, Ends{ 187000,   935.0  ,  188000,   940.0  }},
    {257, Ends{2054166, 26500.02 , 2104165, 29499.96 }, Ends{2054166, 26500.02 , 2104165, 29499.96 }},
    {258, Ends{2016667, 24250.08 , 2070832, 27499.98 }, Ends{2016667, 24250.08 , 2070832, 27499.98 }},
    {259, Ends{2270833, 39500.04 , 2337499, 43500.0  }, Ends{2270833, 39500.04 , 2337499, 43500.0  }},
    {260, Ends{2229166, 37000.02 , 2279165, 39999.96 }, Ends{2229166, 37000.02 , 2279165, 39999.96 }},
    {261, Ends{2070833, 27500.04 , 2084999, 28350.0  }, Ends{2070833, 27500.04 , 2084999, 28350.0  }},
    {262, Ends{2399166, 47200.02 , 2415832, 48199.98 }, Ends{2399166, 47200.02 , 2415832, 48199.98 }},
    {263, Ends{2562499, 57000.0  , 2795832, 70999.98 }, Ends{2562499, 57000.0  , 2795832, 70999.98 }},
};
// clang-format on

using NRLookup = BandNumbers (*)(std::int32_t);

BandNumbers bandsOfNumber(std::uint32_t nrArfcn, NRLookup lookup) {
  const std::optional<std::int32_t> frequency_khz = nrFrequency_khz(nrArfcn);
  return frequency_khz ? lookup(*frequency_khz) : BandNumbers();
}

void expectEnds(std::uint16_t band, const Ends& ends, NRLookup lookup) {
  EXPECT_EQ(nrFrequency_khz(ends.first), kilohertz(ends.first_mhz)) << 'n' << band;
  EXPECT_EQ(nrFrequency_khz(ends.last), kilohertz(ends.last_mhz)) << 'n' << band;
  EXPECT_TRUE(bandsOfNumber(ends.first, lookup).contains(band)) << 'n' << band;
  EXPECT_TRUE(bandsOfNumber(ends.last, lookup).contains(band)) << 'n' << band;
  EXPECT_FALSE(bandsOfNumber(ends.first - 1, lookup).contains(band)) << 'n' << band;
  EXPECT_FALSE(bandsOfNumber(ends.last + 1, lookup).contains(band)) << 'n' << band;
}

TEST(NRChannels, BothEndsOfEachBandsUplinkAndDownlink) {
  for (const NRRow& row : nrRows) {
    if (row.uplink) expectEnds(row.band, *row.uplink, nrUplinkBands);
    if (row.downlink) expectEnds(row.band, *row.downlink, nrDownlinkBands);
  }
}

TEST(NRChannels, AFrequencyHasTheBandsOfItsRowsAndNoOthers) {
  // Every band begins and ends at one of these, so that between two of them nothing changes.
  std::vector<std::uint32_t> numbers;
  for (const NRRow& row : nrRows)
    for (const std::optional<Ends>& ends : {row.uplink, row.downlink})
      if (ends)
        for (const std::uint32_t number : {ends->first - 1, ends->first, ends->last, ends->last + 1})
          numbers.push_back(number);

  const auto expectRows = [](std::uint32_t number, NRLookup lookup, std::optional<Ends> NRRow::*direction) {
    const BandNumbers bands = bandsOfNumber(number, lookup);
    std::size_t expected = 0;
    for (const NRRow& row : nrRows) {
      const std::optional<Ends>& ends = row.*direction;
      const bool holds = ends && ends->contain(number);
      EXPECT_EQ(bands.contains(row.band), holds) << 'n' << row.band << ", number " << number;
      expected += holds;
    }
    EXPECT_EQ(bands.size(), expected) << number;
  };
  for (const std::uint32_t number : numbers) {
    expectRows(number, nrUplinkBands, &NRRow::uplink);
    expectRows(number, nrDownlinkBands, &NRRow::downlink);
  }
}

TEST(NRChannels, WellKnownChannelsWithTheirBandsNarrowestFirst) {
  EXPECT_EQ(nrFrequency_khz(632628), 3'489'420);
  EXPECT_THAT(numbersOf(nrDownlinkBands(3'489'420)), ElementsAre(78, 77));
  EXPECT_EQ(nrFrequency_khz(641760), 3'626'400);
  EXPECT_THAT(numbersOf(nrDownlinkBands(3'626'400)), ElementsAre(48, 78, 77));
  EXPECT_EQ(nrFrequency_khz(519870), 2'599'350);
  EXPECT_THAT(numbersOf(nrDownlinkBands(2'599'350)), ElementsAre(38, 41, 90));
  EXPECT_EQ(nrFrequency_khz(504990), 2'524'950);
  EXPECT_THAT(numbersOf(nrDownlinkBands(2'524'950)), ElementsAre(41, 90));
  EXPECT_EQ(nrFrequency_khz(2079167), 28'000'080);
  EXPECT_THAT(numbersOf(nrDownlinkBands(28'000'080)), ElementsAre(261, 257));
  EXPECT_EQ(nrFrequency_khz(428000), 2'140'000);
  EXPECT_THAT(numbersOf(nrDownlinkBands(2'140'000)), ElementsAre(1, 65, 66));
  EXPECT_EQ(nrFrequency_khz(376200), 1'881'000);
  EXPECT_THAT(numbersOf(nrDownlinkBands(1'881'000)), ElementsAre(39));
}

TEST(NRChannels, OfBandsAsWideTheLowestNumberComesFirst) {
  // 25, 25, 30 (four times) and 35 MHz.
  EXPECT_THAT(numbersOf(nrUplinkBands(840'000)), ElementsAre(5, 89, 20, 82, 91, 92, 26));
  EXPECT_EQ(nrUplinkBands(840'000).mostSpecific(), 5);
}

TEST(NRChannels, OutsideAllBandsThereAreNone) {
  for (const std::int32_t frequency_khz : {-1, 0, 1, 450'000, 1'000'000, 2'250'000, 8'000'000, 99'999'960}) {
    EXPECT_THAT(numbersOf(nrDownlinkBands(frequency_khz)), IsEmpty()) << frequency_khz;
    EXPECT_THAT(numbersOf(nrUplinkBands(frequency_khz)), IsEmpty()) << frequency_khz;
  }
  EXPECT_TRUE(nrDownlinkBands(0).empty());
  EXPECT_FALSE(nrDownlinkBands(2'140'000).empty());
}

TEST(NRChannels, ABandOfOneDirectionHasNoOther) {
  EXPECT_THAT(numbersOf(nrDownlinkBands(720'000)), ElementsAre(29));
  EXPECT_THAT(numbersOf(nrUplinkBands(720'000)), ElementsAre(28, 83));
  EXPECT_THAT(numbersOf(nrUplinkBands(1'925'000)), ElementsAre(1, 84, 65));
  EXPECT_THAT(numbersOf(nrDownlinkBands(1'925'000)), IsEmpty());
}

// ---- UMTS ----

struct UMTSRow {
  int band;
  std::optional<Ends> uplink, downlink;
};

// The general channels. TS 25.101, table 5.1: the frequencies; table 5.2: the numbers.
// clang-format off
const UMTSRow umtsRows[] = {
    { 1, Ends{9612, 1922.4, 9888, 1977.6}, Ends{10562, 2112.4, 10838, 2167.6}},
    { 2, Ends{9262, 1852.4, 9538, 1907.6}, Ends{ 9662, 1932.4,  9938, 1987.6}},
    { 3, Ends{ 937, 1712.4, 1288, 1782.6}, Ends{ 1162, 1807.4,  1513, 1877.6}},
    { 4, Ends{1312, 1712.4, 1513, 1752.6}, Ends{ 1537, 2112.4,  1738, 2152.6}},
    { 5, Ends{4132,  826.4, 4233,  846.6}, Ends{ 4357,  871.4,  4458,  891.6}},
    { 6, Ends{4162,  832.4, 4188,  837.6}, Ends{ 4387,  877.4,  4413,  882.6}},
    { 7, Ends{2012, 2502.4, 2338, 2567.6}, Ends{ 2237, 2622.4,  2563, 2687.6}},
    { 8, Ends{2712,  882.4, 2863,  912.6}, Ends{ 2937,  927.4,  3088,  957.6}},
    { 9, Ends{8762, 1752.4, 8912, 1782.4}, Ends{ 9237, 1847.4,  9387, 1877.4}},
    {10, Ends{2887, 1712.4, 3163, 1767.6}, Ends{ 3112, 2112.4,  3388, 2167.6}},
    {11, Ends{3487, 1430.4, 3562, 1445.4}, Ends{ 3712, 1478.4,  3787, 1493.4}},
    {12, Ends{3617,  701.4, 3678,  713.6}, Ends{ 3842,  731.4,  3903,  743.6}},
    {13, Ends{3792,  779.4, 3818,  784.6}, Ends{ 4017,  748.4,  4043,  753.6}},
    {14, Ends{3892,  790.4, 3918,  795.6}, Ends{ 4117,  760.4,  4143,  765.6}},
    {19, Ends{ 312,  832.4,  363,  842.6}, Ends{  712,  877.4,   763,  887.6}},
    {20, Ends{4287,  834.4, 4413,  859.6}, Ends{ 4512,  793.4,  4638,  818.6}},
    {21, Ends{ 462, 1450.4,  512, 1460.4}, Ends{  862, 1498.4,   912, 1508.4}},
    {22, Ends{4437, 3412.4, 4813, 3487.6}, Ends{ 4662, 3512.4,  5038, 3587.6}},
    {25, Ends{4887, 1852.4, 5188, 1912.6}, Ends{ 5112, 1932.4,  5413, 1992.6}},
    {26, Ends{5537,  816.4, 5688,  846.6}, Ends{ 5762,  861.4,  5913,  891.6}},
    {32, {}                              , Ends{ 6617, 1454.4,  6813, 1493.6}},
};
// clang-format on

struct Numbered {
  std::uint32_t number;
  double mhz;
};
// The additional channels of both directions, paired one with the other.
struct UMTSAdditional {
  int band;
  std::vector<Numbered> uplink, downlink;
};

// TS 25.101, tables 5.1A and 5.2.
// clang-format off
const UMTSAdditional umtsAdditional[] = {
    {2, {{ 12, 1852.5}, { 37, 1857.5}, { 62, 1862.5}, { 87, 1867.5}, {112, 1872.5}, {137, 1877.5},
         {162, 1882.5}, {187, 1887.5}, {212, 1892.5}, {237, 1897.5}, {262, 1902.5}, {287, 1907.5}},
        {{412, 1932.5}, {437, 1937.5}, {462, 1942.5}, {487, 1947.5}, {512, 1952.5}, {537, 1957.5},
         {562, 1962.5}, {587, 1967.5}, {612, 1972.5}, {637, 1977.5}, {662, 1982.5}, {687, 1987.5}}},
    {4, {{1662, 1712.5}, {1687, 1717.5}, {1712, 1722.5}, {1737, 1727.5}, {1762, 1732.5}, {1787, 1737.5},
         {1812, 1742.5}, {1837, 1747.5}, {1862, 1752.5}},
        {{1887, 2112.5}, {1912, 2117.5}, {1937, 2122.5}, {1962, 2127.5}, {1987, 2132.5}, {2012, 2137.5},
         {2037, 2142.5}, {2062, 2147.5}, {2087, 2152.5}}},
    {5, {{ 782, 826.5}, { 787, 827.5}, { 807, 831.5}, { 812, 832.5}, { 837, 837.5}, { 862, 842.5}},
        {{1007, 871.5}, {1012, 872.5}, {1032, 876.5}, {1037, 877.5}, {1062, 882.5}, {1087, 887.5}}},
    {6, {{ 812, 832.5}, { 837, 837.5}},
        {{1037, 877.5}, {1062, 882.5}}},
    {7, {{2362, 2502.5}, {2387, 2507.5}, {2412, 2512.5}, {2437, 2517.5}, {2462, 2522.5}, {2487, 2527.5},
         {2512, 2532.5}, {2537, 2537.5}, {2562, 2542.5}, {2587, 2547.5}, {2612, 2552.5}, {2637, 2557.5},
         {2662, 2562.5}, {2687, 2567.5}},
        {{2587, 2622.5}, {2612, 2627.5}, {2637, 2632.5}, {2662, 2637.5}, {2687, 2642.5}, {2712, 2647.5},
         {2737, 2652.5}, {2762, 2657.5}, {2787, 2662.5}, {2812, 2667.5}, {2837, 2672.5}, {2862, 2677.5},
         {2887, 2682.5}, {2912, 2687.5}}},
    {10, {{3187, 1712.5}, {3212, 1717.5}, {3237, 1722.5}, {3262, 1727.5}, {3287, 1732.5}, {3312, 1737.5},
          {3337, 1742.5}, {3362, 1747.5}, {3387, 1752.5}, {3412, 1757.5}, {3437, 1762.5}, {3462, 1767.5}},
         {{3412, 2112.5}, {3437, 2117.5}, {3462, 2122.5}, {3487, 2127.5}, {3512, 2132.5}, {3537, 2137.5},
          {3562, 2142.5}, {3587, 2147.5}, {3612, 2152.5}, {3637, 2157.5}, {3662, 2162.5}, {3687, 2167.5}}},
    {12, {{3707, 701.5}, {3732, 706.5}, {3737, 707.5}, {3762, 712.5}, {3767, 713.5}},
         {{3932, 731.5}, {3957, 736.5}, {3962, 737.5}, {3987, 742.5}, {3992, 743.5}}},
    {13, {{3842, 779.5}, {3867, 784.5}},
         {{4067, 748.5}, {4092, 753.5}}},
    {14, {{3942, 790.5}, {3967, 795.5}},
         {{4167, 760.5}, {4192, 765.5}}},
    {19, {{387, 832.5}, {412, 837.5}, {437, 842.5}},
         {{787, 877.5}, {812, 882.5}, {837, 887.5}}},
    {25, {{6067, 1852.5}, {6092, 1857.5}, {6117, 1862.5}, {6142, 1867.5}, {6167, 1872.5}, {6192, 1877.5},
          {6217, 1882.5}, {6242, 1887.5}, {6267, 1892.5}, {6292, 1897.5}, {6317, 1902.5}, {6342, 1907.5},
          {6367, 1912.5}},
         {{6292, 1932.5}, {6317, 1937.5}, {6342, 1942.5}, {6367, 1947.5}, {6392, 1952.5}, {6417, 1957.5},
          {6442, 1962.5}, {6467, 1967.5}, {6492, 1972.5}, {6517, 1977.5}, {6542, 1982.5}, {6567, 1987.5},
          {6592, 1992.5}}},
    {26, {{5712, 816.5}, {5737, 821.5}, {5762, 826.5}, {5767, 827.5}, {5787, 831.5}, {5792, 832.5},
          {5812, 836.5}, {5817, 837.5}, {5837, 841.5}, {5842, 842.5}, {5862, 846.5}},
         {{5937, 861.5}, {5962, 866.5}, {5987, 871.5}, {5992, 872.5}, {6012, 876.5}, {6017, 877.5},
          {6037, 881.5}, {6042, 882.5}, {6062, 886.5}, {6067, 887.5}, {6087, 891.5}}},
    {32, {},
         {{6837, 1454.5}, {6862, 1459.5}, {6887, 1464.5}, {6912, 1469.5}, {6937, 1474.5}, {6962, 1479.5},
          {6987, 1484.5}, {7012, 1489.5}}},
};
// clang-format on

using UMTSLookup = std::optional<UMTSChannel> (*)(std::uint32_t);

void expectChannel(int band, const Numbered& expected, UMTSLookup lookup) {
  const std::optional<UMTSChannel> channel = lookup(expected.number);
  ASSERT_TRUE(channel) << expected.number;
  EXPECT_EQ(channel->frequency_khz, kilohertz(expected.mhz)) << expected.number;
  EXPECT_THAT(numbersOf(channel->bands), testing::Contains(band)) << expected.number;
}

void expectEnds(int band, const Ends& ends, UMTSLookup lookup) {
  using testing::Contains, testing::Not;
  expectChannel(band, {ends.first, ends.first_mhz}, lookup);
  expectChannel(band, {ends.last, ends.last_mhz}, lookup);
  EXPECT_THAT(bandsOf(lookup(ends.first - 1)), Not(Contains(band))) << ends.first - 1;
  EXPECT_THAT(bandsOf(lookup(ends.last + 1)), Not(Contains(band))) << ends.last + 1;
}

TEST(UMTSChannels, BothEndsOfEachBandsGeneralChannels) {
  for (const UMTSRow& row : umtsRows) {
    if (row.downlink) expectEnds(row.band, *row.downlink, umtsDownlink);
    if (row.uplink) expectEnds(row.band, *row.uplink, umtsUplink);
  }
}

TEST(UMTSChannels, EachAdditionalChannel) {
  for (const UMTSAdditional& row : umtsAdditional) {
    for (const Numbered& channel : row.downlink) expectChannel(row.band, channel, umtsDownlink);
    for (const Numbered& channel : row.uplink) expectChannel(row.band, channel, umtsUplink);
  }
}

std::vector<int> bandsByRows(std::uint32_t number, std::optional<Ends> UMTSRow::*general,
                             std::vector<Numbered> UMTSAdditional::*additional) {
  std::vector<int> bands;
  for (const UMTSRow& row : umtsRows)
    if (row.*general && (row.*general)->contain(number)) bands.push_back(row.band);
  for (const UMTSAdditional& row : umtsAdditional)
    for (const Numbered& channel : row.*additional)
      if (channel.number == number) bands.push_back(row.band);
  return bands;
}

TEST(UMTSChannels, ANumberHasTheBandsOfItsRowsAndNoOthers) {
  using testing::UnorderedElementsAreArray;
  for (std::uint32_t number = 0; number < 20000; ++number) {
    const std::vector<int> down = bandsByRows(number, &UMTSRow::downlink, &UMTSAdditional::downlink);
    const std::vector<int> up = bandsByRows(number, &UMTSRow::uplink, &UMTSAdditional::uplink);
    ASSERT_THAT(bandsOf(umtsDownlink(number)), UnorderedElementsAreArray(down)) << number;
    ASSERT_THAT(bandsOf(umtsUplink(number)), UnorderedElementsAreArray(up)) << number;
  }
  EXPECT_FALSE(umtsDownlink(highest));
  EXPECT_FALSE(umtsUplink(highest));
}

TEST(UMTSChannels, NumbersOfBandsVAndVIBelongToBothTheNarrowerFirst) {
  EXPECT_THAT(bandsOf(umtsDownlink(4386)), ElementsAre(5));
  EXPECT_THAT(bandsOf(umtsDownlink(4387)), ElementsAre(6, 5));
  EXPECT_THAT(bandsOf(umtsDownlink(4413)), ElementsAre(6, 5));
  EXPECT_THAT(bandsOf(umtsDownlink(4414)), ElementsAre(5));
  EXPECT_THAT(bandsOf(umtsDownlink(1062)), ElementsAre(6, 5));
  EXPECT_THAT(bandsOf(umtsUplink(812)), ElementsAre(6, 5));
  EXPECT_THAT(bandsOf(umtsUplink(4162)), ElementsAre(6, 5));
}

TEST(UMTSChannels, PairedUplinkOfEachChannel) {
  for (const UMTSRow& row : umtsRows) {
    if (!row.uplink) continue;
    EXPECT_EQ(umtsUplinkOf(row.downlink->first), row.uplink->first) << row.band;
    EXPECT_EQ(umtsUplinkOf(row.downlink->last), row.uplink->last) << row.band;
  }
  for (const UMTSAdditional& row : umtsAdditional)
    for (std::size_t i = 0; i < row.uplink.size(); ++i)
      EXPECT_EQ(umtsUplinkOf(row.downlink[i].number), row.uplink[i].number) << row.band;
  EXPECT_EQ(umtsUplinkOf(10700), 9750u);
}

TEST(UMTSChannels, WhereThereIsNoUplinkThereIsNoPartner) {
  // Band XXXII, general and additional, then numbers that are no downlink channel.
  for (const std::uint32_t number : {6617u, 6813u, 6837u, 7012u, 413u, 9612u, 9661u, 0u, highest})
    EXPECT_EQ(umtsUplinkOf(number), std::nullopt) << number;
}

TEST(UMTSChannels, PairsAreOneDuplexDistanceApart) {
  // TS 25.101, table 5.0aA: from the uplink up to the downlink, in MHz.
  struct Distance {
    std::uint16_t band;
    double distance_mhz;
  };
  constexpr Distance distances[] = {
      {1, 190}, {2, 80},  {3, 95},   {4, 400},  {5, 45},  {6, 45},   {7, 120}, {8, 45},   {9, 95},  {10, 400},
      {11, 48}, {12, 30}, {13, -31}, {14, -30}, {19, 45}, {20, -41}, {21, 48}, {22, 100}, {25, 80}, {26, 45},
  };
  std::size_t pairs = 0;
  for (std::uint32_t number = 0; number < 11000; ++number) {
    const std::optional<std::uint32_t> partner = umtsUplinkOf(number);
    if (!partner) continue;
    const std::optional<UMTSChannel> downlink = umtsDownlink(number), uplink = umtsUplink(*partner);
    ASSERT_TRUE(downlink && uplink) << number;
    ASSERT_EQ(numbersOf(downlink->bands), numbersOf(uplink->bands)) << number;
    for (const Distance& row : distances)
      if (downlink->bands.contains(row.band)) {
        ASSERT_EQ(downlink->frequency_khz - uplink->frequency_khz, kilohertz(row.distance_mhz)) << number;
        ++pairs;
      }
  }
  // The general channels are 277 + 277 + 352 + 202 + 102 + 27 + 327 + 152 + 151 + 277 + 76 + 62 + 27 + 27 +
  // 52 + 127 + 51 + 377 + 302 + 152, the additional ones 12 + 9 + 6 + 2 + 14 + 12 + 5 + 2 + 2 + 3 + 13 + 11.
  EXPECT_EQ(pairs, 3488u);
}

// ---- GSM ----

struct GSMEnds {
  GSMBand band;
  std::uint32_t arfcn;
  double uplink_mhz, downlink_mhz;
};

GSMChannel expectedChannel(const GSMEnds& row) {
  return {row.band, kilohertz(row.downlink_mhz), kilohertz(row.uplink_mhz)};
}

// TS 45.005, section 2: the first and the last channel of each band, and channel 0.
// clang-format off
constexpr GSMEnds gsmEnds[] = {
    {GSMBand::PrimaryGSM900,            1, 890.2, 935.2},
    {GSMBand::PrimaryGSM900,          124, 914.8, 959.8},
    {GSMBand::ExtendedGSM900,           0, 890.0, 935.0},
    {GSMBand::ExtendedGSM900,         975, 880.2, 925.2},
    {GSMBand::ExtendedGSM900,        1023, 889.8, 934.8},
    {GSMBand::RailwayGSM900,          955, 876.2, 921.2},
    {GSMBand::RailwayGSM900,          974, 880.0, 925.0},
    {GSMBand::ExtendedRailwayGSM900,  940, 873.2, 918.2},
    {GSMBand::ExtendedRailwayGSM900,  954, 876.0, 921.0},
    {GSMBand::GSM850,                 128, 824.2, 869.2},
    {GSMBand::GSM850,                 251, 848.8, 893.8},
    {GSMBand::GSM450,                 259, 450.6, 460.6},
    {GSMBand::GSM450,                 293, 457.4, 467.4},
    {GSMBand::GSM480,                 306, 479.0, 489.0},
    {GSMBand::GSM480,                 340, 485.8, 495.8},
    {GSMBand::GSM750,                 438, 777.2, 747.2},
    {GSMBand::GSM750,                 511, 791.8, 761.8},
};
constexpr GSMEnds gsm1800Ends[] = {
    {GSMBand::DCS1800, 512, 1710.2, 1805.2},
    {GSMBand::DCS1800, 810, 1769.8, 1864.8},
    {GSMBand::DCS1800, 811, 1770.0, 1865.0},
    {GSMBand::DCS1800, 885, 1784.8, 1879.8},
};
constexpr GSMEnds gsm1900Ends[] = {
    {GSMBand::PCS1900, 512, 1850.2, 1930.2},
    {GSMBand::PCS1900, 810, 1909.8, 1989.8},
};
// clang-format on

constexpr GSMBandIndicator indicators[] = {GSMBandIndicator::Unknown, GSMBandIndicator::DCS1800,
                                           GSMBandIndicator::PCS1900};

TEST(GSMChannels, BothEndsOfEachBandWhateverTheIndicatorSays) {
  for (const GSMEnds& row : gsmEnds)
    for (const GSMBandIndicator indicator : indicators)
      EXPECT_EQ(gsmChannel(row.arfcn, indicator), expectedChannel(row)) << row.arfcn;
}

TEST(GSMChannels, TheIndicatorDecidesBetweenDCS1800AndPCS1900) {
  for (const GSMEnds& row : gsm1800Ends)
    EXPECT_EQ(gsmChannel(row.arfcn, GSMBandIndicator::DCS1800), expectedChannel(row)) << row.arfcn;
  for (const GSMEnds& row : gsm1900Ends)
    EXPECT_EQ(gsmChannel(row.arfcn, GSMBandIndicator::PCS1900), expectedChannel(row)) << row.arfcn;
  for (std::uint32_t arfcn = 512; arfcn <= 810; ++arfcn)
    EXPECT_EQ(gsmChannel(arfcn, GSMBandIndicator::Unknown), std::nullopt) << arfcn;
}

TEST(GSMChannels, NumbersThatDCS1800HasAloneNeedNoIndicator) {
  for (const GSMBandIndicator indicator : indicators) {
    EXPECT_EQ(gsmChannel(811, indicator), expectedChannel({GSMBand::DCS1800, 811, 1770.0, 1865.0}));
    EXPECT_EQ(gsmChannel(885, indicator), expectedChannel({GSMBand::DCS1800, 885, 1784.8, 1879.8}));
  }
}

TEST(GSMChannels, NumbersOfNoBandGiveNothing) {
  // The ranges between the bands, first and last.
  constexpr std::pair<std::uint32_t, std::uint32_t> gaps[] = {
      {125, 127}, {252, 258},   {294, 305},     {341, 437},
      {886, 939}, {1024, 2000}, {65535, 65535}, {highest, highest},
  };
  for (const auto& [first, last] : gaps)
    for (std::uint64_t arfcn = first; arfcn <= last; ++arfcn)
      for (const GSMBandIndicator indicator : indicators)
        EXPECT_EQ(gsmChannel(static_cast<std::uint32_t>(arfcn), indicator), std::nullopt) << arfcn;
}

TEST(GSMChannels, EachOtherNumberIsAChannel) {
  // 125 + 84 of 900 MHz, 124 of 850, 35 of 450, 35 of 480, 74 of 750 and 374 of 1800.
  int channels = 0;
  for (std::uint32_t arfcn = 0; arfcn < 2000; ++arfcn)
    channels += gsmChannel(arfcn, GSMBandIndicator::DCS1800).has_value();
  EXPECT_EQ(channels, 851);
}

TEST(GSMChannels, BandsHaveTheirNames) {
  EXPECT_EQ(nameOf(GSMBand::GSM450), "GSM 450");
  EXPECT_EQ(nameOf(GSMBand::GSM480), "GSM 480");
  EXPECT_EQ(nameOf(GSMBand::GSM750), "GSM 750");
  EXPECT_EQ(nameOf(GSMBand::GSM850), "GSM 850");
  EXPECT_EQ(nameOf(GSMBand::PrimaryGSM900), "P-GSM 900");
  EXPECT_EQ(nameOf(GSMBand::ExtendedGSM900), "E-GSM 900");
  EXPECT_EQ(nameOf(GSMBand::RailwayGSM900), "R-GSM 900");
  EXPECT_EQ(nameOf(GSMBand::ExtendedRailwayGSM900), "ER-GSM 900");
  EXPECT_EQ(nameOf(GSMBand::DCS1800), "DCS 1800");
  EXPECT_EQ(nameOf(GSMBand::PCS1900), "PCS 1900");
}

}  // namespace
}  // namespace varnel::channels
