#include "LogGenerator/Radios/LTE/ServingCell.h"

#include <gtest/gtest.h>

#include <string>

#include "LogGenerator/NumberFormats.h"
#include "tests/LogGenerator/Radios/Modem/ModemReports.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel::lte {
namespace {

constexpr std::size_t header = 13;

// Cell 101 on EARFCN 1300 (band 3, 1815.0 MHz).
PacketBuilder masterInformation(std::uint16_t physicalCell = 101, std::uint32_t earfcn = 1300) {
  return PacketBuilder(0xB0C1, header + 11)
      .u8(header, 2)
      .u16(header + 1, physicalCell)
      .u32(header + 3, earfcn)
      .u16(header + 7, 517)
      .u8(header + 9, 4)
      .u8(header + 10, 75);
}

// The same cell with EARFCN 19300 (1720.0 MHz) upward, cell identity 0x1234567, network 262-02.
PacketBuilder servingCell(std::uint16_t physicalCell = 101, std::uint32_t earfcn = 1300) {
  return PacketBuilder(0xB0C2, header + 29)
      .u8(header, 3)
      .u16(header + 1, physicalCell)
      .u32(header + 3, earfcn)
      .u32(header + 7, 19300)
      .u8(header + 11, 75)
      .u8(header + 12, 50)
      .u32(header + 13, 0x1234567)
      .u16(header + 17, 30000)
      .u32(header + 19, 3)
      .u16(header + 23, 262)
      .u8(header + 25, 2)
      .u16(header + 26, 2)
      .u8(header + 28, 1);
}

class LTEServingCellRows : public testing::Test {
 protected:
  LTEServingCellRows() { decoder.updateSectionRef(section); }

  void decode(const Bytes& packet) {
    const Packet view{packet};
    decoder.updateWithData_logCode(view, packet[0] == 1 ? view.u16(3) : 0xFF0000u | view.u16(3));
  }
  std::string shown(std::string_view entry) const {
    const std::string* text = section.dictionary()->get(entry).string();
    return text ? *text : "no text";
  }

  RecordingLog log;
  Value section = Value::ofDictionary();
  ServingCell decoder;
};

TEST_F(LTEServingCellRows, AMasterInformationBlockShowsTheCellWithItsFrequencyAndBand) {
  decode(masterInformation().bytes());
  EXPECT_EQ(described(section),
            R"({Version: "2", Physical Cell ID: "101", EARFCN: "1300", System Frame Number: "517", )"
            R"(Antennas: "4", Downlink Bandwidth: "15 MHz", Downlink Frequency: "1815.0 MHz", Band: "3"})");
}

TEST_F(LTEServingCellRows, AServingCellShowsItsIdentityAndBothDirections) {
  decode(servingCell().bytes());
  EXPECT_EQ(described(section),
            R"({Version: "3", Physical Cell ID: "101", EARFCN: "1300", Uplink EARFCN: "19300", )"
            R"(Downlink Bandwidth: "15 MHz", Uplink Bandwidth: "10 MHz", Cell Identity: "19088743", )"
            R"(eNB: "74565", Cell: "103", Tracking Area Code: "30000", Band: "3", Allowed Access: "1", )"
            R"(Downlink Frequency: "1815.0 MHz", Uplink Frequency: "1720.0 MHz", PLMN: "262-02"})");
}

TEST_F(LTEServingCellRows, PacketsOfOneCellKeepEachOthersRows) {
  decode(servingCell().bytes());
  decode(masterInformation().bytes());
  EXPECT_EQ(shown("PLMN"), "262-02");
  EXPECT_EQ(shown("Antennas"), "4");
  decode(servingCell().bytes());
  EXPECT_EQ(shown("Antennas"), "4");
}

TEST_F(LTEServingCellRows, AnotherCellEmptiesWhatItsPacketDoesNotTell) {
  decode(servingCell().bytes());
  decode(masterInformation().bytes());
  decode(masterInformation(102).bytes());
  for (const char* entry : {"PLMN", "Tracking Area Code", "Cell Identity", "eNB", "Cell", "Uplink EARFCN",
                            "Uplink Frequency", "Uplink Bandwidth", "Allowed Access"})
    EXPECT_EQ(shown(entry), "") << entry;
  EXPECT_EQ(shown("Antennas"), "4");
  EXPECT_EQ(shown("Band"), "3");

  decode(servingCell(103).bytes());
  EXPECT_EQ(shown("PLMN"), "262-02");
  EXPECT_EQ(shown("Antennas"), "");
  EXPECT_EQ(shown("System Frame Number"), "");
}

TEST_F(LTEServingCellRows, AnotherChannelIsAnotherCell) {
  decode(servingCell().bytes());
  decode(masterInformation(101, 5230).bytes());
  EXPECT_EQ(shown("PLMN"), "");
  EXPECT_EQ(shown("Band"), "13");
  EXPECT_EQ(shown("Downlink Frequency"), "751.0 MHz");
}

TEST_F(LTEServingCellRows, AfterAReconnectionTheShownCellCounts) {
  decode(servingCell().bytes());
  ServingCell next;
  next.updateSectionRef(section);
  next.updateWithData_logCode(Packet(masterInformation().bytes()), 0xB0C1);
  EXPECT_EQ(shown("PLMN"), "262-02");
  next.updateWithData_logCode(Packet(masterInformation(7).bytes()), 0xB0C1);
  EXPECT_EQ(shown("PLMN"), "");
}

TEST_F(LTEServingCellRows, TheCellMonitorShowsItsServingLTECell) {
  decode(cellMonitorMessage({cellRecord("LTE", "Neighbor", {number("PhysicalCellIdentity", 9)}),
                             cellRecord("UMTS", "Serving", {number("CellIdentity", 9)}),
                             cellRecord("LTE", "Serving",
                                        {number("TrackingAreaCode", 30001), number("CellIdentity", 0x1234567),
                                         number("PhysicalCellIdentity", 101), number("BandInfo", 3),
                                         number("UARFCN", 1300), number("MCC", 310), number("MNC", 260)})}));
  EXPECT_EQ(described(section),
            R"({Physical Cell ID: "101", EARFCN: "1300", Downlink Frequency: "1815.0 MHz", Band: "3", )"
            R"(Tracking Area Code: "30001", Cell Identity: "19088743", eNB: "74565", Cell: "103", )"
            R"(PLMN: "310-260"})");
}

TEST_F(LTEServingCellRows, TheCellMonitorsNetworkCodeBelow100HasTwoDigits) {
  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("MCC", 1), number("MNC", 1)})}));
  EXPECT_EQ(shown("PLMN"), "001-01");
}

TEST_F(LTEServingCellRows, TheCellMonitorLeavesWhatItDoesNotKnow) {
  decode(servingCell().bytes());
  decode(cellMonitorMessage({cellRecord("LTE", "Serving",
                                        {number("PhysicalCellIdentity", 101), number("UARFCN", 1300),
                                         number("TrackingAreaCode", -1), number("MCC", 310)})}));
  EXPECT_EQ(shown("Tracking Area Code"), "30000");
  EXPECT_EQ(shown("PLMN"), "262-02");
}

TEST_F(LTEServingCellRows, AnotherCellOfTheCellMonitorEmptiesTheRest) {
  decode(servingCell().bytes());
  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("PhysicalCellIdentity", 5)})}));
  EXPECT_EQ(shown("Physical Cell ID"), "5");
  EXPECT_EQ(shown("EARFCN"), "");
  EXPECT_EQ(shown("Uplink Bandwidth"), "");
}

TEST_F(LTEServingCellRows, ARecordWithTheCellIdentityAloneTellsWhetherItIsTheSameCell) {
  decode(servingCell().bytes());
  decode(masterInformation().bytes());
  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("CellIdentity", 0x1234567)})}));
  EXPECT_EQ(shown("Physical Cell ID"), "101");
  EXPECT_EQ(shown("Antennas"), "4");

  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("CellIdentity", 0x1234566)})}));
  for (const char* entry : {"Physical Cell ID", "EARFCN", "Downlink Frequency", "Band", "Downlink Bandwidth",
                            "PLMN", "Tracking Area Code", "Antennas", "System Frame Number"})
    EXPECT_EQ(shown(entry), "") << entry;
  EXPECT_EQ(shown("Cell Identity"), "19088742");
  EXPECT_EQ(shown("eNB"), "74565");
  EXPECT_EQ(shown("Cell"), "102");
}

TEST_F(LTEServingCellRows, ARecordThatDoesNotTellItsCellStandsAlone) {
  for (const auto& entries :
       {number("TrackingAreaCode", 30000), number("PhysicalCellIdentity", 101), number("UARFCN", 1300)}) {
    decode(servingCell().bytes());
    decode(cellMonitorMessage({cellRecord("LTE", "Serving", {entries})}));
    for (const char* entry : {"Cell Identity", "eNB", "Cell", "PLMN", "Uplink Bandwidth"})
      EXPECT_EQ(shown(entry), "") << entries.key << ", " << entry;
  }
}

TEST_F(LTEServingCellRows, APacketAfterARecordWithoutItsChannelKeepsNothingOfTheRecord) {
  decode(cellMonitorMessage({cellRecord("LTE", "Serving",
                                        {number("CellIdentity", 0x7654321), number("TrackingAreaCode", 9),
                                         number("MCC", 310), number("MNC", 260)})}));
  decode(masterInformation().bytes());
  EXPECT_EQ(shown("Physical Cell ID"), "101");
  for (const char* entry : {"Cell Identity", "eNB", "Cell", "Tracking Area Code", "PLMN"})
    EXPECT_EQ(shown(entry), "") << entry;
}

TEST_F(LTEServingCellRows, AnotherCellIdentityOnTheSameChannelIsAnotherCell) {
  decode(masterInformation().bytes());
  decode(servingCell().bytes());
  decode(servingCell().u32(header + 13, 0x7654321).bytes());
  EXPECT_EQ(shown("Cell Identity"), "124076833");
  EXPECT_EQ(shown("Antennas"), "");
}

TEST_F(LTEServingCellRows, WhatIsEmptiedGetsNoRowsThatWereNotThere) {
  decode(masterInformation().bytes());
  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("CellIdentity", 7)})}));
  EXPECT_EQ(section.dictionary()->get("Access Barring").string(), nullptr);
}

TEST_F(LTEServingCellRows, TheNetworkOfTheCellMonitorKeepsTheThreeDigitsThatAPacketTold) {
  decode(servingCell().u16(header + 23, 310).u8(header + 25, 3).u16(header + 26, 12).bytes());
  EXPECT_EQ(shown("PLMN"), "310-012");
  const Bytes record = cellMonitorMessage(
      {cellRecord("LTE", "Serving", {number("CellIdentity", 5), number("MCC", 310), number("MNC", 12)})});
  decode(record);
  EXPECT_EQ(shown("PLMN"), "310-012");
  decode(cellMonitorMessage({cellRecord("LTE", "Serving", {number("MCC", 310), number("MNC", 13)})}));
  EXPECT_EQ(shown("PLMN"), "310-13");
}

class LTEServingCellWithReports : public LTEServingCellRows {
 protected:
  LTEServingCellWithReports() { reporting.updateSectionRef(section); }

  std::string shownNetwork(std::uint16_t country, std::uint16_t network) {
    const Bytes record =
        cellMonitorMessage({cellRecord("LTE", "Serving", {number("MCC", country), number("MNC", network)})});
    reporting.updateWithData_logCode(Packet(record), 0xFF0001);
    reporting.prepareDisplay({});
    return shown("PLMN");
  }

  CellMonitorReader records;
  modem::ReportReader reports;
  ServingCell reporting{records, reports};
};

TEST_F(LTEServingCellWithReports, TheModemReportTellsHowManyDigitsTheNetworkHas) {
  EXPECT_EQ(shownNetwork(310, 12), "310-12") << "before any report";
  const Bytes report = modemReportOf({{"PLMN", "310012"}});
  reports.read(Packet(report));
  reporting.prepareDisplay({});
  EXPECT_EQ(shown("PLMN"), "310-012");
  EXPECT_EQ(shownNetwork(310, 12), "310-012");
  EXPECT_EQ(shownNetwork(310, 13), "310-13") << "another network";
  EXPECT_EQ(shownNetwork(310, 260), "310-260");
}

TEST_F(LTEServingCellWithReports, AReportWithTwoDigitsOrOfAnUnknownVersionChangesNothing) {
  Value unknown = dictionaryOf({{"Version", Value::ofInteger(2)}, {"PLMN", "310012"}});
  for (const Bytes& report : {modemReportOf({{"PLMN", "31012"}}), serverMessage(0xFF0003, unknown)}) {
    reports.read(Packet(report));
    EXPECT_EQ(shownNetwork(310, 12), "310-12");
  }
}

TEST_F(LTEServingCellRows, ACellMonitorPacketThatIsNoListChangesNothing) {
  decode(serverMessageOfText(0xFF0001, "no list"));
  EXPECT_EQ(described(section), "{}");
}

TEST_F(LTEServingCellRows, ShortPacketsChangeNothing) {
  for (const Bytes& whole : {masterInformation().bytes(), servingCell().bytes()}) {
    for (std::size_t size = header; size < whole.size(); ++size)
      decode(Bytes(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)));
  }
  EXPECT_EQ(described(section), "{}");
}

TEST_F(LTEServingCellRows, NarrowbandShowsItsOwnRows) {
  decode(PacketBuilder(0xB0C1, header + 18)
             .u8(header, 17)
             .u16(header + 1, 101)
             .u32(header + 3, 1300)
             .u16(header + 7, 900)
             .u8(header + 13, 1)
             .u8(header + 14, 2)
             .u16(header + 15, 3)
             .u8(header + 17, 1)
             .bytes());
  EXPECT_EQ(described(section),
            R"({Version: "17", Physical Cell ID: "101", EARFCN: "1300", System Frame Number: "900", )"
            R"(Access Barring: "1", Operation Mode: "Guard band", Raster Offset: "7.5 kHz", )"
            R"(Antennas: "1", Downlink Frequency: "1815.0 MHz", Band: "3"})");
}

TEST_F(LTEServingCellRows, RowsWithAUnitListTheirFormats) {
  NumberFormats formats;
  SectionFormats sectionFormats(formats, "Serving Cell");
  decoder.listNumberFormats(sectionFormats);
  EXPECT_EQ(formats.unit(std::vector<std::string>{"Serving Cell", "Downlink Frequency"}), "MHz");
  EXPECT_EQ(formats.number(std::vector<std::string>{"Serving Cell", "Uplink Bandwidth"}, "1.4 MHz"), "1.4");
  EXPECT_EQ(formats.unit(std::vector<std::string>{"Serving Cell", "Raster Offset"}), "kHz");
}

}  // namespace
}  // namespace varnel::lte
