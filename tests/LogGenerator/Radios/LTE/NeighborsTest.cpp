#include "LogGenerator/Radios/LTE/Neighbors.h"

#include <string>
#include <utility>
#include <vector>

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/LTE/CellPackets.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/DecoderHarness.h"

namespace varnel {
namespace {

// 2020-01-01 00:00:00 UTC.
constexpr Time start{1577836800, 0};

Time after(std::int64_t seconds, std::int32_t nanoseconds = 0) {
  return {start.seconds + seconds, nanoseconds};
}

class LTENeighbors : public RowsDecoderTest<lte::Neighbors, 0xB193> {
 protected:
  LTENeighbors() { decoder.section().setTime(start); }

  // The cells of a carrier, each with its RSRP in sixteenths of 1 dBm above -140 dBm.
  void decodeCells(const std::vector<std::pair<std::uint32_t, std::uint32_t>>& cells,
                   std::uint32_t earfcn = 1300) {
    BodyBuilder carrier = carrierOf(cells.size(), earfcn);
    for (std::size_t i = 0; i < cells.size(); ++i)
      putCell(carrier, i, {.physicalCell = cells[i].first, .rsrp = cells[i].second});
    decode(packetWith(0xB193, carrier));
  }

  const Array& cells() const {
    static const Array none;
    const Array* list = section.dictionary()->get("Cells").array();
    return list ? *list : none;
  }
  // "channel/cell" of each record, in their order.
  std::string places() const {
    std::string text;
    for (const Value& cell : cells())
      text += (text.empty() ? "" : " ") + entry(cell, "EARFCN") + "/" + entry(cell, "Physical Cell ID");
    return text;
  }
  static std::string entry(const Value& record, std::string_view name) {
    const std::string* text = record.dictionary()->get(name).string();
    return text ? *text : "absent";
  }
};

TEST_F(LTENeighbors, CellOfTheServingCarrierIsShown) {
  BodyBuilder carrier = carrierOf(2);
  putCell(carrier, 0, {.physicalCell = 1, .rsrp = 900, .isServing = true});
  putCell(carrier, 1, {.physicalCell = 2, .rsrp = 641});
  carrier.bits(12 + 128 + 44, 0, 10, 300).bits(12 + 128 + 56, 0, 11, 640);
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown(),
            R"({Version: "25.36", Cells: [{EARFCN: "1300", Physical Cell ID: "2", Band: "3", )"
            R"(Downlink Frequency: "1815.0 MHz", RSRP: "-99.94 dBm", RSRQ: "-11.25 dB", RSSI: "-70.00 dBm", )"
            R"(Last Seen: "2020-01-01 00:00:00 +0000", Source: "0xB193"}]})");
}

TEST_F(LTENeighbors, ChannelOfNoBandHasNeitherBandNorFrequency) {
  decodeCells({{2, 640}}, 262143);
  EXPECT_EQ(entry(cells().at(0), "Band"), "absent");
  EXPECT_EQ(entry(cells().at(0), "Downlink Frequency"), "absent");
  EXPECT_EQ(entry(cells().at(0), "EARFCN"), "262143");
}

TEST_F(LTENeighbors, ServingCarrierWithoutNeighborsShowsNoList) {
  BodyBuilder carrier = carrierOf(1);
  putCell(carrier, 0, {.physicalCell = 1, .rsrp = 900, .isServing = true});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(shown(), R"({Version: "25.36"})");
}

TEST_F(LTENeighbors, NeighborThatBecomesThePrimaryCellLeavesTheList) {
  decodeCells({{2, 640}, {3, 650}});
  BodyBuilder carrier = carrierOf(2);
  putCell(carrier, 0, {.physicalCell = 2, .rsrp = 900, .isServing = true});
  putCell(carrier, 1, {.physicalCell = 1, .rsrp = 660});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(places(), "1300/1 1300/3");
}

TEST_F(LTENeighbors, LastNeighborThatBecomesThePrimaryCellLeavesAnEmptyList) {
  decodeCells({{2, 640}});
  decode(packetWith(0xB193, subpacketOf(25, 60, 12 + 148).u32(4, 1300).u32(8, 1).bits(12 + 8, 0, 9, 2)));
  EXPECT_EQ(shown("Cells"), "[]");
}

TEST_F(LTENeighbors, PrimaryCellOfAnotherChannelLeavesTheListAlone) {
  decodeCells({{2, 640}});
  BodyBuilder carrier = carrierOf(1, 1400);
  putCell(carrier, 0, {.physicalCell = 2, .rsrp = 900, .isServing = true});
  decode(packetWith(0xB193, carrier));
  EXPECT_EQ(places(), "1300/2");
}

TEST_F(LTENeighbors, Version60TellsNoNeighbors) {
  decode(packetWith(0xB193, subpacketOf(25, 60, 12 + 2 * 148).u32(4, 1300).u32(8, 2)));
  EXPECT_EQ(shown(), R"({Version: "25.60"})");
}

// A list of the connected mode: one cell per RSRP, from physical cell 10 on.
Bytes intraFrequency(std::uint32_t earfcn, const std::vector<std::uint32_t>& rsrp) {
  BodyBuilder payload(28 + 12 * rsrp.size());
  payload.u8(0, 4).u32(8, earfcn).u16(12, 1).u8(24, static_cast<std::uint32_t>(rsrp.size())).u8(25, 3);
  for (std::size_t i = 0; i < rsrp.size(); ++i)
    payload.u16(28 + 12 * i, static_cast<std::uint32_t>(10 + i))
        .u16(28 + 12 * i + 2, rsrp[i])
        .u16(28 + 12 * i + 6, 320);
  return packetOf(0xB179, payload);
}

TEST_F(LTENeighbors, IntraFrequencyCellHasNoRSSI) {
  decode(intraFrequency(1300, {1280}), 0xB179);
  EXPECT_EQ(shown(), R"({Version: "4", Cells: [{EARFCN: "1300", Physical Cell ID: "10", Band: "3", )"
                     R"(Downlink Frequency: "1815.0 MHz", RSRP: "-100.00 dBm", RSRQ: "-10.00 dB", )"
                     R"(Last Seen: "2020-01-01 00:00:00 +0000", Source: "0xB179"}]})");
}

TEST_F(LTENeighbors, IntraFrequencyLevelsHaveASign) {
  decode(intraFrequency(1300, {0xFFFF}), 0xB179);
  EXPECT_EQ(entry(cells().at(0), "RSRP"), "-180.06 dBm");
}

TEST_F(LTENeighbors, OlderIntraFrequencyListHasAShortChannelNumber) {
  BodyBuilder payload(24 + 12);
  payload.u8(0, 3).u16(8, 5230).u16(10, 1).u8(22, 1).u16(24, 7).u16(26, 1280).u16(30, 320);
  decode(packetOf(0xB179, payload), 0xB179);
  EXPECT_EQ(places(), "5230/7");
  EXPECT_EQ(entry(cells().at(0), "RSRQ"), "-10.00 dB");
}

TEST_F(LTENeighbors, ImplausibleServingCellShowsNothingOfAList) {
  BodyBuilder payload(28 + 12);
  payload.u8(0, 4).u32(8, 1300).u16(12, 504).u8(24, 1);
  decode(packetOf(0xB179, payload), 0xB179);
  EXPECT_EQ(places(), "");
}

TEST_F(LTENeighbors, ImplausibleNeighborShowsNothingOfItsPacket) {
  decodeCells({{2, 640}, {504, 700}});
  EXPECT_EQ(places(), "");
}

TEST_F(LTENeighbors, SearchResultsAreShownInBothModes) {
  const auto result = [](std::uint8_t id, std::uint8_t version, std::size_t channelSize) {
    const std::size_t first = channelSize == 2 ? 8 : 12;
    BodyBuilder body = subpacketOf(id, version, first + 52).bits(4, 0, 8 * channelSize, 1300);
    body.bits(first - 4 + (channelSize == 2 ? 2 : 0), 0, 6, 1).bits(first, 0, 10, id * 10u + version);
    return body.bits(first + 12, 0, 12, 1280).bits(first + 20, 10, 10, 320).bits(first + 28, 11, 11, 640);
  };
  decode(packetWith(0xB195, result(31, 3, 2)), 0xB195);
  EXPECT_EQ(places(), "1300/313");
  EXPECT_EQ(entry(cells().at(0), "Source"), "0xB195");
  decode(packetWith(0xB195, result(31, 4, 4)), 0xB195);
  decode(packetWith(0xB195, result(31, 24, 4)), 0xB195);
  decode(packetWith(0xB192, result(27, 2, 2)), 0xB192);
  decode(packetWith(0xB192, result(27, 4, 4)), 0xB192);
  EXPECT_EQ(places(), "1300/272 1300/274 1300/313 1300/314 1300/334");
  for (const Value& cell : cells()) {
    EXPECT_EQ(entry(cell, "RSRP"), "-100.00 dBm");
    EXPECT_EQ(entry(cell, "RSRQ"), "-10.00 dB");
    EXPECT_EQ(entry(cell, "RSSI"), "-70.00 dBm");
  }
  EXPECT_EQ(entry(cells().at(0), "Source"), "0xB192");
  EXPECT_EQ(shown("Version"), "\"27.4\"");
}

TEST_F(LTENeighbors, IdleNeighborsAreShown) {
  const auto list = [](std::uint8_t version, std::size_t first) {
    BodyBuilder payload(first + 2 * 32);
    payload.u8(0, version).bits(4, 0, version == 4 ? 16 : 32, 1300).bits(version == 4 ? 6 : 8, 6, 10, 2);
    payload.bits(first, 0, 9, version * 10u).bits(first, 9, 11, 640).bits(first, 20, 12, 1296);
    payload.bits(first + 8, 12, 10, 320);
    payload.bits(first + 32, 0, 9, version * 10u + 1).bits(first + 32, 20, 12, 1280);
    return packetOf(0xB180, payload);
  };
  decode(list(4, 8), 0xB180);
  EXPECT_EQ(places(), "1300/40 1300/41");
  EXPECT_EQ(entry(cells().at(0), "RSRP"), "-99.00 dBm");
  EXPECT_EQ(entry(cells().at(0), "RSRQ"), "-10.00 dB");
  EXPECT_EQ(entry(cells().at(0), "RSSI"), "-70.00 dBm");
  EXPECT_EQ(entry(cells().at(0), "Source"), "0xB180");
  decode(list(5, 12), 0xB180);
  EXPECT_EQ(places(), "1300/40 1300/50 1300/41 1300/51");
}

TEST_F(LTENeighbors, CountThatLiesAddsNoCells) {
  BodyBuilder payload(12 + 32 + 17);
  payload.u8(0, 5).u32(4, 1300).u32(8, 0xFFFFFFFF).bits(12, 0, 9, 5);
  decode(packetOf(0xB180, payload), 0xB180);
  EXPECT_EQ(places(), "1300/5");
}

TEST_F(LTENeighbors, CellMonitorCellHasAWholeLevel) {
  decode(cellMonitorMessage({
             cellRecord("LTE", "Serving", {number("UARFCN", 1300), number("PhysicalCellIdentity", 1)}),
             cellRecord("UTRAN", "Neighbor", {number("UARFCN", 1300), number("PhysicalCellIdentity", 2)}),
             cellRecord("LTE", "Neighbor",
                        {number("UARFCN", 1300), number("PhysicalCellIdentity", 3), number("RSSI", -71)}),
             cellRecord("LTE", "Neighbor",
                        {number("UARFCN", 1300), number("PhysicalCellIdentity", 4), number("RSSI", 32767)}),
             cellRecord("LTE", "Neighbor", {number("UARFCN", 1300)}),
             cellRecord("LTE", "Neighbor", {number("PhysicalCellIdentity", 5)}),
             cellRecord("LTE", "Neighbor", {number("UARFCN", 1300), number("PhysicalCellIdentity", 504)}),
             cellRecord("LTE", "Neighbor", {number("UARFCN", -1), number("PhysicalCellIdentity", 6)}),
         }),
         0xFF0001);
  EXPECT_EQ(
      shown(),
      R"({Cells: [{EARFCN: "1300", Physical Cell ID: "3", Band: "3", Downlink Frequency: "1815.0 MHz", )"
      R"(RSSI: "-71 dBm", Last Seen: "2020-01-01 00:00:00 +0000", Source: "Cell Monitor"}, )"
      R"({EARFCN: "1300", Physical Cell ID: "4", Band: "3", Downlink Frequency: "1815.0 MHz", )"
      R"(Last Seen: "2020-01-01 00:00:00 +0000", Source: "Cell Monitor"}]})");
}

TEST_F(LTENeighbors, CellMonitorCellsComeLast) {
  decode(cellMonitorMessage(
             {cellRecord("LTE", "Neighbor", {number("UARFCN", 5), number("PhysicalCellIdentity", 3)})}),
         0xFF0001);
  decodeCells({{2, 0}});
  EXPECT_EQ(places(), "1300/2 5/3");
}

TEST_F(LTENeighbors, CellMonitorThatCannotBeReadLeavesTheList) {
  decodeCells({{2, 0}});
  decode(serverMessageOfText(0xFF0001, "no list"), 0xFF0001);
  EXPECT_EQ(places(), "1300/2");
}

TEST_F(LTENeighbors, StrongestComesFirstThenChannelThenCell) {
  decodeCells({{5, 640}, {4, 640}, {3, 641}});
  decodeCells({{6, 640}, {3, 650}}, 1200);
  EXPECT_EQ(places(), "1200/3 1300/3 1200/6 1300/4 1300/5");
  decodeCells({{5, 700}});
  EXPECT_EQ(places(), "1300/5 1200/3 1300/3 1200/6 1300/4");
}

TEST_F(LTENeighbors, RecordHasWhatItsLastSourceTells) {
  decodeCells({{10, 640}});
  EXPECT_EQ(entry(cells().at(0), "RSSI"), "-110.00 dBm");
  decode(intraFrequency(1300, {1280}), 0xB179);
  EXPECT_EQ(cells().size(), 1u);
  EXPECT_EQ(entry(cells().at(0), "RSSI"), "absent");
  EXPECT_EQ(entry(cells().at(0), "Source"), "0xB179");
  decodeCells({{10, 640}});
  EXPECT_EQ(entry(cells().at(0), "RSSI"), "-110.00 dBm");
}

TEST_F(LTENeighbors, CellGoes30SecondsAfterItWasLastSeen) {
  decodeCells({{2, 640}, {3, 641}});
  decoder.section().setTime(after(10));
  decodeCells({{3, 641}});
  EXPECT_EQ(entry(cells().at(0), "Last Seen"), "2020-01-01 00:00:10 +0000");
  EXPECT_EQ(entry(cells().at(1), "Last Seen"), "2020-01-01 00:00:00 +0000");
  decoder.prepareDisplay(after(29, 999'999'999));
  EXPECT_EQ(places(), "1300/3 1300/2");
  decoder.prepareDisplay(after(30));
  EXPECT_EQ(places(), "1300/3");
  decoder.prepareDisplay(after(40));
  EXPECT_EQ(places(), "");
}

TEST_F(LTENeighbors, PacketsAgeTheOtherCells) {
  decodeCells({{2, 640}});
  decoder.section().setTime(after(30));
  decodeCells({{3, 641}});
  EXPECT_EQ(places(), "1300/3");
}

TEST_F(LTENeighbors, ClockThatStepsBackKeepsCellsFor30SecondsMore) {
  decodeCells({{2, 640}});
  decoder.prepareDisplay(after(-3600));
  decoder.prepareDisplay(after(-3600 + 29));
  EXPECT_EQ(places(), "1300/2");
  decoder.prepareDisplay(after(-3600 + 30));
  EXPECT_EQ(places(), "");
}

TEST_F(LTENeighbors, DisplayWithoutChangeWritesNothing) {
  decodeCells({{2, 640}});
  decoder.section().setTime(after(5));
  decoder.prepareDisplay(after(5));
  EXPECT_EQ(decoder.section().writtenAt("Cells"), start);
}

TEST_F(LTENeighbors, WeakestGoesWhenThereAreMoreThan64) {
  std::vector<std::pair<std::uint32_t, std::uint32_t>> strong;
  for (std::uint32_t cell = 0; cell < 64; ++cell) strong.push_back({cell, 700 + cell});
  decodeCells(strong);
  decodeCells({{100, 699}});
  EXPECT_EQ(cells().size(), 64u);
  EXPECT_EQ(entry(cells().back(), "Physical Cell ID"), "0");
  decodeCells({{100, 800}});
  EXPECT_EQ(cells().size(), 64u);
  EXPECT_EQ(entry(cells().front(), "Physical Cell ID"), "100");
  EXPECT_EQ(entry(cells().back(), "Physical Cell ID"), "1");
  decodeCells({{1, 900}});
  EXPECT_EQ(entry(cells().front(), "Physical Cell ID"), "1");
}

TEST_F(LTENeighbors, ReconnectionKeepsTheCellsAsSeenThen) {
  decodeCells({{2, 640}, {3, 641}});
  lte::Neighbors next;
  next.updateSectionRef(section);
  next.prepareDisplay(after(100));
  next.prepareDisplay(after(129));
  EXPECT_EQ(places(), "1300/3 1300/2");
  BodyBuilder carrier = carrierOf(1);
  putCell(carrier, 0, {.physicalCell = 2, .rsrp = 700});
  next.section().setTime(after(129));
  next.updateWithData_logCode(Packet(packetWith(0xB193, carrier)), 0xB193);
  EXPECT_EQ(places(), "1300/2 1300/3");
  next.prepareDisplay(after(130));
  EXPECT_EQ(places(), "1300/2");
}

TEST_F(LTENeighbors, ReconnectionLeavesOutWhatIsNoCell) {
  section.dictionary()->set("Cells", Value::ofArray({"text", Value::ofDictionary(), Value::ofInteger(1)}));
  decodeCells({{2, 640}});
  EXPECT_EQ(places(), "1300/2");
}

TEST_F(LTENeighbors, ListThatWasClearedIsShownWholeAgain) {
  decodeCells({{2, 640}, {3, 641}});
  section.dictionary()->get("Cells").array()->clear();
  decodeCells({{2, 640}});
  EXPECT_EQ(places(), "1300/3 1300/2");
}

TEST_F(LTENeighbors, LevelsInTheListHaveUnits) {
  NumberFormats formats;
  SectionFormats sectionFormats(formats, "Neighbors");
  decoder.listNumberFormats(sectionFormats);
  const auto unit = [&](const char* name) {
    return formats.unit(std::vector<std::string>{"LTE", "Neighbors", "Cells", "0", name});
  };
  EXPECT_EQ(unit("RSRP"), "dBm");
  EXPECT_EQ(unit("RSRQ"), "dB");
  EXPECT_EQ(unit("RSSI"), "dBm");
  EXPECT_EQ(unit("Downlink Frequency"), "MHz");
}

TEST_F(LTENeighbors, EveryTruncationKeepsWholeCellsOnly) {
  std::vector<std::uint32_t> levels(3, 1280);
  forEachTruncation(
      intraFrequency(1300, levels),
      [&](std::size_t size, const std::vector<std::string>&) {
        const std::size_t payload = size < 13 ? 0 : size - 13;
        // Eight of a neighbor's twelve bytes have values.
        const std::size_t whole = payload < 28 + 8 ? 0 : (payload - 28 - 8) / 12 + 1;
        EXPECT_EQ(cells().size(), std::min<std::size_t>(whole, 3));
        section.dictionary()->remove("Cells");
        decoder.updateSectionRef(Value::ofDictionary());
        decoder.prepareDisplay(start);
        decoder.updateSectionRef(section);
      },
      0xB179);
}

}  // namespace
}  // namespace varnel
