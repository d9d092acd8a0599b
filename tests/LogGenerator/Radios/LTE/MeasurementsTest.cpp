#include "LogGenerator/Radios/LTE/Measurements.h"

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/LTE/CellPackets.h"
#include "tests/support/DecoderHarness.h"

namespace varnel {
namespace {

class LTEMeasurements : public RowsDecoderTest<lte::Measurements, 0xB193> {
 protected:
  // Puts values into the antennas of a cell of version 36, whose first byte is at the offset.
  static void putAntenna0(BodyBuilder& carrier, std::size_t cell) {
    carrier.bits(cell + 16, 10, 12, 1300).bits(cell + 36, 0, 10, 301).bits(cell + 48, 0, 11, 620);
    carrier.bits(cell + 80, 0, 9, 291);
  }
  static void putAntenna3(BodyBuilder& carrier, std::size_t cell) {
    carrier.bits(cell + 28, 0, 12, 1304).bits(cell + 40, 20, 10, 304).bits(cell + 52, 11, 11, 624);
    carrier.bits(cell + 84, 9, 9, 150);
  }

  void decodeServing(BodyBuilder carrier, std::uint32_t physicalCell) {
    putCell(carrier, 0, {.physicalCell = physicalCell, .rsrp = 800, .isServing = true});
    decode(packetWith(0xB193, carrier));
  }
};

TEST_F(LTEMeasurements, ServingCellIsShownWithItsChannel) {
  BodyBuilder carrier = carrierOf(1);
  carrier.u16(12 + 4, 15u << 10 | 1023);
  decodeServing(carrier, 503);
  EXPECT_EQ(shown("EARFCN"), "\"1300\"");
  EXPECT_EQ(shown("Physical Cell ID"), "\"503\"");
  EXPECT_EQ(shown("RSRP"), "\"-90.00 dBm\"");
  EXPECT_EQ(shown("RSRQ"), "\"-30.00 dB\"");
  EXPECT_EQ(shown("RSSI"), "\"-110.00 dBm\"");
  EXPECT_EQ(shown("System Frame Number"), "\"1023\"");
  EXPECT_EQ(shown("Subframe"), "\"15\"");
  EXPECT_EQ(shown("Version"), "\"25.36\"");
}

TEST_F(LTEMeasurements, UsedAntennasAreShownAndOthersAreEmpty) {
  BodyBuilder carrier = carrierOf(1);
  putAntenna0(carrier, 12);
  putAntenna3(carrier, 12);
  decodeServing(carrier, 1);
  EXPECT_EQ(shown("RSRP Rx0"), "\"-98.75 dBm\"");
  EXPECT_EQ(shown("RSRQ Rx0"), "\"-11.19 dB\"");
  EXPECT_EQ(shown("RSSI Rx0"), "\"-71.25 dBm\"");
  EXPECT_EQ(shown("SNR Rx0"), "\"9.1 dB\"");
  for (const char* entry : {"RSRP Rx1", "RSRQ Rx1", "RSSI Rx1", "SNR Rx1", "RSRP Rx2", "SNR Rx2"})
    EXPECT_EQ(shown(entry), "\"\"") << entry;
  EXPECT_EQ(shown("RSRP Rx3"), "\"-98.50 dBm\"");
  EXPECT_EQ(shown("RSRQ Rx3"), "\"-11.00 dB\"");
  EXPECT_EQ(shown("RSSI Rx3"), "\"-71.00 dBm\"");
  EXPECT_EQ(shown("SNR Rx3"), "\"-5.0 dB\"");
}

TEST_F(LTEMeasurements, OneValueMakesAnAntennaUsed) {
  BodyBuilder carrier = carrierOf(1);
  carrier.bits(12 + 80, 9, 9, 1);
  decodeServing(carrier, 1);
  EXPECT_EQ(shown("RSRP Rx1"), "\"-180.00 dBm\"");
  EXPECT_EQ(shown("RSRQ Rx1"), "\"-30.00 dB\"");
  EXPECT_EQ(shown("RSSI Rx1"), "\"-110.00 dBm\"");
  EXPECT_EQ(shown("SNR Rx1"), "\"-19.9 dB\"");
  EXPECT_EQ(shown("RSRP Rx0"), "\"\"");
}

TEST_F(LTEMeasurements, AntennaThatIsSwitchedOffBecomesEmpty) {
  BodyBuilder carrier = carrierOf(1);
  putAntenna3(carrier, 12);
  decodeServing(carrier, 1);
  decodeServing(carrierOf(1), 1);
  EXPECT_EQ(shown("RSRP Rx3"), "\"\"");
  EXPECT_EQ(shown("SNR Rx3"), "\"\"");
}

TEST_F(LTEMeasurements, NeighborsAndSecondaryCellsAreNotShown) {
  BodyBuilder carrier = carrierOf(2);
  putCell(carrier, 0, {.physicalCell = 5, .rsrp = 900});
  putCell(carrier, 1, {.physicalCell = 6, .rsrp = 900, .isServing = true, .servingIndex = 1});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown(), "{Version: \"25.36\"}");
}

TEST_F(LTEMeasurements, PrimaryCellNeedNotBeTheFirst) {
  BodyBuilder carrier = carrierOf(3);
  putCell(carrier, 0, {.physicalCell = 5, .rsrp = 900});
  putCell(carrier, 1, {.physicalCell = 6, .rsrp = 850, .isServing = true, .servingIndex = 2});
  putCell(carrier, 2, {.physicalCell = 7, .rsrp = 880, .isServing = true});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown("Physical Cell ID"), "\"7\"");
  EXPECT_EQ(shown("RSRP"), "\"-85.00 dBm\"");
}

TEST_F(LTEMeasurements, CellsThatAreNotCountedAreNotShown) {
  BodyBuilder carrier = carrierOf(2);
  putCell(carrier, 1, {.physicalCell = 7, .rsrp = 880, .isServing = true});
  decode(packetWith(0xB193, carrier.u16(8, 1)));
  EXPECT_EQ(shown("Physical Cell ID"), "absent");
}

TEST_F(LTEMeasurements, CellIsShownOnlyWhenItsFieldsAreThere) {
  for (const std::size_t size : {112, 111}) {
    BodyBuilder carrier = subpacketOf(25, 36, 12 + size).u32(4, 1300).u16(8, 65535);
    carrier.bits(12, 0, 9, size).bits(12, 12, 1, 1);
    decode(packetWith(0xB193, carrier));
  }
  EXPECT_EQ(shown("Physical Cell ID"), "\"112\"");
}

TEST_F(LTEMeasurements, ChannelsAndCellsThatLTEDoesNotHaveShowNothing) {
  decodeServing(carrierOf(1, 262144), 1);
  EXPECT_EQ(shown("EARFCN"), "absent");
  decodeServing(carrierOf(1), 504);
  EXPECT_EQ(shown("EARFCN"), "absent");
  BodyBuilder carrier = carrierOf(2);
  putCell(carrier, 1, {.physicalCell = 504});
  decodeServing(carrier, 1);
  EXPECT_EQ(shown("EARFCN"), "absent");
  decodeServing(carrierOf(1, 262143), 503);
  EXPECT_EQ(shown("EARFCN"), "\"262143\"");
}

TEST_F(LTEMeasurements, Version60ShowsItsFirstCellWithoutSNR) {
  BodyBuilder carrier = subpacketOf(25, 60, 12 + 2 * 148).u32(4, 66486).u32(8, 2);
  carrier.bits(12 + 8, 0, 9, 42).bits(12 + 40, 12, 12, 640).bits(12 + 24, 10, 12, 1280);
  carrier.bits(12 + 40, 0, 12, 1281).bits(12 + 64, 11, 11, 7);
  carrier.bits(12 + 148 + 8, 0, 9, 43);
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown("EARFCN"), "\"66486\"");
  EXPECT_EQ(shown("Physical Cell ID"), "\"42\"");
  EXPECT_EQ(shown("RSRP"), "\"-100.00 dBm\"");
  EXPECT_EQ(shown("RSRP Rx0"), "\"-100.00 dBm\"");
  EXPECT_EQ(shown("SNR Rx0"), "\"\"");
  EXPECT_EQ(shown("RSRP Rx3"), "\"-99.94 dBm\"");
  EXPECT_EQ(shown("RSSI Rx3"), "\"-109.56 dBm\"");
  EXPECT_EQ(shown("SNR Rx3"), "\"\"");
}

TEST_F(LTEMeasurements, Version4HasItsWordsAtFixedPlaces) {
  BodyBuilder carrier = subpacketOf(25, 4, 80).u16(4, 1300).u16(6, 1u << 12 | 77).u16(8, 3u << 10 | 500);
  carrier.bits(16, 10, 12, 1280).bits(24, 12, 12, 1296).bits(28, 12, 10, 320).bits(32, 20, 10, 336);
  carrier.bits(36, 21, 11, 16).bits(40, 0, 11, 640).bits(64, 9, 9, 300);
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown("EARFCN"), "\"1300\"");
  EXPECT_EQ(shown("Physical Cell ID"), "\"77\"");
  EXPECT_EQ(shown("System Frame Number"), "\"500\"");
  EXPECT_EQ(shown("Subframe"), "\"3\"");
  EXPECT_EQ(shown("RSRP"), "\"-99.00 dBm\"");
  EXPECT_EQ(shown("RSRQ"), "\"-9.00 dB\"");
  EXPECT_EQ(shown("RSSI"), "\"-70.00 dBm\"");
  EXPECT_EQ(shown("RSRP Rx0"), "\"-100.00 dBm\"");
  EXPECT_EQ(shown("RSRQ Rx0"), "\"-10.00 dB\"");
  EXPECT_EQ(shown("RSSI Rx1"), "\"-109.00 dBm\"");
  EXPECT_EQ(shown("SNR Rx1"), "\"10.0 dB\"");
  EXPECT_EQ(shown("Projected SIR"), "absent");
}

TEST_F(LTEMeasurements, Version18HasOneCell) {
  BodyBuilder carrier = subpacketOf(25, 18, 96).u32(4, 1300).u16(8, 1u << 12 | 5).u32(8 + 80, 160);
  carrier.bits(8 + 24, 12, 12, 1296);
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown("Physical Cell ID"), "\"5\"");
  EXPECT_EQ(shown("RSRP"), "\"-99.00 dBm\"");
  EXPECT_EQ(shown("Projected SIR"), "absent");
}

TEST_F(LTEMeasurements, ProjectedSIRHasASign) {
  BodyBuilder carrier = carrierOf(1).u32(12 + 104, 0xFFFFFFFF).u32(12 + 108, 320);
  decodeServing(carrier, 1);
  EXPECT_EQ(shown("Projected SIR"), "\"-0.06 dB\"");
  EXPECT_EQ(shown("RSRQ after Cancellation"), "\"-10.00 dB\"");
}

Bytes idlePacket(std::uint32_t earfcn, std::uint32_t physicalCell) {
  BodyBuilder payload(40);
  payload.u8(0, 5).u32(4, earfcn).bits(8, 0, 9, physicalCell).bits(8, 9, 7, 6);
  payload.bits(12, 0, 12, 1280).bits(16, 0, 12, 1264).bits(20, 0, 10, 320).bits(20, 20, 10, 304);
  payload.bits(24, 10, 11, 640).bits(28, 0, 6, 8).bits(28, 6, 7, 53).bits(28, 13, 6, 51);
  payload.bits(28, 19, 7, 70).bits(32, 0, 6, 31).bits(32, 6, 6, 5);
  return packetOf(0xB17F, payload);
}

TEST_F(LTEMeasurements, IdleMeasurementIsShown) {
  decode(idlePacket(1300, 7), 0xB17F);
  EXPECT_EQ(
      shown(),
      R"({Version: "5", EARFCN: "1300", Physical Cell ID: "7", Cell Priority: "6", RSRP: "-100.00 dBm", )"
      R"(Average RSRP: "-101.00 dBm", RSRQ: "-10.00 dB", Average RSRQ: "-11.00 dB", RSSI: "-70.00 dBm", )"
      R"(Qrxlevmin: "-124 dBm", P-Max: "23 dBm", Max UE Tx Power: "21 dBm", Srxlev: "20 dB", )"
      R"(S Intra Search: "31", S Non Intra Search: "5"})");
}

TEST_F(LTEMeasurements, OlderIdleMeasurementHasAShortChannelNumber) {
  BodyBuilder payload(32);
  payload.u8(0, 4).u16(4, 5230).bits(6, 0, 9, 300).bits(6, 9, 7, 3).bits(8, 0, 12, 1280);
  payload.bits(12, 0, 12, 1264).bits(16, 20, 10, 304).bits(20, 10, 11, 640).bits(28, 6, 6, 9);
  decode(packetOf(0xB17F, payload), 0xB17F);
  EXPECT_EQ(shown("EARFCN"), "\"5230\"");
  EXPECT_EQ(shown("Physical Cell ID"), "\"300\"");
  EXPECT_EQ(shown("Cell Priority"), "\"3\"");
  EXPECT_EQ(shown("RSRP"), "\"-100.00 dBm\"");
  EXPECT_EQ(shown("Average RSRP"), "\"-101.00 dBm\"");
  EXPECT_EQ(shown("Average RSRQ"), "\"-11.00 dB\"");
  EXPECT_EQ(shown("RSSI"), "\"-70.00 dBm\"");
  EXPECT_EQ(shown("S Non Intra Search"), "\"9\"");
}

TEST_F(LTEMeasurements, IdleMeasurementOfTheSameCellLeavesTheAntennas) {
  BodyBuilder carrier = carrierOf(1);
  putAntenna0(carrier, 12);
  decodeServing(carrier, 7);
  decode(idlePacket(1300, 7), 0xB17F);
  EXPECT_EQ(shown("RSRP Rx0"), "\"-98.75 dBm\"");
  EXPECT_EQ(shown("System Frame Number"), "\"0\"");
}

TEST_F(LTEMeasurements, IdleMeasurementOfAnotherCellEmptiesTheAntennas) {
  BodyBuilder carrier = carrierOf(1);
  putAntenna0(carrier, 12);
  decodeServing(carrier, 7);
  decode(idlePacket(1300, 8), 0xB17F);
  EXPECT_EQ(shown("RSRP Rx0"), "\"\"");
  EXPECT_EQ(shown("SNR Rx0"), "\"\"");
  EXPECT_EQ(shown("System Frame Number"), "\"\"");
  EXPECT_EQ(shown("Filtered RSRP"), "\"\"");
  EXPECT_EQ(shown("RSRP"), "\"-100.00 dBm\"");
}

TEST_F(LTEMeasurements, IdleValuesStayForTheSameCellAndGoWithIt) {
  decode(idlePacket(1300, 7), 0xB17F);
  decodeServing(carrierOf(1), 7);
  EXPECT_EQ(shown("Average RSRP"), "\"-101.00 dBm\"");
  decodeServing(carrierOf(1, 1301), 7);
  EXPECT_EQ(shown("Average RSRP"), "\"\"");
  EXPECT_EQ(shown("Srxlev"), "\"\"");
  EXPECT_EQ(shown("EARFCN"), "\"1301\"");
}

TEST_F(LTEMeasurements, IdleMeasurementOfNoLTECellShowsNothing) {
  decode(idlePacket(262144, 7), 0xB17F);
  decode(idlePacket(1300, 504), 0xB17F);
  EXPECT_EQ(shown(), "{Version: \"5\"}");
}

TEST_F(LTEMeasurements, EveryEntryWithAUnitHasAFormat) {
  NumberFormats formats;
  SectionFormats sectionFormats(formats, "Measurements");
  decoder.listNumberFormats(sectionFormats);
  for (const char* entry : {"RSRP", "RSSI", "RSRP Rx0", "RSRP Rx3", "RSSI Rx3", "Filtered RSRP",
                            "Average RSRP", "Qrxlevmin", "P-Max", "Max UE Tx Power"})
    EXPECT_EQ(formats.unit(std::vector<std::string>{"Measurements", entry}), "dBm") << entry;
  for (const char* entry : {"RSRQ", "RSRQ Rx0", "SNR Rx0", "SNR Rx3", "Filtered RSRQ", "Average RSRQ",
                            "Projected SIR", "RSRQ after Cancellation", "Srxlev"})
    EXPECT_EQ(formats.unit(std::vector<std::string>{"Measurements", entry}), "dB") << entry;
}

}  // namespace
}  // namespace varnel
