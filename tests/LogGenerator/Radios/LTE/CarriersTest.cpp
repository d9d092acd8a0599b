#include "LogGenerator/Radios/LTE/Carriers.h"

#include <string>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/LTE/CellPackets.h"
#include "tests/support/DecoderHarness.h"

namespace varnel {
namespace {

// 2020-01-01 00:00:00 UTC.
constexpr Time start{1577836800, 0};

class LTECarriers : public RowsDecoderTest<lte::Carriers, 0xB193> {
 protected:
  LTECarriers() { decoder.section().setTime(start); }

  void decodeCarrier(std::uint32_t earfcn, std::uint32_t servingIndex, std::uint32_t physicalCell) {
    BodyBuilder carrier = carrierOf(1, earfcn);
    putCell(carrier, 0,
            {.physicalCell = physicalCell, .rsrp = 640, .isServing = true, .servingIndex = servingIndex});
    decode(packetWith(0xB193, carrier));
  }

  const Array& cells() const {
    static const Array none;
    const Array* list = section.dictionary()->get("Cells").array();
    return list ? *list : none;
  }
  static std::string entry(const Value& record, std::string_view name) {
    const std::string* text = record.dictionary()->get(name).string();
    return text ? *text : "absent";
  }
  // "carrier: cell" of each record, in their order.
  std::string carriers() const {
    std::string text;
    for (const Value& cell : cells())
      text += (text.empty() ? "" : ", ") + entry(cell, "Carrier") + ": " + entry(cell, "Physical Cell ID");
    return text;
  }
};

TEST_F(LTECarriers, CarrierIsShownWithItsUsedAntennas) {
  BodyBuilder carrier = carrierOf(1);
  putCell(carrier, 0, {.physicalCell = 77, .rsrp = 640, .isServing = true});
  carrier.bits(12 + 44, 0, 10, 320).bits(12 + 56, 0, 11, 640);
  carrier.bits(12 + 16, 10, 12, 1280).bits(12 + 48, 0, 11, 640).bits(12 + 80, 0, 9, 300);
  carrier.bits(12 + 24, 12, 12, 1264).bits(12 + 40, 10, 10, 304);
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(
      shown(),
      R"({Version: "25.36", Cells: [{Carrier: "Primary", EARFCN: "1300", Band: "3", )"
      R"(Downlink Frequency: "1815.0 MHz", Physical Cell ID: "77", RSRP: "-100.00 dBm", )"
      R"(RSRQ: "-10.00 dB", RSSI: "-70.00 dBm", RSRP Rx0: "-100.00 dBm", RSRP Rx2: "-101.00 dBm", )"
      R"(RSRQ Rx0: "-30.00 dB", RSRQ Rx2: "-11.00 dB", RSSI Rx0: "-70.00 dBm", RSSI Rx2: "-110.00 dBm", )"
      R"(SNR Rx0: "10.0 dB", SNR Rx2: "-20.0 dB", Last Seen: "2020-01-01 00:00:00 +0000"}]})");
}

TEST_F(LTECarriers, AntennaThatIsSwitchedOffIsLeftOut) {
  BodyBuilder carrier = carrierOf(1).bits(12 + 16, 10, 12, 1280);
  putCell(carrier, 0, {.physicalCell = 77, .rsrp = 640, .isServing = true});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(entry(cells().at(0), "RSRP Rx0"), "-100.00 dBm");
  decodeCarrier(1300, 0, 77);
  EXPECT_EQ(entry(cells().at(0), "RSRP Rx0"), "absent");
  EXPECT_EQ(entry(cells().at(0), "RSSI"), "-110.00 dBm");
}

TEST_F(LTECarriers, ChannelOfNoBandHasNeitherBandNorFrequency) {
  decodeCarrier(262143, 0, 1);
  EXPECT_EQ(entry(cells().at(0), "Band"), "absent");
  EXPECT_EQ(entry(cells().at(0), "Downlink Frequency"), "absent");
}

TEST_F(LTECarriers, CarriersComeInTheOrderOfTheirServingIndexes) {
  decodeCarrier(2850, 7, 30);
  decodeCarrier(1300, 0, 10);
  decodeCarrier(6200, 1, 20);
  EXPECT_EQ(carriers(), "Primary: 10, Secondary 1: 20, Secondary 7: 30");
}

TEST_F(LTECarriers, AnotherCellOfAServingIndexReplacesItsRecord) {
  decodeCarrier(1300, 0, 10);
  decodeCarrier(6200, 1, 20);
  decodeCarrier(6200, 0, 11);
  EXPECT_EQ(carriers(), "Primary: 11, Secondary 1: 20");
  EXPECT_EQ(entry(cells().at(0), "Band"), "20");
}

TEST_F(LTECarriers, NeighborsAreNoCarriers) {
  BodyBuilder carrier = carrierOf(1);
  putCell(carrier, 0, {.physicalCell = 77, .rsrp = 640, .isServing = false, .servingIndex = 1});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown(), R"({Version: "25.36"})");
}

TEST_F(LTECarriers, FirstCellOfVersion60IsThePrimaryOne) {
  BodyBuilder carrier = subpacketOf(25, 60, 12 + 2 * 148).u32(4, 1300).u32(8, 2);
  decode(packetWith(0xB193, carrier.bits(12 + 8, 0, 9, 42).bits(12 + 148 + 8, 0, 9, 43)));
  EXPECT_EQ(carriers(), "Primary: 42");
}

TEST_F(LTECarriers, ImplausibleCellShowsNothing) {
  decodeCarrier(1300, 0, 504);
  decodeCarrier(262144, 0, 1);
  EXPECT_EQ(carriers(), "");
}

TEST_F(LTECarriers, CarrierGoes30SecondsAfterItWasLastMeasured) {
  decodeCarrier(1300, 0, 10);
  decodeCarrier(6200, 1, 20);
  decoder.section().setTime({start.seconds + 20, 0});
  decodeCarrier(1300, 0, 10);
  decoder.prepareDisplay({start.seconds + 29, 999'999'999});
  EXPECT_EQ(carriers(), "Primary: 10, Secondary 1: 20");
  decoder.prepareDisplay({start.seconds + 30, 0});
  EXPECT_EQ(carriers(), "Primary: 10");
  EXPECT_EQ(entry(cells().at(0), "Last Seen"), "2020-01-01 00:00:20 +0000");
  decoder.prepareDisplay({start.seconds + 50, 0});
  EXPECT_EQ(carriers(), "");
}

TEST_F(LTECarriers, ReconnectionKeepsTheCarriers) {
  decodeCarrier(1300, 0, 10);
  decodeCarrier(6200, 1, 20);
  lte::Carriers next;
  next.updateSectionRef(section);
  next.prepareDisplay({start.seconds + 100, 0});
  next.prepareDisplay({start.seconds + 129, 0});
  EXPECT_EQ(carriers(), "Primary: 10, Secondary 1: 20");
  next.prepareDisplay({start.seconds + 130, 0});
  EXPECT_EQ(carriers(), "");
}

TEST_F(LTECarriers, LevelsInTheListHaveUnits) {
  NumberFormats formats;
  SectionFormats sectionFormats(formats, "Carriers");
  decoder.listNumberFormats(sectionFormats);
  const auto unit = [&](const char* name) {
    return formats.unit(std::vector<std::string>{"LTE", "Carriers", "Cells", "0", name});
  };
  for (const char* name : {"RSRP", "RSSI", "RSRP Rx0", "RSRP Rx3", "RSSI Rx2"})
    EXPECT_EQ(unit(name), "dBm") << name;
  for (const char* name : {"RSRQ", "RSRQ Rx3", "SNR Rx0"}) EXPECT_EQ(unit(name), "dB") << name;
  EXPECT_EQ(unit("Downlink Frequency"), "MHz");
}

}  // namespace
}  // namespace varnel
