#include "LogGenerator/Radios/NR/Cells.h"

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/PayloadBuilder.h"
#include "tests/support/DecoderHarness.h"

namespace varnel::nr {
namespace {

using NRCellsTest = RowsDecoderTest<Cells, 0xB97F>;

/// Builds a layer, a cell or a beam. The bytes that no field takes are not 0.
class RecordBuilder {
 public:
  explicit RecordBuilder(std::size_t size) : _bytes(size, 0xA5) {}
  RecordBuilder& u8(std::size_t offset, unsigned value) {
    _bytes.at(offset) = static_cast<std::uint8_t>(value);
    return *this;
  }
  RecordBuilder& u16(std::size_t offset, unsigned value) {
    return u8(offset, value).u8(offset + 1, value >> 8);
  }
  RecordBuilder& s32(std::size_t offset, int value) {
    const auto bits = static_cast<unsigned>(value);
    return u16(offset, bits).u16(offset + 2, bits >> 16);
  }
  const Bytes& bytes() const { return _bytes; }

 private:
  Bytes _bytes;
};

// Levels are the raw values: 128 of them are 1 dB.
RecordBuilder smallLayer(unsigned cells) {
  return RecordBuilder(32)
      .s32(0, 641280)
      .u8(4, cells)
      .u8(5, 0)
      .u16(6, 65535)
      .u8(8, 0xF3)
      .s32(12, -12800)
      .s32(16, 0);
}
RecordBuilder largeLayer(unsigned cells) {
  return RecordBuilder(40)
      .s32(0, 2079167)
      .u8(4, 2)
      .u8(5, cells)
      .u16(6, 88)
      .u8(8, 0)
      .u8(9, 0x1C)
      .s32(12, -12800)
      .s32(16, -12864)
      .s32(20, 0)
      .s32(24, -12801);
}
RecordBuilder cell(unsigned physicalCell, unsigned beams) {
  return RecordBuilder(16).u16(0, physicalCell).u16(2, 1023).u8(4, beams).s32(8, -11520).s32(12, -1376);
}
RecordBuilder smallBeam() {
  return RecordBuilder(44)
      .u16(0, 0xFFF5)
      .s32(20, -11648)
      .s32(24, -11776)
      .s32(28, -11904)
      .s32(32, -1408)
      .s32(36, -12032)
      .s32(40, -1440);
}
RecordBuilder largeBeam() {
  return RecordBuilder(84)
      .u16(0, 7)
      .s32(20, -11648)
      .s32(24, -11776)
      .s32(28, -1344)
      .s32(32, 0)
      .s32(68, -11904)
      .s32(72, -1408)
      .s32(76, -12032)
      .s32(80, -1440);
}

Bytes packet(PayloadBuilder header, const std::vector<RecordBuilder>& records) {
  Bytes packet = header.bytes();
  for (const RecordBuilder& record : records)
    packet.insert(packet.end(), record.bytes().begin(), record.bytes().end());
  return packet;
}
PayloadBuilder headerOf(std::uint32_t version, std::size_t size, std::size_t counts, std::uint8_t layers) {
  return PayloadBuilder(0xB97F, size).fill(0xA5).u32(0, version).u8(counts, layers).u8(counts + 1, 4);
}
PayloadBuilder header2_7(std::uint8_t layers) { return headerOf(0x20007, 16, 4, layers); }
PayloadBuilder header3_0(std::uint8_t layers) { return headerOf(0x30000, 20, 8, layers); }

constexpr std::string_view smallBeamText =
    R"({SSB: "5", RSRP Rx0: "-91.00 dBm", RSRP Rx1: "-92.00 dBm", Filtered RSRP: "-93.00 dBm", )"
    R"(Filtered RSRQ: "-11.00 dB", L2 Filtered RSRP: "-94.00 dBm", L2 Filtered RSRQ: "-11.25 dB"})";
constexpr std::string_view largeBeamText =
    R"({SSB: "7", RSRP Rx0: "-91.00 dBm", RSRP Rx1: "-92.00 dBm", RSRQ Rx0: "-10.50 dB", )"
    R"(Filtered RSRP: "-93.00 dBm", Filtered RSRQ: "-11.00 dB", L2 Filtered RSRP: "-94.00 dBm", )"
    R"(L2 Filtered RSRQ: "-11.25 dB"})";

std::string cellText(std::string_view physicalCell, std::string_view beams) {
  return R"({Physical Cell ID: ")" + std::string(physicalCell) +
         R"(", System Frame Number: "1023", RSRP: "-90.00 dBm", RSRQ: "-10.75 dB", Beams: [)" +
         std::string(beams) + "]}";
}
std::string smallLayerText(std::string_view cells) {
  return R"({NR-ARFCN: "641280", Frequency: "3619.200 MHz", SSB: "3", RSRP Rx0: "-100.00 dBm", Cells: [)" +
         std::string(cells) + "]}";
}
std::string largeLayerText(std::string_view cells) {
  return R"({NR-ARFCN: "2079167", Frequency: "28000.080 MHz", Carrier: "2", Serving Cell: "88", SSB: "12", )"
         R"(RSRP Rx0: "-100.00 dBm", RSRP Rx1: "-100.50 dBm", RSRP Rx3: "-100.01 dBm", Cells: [)" +
         std::string(cells) + "]}";
}
std::string joined(const std::string& first, const std::string& second) { return first + ", " + second; }

std::string sectionText(std::string_view version, const std::string& layers) {
  return R"({Version: ")" + std::string(version) + R"(", SSB Period: "4", Layers: [)" + layers + "]}";
}

TEST_F(NRCellsTest, Version2_7HasLayersOf32BytesAndBeamsOf44) {
  decode(packet(header2_7(2), {smallLayer(2), cell(11, 1), smallBeam(), cell(12, 0), smallLayer(0)}));
  EXPECT_EQ(
      shown(),
      sectionText("2.7", joined(smallLayerText(joined(cellText("11", smallBeamText), cellText("12", ""))),
                                smallLayerText(""))));
}

TEST_F(NRCellsTest, Version2_6HasTheFirstLayerAt8) {
  decode(packet(headerOf(0x20006, 8, 4, 1), {smallLayer(1), cell(11, 1), smallBeam()}));
  EXPECT_EQ(shown(), sectionText("2.6", smallLayerText(cellText("11", smallBeamText))));
}

TEST_F(NRCellsTest, Version2_9HasAHeaderOf20Bytes) {
  decode(packet(headerOf(0x20009, 20, 8, 1), {smallLayer(1), cell(11, 1), smallBeam()}));
  EXPECT_EQ(shown(), sectionText("2.9", smallLayerText(cellText("11", smallBeamText))));
}

TEST_F(NRCellsTest, Version2_10HasBeamsOf84Bytes) {
  decode(packet(headerOf(0x2000A, 20, 8, 1), {smallLayer(1), cell(11, 1), largeBeam()}));
  EXPECT_EQ(shown(), sectionText("2.10", smallLayerText(cellText("11", largeBeamText))));
}

TEST_F(NRCellsTest, Version3_0HasLayersOf40BytesWithTheirCarrier) {
  decode(packet(header3_0(2), {largeLayer(1), cell(11, 2), largeBeam(), largeBeam(), largeLayer(0)}));
  EXPECT_EQ(shown(),
            sectionText("3.0", joined(largeLayerText(cellText("11", joined(std::string(largeBeamText),
                                                                           std::string(largeBeamText)))),
                                      largeLayerText(""))));
}

TEST_F(NRCellsTest, TheSecondAntennasQualityIsShownWhereItIsMeasured) {
  decode(packet(header3_0(1), {largeLayer(1), cell(11, 1), largeBeam().s32(32, 128)}));
  EXPECT_NE(shown().find(R"(RSRQ Rx0: "-10.50 dB", RSRQ Rx1: "1.00 dB", Filtered RSRP)"), std::string::npos)
      << shown();
}

TEST_F(NRCellsTest, LevelsOf0AreLeftOut) {
  decode(packet(
      header2_7(1),
      {smallLayer(1).s32(12, 0), cell(11, 1).s32(8, 0).s32(12, 0),
       RecordBuilder(44).s32(0, 0).s32(20, 0).s32(24, 0).s32(28, 0).s32(32, 0).s32(36, 0).s32(40, 0)}));
  EXPECT_EQ(shown("Layers"),
            R"([{NR-ARFCN: "641280", Frequency: "3619.200 MHz", SSB: "3", Cells: [)"
            R"({Physical Cell ID: "11", System Frame Number: "1023", Beams: [{SSB: "0"}]}]}])");
}

TEST_F(NRCellsTest, ACountOfCellsThatIsNoneIsInTheServingIndex) {
  for (const unsigned none : {0u, 255u}) {
    decode(packet(header2_7(2), {smallLayer(none).u8(5, 1), cell(11, 0), smallLayer(0)}));
    EXPECT_EQ(shown("Layers"), "[" + joined(smallLayerText(cellText("11", "")), smallLayerText("")) + "]")
        << none;
    decode(packet(header3_0(2), {largeLayer(none).u8(8, 1), cell(11, 0), largeLayer(0)}));
    EXPECT_EQ(shown("Layers"), "[" + joined(largeLayerText(cellText("11", "")), largeLayerText("")) + "]")
        << none;
  }
}

TEST_F(NRCellsTest, AServingIndexOf0Or255IsNoCount) {
  for (const unsigned none : {0u, 255u}) {
    decode(packet(header2_7(1), {smallLayer(0).u8(5, none), cell(11, 0)}));
    EXPECT_EQ(shown("Layers"), "[" + smallLayerText("") + "]") << none;
  }
}

TEST_F(NRCellsTest, AServingIndexBesideACountIsNoCount) {
  decode(packet(header2_7(1), {smallLayer(1).u8(5, 2), cell(11, 0), cell(12, 0)}));
  EXPECT_EQ(shown("Layers"), "[" + smallLayerText(cellText("11", "")) + "]");
}

TEST_F(NRCellsTest, ACellOf65535IsNone) {
  decode(packet(header3_0(1), {largeLayer(1).u16(6, 65535), cell(65535, 0)}));
  EXPECT_EQ(shown("Layers"), R"([{NR-ARFCN: "2079167", Frequency: "28000.080 MHz", Carrier: "2", SSB: "12", )"
                             R"(RSRP Rx0: "-100.00 dBm", RSRP Rx1: "-100.50 dBm", RSRP Rx3: "-100.01 dBm", )"
                             R"(Cells: [{System Frame Number: "1023", RSRP: "-90.00 dBm", )"
                             R"(RSRQ: "-10.75 dB", Beams: []}]}])");
}

TEST_F(NRCellsTest, ACellOrChannelBeyondTheStandardShowsNothing) {
  const Bytes good = packet(header2_7(1), {smallLayer(1).u16(6, 1007), cell(1007, 0)});
  decode(good);
  const std::string before = shown();
  decode(packet(header2_7(2).u8(5, 9), {smallLayer(0), smallLayer(0).s32(0, 3279166)}));
  decode(packet(header2_7(1).u8(5, 9), {smallLayer(0).u16(6, 1008)}));
  decode(packet(header2_7(1).u8(5, 9), {smallLayer(1), cell(1008, 0)}));
  EXPECT_EQ(shown(), before);
}

TEST_F(NRCellsTest, EveryTruncationShowsTheRecordsThatAreWhole) {
  // A header of 16 bytes, a layer of 32, a cell of 16, a beam of 44, a cell of 16, a layer of 32.
  const Bytes whole =
      packet(header2_7(2), {smallLayer(2), cell(11, 1), smallBeam(), cell(12, 0), smallLayer(0)});
  const auto layersOf = [&](std::size_t payload) -> std::string {
    if (payload < 48) return {};
    if (payload < 64) return smallLayerText("");
    if (payload < 108) return smallLayerText(cellText("11", ""));
    const std::string first = cellText("11", smallBeamText);
    if (payload < 124) return smallLayerText(first);
    return smallLayerText(joined(first, cellText("12", "")));
  };
  forEachTruncation(whole, [&](std::size_t size, const auto&) {
    if (size < 13 + 16) {
      EXPECT_EQ(shown(), oldContent());
    } else {
      EXPECT_EQ(shown("Layers"), "[" + layersOf(size - 13) + "]");
    }
  });
}

TEST_F(NRCellsTest, CountsThatLieShowNothingBehindThePacket) {
  decode(packet(header2_7(255), {smallLayer(254), cell(11, 255), smallBeam()}));
  EXPECT_EQ(shown("Layers"), "[" + smallLayerText(cellText("11", smallBeamText)) + "]");
}

// What is left where a beam does not fit has room for a cell and for a layer.
TEST_F(NRCellsTest, NothingIsReadFromAPartOfABeam) {
  decode(packet(header3_0(2), {largeLayer(2), cell(11, 1), RecordBuilder(83)}));
  EXPECT_EQ(shown("Layers"), "[" + largeLayerText(cellText("11", "")) + "]");
}

TEST_F(NRCellsTest, AnotherVersionIsNotKnown) {
  decode(packet(headerOf(0x20008, 20, 8, 1), {smallLayer(0)}));
  EXPECT_EQ(shown(), R"-({Version: "2.8 (not known)"})-");
}

TEST_F(NRCellsTest, ShorterPacketsAreIgnored) {
  expectIgnoredBelow(13 + 8, headerOf(0x20006, 8, 4, 0).bytes(), 0xB97F, {});
  expectIgnoredBelow(13 + 16, header2_7(0).bytes(), 0xB97F, {});
  expectIgnoredBelow(13 + 20, headerOf(0x20009, 20, 8, 0).bytes(), 0xB97F, {});
  expectIgnoredBelow(13 + 20, headerOf(0x2000A, 20, 8, 0).bytes(), 0xB97F, {});
  expectIgnoredBelow(13 + 20, header3_0(0).bytes(), 0xB97F, {});
}

TEST_F(NRCellsTest, LevelsInsideTheListsHaveUnits) {
  NumberFormats formats;
  SectionFormats ofSection(formats, "Cells");
  decoder.listNumberFormats(ofSection);
  const auto unit = [&](std::string_view path) { return formats.under(path).unit(); };
  EXPECT_EQ(unit("Cells/Layers[0]/Frequency"), "MHz");
  EXPECT_EQ(unit("Cells/Layers[0]/RSRP Rx3"), "dBm");
  EXPECT_EQ(unit("Cells/Layers[0]/Cells[0]/RSRQ"), "dB");
  EXPECT_EQ(unit("Cells/Layers[0]/Cells[0]/Beams[0]/RSRQ Rx1"), "dB");
  EXPECT_EQ(unit("Cells/Layers[0]/Cells[0]/Beams[0]/L2 Filtered RSRP"), "dBm");
}

}  // namespace
}  // namespace varnel::nr
