#include <array>
#include <cstddef>
#include <cstdint>

#include "LogGenerator/Radios/Messages/RRCChannels.h"

namespace varnel {

namespace {

using Direction = AirMessage::Direction;
using Alternative = MessageChoice::Alternative;
constexpr auto optionalCheck = MessageChannel::IntegrityCheck::Optional;

// TS 25.331 11.1 (class definitions).

constexpr Alternative dlDcchMessages[] = {
    "ActiveSetUpdate",
    "AssistanceDataDelivery",
    "CellChangeOrderFromUTRAN",
    "CellUpdateConfirm",
    "CounterCheck",
    "DownlinkDirectTransfer",
    "HandoverFromUTRANCommand-GSM",
    "HandoverFromUTRANCommand-CDMA2000",
    "MeasurementControl",
    "PagingType2",
    "PhysicalChannelReconfiguration",
    "PhysicalSharedChannelAllocation",
    "RadioBearerReconfiguration",
    "RadioBearerRelease",
    "RadioBearerSetup",
    "RRCConnectionRelease",
    "SecurityModeCommand",
    "SignallingConnectionRelease",
    "TransportChannelReconfiguration",
    "TransportFormatCombinationControl",
    "UECapabilityEnquiry",
    "UECapabilityInformationConfirm",
    "UplinkPhysicalChannelControl",
    "URAUpdateConfirm",
    "UTRANMobilityInformation",
    "HandoverFromUTRANCommand-GERANIu",
    "MBMSModifiedServicesInformation",
    "ETWSPrimaryNotificationWithSecurity",
    "HandoverFromUTRANCommand-EUTRA",
    "UEInformationRequest",
    "LoggingMeasurementConfiguration",
    spareMessage,
};
constexpr MessageChoice dlDcch = dlDcchMessages;

constexpr Alternative ulDcchLaterMessages[] = {
    "UEInformationResponse",
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice ulDcchLater = ulDcchLaterMessages;

constexpr Alternative ulDcchMessages[] = {
    "ActiveSetUpdateComplete",
    "ActiveSetUpdateFailure",
    "CellChangeOrderFromUTRANFailure",
    "CounterCheckResponse",
    "HandoverToUTRANComplete",
    "InitialDirectTransfer",
    "HandoverFromUTRANFailure",
    "MeasurementControlFailure",
    "MeasurementReport",
    "PhysicalChannelReconfigurationComplete",
    "PhysicalChannelReconfigurationFailure",
    "RadioBearerReconfigurationComplete",
    "RadioBearerReconfigurationFailure",
    "RadioBearerReleaseComplete",
    "RadioBearerReleaseFailure",
    "RadioBearerSetupComplete",
    "RadioBearerSetupFailure",
    "RRCConnectionReleaseComplete",
    "RRCConnectionSetupComplete",
    "RRCStatus",
    "SecurityModeComplete",
    "SecurityModeFailure",
    "SignallingConnectionReleaseIndication",
    "TransportChannelReconfigurationComplete",
    "TransportChannelReconfigurationFailure",
    "TransportFormatCombinationControlFailure",
    "UECapabilityInformation",
    "UplinkDirectTransfer",
    "UTRANMobilityInformationConfirm",
    "UTRANMobilityInformationFailure",
    "MBMSModificationRequest",
    ulDcchLater,
};
constexpr MessageChoice ulDcch = ulDcchMessages;

constexpr Alternative dlCcchMessages[] = {
    "CellUpdateConfirm-CCCH",
    "RRCConnectionReject",
    "RRCConnectionRelease-CCCH",
    "RRCConnectionSetup",
    "URAUpdateConfirm-CCCH",
    "ETWSPrimaryNotificationWithSecurity",
    spareMessage,
    spareMessage,
};
constexpr MessageChoice dlCcch = dlCcchMessages;

constexpr Alternative ulCcchLaterMessages[] = {"CellUpdateFDD-r11", spareMessage, spareMessage, spareMessage};
constexpr MessageChoice ulCcchLater = ulCcchLaterMessages;
constexpr Alternative ulCcchMessages[] = {"CellUpdate", "RRCConnectionRequest", "URAUpdate", ulCcchLater};
constexpr MessageChoice ulCcch = ulCcchMessages;

constexpr Alternative pcchMessages[] = {"PagingType1", spareMessage};
constexpr MessageChoice pcch = pcchMessages;

constexpr Alternative bcchFachMessages[] = {"SystemInformation-FACH", "SystemInformationChangeIndication",
                                            spareMessage, spareMessage};
constexpr MessageChoice bcchFach = bcchFachMessages;

constexpr Alternative mcchMessages[] = {
    "MBMSAccessInformation",
    "MBMSCommonPTMRBInformation",
    "MBMSCurrentCellPTMRBInformation",
    "MBMSGeneralInformation",
    "MBMSModifiedServicesInformation",
    "MBMSNeighbouringCellPTMRBInformation",
    "MBMSUnmodifiedServicesInformation",
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice mcch = mcchMessages;

constexpr Alternative mschMessages[] = {"MBMSSchedulingInformation", spareMessage, spareMessage,
                                        spareMessage};
constexpr MessageChoice msch = mschMessages;

constexpr MessageChannel ulCcchChannel = {"UL-CCCH", &ulCcch, {}, Direction::Uplink, optionalCheck};
constexpr MessageChannel ulDcchChannel = {"UL-DCCH", &ulDcch, {}, Direction::Uplink, optionalCheck};
constexpr MessageChannel dlCcchChannel = {"DL-CCCH", &dlCcch, {}, Direction::Downlink, optionalCheck};
constexpr MessageChannel dlDcchChannel = {"DL-DCCH", &dlDcch, {}, Direction::Downlink, optionalCheck};
constexpr MessageChannel bcchBchChannel = {"BCCH-BCH", nullptr, "SystemInformation-BCH", Direction::Downlink};
constexpr MessageChannel bcchFachChannel = {"BCCH-FACH", &bcchFach, {}, Direction::Downlink};
constexpr MessageChannel pcchChannel = {"PCCH", &pcch, {}, Direction::Downlink};
constexpr MessageChannel mcchChannel = {"MCCH", &mcch, {}, Direction::Downlink};
constexpr MessageChannel mschChannel = {"MSCH", &msch, {}, Direction::Downlink};
constexpr MessageChannel containerType = {"", nullptr, "System-Information-Container", Direction::Downlink};

// By the packet's number; 9 stands for a system information block.
constexpr const MessageChannel* channels[] = {
    &ulCcchChannel, &ulDcchChannel, &dlCcchChannel, &dlDcchChannel, &bcchBchChannel, &bcchFachChannel,
    &pcchChannel,   &mcchChannel,   &mschChannel,   nullptr,        &containerType,
};

constexpr MessageChannel blockOf(std::string_view name) { return {"", nullptr, name, Direction::Downlink}; }

struct Block {
  std::uint8_t number;
  MessageChannel type;
};

// TS 25.331 10.2.48.8. Block 31 of packets with a cell, and 66 and 67, stand at the end.
constexpr Block blocks[] = {
    {0, blockOf("MasterInformationBlock")}, {1, blockOf("SysInfoType1")},
    {2, blockOf("SysInfoType2")},           {3, blockOf("SysInfoType3")},
    {4, blockOf("SysInfoType4")},           {5, blockOf("SysInfoType5")},
    {6, blockOf("SysInfoType6")},           {7, blockOf("SysInfoType7")},
    {8, blockOf("SysInfoType8")},           {9, blockOf("SysInfoType9")},
    {10, blockOf("SysInfoType10")},         {11, blockOf("SysInfoType11")},
    {12, blockOf("SysInfoType12")},         {13, blockOf("SysInfoType13")},
    {14, blockOf("SysInfoType13-1")},       {15, blockOf("SysInfoType13-2")},
    {16, blockOf("SysInfoType13-3")},       {17, blockOf("SysInfoType13-4")},
    {18, blockOf("SysInfoType14")},         {19, blockOf("SysInfoType15")},
    {20, blockOf("SysInfoType15-1")},       {21, blockOf("SysInfoType15-2")},
    {22, blockOf("SysInfoType15-3")},       {23, blockOf("SysInfoType16")},
    {24, blockOf("SysInfoType17")},         {25, blockOf("SysInfoType15-4")},
    {26, blockOf("SysInfoType18")},         {27, blockOf("SysInfoTypeSB1")},
    {28, blockOf("SysInfoTypeSB2")},        {29, blockOf("SysInfoType15-5")},
    {30, blockOf("SysInfoType5bis")},       {31, blockOf("SysInfoType11bis")},
    {66, blockOf("SysInfoType11bis")},      {67, blockOf("SysInfoType19")},
};

}  // namespace

const MessageChannel* umtsRRCChannel(unsigned number) {
  return number < std::size(channels) ? channels[number] : nullptr;
}

const MessageChannel* umtsSystemInformationBlock(unsigned number, BlockNumbers numbers) {
  constexpr unsigned ambiguous = 31, type19 = 67;
  if (number == ambiguous && numbers == BlockNumbers::WithCell) number = type19;
  for (const Block& block : blocks) {
    if (block.number == number) return &block.type;
  }
  return nullptr;
}

}  // namespace varnel
