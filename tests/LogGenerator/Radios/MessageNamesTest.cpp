#include <gtest/gtest.h>

#include <cstdint>
#include <string_view>
#include <vector>

#include "LogGenerator/Radios/Messages/NASNames.h"
#include "LogGenerator/Radios/Messages/RRCChannels.h"

namespace varnel {

namespace {

// A message on LTE's channels, numbered as in version 26.
std::string_view onLTE(unsigned number, const Bytes& message) {
  return messageName(*lteRRCChannel(26, number), message);
}
std::string_view onUMTS(unsigned number, const Bytes& message) {
  return messageName(*umtsRRCChannel(number), message);
}
// A message on NR's channels, numbered as in version 28.
std::string_view onNR(unsigned number, const Bytes& message) {
  return messageName(*nrRRCChannel(28, number), message);
}

}  // namespace

TEST(MessageNames, TheFirstBitsOfAnLTEMessageChooseItsName) {
  EXPECT_EQ(onLTE(1, {0xFF}), "MasterInformationBlock");
  EXPECT_EQ(onLTE(3, {0x00}), "SystemInformation");
  EXPECT_EQ(onLTE(3, {0x40}), "SystemInformationBlockType1");
  EXPECT_EQ(onLTE(6, {0x00}), "MBSFNAreaConfiguration-r9");
  EXPECT_EQ(onLTE(6, {0x80}), "MBMSCountingRequest-r10");
  EXPECT_EQ(onLTE(7, {0x40}), "Paging");
  EXPECT_EQ(onLTE(8, {0x60}), "RRCConnectionSetup");
  EXPECT_EQ(onLTE(9, {0x28}), "RRCConnectionRelease");   // 0 0101
  EXPECT_EQ(onLTE(10, {0x40}), "RRCConnectionRequest");  // 0 1
  EXPECT_EQ(onLTE(10, {0x80}), "RRCConnectionResumeRequest-r13");
  EXPECT_EQ(onLTE(10, {0xC0}), "RRCEarlyDataRequest-r15");
  EXPECT_EQ(onLTE(11, {0x08}), "MeasurementReport");                // 0 0001
  EXPECT_EQ(onLTE(11, {0x98}), "RRCConnectionResumeComplete-r13");  // 1 0 0110
}

TEST(MessageNames, ChoicesWithoutAMessageAreSpareOrExtensions) {
  EXPECT_EQ(onLTE(9, {0x70}), "Spare");      // 0 1110
  EXPECT_EQ(onLTE(9, {0x80}), "Extension");  // 1
  EXPECT_EQ(onLTE(11, {0xC0}), "Extension");
}

TEST(MessageNames, AMessageThatEndsWithinItsChoiceIsUnknown) {
  EXPECT_EQ(onLTE(9, {}), "Unknown");
  EXPECT_EQ(onUMTS(3, {0x80, 0, 0, 0}), "Unknown");
}

TEST(MessageNames, AnIntegrityCheckMovesTheChoiceOfAUMTSMessageBy36Bits) {
  EXPECT_EQ(onUMTS(3, {0x38}), "RadioBearerSetup");  // 0 01110
  // 1, 36 bits, then 01110 in bits 37 to 41.
  EXPECT_EQ(onUMTS(3, {0xFF, 0xFF, 0xFF, 0xFF, 0xFB, 0x80}), "RadioBearerSetup");
  EXPECT_EQ(onUMTS(6, {0x00}), "PagingType1");
  EXPECT_EQ(onUMTS(0, {0x20}), "RRCConnectionRequest");
}

TEST(MessageNames, TheFirstBitsOfAnNRMessageChooseItsName) {
  EXPECT_EQ(onNR(1, {0x00}), "MIB");
  EXPECT_EQ(onNR(2, {0x40}), "SIB1");
  EXPECT_EQ(onNR(3, {0x20}), "RRCSetup");
  EXPECT_EQ(onNR(4, {0x00}), "RRCReconfiguration");
  EXPECT_EQ(onNR(4, {0x10}), "RRCRelease");
  EXPECT_EQ(onNR(6, {0x00}), "Paging");
  EXPECT_EQ(onNR(9, {0x08}), "RRCReconfigurationComplete");
  EXPECT_EQ(onNR(9, {0x84}), "DedicatedSIBRequest-r16");
  EXPECT_EQ(onNR(11, {0xFF}), "RRCReconfiguration");
  EXPECT_EQ(onNR(36, {0xFF}), "RadioBearerConfig");
}

TEST(MessageNames, EachVersionOfLTEPacketsNumbersTheChannelsAnew) {
  struct Case {
    unsigned version;
    std::vector<unsigned> numbers;  // BCCH-BCH, BCCH-DL-SCH, MCCH, PCCH, DL-CCCH, DL-DCCH, UL-CCCH, UL-DCCH
  };
  const std::vector<unsigned> first = {1, 2, 3, 4, 5, 6, 7, 8}, second = {8, 9, 10, 11, 12, 13, 14, 15},
                              third = {1, 2, 4, 5, 6, 7, 8, 9}, fourth = {1, 3, 6, 7, 8, 9, 10, 11};
  const Case cases[] = {{2, first},   {3, first},   {4, first},   {5, first},   {6, first},   {7, first},
                        {8, first},   {13, first},  {22, first},  {9, second},  {12, second}, {14, third},
                        {15, third},  {16, third},  {20, third},  {24, third},  {25, third},  {19, fourth},
                        {26, fourth}, {27, fourth}, {29, fourth}, {30, fourth}, {31, fourth}};
  constexpr std::string_view names[] = {"BCCH-BCH", "BCCH-DL-SCH", "MCCH",    "PCCH",
                                        "DL-CCCH",  "DL-DCCH",     "UL-CCCH", "UL-DCCH"};
  for (const Case& one : cases) {
    for (std::size_t i = 0; i < 8; ++i) {
      const MessageChannel* channel = lteRRCChannel(one.version, one.numbers[i]);
      ASSERT_TRUE(channel) << one.version << ' ' << one.numbers[i];
      EXPECT_EQ(channel->name, names[i]) << one.version << ' ' << one.numbers[i];
    }
  }
  EXPECT_EQ(lteRRCChannel(26, 2), nullptr);
  EXPECT_EQ(lteRRCChannel(10, 6), nullptr);
}

TEST(MessageNames, NarrowBandChannelsHaveNumbersOfTheirOwn) {
  constexpr std::string_view names[] = {"BCCH-BCH-NB", "BCCH-DL-SCH-NB", "PCCH-NB",   "DL-CCCH-NB",
                                        "DL-DCCH-NB",  "UL-CCCH-NB",     "UL-DCCH-NB"};
  constexpr unsigned late[] = {45, 46, 47, 48, 49, 50, 52}, early[] = {54, 55, 56, 57, 58, 59, 61};
  for (std::size_t i = 0; i < 7; ++i) {
    for (const unsigned version : {19U, 26U, 27U, 29U, 30U, 31U})
      EXPECT_EQ(lteRRCChannel(version, late[i])->name, names[i]);
    for (const unsigned version : {20U, 24U, 25U})
      EXPECT_EQ(lteRRCChannel(version, early[i])->name, names[i]);
  }
  EXPECT_EQ(lteRRCChannel(26, 51), nullptr);
  EXPECT_EQ(onLTE(48, {0x30}), "RRCConnectionSetup-NB");  // 0 011
}

TEST(MessageNames, NASMessagesOfNRAreNamedByTheirType) {
  EXPECT_EQ(fiveGNASName(Bytes{0x7E, 0x00, 0x41}), "Registration request");
  EXPECT_EQ(fiveGNASName(Bytes{0x2E, 0x01, 0x02, 0xC2}), "PDU session establishment accept");
  EXPECT_EQ(fiveGNASName(Bytes{0x7E, 0x01, 1, 2, 3, 4, 5, 0x7E, 0x00, 0x5E}), "Security mode complete");
  EXPECT_EQ(fiveGNASName(Bytes{0x7E, 0x02, 1, 2, 3, 4, 5, 0x7E, 0x00, 0x5E}),
            "Security Protected (ciphered)");
  EXPECT_EQ(fiveGNASName(Bytes{0x91, 0x02}), "Security Protected (ciphered)");
  EXPECT_EQ(fiveGNASName(Bytes{0x7E}), "Unknown");
}

TEST(MessageNames, NASMessagesOfGSMAndUMTSAreNamedByDiscriminatorAndType) {
  EXPECT_EQ(circuitNASName(Bytes{0x05, 0x08}), "Location Updating Request");
  EXPECT_EQ(circuitNASName(Bytes{0x05, 0x48}), "Location Updating Request");  // with a sequence number
  EXPECT_EQ(circuitNASName(Bytes{0x08, 0x01}), "Attach Request");
  EXPECT_EQ(circuitNASName(Bytes{0x03, 0x05}), "Setup");
  EXPECT_EQ(circuitNASName(Bytes{0x0A, 0x41}), "Activate PDP Context Request");
  EXPECT_EQ(circuitNASName(Bytes{0x09, 0x01}), "CP-DATA");
  EXPECT_EQ(circuitNASName(Bytes{0x05}), "Unknown");
}

TEST(MessageNames, RRMessagesOfGSMAreNamedByType) {
  EXPECT_EQ(gsmRRName(0x1B), "System Information Type 3");
  EXPECT_EQ(gsmRRName(0x3F), "Immediate Assignment");
  EXPECT_EQ(gsmRRName(0xFF), "Unknown");
}

TEST(MessageNames, ABlockNumberMayMeanAnotherBlockInPacketsWithACell) {
  EXPECT_EQ(umtsSystemInformationBlock(0, BlockNumbers::WithoutCell)->message, "MasterInformationBlock");
  EXPECT_EQ(umtsSystemInformationBlock(31, BlockNumbers::WithoutCell)->message, "SysInfoType11bis");
  EXPECT_EQ(umtsSystemInformationBlock(31, BlockNumbers::WithCell)->message, "SysInfoType19");
  EXPECT_EQ(umtsSystemInformationBlock(32, BlockNumbers::WithCell), nullptr);
}

}  // namespace varnel
