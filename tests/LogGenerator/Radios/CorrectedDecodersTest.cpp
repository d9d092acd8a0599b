#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/NumberFormats.h"
#include "LogGenerator/Radios/GSM/GPRSInformation.h"
#include "LogGenerator/Radios/GSM/GSMServingCell.h"
#include "LogGenerator/Radios/GSM/GSMSet.h"
#include "LogGenerator/Radios/UMTS/ActiveSet.h"
#include "LogGenerator/Radios/UMTS/EquivalentPLMNs.h"
#include "LogGenerator/Radios/UMTS/UMTSRRInfo.h"
#include "LogGenerator/Radios/UMTS/UMTSSet.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"

// The sections whose decoders of older technologies must show wrong values: what all radios show instead.
namespace varnel::radios {
namespace {

std::string unitOf(const Base& decoder, const std::string& entry) {
  NumberFormats formats;
  const std::string section(decoder.getSectionName());
  SectionFormats sectionFormats(formats, section);
  decoder.listNumberFormats(sectionFormats);
  return std::string(formats.unit(std::vector<std::string>{section, "0", entry}));
}

// ---- Equivalent networks ----

using RadiosEquivalentPLMNs = ListDecoderTest<EquivalentPLMNs, 0x7150>;

TEST_F(RadiosEquivalentPLMNs, DigitsArePackedInThreeOctets) {
  PacketBuilder packet(0x7150, 23);
  packet.u8(16, 2).u8(17, 0x21).u8(18, 0x63).u8(19, 0x54).u8(20, 0x62).u8(21, 0xF2).u8(22, 0x20);
  decode(packet.bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "123", Mobile Network Code: "456"}, )"
                     R"({Mobile Country Code: "262", Mobile Network Code: "02"}])");
  EXPECT_EQ(decoder.getSectionName(), "Equivalent PLMN List");
}

TEST_F(RadiosEquivalentPLMNs, APlaceWithoutANetworkIsLeftOut) {
  PacketBuilder packet(0x7150, 23);
  packet.fill(0xFF).u8(16, 2).u8(20, 0x21).u8(21, 0x63).u8(22, 0x54);
  decode(packet.bytes());
  EXPECT_EQ(shown(), R"([{Mobile Country Code: "123", Mobile Network Code: "456"}])");
}

TEST_F(RadiosEquivalentPLMNs, NetworksThatAreCutOffAreLeftOut) {
  const Bytes packet = PacketBuilder(0x7150, 26).fill(0x11).u8(16, 255).bytes();
  forEachTruncation(packet, [&](std::size_t size, const std::vector<std::string>& /*lines*/) {
    if (size < 17) {
      EXPECT_EQ(shown(), oldContent());
    } else {
      EXPECT_EQ(rowCount(), (size - 17) / 3);
    }
  });
}

// ---- GSM ----

TEST(RadiosGSMServingCell, TheDedicatedChannelHasTwoBytes) {
  CellMonitorReader cellMonitor;
  GSMServingCell decoder(cellMonitor);
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  decoder.updateWithData_logCode(Packet(PacketBuilder(0x5076, 17).u16(13, 700).bytes()), 0x5076);
  EXPECT_EQ(described(section), R"({MA Dedicated ARFCN: "700"})");
}

TEST(RadiosGSMServingCell, PathLossCriteriaHaveASign) {
  CellMonitorReader cellMonitor;
  GSMServingCell decoder(cellMonitor);
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  const Bytes packet =
      PacketBuilder(0x5137, 29).u8(15, 40).u32(16, static_cast<std::uint32_t>(-10)).u32(20, 70000).bytes();
  decoder.updateWithData_logCode(Packet(packet), 0x5137);
  EXPECT_EQ(described(section), R"({RSSI: "40 dBm", C1 Value: "-10", C2 Value: "70000"})");
}

TEST(RadiosGSMServingCell, TheRestIsReadAsByItsBase) {
  CellMonitorReader cellMonitor;
  GSMServingCell decoder(cellMonitor);
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  decoder.updateWithData_logCode(
      Packet(PacketBuilder(0x5134, 26).u16(13, 60).u16(15, 12).u16(17, 3456).bytes()), 0x5134);
  EXPECT_EQ(described(section), R"({Cell ID: "3456", ARFCN: "60", BSIC: "12"})");
  decoder.updateWithData_logCode(Packet(cellMonitorMessage({cellRecord(
                                     "GSM", "Serving", {number("CellIdentity", 7), number("ARFCN", 61)})})),
                                 0xFF0001);
  EXPECT_EQ(described(section), R"({Cell ID: "7", ARFCN: "61", BSIC: "12"})");
  EXPECT_EQ(decoder.getSectionName(), "GSM Serving Cell");
  EXPECT_EQ(decoder.getLogCodeArray(), (std::vector<std::uint32_t>{0x5134, 0x5137, 0x5076, 0xFF0001}));
}

using RadiosGSMSet = ListDecoderTest<GSMSet, 0x4005>;

TEST_F(RadiosGSMSet, GSMCellsFollowTheUMTSCells) {
  PacketBuilder packet(0x4005, 15 + 2 * 10 + 7);
  packet.fill(0xEE).u8(13, 2).u8(14, 1).u16(35, 60).u16(37, 12).u8(39, 0xB0).u16(40, 0xFFFF);
  decode(packet.bytes());
  EXPECT_EQ(shown(), R"([{ARFCN: "60", BSIC: "12", RSSI: "-80 dBm", Ranking Value: "-1"}])");
  EXPECT_EQ(unitOf(decoder, "RSSI"), "dBm");
}

TEST_F(RadiosGSMSet, WithoutUMTSCellsTheGSMCellsComeFirst) {
  decode(PacketBuilder(0x4005, 22).u8(14, 1).u16(15, 61).bytes());
  EXPECT_EQ(shown("ARFCN"), R"("61")");
}

TEST_F(RadiosGSMSet, CellsThatAreCutOffAreLeftOut) {
  const Bytes packet = PacketBuilder(0x4005, 15 + 10 + 14).u8(13, 1).u8(14, 200).bytes();
  forEachTruncation(packet, [&](std::size_t size, const std::vector<std::string>& /*lines*/) {
    if (size >= 15) {
      EXPECT_EQ(rowCount(), size < 25 ? 0 : (size - 25) / 7);
    }
  });
}

TEST(RadiosGPRSInformation, WhatTheCellDoesNotTellOfFlowContextsIsNotAvailable) {
  GPRSInformation decoder;
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  const auto shownFor = [&](std::uint8_t support) {
    decoder.updateWithData_logCode(
        Packet(PacketBuilder(0x51F5, 18).u8(13, support).u8(14, 7).u8(15, 1).bytes()), 0x51F5);
    return described(section);
  };
  EXPECT_EQ(shownFor(0xFF), R"({Network Control Order: "NC1", PFC Supported: "Not Available", )"
                            R"(Priority Access Threshold: "Allowed"})");
  EXPECT_EQ(shownFor(1), R"({Network Control Order: "NC1", PFC Supported: "Supported", )"
                         R"(Priority Access Threshold: "Allowed"})");
}

TEST(RadiosGPRSInformation, TheRestIsReadAsByItsModel) {
  GPRSInformation decoder;
  const Value section = Value::ofDictionary();
  decoder.updateSectionRef(section);
  decoder.updateWithData_logCode(Packet(PacketBuilder(0x51FB, 34).u8(13, 1).bytes()), 0x51FB);
  EXPECT_EQ(described(section), R"({PBCCH Present: "1"})");
  EXPECT_EQ(decoder.getLogCodeArray().size(), 7U);
}

// ---- UMTS ----

using RadiosActiveSet = ListDecoderTest<ActiveSet, 0x417A>;

// Cells of the active set that all have this energy. The received signal is 212 / 10 - 106 = -85 dBm.
Bytes activeCells(std::uint8_t count, std::uint32_t energy) {
  PacketBuilder packet(0x417A, 16u + (15u + 44u) * count);
  packet.u16(13, static_cast<std::uint16_t>(-300)).u8(15, count);
  for (std::size_t i = 0; i < count; ++i) {
    packet.u16(16 + 15 * i + 7, static_cast<std::uint16_t>(100 + i));
    packet.u32(16 + 15u * count + 44 * i + 32, energy);
  }
  return packet.bytes();
}

TEST_F(RadiosActiveSet, ThePowerIsShownInDBm) {
  decode(activeCells(1, 300000));
  EXPECT_EQ(shown(), R"([{Scrambling Code: "100", RSCP: "-88 dBm", Energy Per Chip: "-3 dB"}])");
  EXPECT_EQ(unitOf(decoder, "RSCP"), "dBm");
  EXPECT_EQ(unitOf(decoder, "Energy Per Chip"), "dB");
}

TEST_F(RadiosActiveSet, AnEnergyAboveTheTableIs0Decibels) {
  decode(activeCells(1, 524288));
  EXPECT_EQ(shown(), R"([{Scrambling Code: "100", RSCP: "-85 dBm", Energy Per Chip: "0 dB"}])");
}

TEST_F(RadiosActiveSet, ACellTooWeakForALevelShowsNone) {
  decode(activeCells(1, 705));
  EXPECT_EQ(shown(), R"([{Scrambling Code: "100"}])");
  decode(activeCells(1, 0));
  EXPECT_EQ(shown(), R"([{Scrambling Code: "100"}])");
  decode(activeCells(1, 706));
  EXPECT_EQ(shown("Energy Per Chip"), R"("-31 dB")");
}

TEST_F(RadiosActiveSet, CellsOfOtherSetsAreLeftOut) {
  Bytes packet = activeCells(2, 300000);
  packet[16 + 8] |= 0x20;
  decode(packet);
  EXPECT_EQ(shown(), R"([{Scrambling Code: "101", RSCP: "-88 dBm", Energy Per Chip: "-3 dB"}])");
}

TEST_F(RadiosActiveSet, CellsThatAreCutOffAreLeftOut) {
  forEachTruncation(activeCells(2, 300000), [&](std::size_t size, const std::vector<std::string>&) {
    if (size >= 16) {
      EXPECT_EQ(rowCount(), size < 90 ? 0 : 1);
    }
  });
  Bytes packet = activeCells(0, 0);
  packet[15] = 255;
  decode(packet);
  EXPECT_EQ(shown(), "[]");
}

using RadiosUMTSSet = ListDecoderTest<UMTSSet, 0x4005>;

TEST_F(RadiosUMTSSet, PowersAreInDBmAndChannelsHaveNoSign) {
  PacketBuilder packet(0x4005, 25);
  packet.u8(13, 1).u16(15, 40000).u16(17, 500).u8(19, 0xB0).u16(20, 0xFFFE).u8(22, 0xF1).u16(23, 0xFFFF);
  decode(packet.bytes());
  EXPECT_EQ(shown(), R"([{Scrambling Code: "500", RSCP: "-101 dBm", Energy Per Chip: "-7.500000 dB", )"
                     R"(Downlink Frequency: "40000", Ranking Value: "-1", Rank Cell RSCP: "-2 dB"}])");
  EXPECT_EQ(unitOf(decoder, "RSCP"), "dBm");
}

TEST_F(RadiosUMTSSet, TheCellMonitorsNeighborsAreShownAsByItsBase) {
  decode(cellMonitorMessage({cellRecord("UMTS", "Neighbor",
                                        {number("UARFCN", 10700), number("ScramblingCode", 5),
                                         number("RSCP", -90), number("EcN0", -6)})}),
         0xFF0001);
  EXPECT_EQ(shown(),
            R"([{UARFCN: "10700", Scrambling Code: "5", RSCP: "-90 dBm", Energy Per Chip: "-6 dB"}])");
}

TEST_F(RadiosUMTSSet, CellsThatAreCutOffAreLeftOut) {
  forEachTruncation(PacketBuilder(0x4005, 35).u8(13, 2).bytes(),
                    [&](std::size_t size, const std::vector<std::string>&) {
                      if (size >= 15) {
                        EXPECT_EQ(rowCount(), (size - 15) / 10);
                      }
                    });
}

using RadiosUMTSRRInfo = RowsDecoderTest<UMTSRRInfo, 0x4031>;

TEST_F(RadiosUMTSRRInfo, WithoutSamplesThereIsNoTransmitPower) {
  decode(PacketBuilder(0x4031, 44).u8(14, 2).u16(20, 88).u16(34, static_cast<std::uint16_t>(-12)).bytes());
  EXPECT_EQ(shown(), R"({Transmit Power: "-15.00 dBm"})");
  decode(PacketBuilder(0x4031, 16).bytes());
  EXPECT_EQ(shown(), R"({Transmit Power: ""})");
  EXPECT_EQ(unitOf(decoder, "Transmit Power"), "dBm");
}

TEST_F(RadiosUMTSRRInfo, TheRestIsReadAsByItsBase) {
  decode(PacketBuilder(0x4125, 14).u8(13, 3).bytes(), 0x4125);
  decode(cellMonitorMessage(
             {cellRecord("UMTS", "Serving",
                         {number("CellIdentity", 7), number("UARFCN", 10700), number("ScramblingCode", 5)})}),
         0xFF0001);
  EXPECT_EQ(shown(), R"({RRC State: "CELL_DCH", Cell ID: "7", UARFCN: "10700", Scrambling Code: "5"})");
  EXPECT_EQ(decoder.getLogCodeArray(),
            (std::vector<std::uint32_t>{0x4125, 0x4031, 0x4127, 0x4157, 0xFF0001}));
}

}  // namespace
}  // namespace varnel::radios
