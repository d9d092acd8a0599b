#include "LogGenerator/KLV/GSMUMTS/KLV_GSMClassIndex.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <sstream>

#include "tests/support/BeginsWith.h"
#include "tests/support/CellMonitorRecords.h"
#include "tests/support/Describe.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"

namespace varnel {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// Sections in the order in which their decoders are created, with how many codes each has. Newer decoders
// come after them.
struct Section {
  const char* name;
  int codes;
};
constexpr Section sections[] = {
    {"Active Set", 1},
    {"Coding Scheme", 0},
    {"GPRS Information", 7},
    {"GSM Serving Cell", 4},
    {"Mobile Allocation", 1},
    {"Neighboring Cells", 3},
    {"PDP Context Info", 1},
    {"Process PS", 2},
    {"UMTS RR Measurement", 0},
    {"Cell Change Counters", 0},
    {"Detected Set", 1},
    {"GSM Set", 1},
    {"Non-Ranked GSM Set", 0},
    {"Process CO", 2},
    {"Serving PLMN", 3},
    {"UMTS Set", 2},
    {"Equivalent PLMN List", 1},
    {"GSM RR Info", 4},
    {"Monitored Set", 1},
    {"Non-Ranked UMTS Set", 0},
    {"Process CS", 2},
    {"UMTS RR Info", 5},
    {"BLER", 1},
    {"Virtual Active Set", 1},
    {"SIM Info", 1},
    {"HSDPA Info", 1},
};

class KLV_GSMClassIndexTest : public testing::Test {
 protected:
  RecordingLog log;
  std::ostringstream standardOutput;
  std::unique_ptr<KLV_GSMClassIndex> index = std::make_unique<KLV_GSMClassIndex>(standardOutput);
};

TEST_F(KLV_GSMClassIndexTest, OwnsTheDecoderOfEachSection) {
  EXPECT_NE(dynamic_cast<ActiveSet*>(index->getClass("Active Set")), nullptr);
  EXPECT_NE(dynamic_cast<CodingScheme*>(index->getClass("Coding Scheme")), nullptr);
  EXPECT_NE(dynamic_cast<GPRSInformation*>(index->getClass("GPRS Information")), nullptr);
  EXPECT_NE(dynamic_cast<GSMServingCell*>(index->getClass("GSM Serving Cell")), nullptr);
  EXPECT_NE(dynamic_cast<MobileAllocation*>(index->getClass("Mobile Allocation")), nullptr);
  EXPECT_NE(dynamic_cast<NeighboringCells*>(index->getClass("Neighboring Cells")), nullptr);
  EXPECT_NE(dynamic_cast<PDPContextList*>(index->getClass("PDP Context Info")), nullptr);
  EXPECT_NE(dynamic_cast<ProcessPS*>(index->getClass("Process PS")), nullptr);
  EXPECT_NE(dynamic_cast<UMTSRRMeasurement*>(index->getClass("UMTS RR Measurement")), nullptr);
  EXPECT_NE(dynamic_cast<CellChangeCounters*>(index->getClass("Cell Change Counters")), nullptr);
  EXPECT_NE(dynamic_cast<DetectedSet*>(index->getClass("Detected Set")), nullptr);
  EXPECT_NE(dynamic_cast<GSMSet*>(index->getClass("GSM Set")), nullptr);
  EXPECT_NE(dynamic_cast<NonRankedGSMSet*>(index->getClass("Non-Ranked GSM Set")), nullptr);
  EXPECT_NE(dynamic_cast<ProcessCO*>(index->getClass("Process CO")), nullptr);
  EXPECT_NE(dynamic_cast<ServingPLMN*>(index->getClass("Serving PLMN")), nullptr);
  EXPECT_NE(dynamic_cast<UMTSSet*>(index->getClass("UMTS Set")), nullptr);
  EXPECT_NE(dynamic_cast<EquivalentPLMNList*>(index->getClass("Equivalent PLMN List")), nullptr);
  EXPECT_NE(dynamic_cast<GSMRRInfo*>(index->getClass("GSM RR Info")), nullptr);
  EXPECT_NE(dynamic_cast<MonitoredSet*>(index->getClass("Monitored Set")), nullptr);
  EXPECT_NE(dynamic_cast<NonRankedUMTSSet*>(index->getClass("Non-Ranked UMTS Set")), nullptr);
  EXPECT_NE(dynamic_cast<ProcessCS*>(index->getClass("Process CS")), nullptr);
  EXPECT_NE(dynamic_cast<UMTSRRInfo*>(index->getClass("UMTS RR Info")), nullptr);
  EXPECT_NE(dynamic_cast<BLER*>(index->getClass("BLER")), nullptr);
  EXPECT_NE(dynamic_cast<VirtualActiveSet*>(index->getClass("Virtual Active Set")), nullptr);
  EXPECT_NE(dynamic_cast<SimInfo*>(index->getClass("SIM Info")), nullptr);
  EXPECT_NE(dynamic_cast<HSDPAInformation*>(index->getClass("HSDPA Info")), nullptr);
}

TEST_F(KLV_GSMClassIndexTest, CreatesItsDecodersInTheOrderOfTheirSections) {
  std::vector<std::string> lines;
  for (const Section& section : sections) lines.push_back("<4>Array Count: " + std::to_string(section.codes));
  EXPECT_THAT(log.takeTexts(), BeginsWithElements(lines));
}

TEST_F(KLV_GSMClassIndexTest, EachDecoderHasItsNumberOfCodesAndIsSubscribedToAllOfThem) {
  for (const Section& section : sections) {
    Base* decoder = index->getClass(section.name);
    ASSERT_NE(decoder, nullptr) << section.name;
    EXPECT_EQ(decoder->getSectionName(), section.name);
    EXPECT_EQ(decoder->getLogCodeArray().size(), static_cast<std::size_t>(section.codes)) << section.name;
    for (const std::uint32_t code : decoder->getLogCodeArray()) {
      EXPECT_THAT(index->getSubscribers(code), testing::Contains(decoder)) << section.name << " " << code;
    }
  }
}

TEST_F(KLV_GSMClassIndexTest, LogCodesStandInTheOrderOfTheirDecoders) {
  EXPECT_THAT(
      index->getAllLogCodes(),
      BeginsWith("16762", "20981", "28981", "20982", "20987", "20989", "20980", "20791", "20788", "20598",
                 "16711681", "20984", "20991", "16711682", "28976", "28978", "16389", "28977", "29008",
                 "20780", "20594", "16677", "16433", "16679", "16727", "16662", "16711680", "16929"));
}

TEST_F(KLV_GSMClassIndexTest, ASharedCodeHasItsSubscribersInTheOrderOfTheirCreation) {
  const auto decoder = [this](std::string_view section) { return index->getClass(section); };
  EXPECT_THAT(index->getSubscribers(0x417A),
              BeginsWith(decoder("Active Set"), decoder("Detected Set"), decoder("Monitored Set"),
                         decoder("Virtual Active Set")));
  EXPECT_THAT(index->getSubscribers(0x4005), BeginsWith(decoder("GSM Set"), decoder("UMTS Set")));
  EXPECT_THAT(index->getSubscribers(0x5137),
              BeginsWith(decoder("GPRS Information"), decoder("GSM Serving Cell"),
                         decoder("Neighboring Cells"), decoder("GSM RR Info")));
  EXPECT_THAT(index->getSubscribers(0x51F6), BeginsWith(decoder("GPRS Information"), decoder("GSM RR Info")));
  EXPECT_THAT(index->getSubscribers(0x7131), BeginsWith(decoder("Process CO"), decoder("Process CS")));
  EXPECT_THAT(index->getSubscribers(0x7132), BeginsWith(decoder("Process PS"), decoder("Process CO"),
                                                        decoder("Serving PLMN"), decoder("Process CS")));
  EXPECT_THAT(index->getSubscribers(0x7135),
              BeginsWith(decoder("GPRS Information"), decoder("Serving PLMN")));
  EXPECT_THAT(index->getSubscribers(0xFF0001),
              BeginsWith(decoder("GSM Serving Cell"), decoder("Neighboring Cells"), decoder("Serving PLMN"),
                         decoder("UMTS Set"), decoder("UMTS RR Info")));
}

TEST_F(KLV_GSMClassIndexTest, EachOtherCodeHasItsSubscriberFirst) {
  const std::map<std::uint32_t, const char*> owners = {
      {0x51F5, "GPRS Information"},     {0x51FB, "GPRS Information"},
      {0x51FD, "GPRS Information"},     {0x51F4, "GPRS Information"},
      {0x5134, "GSM Serving Cell"},     {0x5076, "GSM Serving Cell"},
      {0x51F8, "Mobile Allocation"},    {0x51FF, "Neighboring Cells"},
      {0xFF0002, "PDP Context Info"},   {0x7130, "Process PS"},
      {0x7150, "Equivalent PLMN List"}, {0x512C, "GSM RR Info"},
      {0x5072, "GSM RR Info"},          {0x4125, "UMTS RR Info"},
      {0x4031, "UMTS RR Info"},         {0x4127, "UMTS RR Info"},
      {0x4157, "UMTS RR Info"},         {0x4116, "BLER"},
      {0xFF0000, "SIM Info"},           {0x4221, "HSDPA Info"}};
  for (const auto& [code, section] : owners) {
    EXPECT_THAT(index->getSubscribers(code), BeginsWith(index->getClass(section))) << section << " " << code;
  }
  EXPECT_THAT(index->getSubscribers(0x10000), IsEmpty());
}

TEST_F(KLV_GSMClassIndexTest, DestructionWritesItsOwnLineAndThenTheBases) {
  EXPECT_EQ(standardOutput.str(), "");
  index.reset();
  EXPECT_EQ(standardOutput.str(), "Deallocing KLV_GSMClassIndex\nDeallocing ClassIndex\n");
}

// An index whose decoders have sections; packets go to those subscribers of their code in turn.
class KLV_GSMSharedCodesTest : public KLV_GSMClassIndexTest {
 protected:
  KLV_GSMSharedCodesTest() {
    for (const char* name : {"Active Set", "Detected Set", "Monitored Set", "Virtual Active Set", "GSM Set",
                             "UMTS Set", "Neighboring Cells"}) {
      put(name, Value::ofArray({"old"}));
    }
    for (const char* name : {"GPRS Information", "GSM Serving Cell", "GSM RR Info", "Process CO",
                             "Process CS", "Process PS", "Serving PLMN", "UMTS RR Info"}) {
      put(name, Value::ofDictionary());
    }
    log.take();
  }

  void put(const char* name, Value section) {
    index->getClass(name)->updateSectionRef(section);
    display[name] = section;
  }
  void dispatch(std::uint32_t logCode, const Bytes& packet) {
    for (Base* subscriber : index->getSubscribers(logCode)) {
      if (!display.contains(std::string(subscriber->getSectionName()))) continue;
      subscriber->updateWithData_logCode(Packet(packet), logCode);
    }
  }
  std::string shown(const std::string& name) { return described(display[name]); }

  std::map<std::string, Value> display;
};

TEST_F(KLV_GSMSharedCodesTest, ACellSetOfCount0EmptiesAllFourSets) {
  dispatch(0x417A, PacketBuilder(0x417A, 16).bytes());
  EXPECT_EQ(shown("Active Set"), "[]");
  EXPECT_EQ(shown("Detected Set"), "[]");
  EXPECT_EQ(shown("Monitored Set"), "[]");
  EXPECT_EQ(shown("Virtual Active Set"), "[]");
  EXPECT_EQ(shown("UMTS Set"), R"(["old"])");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<4>ActiveSet", "<4>DetectedSet", "<4>MonitoredSet", "<4>VirtualActiveSet"));
}

TEST_F(KLV_GSMSharedCodesTest, ACellSetFillsTheActiveSetAloneOfTheFour) {
  dispatch(0x417A, PacketBuilder(0x417A, 75).u16(13, 0xFE00).u8(15, 1).u16(23, 77).u32(63, 60000).bytes());
  EXPECT_EQ(shown("Active Set"), R"([{Scrambling Code: "77", RSCP: "-116 dB", Energy Per Chip: "-10 dB"}])");
  EXPECT_EQ(shown("Detected Set"), "[]");
  EXPECT_EQ(shown("Monitored Set"), "[]");
  EXPECT_EQ(shown("Virtual Active Set"), "[]");
}

TEST_F(KLV_GSMSharedCodesTest, ARankingFillsBothSetsFromTheSameBytes) {
  dispatch(0x4005, PacketBuilder(0x4005, 25)
                       .u8(13, 1)
                       .u8(14, 1)
                       .u16(15, 10564)
                       .u16(17, 511)
                       .u8(19, 0xB0)
                       .u16(20, 0xFFA6)
                       .u8(22, 0xF1)
                       .u16(23, 12)
                       .bytes());
  EXPECT_EQ(shown("GSM Set"), R"([{ARFCN: "10564", BSIC: "511", RSSI: "-80 dBm", Ranking Value: "-90"}])");
  EXPECT_EQ(shown("UMTS Set"), R"([{Scrambling Code: "511", RSCP: "-101 dB", )"
                               R"(Energy Per Chip: "-7.500000 dB", Downlink Frequency: "10564", )"
                               R"(Ranking Value: "12", Rank Cell RSCP: "-90 dB"}])");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>GSMSet", "<4>UMTSSet"));
}

TEST_F(KLV_GSMSharedCodesTest, AMeasurementFillsFourSectionsAndItsFirstQualityShowsInTwoReadings) {
  dispatch(0x5137, PacketBuilder(0x5137, 43)
                       .u8(15, 60)
                       .u32(16, 0xFFFFFFF6)
                       .u32(20, 0x00010002)
                       .u8(26, 1)
                       .u8(28, 1)
                       .u16(29, 62)
                       .u8(31, 12)
                       .u32(32, 5)
                       .bytes());
  EXPECT_EQ(shown("GPRS Information"), R"({Cell Reselect Hysteresis: "Applied"})");
  EXPECT_EQ(shown("GSM Serving Cell"), R"({RSSI: "60 dBm", C1 Value: "65526", C2 Value: "2"})");
  EXPECT_EQ(shown("Neighboring Cells"), R"([{ARFCN: "62", RSSI: "12", C1 Value: "5"}])");
  EXPECT_EQ(shown("GSM RR Info"),
            R"({Serving Rx Level: "60", Rx Quality Full: "-10", Rx Quality Sub: "65538"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<4>GPRSInformation", "<4>GSMServingCell", "<4>NeighboringCells", "<4>GSMRRInfo"));
}

TEST_F(KLV_GSMSharedCodesTest, ATimersPacketShowsItsByte16InBothSections) {
  dispatch(0x51F6, PacketBuilder(0x51F6, 24).u8(15, 8).u8(16, 60).bytes());
  EXPECT_EQ(shown("GPRS Information"),
            R"({T3192: "?? ms", Access Burst Type: "8-bit format", DRX Timer Max: "60"})");
  EXPECT_EQ(shown("GSM RR Info"), R"({DRX Used: "60 sec"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>GPRSInformation", "<4>GSMRRInfo"));
}

TEST_F(KLV_GSMSharedCodesTest, AMobilityPacketFillsTwoProcessesWithOneTraceText) {
  dispatch(0x7131, PacketBuilder(0x7131, 16).u8(13, 19).u8(14, 8).u8(15, 1).bytes());
  EXPECT_EQ(shown("Process CO"), R"({MM State: "MM_IDLE"})");
  EXPECT_EQ(shown("Process CS"),
            R"({MM State: "MM_IDLE", MM Sub State: "MM_NORMAL_SERVICE", LU Reject Cause: "NOT_UPDATED"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>ProcessCS", "<4>ProcessCS"));
}

TEST_F(KLV_GSMSharedCodesTest, ARegistrationPacketUpdatesFourSectionsAtOnce) {
  dispatch(0x7132, PacketBuilder(0x7132, 16).u8(13, 2).u8(14, 1).bytes());
  EXPECT_EQ(shown("Process PS"), R"({MM Service State: "REG_STATE_REGISTERING"})");
  EXPECT_EQ(shown("Process CO"), R"({MM Service State: "REG_STATE_REGISTERING"})");
  EXPECT_EQ(shown("Serving PLMN"), R"({PLMN Sel Mod: "Manual"})");
  EXPECT_EQ(shown("Process CS"), R"({MM Service State: "REG_STATE_REGISTERING"})");
  EXPECT_THAT(log.takeTexts(),
              ElementsAre("<4>ProcessPS", "<4>ProcessCS", "<4>Serving PLMN", "<4>ProcessCS"));
}

TEST_F(KLV_GSMSharedCodesTest, ANetworkPacketFillsTwoSections) {
  dispatch(0x7135,
           PacketBuilder(0x7135, 32).u8(13, 2).u8(14, 1).u8(15, 0x62).u8(16, 0xF2).u8(17, 0x10).bytes());
  EXPECT_EQ(shown("GPRS Information"), R"({Network Operating Mode: "Class 3"})");
  EXPECT_EQ(shown("Serving PLMN"),
            R"({Mobile Country Code: "262", Mobile Network Code: "01 ", Location Area Code: "0", )"
            R"(Routing Area Code: "0", Service Type: "CS_ONLY"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>GPRSInformation", "<4>Serving PLMN"));
}

TEST_F(KLV_GSMSharedCodesTest, CellMonitorRecordsFillFiveSections) {
  dispatch(0xFF0001,
           cellMonitorMessage(
               {cellRecord("GSM", "Neighbor", {number("ARFCN", 62), number("RSSI", -43)}),
                cellRecord("UMTS", "Neighbor",
                           {number("UARFCN", 10564), number("ScramblingCode", 77), number("RSCP", -95),
                            number("EcN0", 32767)}),
                cellRecord("UMTS", "Serving",
                           {number("MCC", 262), number("MNC", 1), number("LAC", 5), number("CellIdentity", 6),
                            number("UARFCN", 10565), number("ScramblingCode", 78)}),
                cellRecord("GSM", "Serving",
                           {number("MCC", 310), number("MNC", 2), number("LAC", 7), number("CellIdentity", 8),
                            number("ARFCN", 63)})}));
  EXPECT_EQ(shown("GSM Serving Cell"), R"({Cell ID: "8", ARFCN: "63"})");
  EXPECT_EQ(shown("Neighboring Cells"), R"([{ARFCN: "62", RSSI: "-86 dBm"}])");
  EXPECT_EQ(shown("Serving PLMN"),
            R"({Mobile Country Code: "262", Mobile Network Code: "1", Location Area Code: "5"})");
  EXPECT_EQ(shown("UMTS Set"),
            R"([{UARFCN: "10564", Scrambling Code: "77", RSCP: "-95 dBm", Energy Per Chip: ""}])");
  EXPECT_EQ(shown("UMTS RR Info"), R"({Cell ID: "6", UARFCN: "10565", Scrambling Code: "78"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>GSMServingCell", "<4>NeighboringCells", "<4>Serving PLMN",
                                           "<4>UMTSSet", "<4>UMTSRRInfo"));
}

TEST_F(KLV_GSMSharedCodesTest, TheNextMessageInTheSamePlaceAndOfTheSameSizeIsShownByAllFive) {
  const auto message = [](std::int64_t value) {
    return cellMonitorMessage({cellRecord("GSM", "Serving",
                                          {number("MCC", value), number("MNC", value), number("LAC", value),
                                           number("CellIdentity", value), number("ARFCN", value)}),
                               cellRecord("GSM", "Neighbor", {number("ARFCN", value), number("RSSI", value)}),
                               cellRecord("UMTS", "Neighbor",
                                          {number("UARFCN", value), number("ScramblingCode", value),
                                           number("RSCP", value), number("EcN0", value)}),
                               cellRecord("UMTS", "Serving",
                                          {number("CellIdentity", value), number("UARFCN", value),
                                           number("ScramblingCode", value)})});
  };
  Bytes packet = message(1);
  dispatch(0xFF0001, packet);
  const Bytes next = message(2);
  ASSERT_EQ(next.size(), packet.size());
  std::copy(next.begin(), next.end(), packet.begin());
  dispatch(0xFF0001, packet);
  EXPECT_EQ(shown("GSM Serving Cell"), R"({Cell ID: "2", ARFCN: "2"})");
  EXPECT_EQ(shown("Neighboring Cells"), R"([{ARFCN: "2", RSSI: "4 dBm"}])");
  EXPECT_EQ(shown("Serving PLMN"),
            R"({Mobile Country Code: "2", Mobile Network Code: "2", Location Area Code: "2"})");
  EXPECT_EQ(shown("UMTS Set"),
            R"([{UARFCN: "2", Scrambling Code: "2", RSCP: "2 dBm", Energy Per Chip: "2 dB"}])");
  EXPECT_EQ(shown("UMTS RR Info"), R"({Cell ID: "2", UARFCN: "2", Scrambling Code: "2"})");
}

TEST_F(KLV_GSMSharedCodesTest, AFailedParseIsReportedByAllFiveAndEmptiesTwoLists) {
  for (const char* name : {"GSM Serving Cell", "Serving PLMN", "UMTS RR Info"}) {
    display[name].dictionary()->set("Old", "row");
  }
  dispatch(0xFF0001, serverMessageOfText(0xFF0001, "no property list"));
  EXPECT_EQ(shown("Neighboring Cells"), "[]");
  EXPECT_EQ(shown("UMTS Set"), "[]");
  EXPECT_EQ(shown("GSM Serving Cell"), R"({Old: "row"})");
  EXPECT_EQ(shown("Serving PLMN"), R"({Old: "row"})");
  EXPECT_EQ(shown("UMTS RR Info"), R"({Old: "row"})");
  EXPECT_EQ(shown("Active Set"), R"(["old"])");
  std::vector<std::string> lines;
  for (const char* trace : {"GSMServingCell", "NeighboringCells", "Serving PLMN", "UMTSSet", "UMTSRRInfo"}) {
    lines.push_back(std::string("<4>") + trace);
    lines.emplace_back("<3>Cell Info Array data could not be constructed");
    lines.emplace_back("<3>Failed to get Cell Array\n");
  }
  EXPECT_EQ(log.takeTexts(), lines);
}

TEST_F(KLV_GSMSharedCodesTest, AnEmptyArrayEmptiesTwoListsAndWritesTheTraceLinesOnly) {
  for (const char* name : {"GSM Serving Cell", "Serving PLMN", "UMTS RR Info"}) {
    display[name].dictionary()->set("Old", "row");
  }
  dispatch(0xFF0001, cellMonitorMessage({}));
  EXPECT_EQ(shown("Neighboring Cells"), "[]");
  EXPECT_EQ(shown("UMTS Set"), "[]");
  EXPECT_EQ(shown("GSM Serving Cell"), R"({Old: "row"})");
  EXPECT_EQ(shown("Serving PLMN"), R"({Old: "row"})");
  EXPECT_EQ(shown("UMTS RR Info"), R"({Old: "row"})");
  EXPECT_THAT(log.takeTexts(), ElementsAre("<4>GSMServingCell", "<4>NeighboringCells", "<4>Serving PLMN",
                                           "<4>UMTSSet", "<4>UMTSRRInfo"));
}

}  // namespace
}  // namespace varnel
