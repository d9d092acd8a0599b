#include "LogGenerator/Radios/LTE/Measurements.h"

#include <gtest/gtest.h>

#include "tests/support/MeasurementLayouts.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

constexpr std::uint32_t evaluation = 0xB17F;

DecoderAlone<Measurements> newDecoder() { return DecoderAlone<Measurements>(); }
const LayoutRules rules(newDecoder);

DescribedLayout connectedLayout(const MeasurementDescription& layout) {
  DescribedLayout made = measurementCase(layout);
  made.fields = {{"EARFCN", channelRun(layout), measuredChannel, plainNumber()},
                 {"Physical Cell ID", cellRun(layout), measuredCell, plainNumber()},
                 {"System Frame Number", {layout.first + layout.frameWord, 0, 10}, 713, plainNumber()},
                 {"Subframe", {layout.first + layout.frameWord, 10, 4}, 5, plainNumber()}};
  for (const FieldRow& field : layout.levels) made.fields.push_back(shifted(field, layout.first));
  if (layout.hasServing) {
    made.fixed.push_back({servingIndexRun(layout), 0});
    made.fixed.push_back({isServingRun(layout), 1});
  }
  return inSubpacket(made, 25, static_cast<std::uint8_t>(layout.version));
}

std::vector<DescribedLayout> connectedLayouts() {
  std::vector<DescribedLayout> made;
  for (const MeasurementDescription& layout : measurementDescriptions())
    made.push_back(connectedLayout(layout));
  return made;
}

DescribedLayout idleLayout(std::uint32_t version) {
  const unsigned channelWidth = version == 4 ? 16 : 32;
  const std::size_t cell = version == 4 ? 6 : 8, words = version == 4 ? 8 : 12;
  const BitRun channel{4, 0, channelWidth}, cellIdentity{cell, 0, 9};
  return {
      .logCode = evaluation,
      .version = {version},
      .size = words + 28,
      .minimum = words + 24,
      .fields =
          {
              {"EARFCN", channel, measuredChannel, plainNumber()},
              {"Physical Cell ID", cellIdentity, measuredCell, plainNumber()},
              {"Cell Priority", {cell, 9, 7}, 6, plainNumber()},
              {"RSRP", {words, 0, 12}, 1301, rsrpText()},
              {"Average RSRP", {words + 4, 0, 12}, 1290, rsrpText()},
              {"RSRQ", {words + 8, 0, 10}, 309, rsrqText()},
              {"Average RSRQ", {words + 8, 20, 10}, 300, rsrqText()},
              {"RSSI", {words + 12, 10, 11}, 691, rssiText()},
              {"Qrxlevmin",
               {words + 16, 0, 6},
               9,
               [](std::uint64_t number) { return printed("%d dBm", static_cast<int>(number) * 2 - 140); }},
              {"P-Max",
               {words + 16, 6, 7},
               53,
               [](std::uint64_t number) { return printed("%d dBm", static_cast<int>(number) - 30); }},
              {"Max UE Tx Power",
               {words + 16, 13, 6},
               51,
               [](std::uint64_t number) { return printed("%d dBm", static_cast<int>(number) - 30); }},
              {"Srxlev",
               {words + 16, 19, 7},
               70,
               [](std::uint64_t number) { return printed("%d dB", static_cast<int>(number) - 50); }},
              {"S Intra Search", {words + 20, 0, 6}, 29, plainNumber()},
              {"S Non Intra Search", {words + 20, 6, 6}, 11, plainNumber()},
          },
      .isPlausible = [=](ByteView payload) {
        return numberIn(payload, channel) <= 262143 && numberIn(payload, cellIdentity) <= 503;
      }};
}

TEST(LTEMeasurementsLayouts, EachFieldMovesItsRowsOnly) {
  for (const DescribedLayout& layout : connectedLayouts()) rules.expectEachFieldByItself(layout);
  for (const std::uint32_t version : {4, 5}) rules.expectEachFieldByItself(idleLayout(version));
}

TEST(LTEMeasurementsLayouts, KnownVersionsShowTheirNumber) {
  for (const DescribedLayout& layout : connectedLayouts()) rules.expectVersionKnown(layout);
  for (const std::uint32_t version : {4, 5}) rules.expectVersionKnown(idleLayout(version));
}

TEST(LTEMeasurementsLayouts, NothingPastTheEndIsShown) {
  for (const DescribedLayout& layout : connectedLayouts()) {
    rules.expectNothingPastTheEnd(layout);
    rules.expectNothingPastTheSubpacketsEnd(layout);
  }
  for (const std::uint32_t version : {4, 5}) {
    rules.expectNothingPastTheEnd(idleLayout(version));
    rules.expectUnchangedBelowMinimum(idleLayout(version), connectedLayout(measurementDescription(36)));
  }
}

TEST(LTEMeasurementsLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(connectedLayout(measurementDescription(36)), {1});
  rules.expectOtherSubpacketVersionsUnknown(connectedLayout(measurementDescription(36)),
                                            measurementVersions());
  rules.expectOtherSubpacketVersionsUnknown(connectedLayout(measurementDescription(18)),
                                            measurementVersions());
  rules.expectOtherVersionsUnknown(idleLayout(5), {4, 5});
}

// The largest packet, cell 9 of channel 0x64 = 100; each word is written out.
TEST(LTEMeasurementsLayouts, Version36InLiterals) {
  Bytes subpacket(12 + 128);
  PacketBuilder words(0, 13 + subpacket.size());
  words.u16(13, 25 | 36 << 8).u16(15, 140).u32(17, 100).u16(21, 1).u16(23, 15);
  const std::size_t cell = 25;
  words.u32(cell, 9 | 1 << 12).u32(cell + 4, 1000 | 9 << 10);
  words.u32(cell + 16, 1280 << 10).u32(cell + 20, 1264 << 12).u32(cell + 24, 1248 << 12);
  words.u32(cell + 28, 1232 | 640 << 12).u32(cell + 32, 1272 << 12);
  words.u32(cell + 36, 320 | 304 << 20).u32(cell + 40, 288 << 10 | 272 << 20);
  words.u32(cell + 44, 320 | 312 << 20);
  words.u32(cell + 48, 640 | 624 << 11).u32(cell + 52, 608 | 592 << 11).u32(cell + 56, 640);
  words.u32(cell + 80, 300 | 255 << 9).u32(cell + 84, 200 | 155 << 9);
  words.u32(cell + 104, 0xFFFFFFF0).u32(cell + 108, 336);
  const Bytes packet = words.bytes();
  auto decoder = newDecoder();
  decoder.decode(measurementCode, packetOfSubpackets({Bytes(packet.begin() + 13, packet.end())}));
  EXPECT_EQ(differences({{"EARFCN", "100"},
                         {"Physical Cell ID", "9"},
                         {"System Frame Number", "1000"},
                         {"Subframe", "9"},
                         {"RSRP Rx0", "-100.00 dBm"},
                         {"RSRP Rx1", "-101.00 dBm"},
                         {"RSRP Rx2", "-102.00 dBm"},
                         {"RSRP Rx3", "-103.00 dBm"},
                         {"RSRP", "-100.00 dBm"},
                         {"Filtered RSRP", "-100.50 dBm"},
                         {"RSRQ Rx0", "-10.00 dB"},
                         {"RSRQ Rx1", "-11.00 dB"},
                         {"RSRQ Rx2", "-12.00 dB"},
                         {"RSRQ Rx3", "-13.00 dB"},
                         {"RSRQ", "-10.00 dB"},
                         {"Filtered RSRQ", "-10.50 dB"},
                         {"RSSI Rx0", "-70.00 dBm"},
                         {"RSSI Rx1", "-71.00 dBm"},
                         {"RSSI Rx2", "-72.00 dBm"},
                         {"RSSI Rx3", "-73.00 dBm"},
                         {"RSSI", "-70.00 dBm"},
                         {"SNR Rx0", "10.0 dB"},
                         {"SNR Rx1", "5.5 dB"},
                         {"SNR Rx2", "0.0 dB"},
                         {"SNR Rx3", "-4.5 dB"},
                         {"Projected SIR", "-1.00 dB"},
                         {"RSRQ after Cancellation", "-9.00 dB"}},
                        decoder.rows()),
            "");
  EXPECT_EQ(decoder.version(), "25.36");
}

// The fields of one antenna.
std::vector<FieldRow> fieldsOf(const DescribedLayout& layout, unsigned antenna) {
  std::vector<FieldRow> fields;
  for (const FieldRow& field : layout.fields)
    if (field.path.ends_with("Rx" + std::to_string(antenna))) fields.push_back(field);
  return fields;
}

TEST(LTEMeasurementsLayouts, AnAntennaOfZeroBitsIsAbsent) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    const DescribedLayout described = connectedLayout(layout);
    for (unsigned antenna = 0; antenna < layout.antennas; ++antenna) {
      SCOPED_TRACE(described.name() + " antenna " + std::to_string(antenna));
      Bytes payload = described.payload();
      Rows expected = described.rowsOf(payload);
      auto decoder = newDecoder();
      decoder.decode(measurementCode, payload);
      for (const FieldRow& field : fieldsOf(described, antenna)) {
        put(payload, field.run, 0);
        expected.erase(field.path);
      }
      decoder.decode(measurementCode, payload);
      EXPECT_EQ(differences(expected, decoder.rows()), "");
      for (const FieldRow& field : fieldsOf(described, antenna))
        EXPECT_EQ(varnel::described(decoder.section().dictionary()->get(field.path)), R"("")") << field.path;
    }
  }
}

TEST(LTEMeasurementsLayouts, AnAntennaWithOneBitShowsItsOtherLevelsAtTheirFloors) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    const DescribedLayout described = connectedLayout(layout);
    for (unsigned antenna = 0; antenna < layout.antennas; ++antenna) {
      const std::vector<FieldRow> fields = fieldsOf(described, antenna);
      ASSERT_EQ(fields.size(), layout.version == 60 ? 3u : 4u);
      for (const FieldRow& other : fields) {
        SCOPED_TRACE(described.name() + " but for " + other.path);
        Bytes payload = described.payload();
        for (const FieldRow& field : fields) put(payload, field.run, 0);
        put(payload, other.run, 1);
        auto decoder = newDecoder();
        decoder.decode(measurementCode, payload);
        EXPECT_EQ(differences(described.rowsOf(payload), decoder.rows()), "");
      }
    }
  }
}

TEST(LTEMeasurementsLayouts, ALayoutOfTwoAntennasRemovesTheOthers) {
  auto decoder = newDecoder();
  decoder.decode(measurementCode, connectedLayout(measurementDescription(36)).payload());
  EXPECT_NE(decoder.text("RSRP Rx3"), "");
  decoder.decode(measurementCode, connectedLayout(measurementDescription(19)).payload());
  for (const char* row :
       {"RSRP Rx2", "RSRP Rx3", "RSRQ Rx2", "RSRQ Rx3", "RSSI Rx2", "RSSI Rx3", "SNR Rx2", "SNR Rx3"})
    EXPECT_EQ(decoder.text(row), "") << row;
}

TEST(LTEMeasurementsLayouts, OnlyThePrimaryServingCellIsShown) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    if (!layout.hasServing) continue;
    SCOPED_TRACE(layout.version);
    for (const DescribedCell& cell : {DescribedCell{301, 1, 1}, DescribedCell{301, 7, 1},
                                      DescribedCell{301, 0, 0}, DescribedCell{301, 1, 0}}) {
      auto decoder = newDecoder();
      decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {cell}, 1)}));
      EXPECT_EQ(differences({}, decoder.rows()), "") << cell.servingIndex << " " << cell.isServing;
    }
  }
}

TEST(LTEMeasurementsLayouts, ThePrimaryCellIsFoundBehindOthers) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    if (layout.countWidth == 0) continue;
    SCOPED_TRACE(layout.version);
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(
                                        layout, {{11, 0, 0, 700}, {12, 1, 1, 800}, {13, 0, 1, 900}}, 3)}));
    EXPECT_EQ(decoder.text("Physical Cell ID"), layout.hasServing ? "13" : "11");
    const double offset = layout.antennas == 4 ? -140 : -180;
    EXPECT_EQ(decoder.text("RSRP"), printed("%.2f dBm", (layout.hasServing ? 900 : 700) / 16.0 + offset));
  }
}

TEST(LTEMeasurementsLayouts, TheNumberOfCellsIsAnUpperBoundOnly) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    if (layout.countWidth == 0) continue;
    SCOPED_TRACE(layout.version);
    const std::vector<DescribedCell> cells = {{11, 0, 0}, {12, 1, 1}, {13, 0, 1}};
    const auto cellOf = [&](std::uint64_t count) {
      auto decoder = newDecoder();
      decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, cells, count)}));
      return decoder.text("Physical Cell ID");
    };
    EXPECT_EQ(cellOf(0), "");
    if (layout.hasServing) {
      EXPECT_EQ(cellOf(2), "");  // the third has room, but is not one of them
    }
    const std::uint64_t most = layout.countWidth == 32 ? 0xFFFFFFFF : 0xFFFF;
    for (const std::uint64_t count : {std::uint64_t{4}, std::uint64_t{255}, most})
      EXPECT_EQ(cellOf(count), layout.hasServing ? "13" : "11") << count;
  }
}

TEST(LTEMeasurementsLayouts, CellsDoNotReachIntoTheNextSubpacket) {
  const MeasurementDescription layout = measurementDescription(19);
  // The count says two; the second would be what the next subpacket has.
  auto decoder = newDecoder();
  Bytes next(88, 0);
  put(next, byteAt(0), 99);
  put(next, byteAt(1), 0x10);  // as a cell's word: serving
  put(next, wordAt(2), next.size());
  decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{11, 0, 0}}, 2), next}));
  EXPECT_EQ(differences({}, decoder.rows()), "");
}

TEST(LTEMeasurementsLayouts, SubpacketsFollowBySizeWhateverTheyAre) {
  const Bytes primary = measurementSubpacket(measurementDescription(48), {{13, 0, 1}}, 1);
  const Bytes unknownVersion = measurementSubpacket({.version = 99,
                                                     .channelWidth = 32,
                                                     .first = 12,
                                                     .stride = 77,
                                                     .countWidth = 16,
                                                     .cellWord = 0,
                                                     .frameWord = 4,
                                                     .hasServing = true,
                                                     .antennas = 0,
                                                     .extent = 0,
                                                     .levels = {}},
                                                    {{14, 0, 1}}, 1);
  Bytes otherKind = unknownVersion;
  otherKind[0] = 7;
  const Bytes smallest = {7, 1, 4, 0};
  for (const std::vector<Bytes>& subpackets :
       {std::vector{unknownVersion, primary}, std::vector{otherKind, primary}, std::vector{smallest, primary},
        std::vector{smallest, smallest, unknownVersion, otherKind, primary}}) {
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets(subpackets));
    EXPECT_EQ(decoder.text("Physical Cell ID"), "13") << subpackets.size();
  }
}

TEST(LTEMeasurementsLayouts, ASubpacketBehindALyingSizeIsNotRead) {
  const Bytes primary = measurementSubpacket(measurementDescription(48), {{13, 0, 1}}, 1);
  for (const unsigned size : {0u, 1u, 2u, 3u, 2000u, 65535u}) {
    const Bytes liar = {7, 1, static_cast<std::uint8_t>(size), static_cast<std::uint8_t>(size >> 8)};
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets({liar, primary}));
    EXPECT_EQ(differences({}, decoder.rows()), "") << size;
  }
}

TEST(LTEMeasurementsLayouts, TheNumberOfSubpacketsBoundsThem) {
  const Bytes secondary = measurementSubpacket(measurementDescription(36), {{12, 1, 1}}, 1);
  const Bytes primary = measurementSubpacket(measurementDescription(36), {{13, 0, 1}}, 1);
  Bytes payload = packetOfSubpackets({secondary, primary});
  const auto cellOf = [&](std::uint8_t count) {
    payload[1] = count;
    auto decoder = newDecoder();
    decoder.decode(measurementCode, payload);
    return decoder.text("Physical Cell ID");
  };
  EXPECT_EQ(cellOf(0), "");
  EXPECT_EQ(cellOf(1), "");
  EXPECT_EQ(cellOf(2), "13");
  EXPECT_EQ(cellOf(255), "13");
}

TEST(LTEMeasurementsLayouts, AnImplausibleCellOrChannelShowsNothing) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    SCOPED_TRACE(layout.version);
    const auto rowsOf = [&](unsigned cell, std::uint64_t channel) {
      auto decoder = newDecoder();
      decoder.decode(measurementCode,
                     packetOfSubpackets({measurementSubpacket(layout, {{cell, 0, 1}}, 1, channel)}));
      return decoder.rows();
    };
    EXPECT_EQ(rowsOf(503, 60000).at("Physical Cell ID"), "503");
    for (const unsigned cell : {504u, 511u}) EXPECT_EQ(differences({}, rowsOf(cell, 100)), "") << cell;
    if (layout.channelWidth == 32) {
      EXPECT_EQ(rowsOf(1, 262143).at("EARFCN"), "262143");
      for (const std::uint64_t channel : {std::uint64_t{262144}, std::uint64_t{0xFFFFFFFF}})
        EXPECT_EQ(differences({}, rowsOf(1, channel)), "") << channel;
    }
  }
  Bytes last = idleLayout(5).payload();
  put(last, {8, 0, 9}, 503);
  put(last, longAt(4), 262143);
  auto idle = newDecoder();
  idle.decode(evaluation, last);
  EXPECT_EQ(idle.text("Physical Cell ID"), "503");
  EXPECT_EQ(idle.text("EARFCN"), "262143");
  for (const unsigned cell : {504u, 511u}) {
    Bytes payload = idleLayout(5).payload();
    put(payload, {8, 0, 9}, cell);
    auto decoder = newDecoder();
    decoder.decode(evaluation, payload);
    EXPECT_EQ(differences({}, decoder.rows()), "") << cell;
  }
}

constexpr const char* antennaRows[] = {"RSRP Rx0", "RSRP Rx1", "RSRP Rx2", "RSRP Rx3", "RSRQ Rx0", "RSRQ Rx1",
                                       "RSRQ Rx2", "RSRQ Rx3", "RSSI Rx0", "RSSI Rx1", "RSSI Rx2", "RSSI Rx3",
                                       "SNR Rx0",  "SNR Rx1",  "SNR Rx2",  "SNR Rx3"};

TEST(LTEMeasurementsLayouts, EvaluationOfAnotherCellOrChannelRemovesTheAntennas) {
  for (const auto& [cell, channel] : {std::pair{302u, 3050u}, std::pair{301u, 3051u}}) {
    auto decoder = newDecoder();
    decoder.decode(measurementCode, connectedLayout(measurementDescription(36)).payload());
    Bytes payload = idleLayout(5).payload();
    put(payload, {8, 0, 9}, cell);
    put(payload, longAt(4), channel);
    decoder.decode(evaluation, payload);
    for (const char* row : antennaRows)
      EXPECT_EQ(described(decoder.section().dictionary()->get(row)), R"("")") << row;
  }
}

TEST(LTEMeasurementsLayouts, EvaluationOfTheSameCellKeepsTheAntennas) {
  auto decoder = newDecoder();
  decoder.decode(measurementCode, connectedLayout(measurementDescription(36)).payload());
  const Rows before = decoder.rows();
  decoder.decode(evaluation, idleLayout(5).payload());
  for (const char* row : antennaRows) EXPECT_EQ(decoder.text(row), before.at(row)) << row;
}

// They told about the cell before.
TEST(LTEMeasurementsLayouts, AMeasurementOfAnotherCellRemovesWhatOnlyEvaluationsTell) {
  auto decoder = newDecoder();
  decoder.decode(evaluation, idleLayout(5).payload());
  decoder.decode(measurementCode,
                 packetOfSubpackets({measurementSubpacket(measurementDescription(36), {{302, 0, 1}}, 1)}));
  for (const char* row : {"Average RSRP", "Average RSRQ", "Cell Priority", "Qrxlevmin", "P-Max",
                          "Max UE Tx Power", "Srxlev", "S Intra Search", "S Non Intra Search"})
    EXPECT_EQ(decoder.text(row), "") << row;
}

TEST(LTEMeasurementsLayouts, EvaluationInLiterals) {
  auto decoder = newDecoder();
  PacketBuilder words(0, 13 + 40);
  words.u8(13, 5).u32(17, 66486).u16(21, 100 | 7 << 9);
  words.u32(25, 1408).u32(29, 1400).u32(33, 321 | 319 << 20).u32(37, 656 << 10);
  words.u32(41, 5u | 53u << 6 | 53u << 13 | 92u << 19).u32(45, 31u | 9u << 6);
  const Bytes packet = words.bytes();
  decoder.decode(evaluation, Bytes(packet.begin() + 13, packet.end()));
  EXPECT_EQ(differences({{"EARFCN", "66486"},
                         {"Physical Cell ID", "100"},
                         {"Cell Priority", "7"},
                         {"RSRP", "-92.00 dBm"},
                         {"Average RSRP", "-92.50 dBm"},
                         {"RSRQ", "-9.94 dB"},
                         {"Average RSRQ", "-10.06 dB"},
                         {"RSSI", "-69.00 dBm"},
                         {"Qrxlevmin", "-130 dBm"},
                         {"P-Max", "23 dBm"},
                         {"Max UE Tx Power", "23 dBm"},
                         {"Srxlev", "42 dB"},
                         {"S Intra Search", "31"},
                         {"S Non Intra Search", "9"}},
                        decoder.rows()),
            "");
}

TEST(LTEMeasurementsLayouts, ADecoderThatTakesTheSectionOverKnowsItsCell) {
  auto decoder = newDecoder();
  decoder.decode(measurementCode, connectedLayout(measurementDescription(36)).payload());
  const std::string before = decoder.text("RSRP Rx3");
  decoder.decodeByAnother(evaluation, idleLayout(5).payload());
  EXPECT_EQ(decoder.text("RSRP Rx3"), before);
  Bytes payload = idleLayout(5).payload();
  put(payload, {8, 0, 9}, 302);
  decoder.decodeByAnother(evaluation, payload);
  for (const char* row : antennaRows) EXPECT_EQ(decoder.text(row), "") << row;
}

TEST(LTEMeasurementsLayouts, TheVersionIsThatOfTheLastSubpacket) {
  const Bytes known = subpacketOf(connectedLayout(measurementDescription(36)).payload());
  Bytes unknown = known;
  unknown[1] = 99;
  auto decoder = newDecoder();
  const Bytes unknownLast = packetOfSubpackets({known, unknown});
  decoder.decode(measurementCode, unknownLast);
  EXPECT_EQ(decoder.version(), "25.99 (not known)");
  EXPECT_EQ(decoder.text("Physical Cell ID"), "301");
  EXPECT_EQ(decoder.fateOf(measurementCode, unknownLast).outcome, MessageFate::Outcome::Decoded);
  const Bytes knownLast = packetOfSubpackets({unknown, known});
  decoder.decode(measurementCode, knownLast);
  EXPECT_EQ(decoder.version(), "25.36");
  EXPECT_EQ(decoder.fateOf(measurementCode, knownLast).outcome, MessageFate::Outcome::Decoded);
}

}  // namespace
}  // namespace varnel::lte
