#include "LogGenerator/Radios/LTE/ServingCell.h"

#include <gtest/gtest.h>

#include <string>

#include "LogGenerator/NumberFormats.h"
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
  decode(cellMonitorMessage({cellRecord(
      "LTE", "Serving",
      {number("PhysicalCellIdentity", 101), number("TrackingAreaCode", -1), number("MCC", 310)})}));
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
