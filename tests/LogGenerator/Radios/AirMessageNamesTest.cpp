#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
#include <string>
#include <string_view>

#include "LogGenerator/Radios/AirMessage.h"
#include "tests/LogGenerator/Radios/MessagePackets.h"

namespace varnel {

namespace {

// What the reader makes of a packet, in one text: "DL-DCCH Downlink Paging".
std::string summary(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  if (!reading.message) return "no message";
  const AirMessage& message = *reading.message;
  std::string text(message.channel);
  text += std::string(" ") + std::string(nameOf(message.direction));
  return text + " " + std::string(message.name);
}

std::string nameIn(const Bytes& packet, std::uint32_t logCode) {
  AirMessageReader reader;
  const AirMessageReading reading = reader.read(Packet(packet), logCode);
  return reading.message ? std::string(reading.message->name) : "no message";
}

// The bits that a message begins with, and its name.
struct Coded {
  std::string_view bits;
  std::string_view name;
};

// Three bytes follow the bits of the choice.
Bytes messageOf(std::string_view bits) {
  Bytes message = bytesOfBits(bits);
  message.insert(message.end(), {0, 0, 0});
  return message;
}

void expectOfLTE(unsigned version, std::uint8_t number, std::string_view channel,
                 std::initializer_list<Coded> messages) {
  for (const Coded& coded : messages) {
    EXPECT_EQ(summary(lteRRC(version).channel(number).message(messageOf(coded.bits)).packet(), 0xB0C0),
              std::string(channel) + " " + std::string(coded.name))
        << coded.bits;
  }
}

void expectOfNR(unsigned version, std::uint8_t number, std::string_view channel,
                std::initializer_list<Coded> messages) {
  for (const Coded& coded : messages) {
    EXPECT_EQ(summary(nrRRC(version).channel(number).message(messageOf(coded.bits)).packet(), 0xB821),
              std::string(channel) + " " + std::string(coded.name))
        << coded.bits;
  }
}

void expectOfUMTS(std::uint8_t number, std::string_view channel, std::initializer_list<Coded> messages) {
  for (const Coded& coded : messages) {
    EXPECT_EQ(summary(umtsRRC(number, messageOf(coded.bits)), 0x412F),
              std::string(channel) + " " + std::string(coded.name))
        << coded.bits;
  }
}

struct Typed {
  std::uint8_t type;
  std::string_view name;
};

}  // namespace

// TS 36.331 6.2.1: a message begins with one bit for the choice c1 or messageClassExtension.

TEST(AirMessageNames, OfLTEBroadcastChannels) {
  expectOfLTE(26, 1, "BCCH-BCH Downlink", {{"0", "MasterInformationBlock"}, {"1", "MasterInformationBlock"}});
  expectOfLTE(26, 3, "BCCH-DL-SCH Downlink",
              {{"0 0", "SystemInformation"}, {"0 1", "SystemInformationBlockType1"}, {"1", "Extension"}});
}

TEST(AirMessageNames, OfLTEMulticastControlChannel) {
  expectOfLTE(26, 6, "MCCH Downlink",
              {{"0", "MBSFNAreaConfiguration-r9"}, {"1 0", "MBMSCountingRequest-r10"}, {"1 1", "Extension"}});
}

TEST(AirMessageNames, OfLTEPagingChannel) {
  expectOfLTE(26, 7, "PCCH Downlink", {{"0", "Paging"}, {"1", "Extension"}});
}

TEST(AirMessageNames, OfLTEDownlinkCommonChannel) {
  expectOfLTE(26, 8, "DL-CCCH Downlink",
              {{"0 00", "RRCConnectionReestablishment"},
               {"0 01", "RRCConnectionReestablishmentReject"},
               {"0 10", "RRCConnectionReject"},
               {"0 11", "RRCConnectionSetup"},
               {"1 0 00", "RRCEarlyDataComplete-r15"},
               {"1 0 01", "Spare"},
               {"1 0 11", "Spare"},
               {"1 1", "Extension"}});
}

TEST(AirMessageNames, OfLTEDownlinkDedicatedChannel) {
  expectOfLTE(26, 9, "DL-DCCH Downlink",
              {{"0 0000", "CSFBParametersResponseCDMA2000"},
               {"0 0001", "DLInformationTransfer"},
               {"0 0010", "HandoverFromEUTRAPreparationRequest"},
               {"0 0011", "MobilityFromEUTRACommand"},
               {"0 0100", "RRCConnectionReconfiguration"},
               {"0 0101", "RRCConnectionRelease"},
               {"0 0110", "SecurityModeCommand"},
               {"0 0111", "UECapabilityEnquiry"},
               {"0 1000", "CounterCheck"},
               {"0 1001", "UEInformationRequest-r9"},
               {"0 1010", "LoggedMeasurementConfiguration-r10"},
               {"0 1011", "RNReconfiguration-r10"},
               {"0 1100", "RRCConnectionResume-r13"},
               {"0 1101", "DLDedicatedMessageSegment-r16"},
               {"0 1110", "Spare"},
               {"0 1111", "Spare"},
               {"1", "Extension"}});
}

TEST(AirMessageNames, OfLTEUplinkCommonChannel) {
  expectOfLTE(26, 10, "UL-CCCH Uplink",
              {{"0 0", "RRCConnectionReestablishmentRequest"},
               {"0 1", "RRCConnectionRequest"},
               {"1 0", "RRCConnectionResumeRequest-r13"},
               {"1 1 0 00", "RRCEarlyDataRequest-r15"},
               {"1 1 0 01", "Spare"},
               {"1 1 0 11", "Spare"},
               {"1 1 1", "Extension"}});
}

TEST(AirMessageNames, OfLTEUplinkDedicatedChannel) {
  expectOfLTE(26, 11, "UL-DCCH Uplink",
              {{"0 0000", "CSFBParametersRequestCDMA2000"},
               {"0 0001", "MeasurementReport"},
               {"0 0010", "RRCConnectionReconfigurationComplete"},
               {"0 0011", "RRCConnectionReestablishmentComplete"},
               {"0 0100", "RRCConnectionSetupComplete"},
               {"0 0101", "SecurityModeComplete"},
               {"0 0110", "SecurityModeFailure"},
               {"0 0111", "UECapabilityInformation"},
               {"0 1000", "ULHandoverPreparationTransfer"},
               {"0 1001", "ULInformationTransfer"},
               {"0 1010", "CounterCheckResponse"},
               {"0 1011", "UEInformationResponse-r9"},
               {"0 1100", "ProximityIndication-r9"},
               {"0 1101", "RNReconfigurationComplete-r10"},
               {"0 1110", "MBMSCountingResponse-r10"},
               {"0 1111", "InterFreqRSTDMeasurementIndication-r10"},
               {"1 0 0000", "UEAssistanceInformation-r11"},
               {"1 0 0001", "InDeviceCoexIndication-r11"},
               {"1 0 0010", "MBMSInterestIndication-r11"},
               {"1 0 0011", "SCGFailureInformation-r12"},
               {"1 0 0100", "SidelinkUEInformation-r12"},
               {"1 0 0101", "WLANConnectionStatusReport-r13"},
               {"1 0 0110", "RRCConnectionResumeComplete-r13"},
               {"1 0 0111", "ULInformationTransferMRDC-r15"},
               {"1 0 1000", "SCGFailureInformationNR-r15"},
               {"1 0 1001", "MeasReportAppLayer-r15"},
               {"1 0 1010", "FailureInformation-r15"},
               {"1 0 1011", "ULDedicatedMessageSegment-r16"},
               {"1 0 1100", "PURConfigurationRequest-r16"},
               {"1 0 1101", "FailureInformation-r16"},
               {"1 0 1110", "MCGFailureInformation-r16"},
               {"1 0 1111", "ULInformationTransferIRAT-r16"},
               {"1 1", "Extension"}});
}

// TS 36.331 6.7.1

TEST(AirMessageNames, OfNarrowBandBroadcastAndPagingChannels) {
  expectOfLTE(26, 45, "BCCH-BCH-NB Downlink", {{"0", "MasterInformationBlock-NB"}});
  expectOfLTE(
      26, 46, "BCCH-DL-SCH-NB Downlink",
      {{"0 0", "SystemInformation-NB"}, {"0 1", "SystemInformationBlockType1-NB"}, {"1", "Extension"}});
  expectOfLTE(26, 47, "PCCH-NB Downlink", {{"0", "Paging-NB"}, {"1", "Extension"}});
}

TEST(AirMessageNames, OfNarrowBandCommonChannels) {
  expectOfLTE(26, 48, "DL-CCCH-NB Downlink",
              {{"0 000", "RRCConnectionReestablishment-NB"},
               {"0 001", "RRCConnectionReestablishmentReject"},
               {"0 010", "RRCConnectionReject-NB"},
               {"0 011", "RRCConnectionSetup-NB"},
               {"0 100", "RRCEarlyDataComplete-NB-r15"},
               {"0 101", "Spare"},
               {"0 111", "Spare"},
               {"1", "Extension"}});
  expectOfLTE(26, 50, "UL-CCCH-NB Uplink",
              {{"0 00", "RRCConnectionReestablishmentRequest-NB"},
               {"0 01", "RRCConnectionRequest-NB"},
               {"0 10", "RRCConnectionResumeRequest-NB"},
               {"0 11", "RRCEarlyDataRequest-NB-r15"},
               {"1", "Extension"}});
}

TEST(AirMessageNames, OfNarrowBandDedicatedChannels) {
  expectOfLTE(26, 49, "DL-DCCH-NB Downlink",
              {{"0 000", "DLInformationTransfer-NB"},
               {"0 001", "RRCConnectionReconfiguration-NB"},
               {"0 010", "RRCConnectionRelease-NB"},
               {"0 011", "SecurityModeCommand"},
               {"0 100", "UECapabilityEnquiry-NB"},
               {"0 101", "RRCConnectionResume-NB"},
               {"0 110", "UEInformationRequest-NB-r16"},
               {"0 111", "Spare"},
               {"1", "Extension"}});
  expectOfLTE(26, 52, "UL-DCCH-NB Uplink",
              {{"0 0000", "RRCConnectionReconfigurationComplete-NB"},
               {"0 0001", "RRCConnectionReestablishmentComplete-NB"},
               {"0 0010", "RRCConnectionSetupComplete-NB"},
               {"0 0011", "SecurityModeComplete"},
               {"0 0100", "SecurityModeFailure"},
               {"0 0101", "UECapabilityInformation-NB"},
               {"0 0110", "ULInformationTransfer-NB"},
               {"0 0111", "RRCConnectionResumeComplete-NB"},
               {"0 1000", "UEInformationResponse-NB-r16"},
               {"0 1001", "PURConfigurationRequest-NB-r16"},
               {"0 1010", "Spare"},
               {"0 1111", "Spare"},
               {"1", "Extension"}});
}

// TS 38.331 6.2.1

TEST(AirMessageNames, OfNRBroadcastAndPagingChannels) {
  expectOfNR(26, 1, "BCCH-BCH Downlink", {{"0", "MIB"}, {"1", "Extension"}});
  expectOfNR(26, 2, "BCCH-DL-SCH Downlink",
             {{"0 0", "SystemInformation"}, {"0 1", "SIB1"}, {"1", "Extension"}});
  expectOfNR(26, 6, "PCCH Downlink", {{"0 0", "Paging"}, {"0 1", "Spare"}, {"1", "Extension"}});
  expectOfNR(26, 5, "MCCH Downlink",
             {{"0 0", "MBSBroadcastConfiguration-r17"}, {"0 1", "Spare"}, {"1", "Extension"}});
}

TEST(AirMessageNames, OfNRCommonChannels) {
  expectOfNR(26, 3, "DL-CCCH Downlink",
             {{"0 00", "RRCReject"},
              {"0 01", "RRCSetup"},
              {"0 10", "Spare"},
              {"0 11", "Spare"},
              {"1", "Extension"}});
  expectOfNR(26, 7, "UL-CCCH Uplink",
             {{"0 00", "RRCSetupRequest"},
              {"0 01", "RRCResumeRequest"},
              {"0 10", "RRCReestablishmentRequest"},
              {"0 11", "RRCSystemInfoRequest"},
              {"1", "Extension"}});
  expectOfNR(26, 8, "UL-CCCH1 Uplink",
             {{"0 00", "RRCResumeRequest1"}, {"0 01", "Spare"}, {"0 11", "Spare"}, {"1", "Extension"}});
}

TEST(AirMessageNames, OfNRDownlinkDedicatedChannel) {
  expectOfNR(26, 4, "DL-DCCH Downlink",
             {{"0 0000", "RRCReconfiguration"},
              {"0 0001", "RRCResume"},
              {"0 0010", "RRCRelease"},
              {"0 0011", "RRCReestablishment"},
              {"0 0100", "SecurityModeCommand"},
              {"0 0101", "DLInformationTransfer"},
              {"0 0110", "UECapabilityEnquiry"},
              {"0 0111", "CounterCheck"},
              {"0 1000", "MobilityFromNRCommand"},
              {"0 1001", "DLDedicatedMessageSegment-r16"},
              {"0 1010", "UEInformationRequest-r16"},
              {"0 1011", "DLInformationTransferMRDC-r16"},
              {"0 1100", "LoggedMeasurementConfiguration-r16"},
              {"0 1101", "Spare"},
              {"0 1111", "Spare"},
              {"1", "Extension"}});
}

TEST(AirMessageNames, OfNRUplinkDedicatedChannel) {
  expectOfNR(26, 9, "UL-DCCH Uplink",
             {{"0 0000", "MeasurementReport"},
              {"0 0001", "RRCReconfigurationComplete"},
              {"0 0010", "RRCSetupComplete"},
              {"0 0011", "RRCReestablishmentComplete"},
              {"0 0100", "RRCResumeComplete"},
              {"0 0101", "SecurityModeComplete"},
              {"0 0110", "SecurityModeFailure"},
              {"0 0111", "ULInformationTransfer"},
              {"0 1000", "LocationMeasurementIndication"},
              {"0 1001", "UECapabilityInformation"},
              {"0 1010", "CounterCheckResponse"},
              {"0 1011", "UEAssistanceInformation"},
              {"0 1100", "FailureInformation"},
              {"0 1101", "ULInformationTransferMRDC"},
              {"0 1110", "SCGFailureInformation"},
              {"0 1111", "SCGFailureInformationEUTRA"},
              {"1 0 0000", "ULDedicatedMessageSegment-r16"},
              {"1 0 0001", "DedicatedSIBRequest-r16"},
              {"1 0 0010", "MCGFailureInformation-r16"},
              {"1 0 0011", "UEInformationResponse-r16"},
              {"1 0 0100", "SidelinkUEInformationNR-r16"},
              {"1 0 0101", "ULInformationTransferIRAT-r16"},
              {"1 0 0110", "IABOtherInformation-r16"},
              {"1 0 0111", "MBSInterestIndication-r17"},
              {"1 0 1000", "UEPositioningAssistanceInfo-r17"},
              {"1 0 1001", "MeasurementReportAppLayer-r17"},
              {"1 0 1111", "Spare"},
              {"1 1", "Extension"}});
}

TEST(AirMessageNames, OfNRTypesWithoutAChannel) {
  // Whatever the bits are: no choice comes first.
  expectOfNR(26, 11, " Downlink", {{"0", "RRCReconfiguration"}, {"1111 1111", "RRCReconfiguration"}});
  expectOfNR(26, 12, " Uplink",
             {{"0", "RRCReconfigurationComplete"}, {"1111 1111", "RRCReconfigurationComplete"}});
}

// TS 25.331 11.2: one bit tells whether an integrity check of 36 bits comes before the choice.

TEST(AirMessageNames, OfUMTSUplinkCommonChannel) {
  expectOfUMTS(0, "UL-CCCH Uplink",
               {{"0 00", "CellUpdate"}, {"0 01", "RRCConnectionRequest"}, {"0 10", "URAUpdate"}});
}

TEST(AirMessageNames, OfUMTSUplinkDedicatedChannel) {
  expectOfUMTS(1, "UL-DCCH Uplink",
               {{"0 00000", "ActiveSetUpdateComplete"},
                {"0 00001", "ActiveSetUpdateFailure"},
                {"0 00010", "CellChangeOrderFromUTRANFailure"},
                {"0 00011", "CounterCheckResponse"},
                {"0 00100", "HandoverToUTRANComplete"},
                {"0 00101", "InitialDirectTransfer"},
                {"0 00110", "HandoverFromUTRANFailure"},
                {"0 00111", "MeasurementControlFailure"},
                {"0 01000", "MeasurementReport"},
                {"0 01001", "PhysicalChannelReconfigurationComplete"},
                {"0 01010", "PhysicalChannelReconfigurationFailure"},
                {"0 01011", "RadioBearerReconfigurationComplete"},
                {"0 01100", "RadioBearerReconfigurationFailure"},
                {"0 01101", "RadioBearerReleaseComplete"},
                {"0 01110", "RadioBearerReleaseFailure"},
                {"0 01111", "RadioBearerSetupComplete"},
                {"0 10000", "RadioBearerSetupFailure"},
                {"0 10001", "RRCConnectionReleaseComplete"},
                {"0 10010", "RRCConnectionSetupComplete"},
                {"0 10011", "RRCStatus"},
                {"0 10100", "SecurityModeComplete"},
                {"0 10101", "SecurityModeFailure"},
                {"0 10110", "SignallingConnectionReleaseIndication"},
                {"0 10111", "TransportChannelReconfigurationComplete"},
                {"0 11000", "TransportChannelReconfigurationFailure"},
                {"0 11001", "TransportFormatCombinationControlFailure"},
                {"0 11010", "UECapabilityInformation"},
                {"0 11011", "UplinkDirectTransfer"},
                {"0 11100", "UTRANMobilityInformationConfirm"},
                {"0 11101", "UTRANMobilityInformationFailure"},
                {"0 11110", "MBMSModificationRequest"},
                {"0 11111 0000", "UEInformationResponse"},
                {"0 11111 0001", "Spare"}});
}

TEST(AirMessageNames, OfUMTSDownlinkCommonChannel) {
  expectOfUMTS(2, "DL-CCCH Downlink",
               {{"0 000", "CellUpdateConfirm-CCCH"},
                {"0 001", "RRCConnectionReject"},
                {"0 010", "RRCConnectionRelease-CCCH"},
                {"0 011", "RRCConnectionSetup"},
                {"0 100", "URAUpdateConfirm-CCCH"},
                {"0 110", "Spare"},
                {"0 111", "Spare"}});
}

TEST(AirMessageNames, OfUMTSDownlinkDedicatedChannel) {
  expectOfUMTS(3, "DL-DCCH Downlink",
               {{"0 00000", "ActiveSetUpdate"},
                {"0 00001", "AssistanceDataDelivery"},
                {"0 00010", "CellChangeOrderFromUTRAN"},
                {"0 00011", "CellUpdateConfirm"},
                {"0 00100", "CounterCheck"},
                {"0 00101", "DownlinkDirectTransfer"},
                {"0 00110", "HandoverFromUTRANCommand-GSM"},
                {"0 00111", "HandoverFromUTRANCommand-CDMA2000"},
                {"0 01000", "MeasurementControl"},
                {"0 01001", "PagingType2"},
                {"0 01010", "PhysicalChannelReconfiguration"},
                {"0 01011", "PhysicalSharedChannelAllocation"},
                {"0 01100", "RadioBearerReconfiguration"},
                {"0 01101", "RadioBearerRelease"},
                {"0 01110", "RadioBearerSetup"},
                {"0 01111", "RRCConnectionRelease"},
                {"0 10000", "SecurityModeCommand"},
                {"0 10001", "SignallingConnectionRelease"},
                {"0 10010", "TransportChannelReconfiguration"},
                {"0 10011", "TransportFormatCombinationControl"},
                {"0 10100", "UECapabilityEnquiry"},
                {"0 10101", "UECapabilityInformationConfirm"},
                {"0 10110", "UplinkPhysicalChannelControl"},
                {"0 10111", "URAUpdateConfirm"},
                {"0 11000", "UTRANMobilityInformation"},
                {"0 11001", "HandoverFromUTRANCommand-GERANIu"},
                {"0 11010", "MBMSModifiedServicesInformation"},
                {"0 11011", "ETWSPrimaryNotificationWithSecurity"},
                {"0 11100", "HandoverFromUTRANCommand-EUTRA"},
                {"0 11101", "UEInformationRequest"},
                {"0 11110", "LoggingMeasurementConfiguration"},
                {"0 11111", "Spare"}});
}

TEST(AirMessageNames, OfUMTSMessagesBehindAnIntegrityCheck) {
  constexpr std::string_view check = "1 11111111111111110000000011111111 1010 ";
  const std::string text(check);
  EXPECT_EQ(nameIn(umtsRRC(3, messageOf(text + "01111")), 0x412F), "RRCConnectionRelease");
  EXPECT_EQ(nameIn(umtsRRC(1, messageOf(text + "01000")), 0x412F), "MeasurementReport");
  EXPECT_EQ(nameIn(umtsRRC(2, messageOf(text + "010")), 0x412F), "RRCConnectionRelease-CCCH");
  EXPECT_EQ(nameIn(umtsRRC(0, messageOf(text + "10")), 0x412F), "URAUpdate");
}

TEST(AirMessageNames, OfUMTSChannelsWithoutAnIntegrityCheck) {
  expectOfUMTS(5, "BCCH-FACH Downlink",
               {{"00", "SystemInformation-FACH"},
                {"01", "SystemInformationChangeIndication"},
                {"10", "Spare"},
                {"11", "Spare"}});
  expectOfUMTS(6, "PCCH Downlink", {{"0", "PagingType1"}, {"1", "Spare"}});
  expectOfUMTS(7, "MCCH Downlink",
               {{"0000", "MBMSAccessInformation"},
                {"0001", "MBMSCommonPTMRBInformation"},
                {"0010", "MBMSCurrentCellPTMRBInformation"},
                {"0011", "MBMSGeneralInformation"},
                {"0100", "MBMSModifiedServicesInformation"},
                {"0101", "MBMSNeighbouringCellPTMRBInformation"},
                {"0110", "MBMSUnmodifiedServicesInformation"},
                {"0111", "Spare"},
                {"1111", "Spare"}});
  expectOfUMTS(8, "MSCH Downlink", {{"00", "MBMSSchedulingInformation"}, {"01", "Spare"}, {"11", "Spare"}});
  expectOfUMTS(4, "BCCH-BCH Downlink", {{"0", "SystemInformation-BCH"}, {"1", "SystemInformation-BCH"}});
}

TEST(AirMessageNames, AMessageThatEndsInItsChoiceIsUnknown) {
  // The presence and the integrity check have 37 bits, the choice has five.
  EXPECT_EQ(nameIn(umtsRRC(3, {0x80, 0, 0, 0, 0}), 0x412F), "Unknown");
  EXPECT_EQ(nameIn(umtsRRC(3, {0x80, 0, 0, 0, 0, 0}), 0x412F), "ActiveSetUpdate");
}

// TS 24.301 table 9.8.1

TEST(AirMessageNames, OfLTEMobilityManagement) {
  constexpr Typed messages[] = {{0x41, "Attach request"},
                                {0x42, "Attach accept"},
                                {0x43, "Attach complete"},
                                {0x44, "Attach reject"},
                                {0x45, "Detach request"},
                                {0x46, "Detach accept"},
                                {0x48, "Tracking area update request"},
                                {0x49, "Tracking area update accept"},
                                {0x4A, "Tracking area update complete"},
                                {0x4B, "Tracking area update reject"},
                                {0x4C, "Extended service request"},
                                {0x4D, "Control plane service request"},
                                {0x4E, "Service reject"},
                                {0x4F, "Service accept"},
                                {0x50, "GUTI reallocation command"},
                                {0x51, "GUTI reallocation complete"},
                                {0x52, "Authentication request"},
                                {0x53, "Authentication response"},
                                {0x54, "Authentication reject"},
                                {0x55, "Identity request"},
                                {0x56, "Identity response"},
                                {0x5C, "Authentication failure"},
                                {0x5D, "Security mode command"},
                                {0x5E, "Security mode complete"},
                                {0x5F, "Security mode reject"},
                                {0x60, "EMM status"},
                                {0x61, "EMM information"},
                                {0x62, "Downlink NAS transport"},
                                {0x63, "Uplink NAS transport"},
                                {0x64, "CS service notification"},
                                {0x68, "Downlink generic NAS transport"},
                                {0x69, "Uplink generic NAS transport"},
                                {0x40, "Unknown"},
                                {0x47, "Unknown"},
                                {0x65, "Unknown"},
                                {0xC1, "Unknown"}};
  for (const Typed& message : messages) {
    EXPECT_EQ(nameIn(lteNAS(0xB0EC, {0x07, message.type, 0}), 0xB0EC), message.name)
        << unsigned{message.type};
  }
}

// TS 24.301 table 9.8.2

TEST(AirMessageNames, OfLTESessionManagement) {
  constexpr Typed messages[] = {{0xC1, "Activate default EPS bearer context request"},
                                {0xC2, "Activate default EPS bearer context accept"},
                                {0xC3, "Activate default EPS bearer context reject"},
                                {0xC5, "Activate dedicated EPS bearer context request"},
                                {0xC6, "Activate dedicated EPS bearer context accept"},
                                {0xC7, "Activate dedicated EPS bearer context reject"},
                                {0xC9, "Modify EPS bearer context request"},
                                {0xCA, "Modify EPS bearer context accept"},
                                {0xCB, "Modify EPS bearer context reject"},
                                {0xCD, "Deactivate EPS bearer context request"},
                                {0xCE, "Deactivate EPS bearer context accept"},
                                {0xD0, "PDN connectivity request"},
                                {0xD1, "PDN connectivity reject"},
                                {0xD2, "PDN disconnect request"},
                                {0xD3, "PDN disconnect reject"},
                                {0xD4, "Bearer resource allocation request"},
                                {0xD5, "Bearer resource allocation reject"},
                                {0xD6, "Bearer resource modification request"},
                                {0xD7, "Bearer resource modification reject"},
                                {0xD9, "ESM information request"},
                                {0xDA, "ESM information response"},
                                {0xDB, "Notification"},
                                {0xDC, "ESM dummy message"},
                                {0xE8, "ESM status"},
                                {0xE9, "Remote UE report"},
                                {0xEA, "Remote UE report response"},
                                {0xEB, "ESM data transport"},
                                {0xC0, "Unknown"},
                                {0xC4, "Unknown"},
                                {0x41, "Unknown"}};
  for (const Typed& message : messages) {
    EXPECT_EQ(nameIn(lteNAS(0xB0E2, {0x52, 0x01, message.type}), 0xB0E2), message.name)
        << unsigned{message.type};
  }
}

// TS 24.301 9.3.1: 1 and 3 are integrity protected, 2 and 4 ciphered as well.
TEST(AirMessageNames, AProtectedMessageHasTheNameOfTheMessageInIt) {
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x17, 1, 2, 3, 4, 5, 0x07, 0x42}), 0xB0EA), "Attach accept");
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x37, 1, 2, 3, 4, 5, 0x07, 0x5D}), 0xB0EA), "Security mode command");
  EXPECT_EQ(nameIn(lteNAS(0xB0EB, {0x17, 1, 2, 3, 4, 5, 0x52, 0x01, 0xDA}), 0xB0EB),
            "ESM information response");
}

TEST(AirMessageNames, ACipheredMessageIsSecurityProtected) {
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x27, 1, 2, 3, 4, 5, 0x91, 0x42}), 0xB0EA),
            "Security Protected (ciphered)");
  EXPECT_EQ(nameIn(lteNAS(0xB0EB, {0x47, 1, 2, 3, 4, 5, 0x91, 0x42}), 0xB0EB),
            "Security Protected (ciphered)");
}

TEST(AirMessageNames, AProtectedMessageThatEndsBeforeItsTypeIsUnknown) {
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x17}), 0xB0EA), "Unknown");
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x17, 1, 2, 3, 4, 5}), 0xB0EA), "Unknown");
  EXPECT_EQ(nameIn(lteNAS(0xB0EA, {0x17, 1, 2, 3, 4, 5, 0x07}), 0xB0EA), "Unknown");
  EXPECT_EQ(nameIn(lteNAS(0xB0EC, {0x07}), 0xB0EC), "Unknown");
  EXPECT_EQ(nameIn(lteNAS(0xB0E2, {0x52, 0x01}), 0xB0E2), "Unknown");
}

TEST(AirMessageNames, AServiceRequestOfLTEHasNoMessageType) {
  EXPECT_EQ(nameIn(lteNAS(0xB0ED, {0xC7, 0x41, 0x42, 0x43}), 0xB0ED), "Service request");
  EXPECT_EQ(nameIn(lteNAS(0xB0EB, {0xC7, 0x00, 0x00, 0x00}), 0xB0EB), "Service request");
}

TEST(AirMessageNames, AProtectedSessionMessageWithoutADiscriminatorIsSecurityProtected) {
  EXPECT_EQ(nameIn(lteNAS(0xB0E0, {0x9B, 0x01, 0xC1, 0x55}), 0xB0E0), "Security Protected (ciphered)");
  EXPECT_EQ(nameIn(lteNAS(0xB0E1, {0x9B, 0x01, 0xC1, 0x55}), 0xB0E1), "Security Protected (ciphered)");
}

TEST(AirMessageNames, APlainMessageOfAnotherProtocolIsUnknown) {
  for (const std::uint32_t logCode : {0xB0E2U, 0xB0E3U, 0xB0ECU, 0xB0EDU})
    EXPECT_EQ(nameIn(lteNAS(logCode, {0x05, 0x41, 0xC1}), logCode), "Unknown") << logCode;
}

TEST(AirMessageNames, AProtectedSessionMessageThatCanBeReadHasItsName) {
  EXPECT_EQ(nameIn(lteNAS(0xB0E0, {0x62, 0x07, 0xC5, 0x55}), 0xB0E0),
            "Activate dedicated EPS bearer context request");
}

// TS 24.501 tables 9.7.1 and 9.7.2

TEST(AirMessageNames, OfNRMobilityManagement) {
  constexpr Typed messages[] = {{0x41, "Registration request"},
                                {0x42, "Registration accept"},
                                {0x43, "Registration complete"},
                                {0x44, "Registration reject"},
                                {0x45, "Deregistration request (UE originating)"},
                                {0x46, "Deregistration accept (UE originating)"},
                                {0x47, "Deregistration request (UE terminated)"},
                                {0x48, "Deregistration accept (UE terminated)"},
                                {0x4C, "Service request"},
                                {0x4D, "Service reject"},
                                {0x4E, "Service accept"},
                                {0x4F, "Control plane service request"},
                                {0x50, "Network slice-specific authentication command"},
                                {0x51, "Network slice-specific authentication complete"},
                                {0x52, "Network slice-specific authentication result"},
                                {0x54, "Configuration update command"},
                                {0x55, "Configuration update complete"},
                                {0x56, "Authentication request"},
                                {0x57, "Authentication response"},
                                {0x58, "Authentication reject"},
                                {0x59, "Authentication failure"},
                                {0x5A, "Authentication result"},
                                {0x5B, "Identity request"},
                                {0x5C, "Identity response"},
                                {0x5D, "Security mode command"},
                                {0x5E, "Security mode complete"},
                                {0x5F, "Security mode reject"},
                                {0x64, "5GMM status"},
                                {0x65, "Notification"},
                                {0x66, "Notification response"},
                                {0x67, "UL NAS transport"},
                                {0x68, "DL NAS transport"},
                                {0x40, "Unknown"},
                                {0x49, "Unknown"}};
  for (const Typed& message : messages) {
    EXPECT_EQ(nameIn(nrNAS(0xB80A, {0x7E, 0x00, message.type}), 0xB80A), message.name)
        << unsigned{message.type};
  }
}

TEST(AirMessageNames, OfNRSessionManagement) {
  constexpr Typed messages[] = {{0xC1, "PDU session establishment request"},
                                {0xC2, "PDU session establishment accept"},
                                {0xC3, "PDU session establishment reject"},
                                {0xC5, "PDU session authentication command"},
                                {0xC6, "PDU session authentication complete"},
                                {0xC7, "PDU session authentication result"},
                                {0xC9, "PDU session modification request"},
                                {0xCA, "PDU session modification reject"},
                                {0xCB, "PDU session modification command"},
                                {0xCC, "PDU session modification complete"},
                                {0xCD, "PDU session modification command reject"},
                                {0xD1, "PDU session release request"},
                                {0xD2, "PDU session release reject"},
                                {0xD3, "PDU session release command"},
                                {0xD4, "PDU session release complete"},
                                {0xD6, "5GSM status"},
                                {0xC4, "Unknown"}};
  for (const Typed& message : messages) {
    EXPECT_EQ(nameIn(nrNAS(0xB800, {0x2E, 0x05, 0x01, message.type}), 0xB800), message.name)
        << unsigned{message.type};
  }
}

TEST(AirMessageNames, OfProtectedMessagesOfNR) {
  EXPECT_EQ(nameIn(nrNAS(0xB808, {0x7E, 0x01, 1, 2, 3, 4, 5, 0x7E, 0x00, 0x42}), 0xB808),
            "Registration accept");
  EXPECT_EQ(nameIn(nrNAS(0xB808, {0x7E, 0x03, 1, 2, 3, 4, 5, 0x7E, 0x00, 0x5D}), 0xB808),
            "Security mode command");
  EXPECT_EQ(nameIn(nrNAS(0xB808, {0x7E, 0x02, 1, 2, 3, 4, 5, 0x99, 0x00, 0x42}), 0xB808),
            "Security Protected (ciphered)");
  EXPECT_EQ(nameIn(nrNAS(0xB809, {0x7E, 0x04, 1, 2, 3, 4, 5, 0x99, 0x00, 0x42}), 0xB809),
            "Security Protected (ciphered)");
  EXPECT_EQ(nameIn(nrNAS(0xB808, {0x7E, 0x01, 1, 2, 3, 4, 5, 0x7E, 0x00}), 0xB808), "Unknown");
  EXPECT_EQ(nameIn(nrNAS(0xB80A, {0x7E, 0x00}), 0xB80A), "Unknown");
  EXPECT_EQ(nameIn(nrNAS(0xB800, {0x2E, 0x05, 0x01}), 0xB800), "Unknown");
}

// TS 44.018 table 10.4.1

TEST(AirMessageNames, OfGSMRadioResources) {
  constexpr Typed messages[] = {{0x3F, "Immediate Assignment"},
                                {0x39, "Immediate Assignment Extended"},
                                {0x3A, "Immediate Assignment Reject"},
                                {0x35, "Ciphering Mode Command"},
                                {0x32, "Ciphering Mode Complete"},
                                {0x2E, "Assignment Command"},
                                {0x29, "Assignment Complete"},
                                {0x2F, "Assignment Failure"},
                                {0x2B, "Handover Command"},
                                {0x2C, "Handover Complete"},
                                {0x28, "Handover Failure"},
                                {0x2D, "Physical Information"},
                                {0x0D, "Channel Release"},
                                {0x0A, "Partial Release"},
                                {0x0F, "Partial Release Complete"},
                                {0x21, "Paging Request Type 1"},
                                {0x22, "Paging Request Type 2"},
                                {0x24, "Paging Request Type 3"},
                                {0x27, "Paging Response"},
                                {0x18, "System Information Type 8"},
                                {0x19, "System Information Type 1"},
                                {0x1A, "System Information Type 2"},
                                {0x1B, "System Information Type 3"},
                                {0x1C, "System Information Type 4"},
                                {0x1D, "System Information Type 5"},
                                {0x1E, "System Information Type 6"},
                                {0x1F, "System Information Type 7"},
                                {0x02, "System Information Type 2bis"},
                                {0x03, "System Information Type 2ter"},
                                {0x07, "System Information Type 2quater"},
                                {0x05, "System Information Type 5bis"},
                                {0x06, "System Information Type 5ter"},
                                {0x04, "System Information Type 9"},
                                {0x00, "System Information Type 13"},
                                {0x10, "Channel Mode Modify"},
                                {0x17, "Channel Mode Modify Acknowledge"},
                                {0x12, "RR Status"},
                                {0x14, "Frequency Redefinition"},
                                {0x15, "Measurement Report"},
                                {0x16, "Classmark Change"},
                                {0x13, "Classmark Enquiry"},
                                {0x34, "GPRS Suspension Request"},
                                {0xFF, "Unknown"}};
  for (const Typed& message : messages) {
    EXPECT_EQ(nameIn(gsmRR(0x80, message.type, {0x06, message.type}), 0x512F), message.name)
        << unsigned{message.type};
  }
}

// TS 24.008 tables 10.2 to 10.4a, TS 24.011 8.1.3

TEST(AirMessageNames, OfCircuitAndPacketServices) {
  const struct {
    std::uint8_t discriminator, type;
    std::string_view name;
  } messages[] = {{5, 0x01, "IMSI Detach Indication"},
                  {5, 0x02, "Location Updating Accept"},
                  {5, 0x04, "Location Updating Reject"},
                  {5, 0x08, "Location Updating Request"},
                  {5, 0x11, "Authentication Reject"},
                  {5, 0x12, "Authentication Request"},
                  {5, 0x14, "Authentication Response"},
                  {5, 0x1C, "Authentication Failure"},
                  {5, 0x18, "Identity Request"},
                  {5, 0x19, "Identity Response"},
                  {5, 0x1A, "TMSI Reallocation Command"},
                  {5, 0x1B, "TMSI Reallocation Complete"},
                  {5, 0x21, "CM Service Accept"},
                  {5, 0x22, "CM Service Reject"},
                  {5, 0x23, "CM Service Abort"},
                  {5, 0x24, "CM Service Request"},
                  {5, 0x28, "CM Re-establishment Request"},
                  {5, 0x29, "Abort"},
                  {5, 0x31, "MM Status"},
                  {5, 0x32, "MM Information"},
                  {3, 0x01, "Alerting"},
                  {3, 0x02, "Call Proceeding"},
                  {3, 0x03, "Progress"},
                  {3, 0x05, "Setup"},
                  {3, 0x07, "Connect"},
                  {3, 0x08, "Call Confirmed"},
                  {3, 0x0E, "Emergency Setup"},
                  {3, 0x0F, "Connect Acknowledge"},
                  {3, 0x25, "Disconnect"},
                  {3, 0x2A, "Release Complete"},
                  {3, 0x2D, "Release"},
                  {3, 0x3D, "Status"},
                  {8, 0x01, "Attach Request"},
                  {8, 0x02, "Attach Accept"},
                  {8, 0x03, "Attach Complete"},
                  {8, 0x04, "Attach Reject"},
                  {8, 0x05, "Detach Request"},
                  {8, 0x06, "Detach Accept"},
                  {8, 0x08, "Routing Area Update Request"},
                  {8, 0x09, "Routing Area Update Accept"},
                  {8, 0x0A, "Routing Area Update Complete"},
                  {8, 0x0B, "Routing Area Update Reject"},
                  {8, 0x0C, "Service Request"},
                  {8, 0x15, "Identity Request"},
                  {8, 0x21, "GMM Information"},
                  {10, 0x41, "Activate PDP Context Request"},
                  {10, 0x42, "Activate PDP Context Accept"},
                  {10, 0x43, "Activate PDP Context Reject"},
                  {10, 0x46, "Deactivate PDP Context Request"},
                  {10, 0x47, "Deactivate PDP Context Accept"},
                  {10, 0x55, "SM Status"},
                  {9, 0x01, "CP-DATA"},
                  {9, 0x04, "CP-ACK"},
                  {9, 0x10, "CP-ERROR"},
                  {5, 0x3F, "Unknown"}};
  for (const auto& message : messages) {
    EXPECT_EQ(nameIn(circuitNAS(0, {message.discriminator, message.type, 0}), 0x713A), message.name)
        << unsigned{message.discriminator} << " " << unsigned{message.type};
  }
}

// The two upper bits of the type are a sequence number in messages from the phone (TS 24.007 11.2.3.2.3).
TEST(AirMessageNames, TheSequenceNumberOfACircuitMessageIsNotPartOfItsType) {
  EXPECT_EQ(nameIn(circuitNAS(1, {0x05, 0x48}), 0x713A), "Location Updating Request");
  EXPECT_EQ(nameIn(circuitNAS(1, {0x03, 0xC5}), 0x713A), "Setup");
  EXPECT_EQ(nameIn(circuitNAS(1, {0x83, 0x45}), 0x713A), "Setup");
}

TEST(AirMessageNames, OfUMTSSystemInformationBlocks) {
  const struct {
    unsigned type;
    std::string_view name;
  } blocks[] = {{0, "MasterInformationBlock"}, {1, "SysInfoType1"},      {2, "SysInfoType2"},
                {3, "SysInfoType3"},           {4, "SysInfoType4"},      {5, "SysInfoType5"},
                {6, "SysInfoType6"},           {7, "SysInfoType7"},      {8, "SysInfoType8"},
                {9, "SysInfoType9"},           {10, "SysInfoType10"},    {11, "SysInfoType11"},
                {12, "SysInfoType12"},         {13, "SysInfoType13"},    {14, "SysInfoType13-1"},
                {15, "SysInfoType13-2"},       {16, "SysInfoType13-3"},  {17, "SysInfoType13-4"},
                {18, "SysInfoType14"},         {19, "SysInfoType15"},    {20, "SysInfoType15-1"},
                {21, "SysInfoType15-2"},       {22, "SysInfoType15-3"},  {23, "SysInfoType16"},
                {24, "SysInfoType17"},         {25, "SysInfoType15-4"},  {26, "SysInfoType18"},
                {27, "SysInfoTypeSB1"},        {28, "SysInfoTypeSB2"},   {29, "SysInfoType15-5"},
                {30, "SysInfoType5bis"},       {31, "SysInfoType11bis"}, {66, "SysInfoType11bis"},
                {67, "SysInfoType19"}};
  // The type is the first byte of the block, or follows the cell.
  for (const auto& block : blocks) {
    const auto type = static_cast<std::uint8_t>(block.type);
    for (const unsigned channel : {0x09U, 0xFEU, 0xFFU}) {
      EXPECT_EQ(nameIn(umtsRRC(channel, {type, 0x11, 0x22}), 0x412F), block.name)
          << block.type << " " << channel;
    }
    for (const unsigned channel : {0x89U, 0xF0U}) {
      EXPECT_EQ(nameIn(umtsBlockWithCell(channel, 10638, 291, block.type, {0x11, 0x22}), 0x412F),
                block.type == 31 ? "SysInfoType19" : block.name)
          << block.type << " " << channel;
    }
  }
}

}  // namespace varnel
