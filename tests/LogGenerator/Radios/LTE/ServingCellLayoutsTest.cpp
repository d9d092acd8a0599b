#include <gtest/gtest.h>

#include "LogGenerator/Radios/Channels.h"
#include "LogGenerator/Radios/LTE/ServingCell.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t masterInformation = 0xB0C1, servingCell = 0xB0C2;

DecoderAlone<ServingCell> newDecoder() { return DecoderAlone<ServingCell>(); }
const LayoutRules rules(newDecoder);

std::string downlinkFrequency(std::uint64_t earfcn) {
  const auto channel = channels::lteDownlink(static_cast<std::uint32_t>(earfcn));
  return channel ? printed("%.1f MHz", channel->frequency_khz / 1000.0) : "";
}
std::string downlinkBand(std::uint64_t earfcn) {
  const auto channel = channels::lteDownlink(static_cast<std::uint32_t>(earfcn));
  return channel ? std::to_string(channel->band) : "";
}
std::string uplinkFrequency(std::uint64_t earfcn) {
  const auto channel = channels::lteUplink(static_cast<std::uint32_t>(earfcn));
  return channel ? printed("%.1f MHz", channel->frequency_khz / 1000.0) : "";
}

// Channel 3050 lies in band 7, at 2650 MHz: 2620 + 0.1 (3050 - 2750).
constexpr std::uint32_t channel = 3050;

DescribedLayout masterInformationLayout(std::uint32_t version) {
  const unsigned channelWidth = version == 1 ? 16 : 32;
  const std::size_t behind = 3 + channelWidth / 8;
  DescribedLayout layout{.logCode = masterInformation, .version = {version}, .size = behind + 4};
  if (version == 3) layout.size += 1;
  layout.minimum = layout.size;
  const BitRun earfcn{3, 0, channelWidth};
  layout.fields = {
      {"Physical Cell ID", wordAt(1), 301, plainNumber()},
      {"EARFCN", earfcn, channel, plainNumber()},
      {"Downlink Frequency", earfcn, channel, downlinkFrequency},
      {"Band", earfcn, channel, downlinkBand},
      {"System Frame Number", wordAt(behind), 713, plainNumber()},
      {"Antennas", byteAt(behind + 2), 4, plainNumber()},
      {"Downlink Bandwidth", byteAt(behind + 3), 75, lteBandwidthText},
  };
  return layout;
}

DescribedLayout narrowBandLayout() {
  return {.logCode = masterInformation,
          .version = {17},
          .size = 18,
          .minimum = 18,
          .fields = {
              {"Physical Cell ID", wordAt(1), 301, plainNumber()},
              {"EARFCN", longAt(3), channel, plainNumber()},
              {"Downlink Frequency", longAt(3), channel, downlinkFrequency},
              {"Band", longAt(3), channel, downlinkBand},
              {"System Frame Number", wordAt(7), 713, plainNumber()},
              {"Access Barring", byteAt(13), 3, plainNumber()},
              {"Operation Mode", byteAt(14), 2,
               choiceOf({"In-band, other PCI", "In-band, same PCI", "Guard band", "Stand-alone"}, "Unknown")},
              {"Raster Offset", wordAt(15), 1,
               choiceOf({"-7.5 kHz", "-2.5 kHz", "2.5 kHz", "7.5 kHz"}, "Unknown")},
              {"Antennas", byteAt(17), 2, plainNumber()},
          }};
}

DescribedLayout servingCellLayout(std::uint32_t version) {
  const unsigned channelWidth = version == 2 ? 16 : 32;
  const std::size_t after = version == 2 ? 7 : 11;
  const BitRun earfcn{3, 0, channelWidth}, uplink{3 + channelWidth / 8, 0, channelWidth};
  const std::size_t plmn = after + 12;
  DescribedLayout layout{.logCode = servingCell,
                         .version = {version},
                         .size = after + 18,
                         .minimum = after + 18,
                         .fields = {
                             {"Physical Cell ID", wordAt(1), 77, plainNumber()},
                             {"EARFCN", earfcn, channel, plainNumber()},
                             {"Downlink Frequency", earfcn, channel, downlinkFrequency},
                             {"Uplink EARFCN", uplink, 21050, plainNumber()},
                             {"Uplink Frequency", uplink, 21050, uplinkFrequency},
                             {"Downlink Bandwidth", byteAt(after), 100, lteBandwidthText},
                             {"Uplink Bandwidth", byteAt(after + 1), 50, lteBandwidthText},
                             {"Cell Identity", {after + 2, 0, 28}, 0x0ABCDE7, plainNumber()},
                             {"eNB", {after + 3, 0, 20}, 0x0ABCD, plainNumber()},
                             {"Cell", byteAt(after + 2), 0xE7, plainNumber()},
                             {"Tracking Area Code", wordAt(after + 6), 40001, plainNumber()},
                             {"Band", longAt(after + 8), 7, plainNumber()},
                             {"Allowed Access", byteAt(after + 17), 1, plainNumber()},
                         }};
  layout.fixed = {{byteAt(plmn + 2), 3}};
  layout.fixed.push_back({wordAt(plmn), 262});
  layout.fixed.push_back({wordAt(plmn + 3), 7});
  layout.derived = {{"PLMN", [](ByteView) { return std::string("262-007"); }}};
  return layout;
}

TEST(LTEServingCellLayouts, EachFieldMovesItsRowsOnly) {
  for (const std::uint32_t version : {1, 2, 3})
    rules.expectEachFieldByItself(masterInformationLayout(version));
  rules.expectEachFieldByItself(narrowBandLayout());
  for (const std::uint32_t version : {2, 3}) rules.expectEachFieldByItself(servingCellLayout(version));
}

TEST(LTEServingCellLayouts, KnownVersionsShowTheirNumber) {
  for (const std::uint32_t version : {1, 2, 3}) rules.expectVersionKnown(masterInformationLayout(version));
  rules.expectVersionKnown(narrowBandLayout());
  for (const std::uint32_t version : {2, 3}) rules.expectVersionKnown(servingCellLayout(version));
}

TEST(LTEServingCellLayouts, NothingPastTheEndIsShown) {
  for (const std::uint32_t version : {1, 2}) rules.expectNothingPastTheEnd(masterInformationLayout(version));
  rules.expectNothingPastTheEnd(narrowBandLayout());
  for (const std::uint32_t version : {2, 3}) rules.expectNothingPastTheEnd(servingCellLayout(version));
  for (const std::uint32_t version : {1, 2}) {
    rules.expectUnchangedBelowMinimum(masterInformationLayout(version), servingCellLayout(3));
    rules.expectUnchangedBelowMinimum(servingCellLayout(version + 1), masterInformationLayout(2));
  }
  rules.expectUnchangedBelowMinimum(narrowBandLayout(), servingCellLayout(3));
}

// Nothing of its last byte is shown, so a packet without it may be.
TEST(LTEServingCellLayouts, Version3OfTheMasterInformationNeedsItsElevenBytes) {
  DescribedLayout layout = masterInformationLayout(3);
  layout.minimum = 11;
  rules.expectNothingPastTheEnd(layout);
  rules.expectUnchangedBelowMinimum(layout, servingCellLayout(3));
}

TEST(LTEServingCellLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(masterInformationLayout(2), {1, 2, 3, 17});
  rules.expectOtherVersionsUnknown(narrowBandLayout(), {1, 2, 3, 17});
  rules.expectOtherVersionsUnknown(servingCellLayout(3), {2, 3});
}

TEST(LTEServingCellLayouts, LongerPacketsShowTheSame) {
  for (const DescribedLayout& layout :
       {masterInformationLayout(1), masterInformationLayout(2), narrowBandLayout(), servingCellLayout(3)}) {
    Bytes payload = layout.payload();
    payload.insert(payload.end(), 40, 0xFF);
    auto decoder = newDecoder();
    decoder.decode(layout.logCode, payload);
    EXPECT_EQ(differences(layout.rowsOf(payload), decoder.rows()), "") << layout.name();
  }
}

TEST(LTEServingCellLayouts, MasterInformationInLiterals) {
  auto decoder = newDecoder();
  // Cell 0x0123, channel 0x141E = 5150 (band 12: 729 + 0.1 x 140 MHz), frame 0x0321.
  decoder.decode(masterInformation, Bytes{2, 0x23, 0x01, 0x1E, 0x14, 0, 0, 0x21, 0x03, 2, 50});
  EXPECT_EQ(differences({{"Physical Cell ID", "291"},
                         {"EARFCN", "5150"},
                         {"Downlink Frequency", "743.0 MHz"},
                         {"Band", "12"},
                         {"System Frame Number", "801"},
                         {"Antennas", "2"},
                         {"Downlink Bandwidth", "10 MHz"}},
                        decoder.rows()),
            "");
}

TEST(LTEServingCellLayouts, ServingCellInLiterals) {
  auto decoder = newDecoder();
  // Channels 6300 (band 20: 791 + 15 MHz) and 24300 (832 + 15 MHz), identity 0x0123456.
  decoder.decode(servingCell,
                 Bytes{3,    0xF7, 0x01, 0x9C, 0x18, 0, 0, 0xEC, 0x5E, 0,    0, 50, 25, 0x56, 0x34,
                       0x12, 0x00, 0xCD, 0xAB, 20,   0, 0, 0,    6,    0x01, 2, 2,  0,  9});
  EXPECT_EQ(differences({{"Physical Cell ID", "503"},
                         {"EARFCN", "6300"},
                         {"Downlink Frequency", "806.0 MHz"},
                         {"Uplink EARFCN", "24300"},
                         {"Uplink Frequency", "847.0 MHz"},
                         {"Band", "20"},
                         {"Downlink Bandwidth", "10 MHz"},
                         {"Uplink Bandwidth", "5 MHz"},
                         {"PLMN", "262-02"},
                         {"Tracking Area Code", "43981"},
                         {"Cell Identity", "1193046"},
                         {"eNB", "4660"},
                         {"Cell", "86"},
                         {"Allowed Access", "9"}},
                        decoder.rows()),
            "");
}

TEST(LTEServingCellLayouts, PLMNHasTheDigitsThatThePacketTells) {
  const std::size_t mcc = 23, digits = 25, mnc = 26;
  const auto shown = [&](unsigned country, unsigned count, unsigned network) {
    Bytes payload = servingCellLayout(3).payload();
    put(payload, wordAt(mcc), country);
    put(payload, byteAt(digits), count);
    put(payload, wordAt(mnc), network);
    auto decoder = newDecoder();
    decoder.decode(servingCell, payload);
    return decoder.text("PLMN");
  };
  EXPECT_EQ(shown(262, 2, 1), "262-01");
  EXPECT_EQ(shown(262, 3, 1), "262-001");
  EXPECT_EQ(shown(1, 2, 0), "001-00");
  EXPECT_EQ(shown(310, 3, 410), "310-410");
  EXPECT_EQ(shown(999, 3, 999), "999-999");
  // Each bit of the two numbers, alone.
  for (unsigned bit = 0; bit < 10; ++bit) {
    EXPECT_EQ(shown(1u << bit, 3, 1), printed("%03u-001", 1u << bit));
    EXPECT_EQ(shown(262, 3, 1u << bit), printed("262-%03u", 1u << bit));
    if (bit > 6) continue;
    EXPECT_EQ(shown(262, 2, 1u << bit), printed("262-%02u", 1u << bit));
  }
}

TEST(LTEServingCellLayouts, EveryBandwidthThatIsNoneIsUnknown) {
  for (unsigned blocks = 0; blocks < 256; ++blocks) {
    Bytes payload = servingCellLayout(3).payload();
    payload[11] = payload[12] = static_cast<std::uint8_t>(blocks);
    auto decoder = newDecoder();
    decoder.decode(servingCell, payload);
    EXPECT_EQ(decoder.text("Downlink Bandwidth"), lteBandwidthText(blocks));
    EXPECT_EQ(decoder.text("Uplink Bandwidth"), lteBandwidthText(blocks));
  }
}

// Both packets of cell 77 on channel 3050.
Bytes servingCellPacket() { return servingCellLayout(3).payload(); }
Bytes masterInformationPacket(std::uint16_t cell, std::uint32_t earfcn) {
  Bytes payload = masterInformationLayout(2).payload();
  put(payload, wordAt(1), cell);
  put(payload, longAt(3), earfcn);
  return payload;
}

constexpr const char* rowsOfServingCellOnly[] = {
    "PLMN",          "Tracking Area Code", "Cell Identity",    "eNB",           "Cell",
    "Uplink EARFCN", "Uplink Frequency",   "Uplink Bandwidth", "Allowed Access"};

TEST(LTEServingCellLayouts, MasterInformationOfTheSameCellKeepsItsIdentity) {
  auto decoder = newDecoder();
  decoder.decode(servingCell, servingCellPacket());
  const Rows before = decoder.rows();
  decoder.decode(masterInformation, masterInformationPacket(77, channel));
  for (const char* row : rowsOfServingCellOnly) EXPECT_EQ(decoder.text(row), before.at(row)) << row;
  EXPECT_EQ(decoder.text("Antennas"), "4");
}

TEST(LTEServingCellLayouts, MasterInformationOfAnotherCellOrChannelRemovesTheIdentity) {
  for (const Bytes& packet :
       {masterInformationPacket(78, channel), masterInformationPacket(77, channel + 1)}) {
    auto decoder = newDecoder();
    decoder.decode(servingCell, servingCellPacket());
    decoder.decode(masterInformation, packet);
    for (const char* row : rowsOfServingCellOnly) {
      EXPECT_EQ(decoder.text(row), "") << row;
      // The row stays, with an empty text.
      EXPECT_EQ(described(decoder.section().dictionary()->get(row)), R"("")") << row;
    }
    EXPECT_EQ(decoder.text("Band"), "7");
    EXPECT_EQ(decoder.text("Antennas"), "4");
  }
}

TEST(LTEServingCellLayouts, ServingCellOfAnotherCellRemovesAntennasAndFrame) {
  for (const auto& [cell, earfcn] : {std::pair{78, channel}, std::pair{77, channel + 1}}) {
    auto decoder = newDecoder();
    decoder.decode(masterInformation, masterInformationPacket(static_cast<std::uint16_t>(cell), earfcn));
    decoder.decode(servingCell, servingCellPacket());
    for (const char* row : {"Antennas", "System Frame Number"})
      EXPECT_EQ(described(decoder.section().dictionary()->get(row)), R"("")") << row;
  }
  auto decoder = newDecoder();
  decoder.decode(masterInformation, masterInformationPacket(77, channel));
  decoder.decode(servingCell, servingCellPacket());
  EXPECT_EQ(decoder.text("Antennas"), "4");
  EXPECT_EQ(decoder.text("System Frame Number"), "713");
}

// A packet of another version is not read, so it names no other cell.
TEST(LTEServingCellLayouts, AnUnknownVersionOfAnotherCellRemovesNothing) {
  auto decoder = newDecoder();
  decoder.decode(servingCell, servingCellPacket());
  Bytes packet = masterInformationPacket(78, channel);
  packet[0] = 4;
  const Rows before = decoder.rows();
  decoder.decode(masterInformation, packet);
  EXPECT_EQ(differences(before, decoder.rows()), "");
  EXPECT_EQ(decoder.version(), "4 (not known)");
  decoder.decode(servingCell, servingCellPacket());
  EXPECT_EQ(decoder.version(), "3");
}

TEST(LTEServingCellLayouts, AChannelOfNoBandHasNoFrequency) {
  for (const std::uint32_t earfcn : {4950u, 40000000u, 35999u, 65535u}) {
    auto decoder = newDecoder();
    decoder.decode(servingCell, servingCellPacket());
    decoder.decode(masterInformation, masterInformationPacket(77, earfcn));
    EXPECT_EQ(decoder.text("Downlink Frequency"), "") << earfcn;
    EXPECT_EQ(decoder.text("EARFCN"), std::to_string(earfcn));
  }
}

TEST(LTEServingCellLayouts, CellMonitorShowsItsServingCell) {
  auto decoder = newDecoder();
  decoder.decodePacket(
      0xFF0001,
      cellMonitorMessage({cellRecord("LTE", "Serving",
                                     {number("TrackingAreaCode", 40001), number("CellIdentity", 0x0ABCDE7),
                                      number("PhysicalCellIdentity", 77), number("BandInfo", 7),
                                      number("UARFCN", 3050), number("MCC", 262), number("MNC", 7)})}));
  const Rows rows = decoder.rows();
  EXPECT_EQ(rows.at("Tracking Area Code"), "40001");
  EXPECT_EQ(rows.at("Physical Cell ID"), "77");
  EXPECT_EQ(rows.at("EARFCN"), "3050");
  EXPECT_EQ(rows.at("Band"), "7");
  EXPECT_EQ(rows.at("PLMN"), "262-07");
  EXPECT_EQ(rows.at("Cell Identity"), "11259367");
  EXPECT_EQ(rows.at("eNB"), "43981");
  EXPECT_EQ(rows.at("Cell"), "231");
}

TEST(LTEServingCellLayouts, CellMonitorShowsAPLMNOfBothNumbersOnly) {
  const auto shown = [](std::initializer_list<Dictionary::Entry> entries) {
    auto decoder = newDecoder();
    decoder.decodePacket(
        0xFF0001, cellMonitorMessage({cellRecord("LTE", "Neighbor", {number("MCC", 1), number("MNC", 1)}),
                                      cellRecord("LTE", "Serving", entries)}));
    return decoder.text("PLMN");
  };
  EXPECT_EQ(shown({number("MCC", 1), number("MNC", 99)}), "001-99");
  EXPECT_EQ(shown({number("MCC", 310), number("MNC", 100)}), "310-100");
  EXPECT_EQ(shown({number("MCC", 310)}), "");
  EXPECT_EQ(shown({number("MNC", 10)}), "");
}

TEST(LTEServingCellLayouts, ADecoderThatTakesTheSectionOverKnowsItsCell) {
  auto decoder = newDecoder();
  decoder.decode(servingCell, servingCellPacket());
  decoder.decodeByAnother(masterInformation, masterInformationPacket(77, channel));
  EXPECT_EQ(decoder.text("PLMN"), "262-007");
  decoder.decodeByAnother(masterInformation, masterInformationPacket(78, channel));
  for (const char* row : rowsOfServingCellOnly) EXPECT_EQ(decoder.text(row), "") << row;
}

}  // namespace
}  // namespace varnel::lte
