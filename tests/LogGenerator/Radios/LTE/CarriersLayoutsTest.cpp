#include "LogGenerator/Radios/LTE/Carriers.h"

#include <gtest/gtest.h>

#include "tests/support/MeasurementLayouts.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

DecoderAlone<Carriers> newDecoder() { return DecoderAlone<Carriers>("Cells"); }
const LayoutRules rules(newDecoder);

constexpr const char* first = "Cells/0/";

bool isShown(const std::string& level) {
  return !level.starts_with("Filtered") && level != "Projected SIR" && level != "RSRQ after Cancellation";
}

// The first cell is a serving one: of another one there is no row.
DescribedLayout layoutOf(const MeasurementDescription& layout) {
  DescribedLayout made = measurementCase(layout);
  const auto add = [&](const char* label, BitRun run, std::uint64_t number, TextOf text) {
    made.fields.push_back({first + std::string(label), run, number, std::move(text)});
  };
  add("EARFCN", channelRun(layout), measuredChannel, plainNumber());
  add("Band", channelRun(layout), measuredChannel, lteBandText);
  add("Downlink Frequency", channelRun(layout), measuredChannel, lteDownlinkText);
  add("Physical Cell ID", cellRun(layout), measuredCell, plainNumber());
  if (layout.hasServing) {
    add("Carrier", servingIndexRun(layout), 0, [](std::uint64_t index) {
      return index == 0 ? "Primary" : printed("Secondary %d", static_cast<int>(index));
    });
    made.fixed.push_back({isServingRun(layout), 1});
  }
  for (const FieldRow& field : layout.levels)
    if (isShown(field.path)) made.fields.push_back(shifted(field, layout.first, first));
  made.derived = {
      {std::string(first) + "Last Seen", [](ByteView) { return std::string(versionedTestTimeText); }}};
  return inSubpacket(made, 25, static_cast<std::uint8_t>(layout.version));
}

std::vector<MeasurementDescription> layoutsWithServing() {
  std::vector<MeasurementDescription> layouts;
  for (const MeasurementDescription& layout : measurementDescriptions())
    if (layout.hasServing) layouts.push_back(layout);
  return layouts;
}

TEST(LTECarriersLayouts, EachFieldMovesItsRowsOnly) {
  for (const MeasurementDescription& layout : layoutsWithServing())
    rules.expectEachFieldByItself(layoutOf(layout));
}

TEST(LTECarriersLayouts, KnownVersionsShowTheirNumber) {
  for (const MeasurementDescription& layout : measurementDescriptions())
    rules.expectVersionKnown(layoutOf(layout));
}

TEST(LTECarriersLayouts, NothingPastTheEndIsShown) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    rules.expectNothingPastTheEnd(layoutOf(layout));
    rules.expectNothingPastTheSubpacketsEnd(layoutOf(layout));
  }
}

TEST(LTECarriersLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(layoutOf(measurementDescription(36)), {1});
  rules.expectOtherSubpacketVersionsUnknown(layoutOf(measurementDescription(36)), measurementVersions());
}

TEST(LTECarriersLayouts, ACellThatDoesNotServeIsNone) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{301, 0, 0}}, 1)}));
    EXPECT_EQ(differences({}, decoder.rows()), "") << layout.version;
  }
}

TEST(LTECarriersLayouts, AnAntennaOfZeroBitsIsLeftOut) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    const DescribedLayout described = layoutOf(layout);
    for (unsigned antenna = 0; antenna < layout.antennas; ++antenna) {
      SCOPED_TRACE(described.name() + " antenna " + std::to_string(antenna));
      Bytes payload = described.payload();
      Rows expected = described.rowsOf(payload);
      auto decoder = newDecoder();
      decoder.decode(measurementCode, payload);
      BitRun last{};
      for (const FieldRow& field : described.fields) {
        if (!field.path.ends_with("Rx" + std::to_string(antenna))) continue;
        put(payload, field.run, 0);
        expected.erase(field.path);
        last = field.run;
      }
      decoder.decode(measurementCode, payload);
      EXPECT_EQ(differences(expected, decoder.rows()), "");
      // One bit brings all of them back.
      put(payload, last, 1);
      decoder.decode(measurementCode, payload);
      EXPECT_EQ(differences(described.rowsOf(payload), decoder.rows()), "");
    }
  }
}

TEST(LTECarriersLayouts, CarriersOfOnePacketAreSortedByTheirIndex) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    if (layout.countWidth == 0) continue;
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(
                                        layout, {{14, 7, 1}, {11, 0, 0}, {12, 2, 1}, {13, 0, 1}}, 4)}));
    SCOPED_TRACE(layout.version);
    EXPECT_EQ(decoder.text("Cells/0/Carrier"), "Primary");
    EXPECT_EQ(decoder.text("Cells/0/Physical Cell ID"), "13");
    EXPECT_EQ(decoder.text("Cells/1/Carrier"), "Secondary 2");
    EXPECT_EQ(decoder.text("Cells/1/Physical Cell ID"), "12");
    EXPECT_EQ(decoder.text("Cells/2/Carrier"), "Secondary 7");
    EXPECT_EQ(decoder.text("Cells/2/Physical Cell ID"), "14");
    EXPECT_EQ(decoder.text("Cells/3/Carrier"), "");
  }
}

TEST(LTECarriersLayouts, TheNumberOfCellsIsAnUpperBoundOnly) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    if (layout.countWidth == 0) continue;
    const auto cellsOf = [&](std::uint64_t count) {
      auto decoder = newDecoder();
      decoder.decode(
          measurementCode,
          packetOfSubpackets({measurementSubpacket(layout, {{13, 0, 1}, {12, 1, 1}, {14, 2, 1}}, count)}));
      return decoder.section().dictionary()->get("Cells").array()->size();
    };
    EXPECT_EQ(cellsOf(0), 0u) << layout.version;
    EXPECT_EQ(cellsOf(1), 1u) << layout.version;
    EXPECT_EQ(cellsOf(3), 3u) << layout.version;
    EXPECT_EQ(cellsOf(4), 3u) << layout.version;
    EXPECT_EQ(cellsOf(65535), 3u) << layout.version;
  }
}

// One packet has one carrier.
TEST(LTECarriersLayouts, CarriersOfSeveralPacketsAndSubpacketsStandTogether) {
  const MeasurementDescription layout = measurementDescription(36);
  auto decoder = newDecoder();
  decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{12, 1, 1}}, 1, 5230)}));
  decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{14, 2, 1}}, 1, 66486),
                                                      measurementSubpacket(layout, {{13, 0, 1}}, 1, 100)}));
  EXPECT_EQ(decoder.text("Cells/0/Carrier"), "Primary");
  EXPECT_EQ(decoder.text("Cells/0/EARFCN"), "100");
  EXPECT_EQ(decoder.text("Cells/0/Band"), "1");
  EXPECT_EQ(decoder.text("Cells/0/Downlink Frequency"), "2120.0 MHz");
  EXPECT_EQ(decoder.text("Cells/1/Carrier"), "Secondary 1");
  EXPECT_EQ(decoder.text("Cells/1/Band"), "13");
  EXPECT_EQ(decoder.text("Cells/1/Downlink Frequency"), "751.0 MHz");
  EXPECT_EQ(decoder.text("Cells/2/Carrier"), "Secondary 2");
  EXPECT_EQ(decoder.text("Cells/2/Band"), "66");
  EXPECT_EQ(decoder.text("Cells/2/Downlink Frequency"), "2115.0 MHz");
}

TEST(LTECarriersLayouts, ANewCellOfAnIndexReplacesTheOldOne) {
  const MeasurementDescription layout = measurementDescription(36);
  auto decoder = newDecoder();
  decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{12, 1, 1}}, 1, 5230)}));
  decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{15, 1, 1}}, 1, 100)}));
  EXPECT_EQ(decoder.text("Cells/0/Physical Cell ID"), "15");
  EXPECT_EQ(decoder.text("Cells/1/Physical Cell ID"), "");
}

TEST(LTECarriersLayouts, ACarrierIsGoneAfter30Seconds) {
  const MeasurementDescription layout = measurementDescription(36);
  const auto packet = [&](unsigned cell, unsigned index) {
    return packetOfSubpackets({measurementSubpacket(layout, {{cell, index, 1}}, 1, 100)});
  };
  auto decoder = newDecoder();
  decoder.decode(measurementCode, packet(12, 1), {1600000000, 0});
  decoder.decode(measurementCode, packet(13, 0), {1600000029, 0});
  EXPECT_EQ(decoder.text("Cells/0/Last Seen"), "2020-09-13 12:27:09 +0000");
  EXPECT_EQ(decoder.text("Cells/1/Last Seen"), "2020-09-13 12:26:40 +0000");
  // By packets,
  decoder.decode(measurementCode, packet(13, 0), {1600000031, 0});
  EXPECT_EQ(decoder.text("Cells/0/Carrier"), "Primary");
  EXPECT_EQ(decoder.text("Cells/1/Carrier"), "");
  // and by displays.
  decoder.decoder().prepareDisplay({1600000060, 0});
  EXPECT_EQ(decoder.text("Cells/0/Carrier"), "Primary");
  decoder.decoder().prepareDisplay({1600000062, 0});
  EXPECT_EQ(differences({}, decoder.rows()), "");
}

TEST(LTECarriersLayouts, AnImplausibleCellOrChannelShowsNothing) {
  for (const MeasurementDescription& layout : layoutsWithServing()) {
    const auto rowsOf = [&](unsigned cell, std::uint64_t channel) {
      auto decoder = newDecoder();
      decoder.decode(measurementCode,
                     packetOfSubpackets({measurementSubpacket(layout, {{cell, 0, 1}}, 1, channel)}));
      return decoder.rows();
    };
    EXPECT_EQ(differences({}, rowsOf(504, 100)), "");
    EXPECT_NE(differences({}, rowsOf(503, 100)), "");
    if (layout.channelWidth == 16) continue;
    EXPECT_EQ(differences({}, rowsOf(1, 262144)), "");
  }
}

TEST(LTECarriersLayouts, TheFirstCellOfVersion60IsThePrimaryOne) {
  const MeasurementDescription layout = measurementDescription(60);
  auto decoder = newDecoder();
  decoder.decode(measurementCode,
                 packetOfSubpackets({measurementSubpacket(layout, {{13, 0, 0}, {14, 0, 0}}, 2)}));
  EXPECT_EQ(decoder.text("Cells/0/Carrier"), "Primary");
  EXPECT_EQ(decoder.text("Cells/0/Physical Cell ID"), "13");
  EXPECT_EQ(decoder.text("Cells/1/Carrier"), "");
}

TEST(LTECarriersLayouts, CarriersOfASectionThatIsBoundAgainStay) {
  const MeasurementDescription layout = measurementDescription(36);
  auto decoder = newDecoder();
  decoder.decode(measurementCode,
                 packetOfSubpackets({measurementSubpacket(layout, {{13, 0, 1}, {14, 1, 1}}, 2)}));
  decoder.decodeByAnother(measurementCode,
                          packetOfSubpackets({measurementSubpacket(layout, {{15, 1, 1}}, 1)}));
  EXPECT_EQ(decoder.text("Cells/0/Physical Cell ID"), "13");
  EXPECT_EQ(decoder.text("Cells/1/Physical Cell ID"), "15");
  EXPECT_EQ(decoder.text("Cells/2/Physical Cell ID"), "");
}

}  // namespace
}  // namespace varnel::lte
