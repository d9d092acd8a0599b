#include "LogGenerator/Radios/LTE/Neighbors.h"

#include <gtest/gtest.h>

#include "tests/support/CellMonitorRecords.h"
#include "tests/support/MeasurementLayouts.h"
#include "tests/support/VersionedHarness.h"

namespace varnel::lte {
namespace {

DecoderAlone<Neighbors> newDecoder() { return DecoderAlone<Neighbors>("Cells"); }
const LayoutRules rules(newDecoder);

constexpr std::uint32_t connectedCode = 0xB179, connectedNeighborsCode = 0xB195, idleCode = 0xB180,
                        idleResultCode = 0xB192;

TextOf constantText(const char* text) {
  return [text](std::uint64_t) { return std::string(text); };
}

// Adds the rows that every source has.
void addIdentity(DescribedLayout& layout, BitRun channel, BitRun cell, const char* source) {
  const auto add = [&](const char* label, BitRun run, std::uint64_t number, TextOf text) {
    layout.fields.push_back({"Cells/0/" + std::string(label), run, number, std::move(text)});
  };
  add("EARFCN", channel, measuredChannel, plainNumber());
  add("Band", channel, measuredChannel, lteBandText);
  add("Downlink Frequency", channel, measuredChannel, lteDownlinkText);
  add("Physical Cell ID", cell, measuredCell, plainNumber());
  add("Last Seen", channel, measuredChannel, constantText(versionedTestTimeText));
  add("Source", channel, measuredChannel, constantText(source));
  layout.isPlausible = [plausible = layout.isPlausible, channel, cell](ByteView payload) {
    return plausible(payload) && numberIn(payload, channel) <= 262143 && numberIn(payload, cell) <= 503;
  };
}
void addLevel(DescribedLayout& layout, const char* label, BitRun run, std::uint64_t number, TextOf text) {
  layout.fields.push_back({"Cells/0/" + std::string(label), run, number, std::move(text)});
}

DescribedLayout measurementNeighbor(const MeasurementDescription& layout) {
  DescribedLayout made = measurementCase(layout);
  addIdentity(made, channelRun(layout), cellRun(layout), "0xB193");
  for (const FieldRow& field : layout.levels)
    if (field.path == "RSRP" || field.path == "RSRQ" || field.path == "RSSI")
      made.fields.push_back(shifted(field, layout.first, "Cells/0/"));
  made.fixed.push_back({isServingRun(layout), 0});
  return inSubpacket(made, 25, static_cast<std::uint8_t>(layout.version));
}

// One neighbor at its place, and room for one detected cell behind it.
DescribedLayout connectedMeasurement(std::uint32_t version) {
  const bool isOld = version == 3;
  const std::size_t cells = isOld ? 24 : 28;
  const BitRun servingCell = wordAt(isOld ? 10 : 12), cell = wordAt(cells);
  DescribedLayout layout{
      .logCode = connectedCode,
      .version = {version},
      .size = cells + 12 + 16,
      .minimum = cells + 8,
      .fixed = {{byteAt(isOld ? 22 : 24), 1}, {byteAt(isOld ? 23 : 25), 1}, {servingCell, 5}}};
  addIdentity(layout, {8, 0, isOld ? 16u : 32u}, cell, "0xB179");
  const auto signedLevel = [](const char* format, double summand) -> TextOf {
    return [=](std::uint64_t number) {
      return printed(format, static_cast<double>(signedNumber(number, 16)) / 16 + summand);
    };
  };
  addLevel(layout, "RSRP", wordAt(cells + 2), 1301, signedLevel("%.2f dBm", -180));
  addLevel(layout, "RSRQ", wordAt(cells + 6), 309, signedLevel("%.2f dB", -30));
  return layout;
}

// Of 0xB195 and 0xB192; those of two-byte channel numbers begin four bytes earlier.
DescribedLayout neighborResult(std::uint32_t code, std::uint8_t id, std::uint8_t version, bool isOld) {
  const std::size_t count = isOld ? 6 : 8, cells = isOld ? 8 : 12;
  DescribedLayout layout{
      .logCode = code, .size = cells + 52, .minimum = cells + 32, .fixed = {{{count, 0, 6}, 1}}};
  addIdentity(layout, {4, 0, isOld ? 16u : 32u}, {cells, 0, 10},
              code == idleResultCode ? "0xB192" : "0xB195");
  addLevel(layout, "RSRP", {cells + 12, 0, 12}, 1301, rsrpText());
  addLevel(layout, "RSRQ", {cells + 20, 10, 10}, 309, rsrqText());
  addLevel(layout, "RSSI", {cells + 28, 11, 11}, 691, rssiText());
  return inSubpacket(layout, id, version);
}
std::vector<DescribedLayout> neighborResults() {
  return {neighborResult(connectedNeighborsCode, 31, 3, true),
          neighborResult(connectedNeighborsCode, 31, 4, false),
          neighborResult(connectedNeighborsCode, 31, 24, false), neighborResult(idleResultCode, 27, 2, true),
          neighborResult(idleResultCode, 27, 4, false)};
}

DescribedLayout idleNeighbors(std::uint32_t version) {
  const bool isOld = version == 4;
  const std::size_t cells = isOld ? 8 : 12;
  const BitRun count = isOld ? BitRun{6, 6, 10} : BitRun{8, 6, 26};
  DescribedLayout layout{.logCode = idleCode,
                         .version = {version},
                         .size = cells + 32,
                         .minimum = cells + 12,
                         .fixed = {{count, 1}}};
  addIdentity(layout, {4, 0, isOld ? 16u : 32u}, {cells, 0, 9}, "0xB180");
  addLevel(layout, "RSRP", {cells, 20, 12}, 1301, rsrpText());
  addLevel(layout, "RSRQ", {cells + 8, 12, 10}, 309, rsrqText());
  addLevel(layout, "RSSI", {cells, 9, 11}, 691, rssiText());
  return layout;
}

std::vector<DescribedLayout> measurementNeighbors() {
  std::vector<DescribedLayout> made;
  for (const MeasurementDescription& layout : measurementDescriptions())
    if (layout.hasServing) made.push_back(measurementNeighbor(layout));
  return made;
}
std::vector<DescribedLayout> plainPackets() {
  return {connectedMeasurement(3), connectedMeasurement(4), idleNeighbors(4), idleNeighbors(5)};
}
std::vector<DescribedLayout> subpackets() {
  std::vector<DescribedLayout> all = measurementNeighbors();
  for (const DescribedLayout& layout : neighborResults()) all.push_back(layout);
  return all;
}

TEST(LTENeighborsLayouts, EachFieldMovesItsRowsOnly) {
  for (const DescribedLayout& layout : plainPackets()) rules.expectEachFieldByItself(layout);
  for (const DescribedLayout& layout : subpackets()) rules.expectEachFieldByItself(layout);
}

TEST(LTENeighborsLayouts, KnownVersionsShowTheirNumber) {
  for (const DescribedLayout& layout : plainPackets()) rules.expectVersionKnown(layout);
  for (const DescribedLayout& layout : subpackets()) rules.expectVersionKnown(layout);
}

TEST(LTENeighborsLayouts, NothingPastTheEndIsShown) {
  for (const DescribedLayout& layout : plainPackets()) rules.expectNothingPastTheEnd(layout);
  for (const DescribedLayout& layout : subpackets()) {
    rules.expectNothingPastTheEnd(layout);
    rules.expectNothingPastTheSubpacketsEnd(layout);
  }
}

TEST(LTENeighborsLayouts, AHeaderThatIsCutLeavesTheListAsItIs) {
  DescribedLayout connected = connectedMeasurement(4), idle = idleNeighbors(5), oldIdle = idleNeighbors(4);
  connected.minimum = 28;
  idle.minimum = 12;
  oldIdle.minimum = 8;
  rules.expectUnchangedBelowMinimum(connected, idle);
  rules.expectUnchangedBelowMinimum(idle, connected);
  rules.expectUnchangedBelowMinimum(oldIdle, connected);
}

TEST(LTENeighborsLayouts, OtherVersionsAreNotKnown) {
  rules.expectOtherVersionsUnknown(connectedMeasurement(4), {3, 4});
  rules.expectOtherVersionsUnknown(idleNeighbors(5), {4, 5});
  rules.expectOtherVersionsUnknown(neighborResults()[1], {1});
  rules.expectOtherVersionsUnknown(neighborResults()[4], {1});
  rules.expectOtherVersionsUnknown(measurementNeighbors()[3], {1});
  rules.expectOtherSubpacketVersionsUnknown(neighborResults()[1], {3, 4, 24});
  rules.expectOtherSubpacketVersionsUnknown(neighborResults()[4], {2, 4});
  // Version 60 does not say which cells are neighbors.
  rules.expectOtherSubpacketVersionsUnknown(measurementNeighbors()[3], measurementVersions());
}

TEST(LTENeighborsLayouts, ServingCellsAreNoNeighbors) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    if (!layout.hasServing) continue;
    auto decoder = newDecoder();
    decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{301, 0, 1}}, 1)}));
    EXPECT_EQ(differences({}, decoder.rows()), "") << layout.version;
    decoder.decode(measurementCode, packetOfSubpackets({measurementSubpacket(layout, {{301, 1, 1}}, 1)}));
    EXPECT_EQ(differences({}, decoder.rows()), "") << layout.version;
  }
}

TEST(LTENeighborsLayouts, Version60HasNoNeighbors) {
  auto decoder = newDecoder();
  decoder.decode(
      measurementCode,
      packetOfSubpackets({measurementSubpacket(measurementDescription(60), {{301, 0, 0}, {302, 0, 0}}, 2)}));
  EXPECT_EQ(differences({}, decoder.rows()), "");
}

TEST(LTENeighborsLayouts, MeasuredCellsAreSortedByTheirPower) {
  for (const MeasurementDescription& layout : measurementDescriptions()) {
    if (!layout.hasServing || layout.countWidth == 0) continue;
    SCOPED_TRACE(layout.version);
    auto decoder = newDecoder();
    decoder.decode(measurementCode,
                   packetOfSubpackets({measurementSubpacket(
                       layout, {{10, 0, 1, 950}, {11, 0, 0, 700}, {12, 0, 0, 900}, {13, 0, 0, 800}}, 4)}));
    EXPECT_EQ(decoder.text("Cells/0/Physical Cell ID"), "12");
    EXPECT_EQ(decoder.text("Cells/1/Physical Cell ID"), "13");
    EXPECT_EQ(decoder.text("Cells/2/Physical Cell ID"), "11");
    EXPECT_EQ(decoder.text("Cells/3/Physical Cell ID"), "");
  }
}

struct Neighbor {
  unsigned cell, rsrp, rsrq;
};

// 0xB179 of version 4.
Bytes connectedPacket(std::uint32_t channel, const std::vector<Neighbor>& neighbors, std::size_t count,
                      std::size_t detected = 0, std::size_t roomForDetected = 0) {
  Bytes payload(28 + 12 * neighbors.size() + 16 * roomForDetected);
  payload[0] = 4;
  put(payload, longAt(8), channel);
  put(payload, wordAt(12), 5);
  put(payload, byteAt(24), count);
  put(payload, byteAt(25), detected);
  std::size_t at = 28;
  for (const Neighbor& neighbor : neighbors) {
    put(payload, wordAt(at), neighbor.cell);
    put(payload, wordAt(at + 2), neighbor.rsrp);
    put(payload, wordAt(at + 6), neighbor.rsrq);
    at += 12;
  }
  for (; at < payload.size(); at += 16) put(payload, wordAt(at), 400);
  return payload;
}

std::size_t cellCount(const DecoderAlone<Neighbors>& decoder) {
  return decoder.section().dictionary()->get("Cells").array()->size();
}
std::vector<std::string> cellsOf(const DecoderAlone<Neighbors>& decoder) {
  std::vector<std::string> cells;
  for (std::size_t index = 0; index < cellCount(decoder); ++index)
    cells.push_back(decoder.text("Cells/" + std::to_string(index) + "/Physical Cell ID"));
  return cells;
}
using Cells = std::vector<std::string>;

TEST(LTENeighborsLayouts, ConnectedNeighborsInLiterals) {
  auto decoder = newDecoder();
  // Channel 0x1644 = 5700 lies in no band, 6200 in band 20: 791 + 5 MHz.
  decoder.decode(connectedCode, connectedPacket(5700, {{7, 1000, 200}}, 1));
  decoder.decode(connectedCode, connectedPacket(6200, {{8, 1600, 300}, {9, 0, 0xFFF0}}, 2));
  EXPECT_EQ(differences({{"Cells/0/EARFCN", "6200"},
                         {"Cells/0/Physical Cell ID", "8"},
                         {"Cells/0/Band", "20"},
                         {"Cells/0/Downlink Frequency", "796.0 MHz"},
                         {"Cells/0/RSRP", "-80.00 dBm"},
                         {"Cells/0/RSRQ", "-11.25 dB"},
                         {"Cells/0/Last Seen", "2020-09-13 12:26:40 +0000"},
                         {"Cells/0/Source", "0xB179"},
                         {"Cells/1/EARFCN", "5700"},
                         {"Cells/1/Physical Cell ID", "7"},
                         {"Cells/1/RSRP", "-117.50 dBm"},
                         {"Cells/1/RSRQ", "-17.50 dB"},
                         {"Cells/1/Last Seen", "2020-09-13 12:26:40 +0000"},
                         {"Cells/1/Source", "0xB179"},
                         {"Cells/2/EARFCN", "6200"},
                         {"Cells/2/Physical Cell ID", "9"},
                         {"Cells/2/Band", "20"},
                         {"Cells/2/Downlink Frequency", "796.0 MHz"},
                         {"Cells/2/RSRP", "-180.00 dBm"},
                         {"Cells/2/RSRQ", "-31.00 dB"},
                         {"Cells/2/Last Seen", "2020-09-13 12:26:40 +0000"},
                         {"Cells/2/Source", "0xB179"}},
                        decoder.rows()),
            "");
}

TEST(LTENeighborsLayouts, DetectedCellsAreNotShown) {
  auto decoder = newDecoder();
  decoder.decode(connectedCode, connectedPacket(6200, {{8, 1600, 300}}, 1, 2, 2));
  EXPECT_EQ(cellsOf(decoder), Cells{"8"});
  auto without = newDecoder();
  without.decode(connectedCode, connectedPacket(6200, {}, 0, 2, 2));
  EXPECT_EQ(cellsOf(without), Cells{});
}

TEST(LTENeighborsLayouts, CountsAreUpperBoundsOnly) {
  const std::vector<Neighbor> three = {{1, 1600, 300}, {2, 1500, 300}, {3, 1400, 300}};
  for (const std::size_t count : {0, 1, 2, 3, 4, 255}) {
    auto decoder = newDecoder();
    decoder.decode(connectedCode, connectedPacket(6200, three, count));
    EXPECT_EQ(cellCount(decoder), std::min<std::size_t>(count, 3)) << count;
  }
  for (const DescribedLayout& layout : neighborResults()) {
    const std::size_t count = layout.size == 4 + 8 + 52 ? 4 + 6 : 4 + 8;
    for (const unsigned cells : {0u, 1u, 2u, 63u}) {
      Bytes payload = layout.payload();
      put(payload, {count, 0, 6}, cells);
      auto decoder = newDecoder();
      decoder.decode(layout.logCode, payload);
      EXPECT_EQ(cellCount(decoder), std::min(cells, 1u)) << layout.name() << " " << cells;
    }
  }
  for (const std::uint32_t cells : {0u, 1u, 2u, 63u, 0x3FFu, 0x3FFFFFFu}) {
    Bytes payload = idleNeighbors(5).payload();
    put(payload, {8, 6, 26}, cells);
    auto decoder = newDecoder();
    decoder.decode(idleCode, payload);
    EXPECT_EQ(cellCount(decoder), std::min(cells, 1u)) << cells;
    Bytes old = idleNeighbors(4).payload();
    put(old, {6, 6, 10}, cells & 0x3FF);
    auto oldDecoder = newDecoder();
    oldDecoder.decode(idleCode, old);
    EXPECT_EQ(cellCount(oldDecoder), std::min(cells, 1u)) << cells;
  }
}

TEST(LTENeighborsLayouts, SecondCellsStandAStrideFurther) {
  for (DescribedLayout layout :
       {neighborResults()[0], neighborResults()[1], idleNeighbors(4), idleNeighbors(5)}) {
    SCOPED_TRACE(layout.name());
    const bool isResult = layout.version.subpacket != 0;
    const std::size_t stride = isResult ? 52 : 32;
    Bytes payload = layout.payload();
    const Bytes cell(payload.end() - static_cast<std::ptrdiff_t>(stride), payload.end());
    payload.insert(payload.end(), cell.begin(), cell.end());
    put(payload, {payload.size() - stride, 0, 9}, 77);
    if (isResult) put(payload, wordAt(6), payload.size() - 4);
    put(payload, layout.fixed.front().run, 2);
    auto decoder = newDecoder();
    decoder.decode(layout.logCode, payload);
    // Of equal power, the lower cell comes first.
    EXPECT_EQ(cellsOf(decoder), (Cells{"77", "301"}));
  }
}

TEST(LTENeighborsLayouts, EqualPowersAreSortedByChannelAndCell) {
  auto decoder = newDecoder();
  decoder.decode(connectedCode, connectedPacket(6200, {{9, 1000, 300}, {8, 1000, 300}}, 2));
  decoder.decode(connectedCode, connectedPacket(100, {{10, 1000, 300}, {11, 1001, 300}}, 2));
  EXPECT_EQ(cellsOf(decoder), (Cells{"11", "10", "8", "9"}));
}

TEST(LTENeighborsLayouts, TheSameCellOfTheSameChannelIsOneRecord) {
  auto decoder = newDecoder();
  decoder.decode(idleCode, idleNeighbors(5).payload());
  EXPECT_EQ(decoder.text("Cells/0/RSSI"), "-66.81 dBm");  // 691 / 16 - 110
  decoder.decode(connectedCode, connectedPacket(3050, {{301, 1000, 300}}, 1), {1600000001, 0});
  EXPECT_EQ(cellsOf(decoder), Cells{"301"});
  EXPECT_EQ(decoder.text("Cells/0/RSRP"), "-117.50 dBm");
  EXPECT_EQ(decoder.text("Cells/0/Source"), "0xB179");
  EXPECT_EQ(decoder.text("Cells/0/Last Seen"), "2020-09-13 12:26:41 +0000");
  EXPECT_EQ(decoder.text("Cells/0/RSSI"), "");  // 0xB179 has none
  decoder.decode(connectedCode, connectedPacket(3051, {{301, 1000, 300}}, 1), {1600000001, 0});
  EXPECT_EQ(cellsOf(decoder), (Cells{"301", "301"}));
}

TEST(LTENeighborsLayouts, ACellIsGoneAt30Seconds) {
  const Bytes packet = connectedPacket(6200, {{8, 1000, 300}}, 1);
  const Bytes other = connectedPacket(6200, {{9, 900, 300}}, 1);
  auto byPackets = newDecoder();
  byPackets.decode(connectedCode, packet, {1600000000, 500000000});
  byPackets.decode(connectedCode, other, {1600000030, 499999999});
  EXPECT_EQ(cellsOf(byPackets), (Cells{"8", "9"}));
  byPackets.decode(connectedCode, other, {1600000030, 500000000});
  EXPECT_EQ(cellsOf(byPackets), Cells{"9"});
  auto byDisplays = newDecoder();
  byDisplays.decode(connectedCode, packet, {1600000000, 500000000});
  byDisplays.decoder().prepareDisplay({1600000030, 499999999});
  EXPECT_EQ(cellsOf(byDisplays), Cells{"8"});
  byDisplays.decoder().prepareDisplay({1600000030, 500000000});
  EXPECT_EQ(cellsOf(byDisplays), Cells{});
}

TEST(LTENeighborsLayouts, TheWeakestOf65CellsIsNotShown) {
  std::vector<Neighbor> neighbors;
  for (unsigned cell = 0; cell < 65; ++cell) neighbors.push_back({cell, 1000 + cell * 7 % 65, 300});
  auto decoder = newDecoder();
  decoder.decode(connectedCode, connectedPacket(6200, neighbors, 65));
  ASSERT_EQ(cellCount(decoder), 64u);
  const Cells cells = cellsOf(decoder);
  EXPECT_EQ(std::find(cells.begin(), cells.end(), "0"), cells.end());  // 0 x 7 is the least
  EXPECT_EQ(cells.front(), "37");                                      // 37 x 7 = 259 = 3 x 65 + 64
  // A stronger one takes the place of the weakest.
  decoder.decode(connectedCode, connectedPacket(6200, {{400, 1500, 300}}, 1));
  ASSERT_EQ(cellCount(decoder), 64u);
  EXPECT_EQ(cellsOf(decoder).front(), "400");
  // A weaker one has no place.
  decoder.decode(connectedCode, connectedPacket(6200, {{401, 10, 300}}, 1));
  ASSERT_EQ(cellCount(decoder), 64u);
  EXPECT_EQ(decoder.text("Cells/63/RSRP"), "-117.38 dBm");  // 1002 / 16 - 180
}

TEST(LTENeighborsLayouts, CellsOfASectionThatIsBoundAgainStay) {
  auto first = newDecoder();
  first.decode(connectedCode, connectedPacket(6200, {{8, 1000, 300}}, 1), {1600000000, 0});
  Neighbors second;
  second.section().setTime({1600000100, 0});
  second.updateSectionRef(first.section());
  EXPECT_EQ(cellsOf(first), Cells{"8"});
  const Bytes packet = packetOf(connectedCode, connectedPacket(6200, {{9, 1100, 300}}, 1));
  second.updateWithData_logCode(Packet(packet), connectedCode);
  EXPECT_EQ(cellsOf(first), (Cells{"9", "8"}));
  EXPECT_EQ(first.text("Cells/1/RSRP"), "-117.50 dBm");
  second.prepareDisplay({1600000131, 0});
  EXPECT_EQ(cellsOf(first), Cells{});
}

TEST(LTENeighborsLayouts, ImplausibleCellsAndChannelsShowNothing) {
  for (const unsigned cell : {504u, 1000u, 65535u}) {
    auto decoder = newDecoder();
    decoder.decode(connectedCode, connectedPacket(6200, {{cell, 1000, 300}}, 1));
    EXPECT_EQ(cellCount(decoder), 0u) << cell;
  }
  auto decoder = newDecoder();
  decoder.decode(connectedCode, connectedPacket(262144, {{8, 1000, 300}}, 1));
  EXPECT_EQ(cellCount(decoder), 0u);
  Bytes servingCell = connectedPacket(6200, {{8, 1000, 300}}, 1);
  put(servingCell, wordAt(12), 504);
  decoder.decode(connectedCode, servingCell);
  EXPECT_EQ(cellCount(decoder), 0u);
  decoder.decode(connectedCode, connectedPacket(262143, {{503, 1000, 300}}, 1));
  EXPECT_EQ(cellsOf(decoder), Cells{"503"});
}

// Subpackets of requests come before those of results.
TEST(LTENeighborsLayouts, ResultsAreFoundBehindRequests) {
  for (const DescribedLayout& layout : neighborResults()) {
    const std::uint8_t requestKind = layout.logCode == idleResultCode ? 26 : 30;
    Bytes request(32, 0x5A);
    request[0] = requestKind;
    request[1] = 4;
    put(request, wordAt(2), request.size());
    const Bytes payload = packetOfSubpackets({request, subpacketOf(layout.payload())});
    auto decoder = newDecoder();
    decoder.decode(layout.logCode, payload);
    EXPECT_EQ(cellsOf(decoder), Cells{"301"}) << layout.name();
    EXPECT_EQ(decoder.fateOf(layout.logCode, payload).outcome, MessageFate::Outcome::Decoded);
  }
}

TEST(LTENeighborsLayouts, SeveralSubpacketsAddUp) {
  const DescribedLayout layout = neighborResults()[1];
  Bytes second = subpacketOf(layout.payload());
  put(second, longAt(4), 100);
  put(second, {12, 0, 10}, 44);
  auto decoder = newDecoder();
  decoder.decode(layout.logCode, packetOfSubpackets({subpacketOf(layout.payload()), second}));
  EXPECT_EQ(cellsOf(decoder), (Cells{"44", "301"}));
}

TEST(LTENeighborsLayouts, TheCellMonitorsNeighborsHaveNoLevels) {
  auto decoder = newDecoder();
  decoder.decodePacket(
      0xFF0001,
      cellMonitorMessage({
          cellRecord("LTE", "Serving", {number("PhysicalCellIdentity", 1), number("UARFCN", 100)}),
          cellRecord("LTE", "Neighbor", {number("PhysicalCellIdentity", 2), number("UARFCN", 6200)}),
          cellRecord("UMTS", "Neighbor", {number("PhysicalCellIdentity", 3), number("UARFCN", 6200)}),
      }));
  EXPECT_EQ(differences({{"Cells/0/EARFCN", "6200"},
                         {"Cells/0/Physical Cell ID", "2"},
                         {"Cells/0/Band", "20"},
                         {"Cells/0/Downlink Frequency", "796.0 MHz"},
                         {"Cells/0/Last Seen", "2020-09-13 12:26:40 +0000"},
                         {"Cells/0/Source", "Cell Monitor"}},
                        decoder.rows()),
            "");
}

// A modem that finds no neighbors says so with a header alone.
TEST(LTENeighborsLayouts, AHeaderAloneIsDecoded) {
  const auto expectDecoded = [](DescribedLayout layout, std::size_t size) {
    SCOPED_TRACE(layout.name());
    Bytes payload = layout.payload();
    for (const FixedRun& run : layout.fixed)
      if (run.number == 1) put(payload, run.run, 0);
    payload.resize(size);
    auto decoder = newDecoder();
    EXPECT_EQ(decoder.fateOf(layout.logCode, payload).outcome, MessageFate::Outcome::Decoded);
    decoder.decode(layout.logCode, payload);
    EXPECT_EQ(decoder.version(), layout.version.text());
    EXPECT_EQ(cellCount(decoder), 0u);
    payload.resize(size - 1);
    EXPECT_EQ(decoder.fateOf(layout.logCode, payload).outcome, MessageFate::Outcome::TooShort);
  };
  expectDecoded(connectedMeasurement(3), 24);
  expectDecoded(connectedMeasurement(4), 28);
  expectDecoded(idleNeighbors(4), 8);
  expectDecoded(idleNeighbors(5), 12);
}

}  // namespace
}  // namespace varnel::lte
