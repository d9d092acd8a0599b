#include <array>
#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <iterator>

#include "LogGenerator/Radios/Messages/RRCChannels.h"

namespace varnel {

namespace {

using Direction = AirMessage::Direction;
using Alternative = MessageChoice::Alternative;

// TS 36.331 6.2.1 (the channels) and 6.7.1 (those of NB-IoT). The names are those of the message types
// without the release in which a type came.

constexpr Alternative bcchDlSchMessages[] = {"SystemInformation", "SystemInformationBlockType1"};
constexpr MessageChoice bcchDlSchC1 = bcchDlSchMessages;
constexpr Alternative bcchDlSchClasses[] = {bcchDlSchC1, extensionMessage};
constexpr MessageChoice bcchDlSch = bcchDlSchClasses;

constexpr Alternative mcchLaterMessages[] = {"MBMSCountingRequest-r10", extensionMessage};
constexpr MessageChoice mcchLater = mcchLaterMessages;
constexpr Alternative mcchClasses[] = {"MBSFNAreaConfiguration-r9", mcchLater};
constexpr MessageChoice mcch = mcchClasses;

constexpr Alternative pcchClasses[] = {"Paging", extensionMessage};
constexpr MessageChoice pcch = pcchClasses;

constexpr Alternative dlCcchMessages[] = {"RRCConnectionReestablishment",
                                          "RRCConnectionReestablishmentReject", "RRCConnectionReject",
                                          "RRCConnectionSetup"};
constexpr MessageChoice dlCcchC1 = dlCcchMessages;
constexpr Alternative dlCcchMessages2[] = {"RRCEarlyDataComplete-r15", spareMessage, spareMessage,
                                           spareMessage};
constexpr MessageChoice dlCcchC2 = dlCcchMessages2;
constexpr Alternative dlCcchExtensions[] = {dlCcchC2, extensionMessage};
constexpr MessageChoice dlCcchExtension = dlCcchExtensions;
constexpr Alternative dlCcchClasses[] = {dlCcchC1, dlCcchExtension};
constexpr MessageChoice dlCcch = dlCcchClasses;

constexpr Alternative dlDcchMessages[] = {
    "CSFBParametersResponseCDMA2000",
    "DLInformationTransfer",
    "HandoverFromEUTRAPreparationRequest",
    "MobilityFromEUTRACommand",
    "RRCConnectionReconfiguration",
    "RRCConnectionRelease",
    "SecurityModeCommand",
    "UECapabilityEnquiry",
    "CounterCheck",
    "UEInformationRequest-r9",
    "LoggedMeasurementConfiguration-r10",
    "RNReconfiguration-r10",
    "RRCConnectionResume-r13",
    "DLDedicatedMessageSegment-r16",
    spareMessage,
    spareMessage,
};
constexpr MessageChoice dlDcchC1 = dlDcchMessages;
constexpr Alternative dlDcchClasses[] = {dlDcchC1, extensionMessage};
constexpr MessageChoice dlDcch = dlDcchClasses;

constexpr Alternative ulCcchMessages[] = {"RRCConnectionReestablishmentRequest", "RRCConnectionRequest"};
constexpr MessageChoice ulCcchC1 = ulCcchMessages;
constexpr Alternative ulCcchMessages3[] = {"RRCEarlyDataRequest-r15", spareMessage, spareMessage,
                                           spareMessage};
constexpr MessageChoice ulCcchC3 = ulCcchMessages3;
constexpr Alternative ulCcchLaterMessages[] = {ulCcchC3, extensionMessage};
constexpr MessageChoice ulCcchLater = ulCcchLaterMessages;
constexpr Alternative ulCcchExtensions[] = {"RRCConnectionResumeRequest-r13", ulCcchLater};
constexpr MessageChoice ulCcchExtension = ulCcchExtensions;
constexpr Alternative ulCcchClasses[] = {ulCcchC1, ulCcchExtension};
constexpr MessageChoice ulCcch = ulCcchClasses;

constexpr Alternative ulDcchMessages[] = {
    "CSFBParametersRequestCDMA2000",
    "MeasurementReport",
    "RRCConnectionReconfigurationComplete",
    "RRCConnectionReestablishmentComplete",
    "RRCConnectionSetupComplete",
    "SecurityModeComplete",
    "SecurityModeFailure",
    "UECapabilityInformation",
    "ULHandoverPreparationTransfer",
    "ULInformationTransfer",
    "CounterCheckResponse",
    "UEInformationResponse-r9",
    "ProximityIndication-r9",
    "RNReconfigurationComplete-r10",
    "MBMSCountingResponse-r10",
    "InterFreqRSTDMeasurementIndication-r10",
};
constexpr MessageChoice ulDcchC1 = ulDcchMessages;
constexpr Alternative ulDcchMessages2[] = {
    "UEAssistanceInformation-r11",     "InDeviceCoexIndication-r11",    "MBMSInterestIndication-r11",
    "SCGFailureInformation-r12",       "SidelinkUEInformation-r12",     "WLANConnectionStatusReport-r13",
    "RRCConnectionResumeComplete-r13", "ULInformationTransferMRDC-r15", "SCGFailureInformationNR-r15",
    "MeasReportAppLayer-r15",          "FailureInformation-r15",        "ULDedicatedMessageSegment-r16",
    "PURConfigurationRequest-r16",     "FailureInformation-r16",        "MCGFailureInformation-r16",
    "ULInformationTransferIRAT-r16",
};
constexpr MessageChoice ulDcchC2 = ulDcchMessages2;
constexpr Alternative ulDcchExtensions[] = {ulDcchC2, extensionMessage};
constexpr MessageChoice ulDcchExtension = ulDcchExtensions;
constexpr Alternative ulDcchClasses[] = {ulDcchC1, ulDcchExtension};
constexpr MessageChoice ulDcch = ulDcchClasses;

constexpr Alternative bcchDlSchNBMessages[] = {"SystemInformation-NB", "SystemInformationBlockType1-NB"};
constexpr MessageChoice bcchDlSchNBC1 = bcchDlSchNBMessages;
constexpr Alternative bcchDlSchNBClasses[] = {bcchDlSchNBC1, extensionMessage};
constexpr MessageChoice bcchDlSchNB = bcchDlSchNBClasses;

constexpr Alternative pcchNBClasses[] = {"Paging-NB", extensionMessage};
constexpr MessageChoice pcchNB = pcchNBClasses;

constexpr Alternative dlCcchNBMessages[] = {
    "RRCConnectionReestablishment-NB",
    "RRCConnectionReestablishmentReject",
    "RRCConnectionReject-NB",
    "RRCConnectionSetup-NB",
    "RRCEarlyDataComplete-NB-r15",
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice dlCcchNBC1 = dlCcchNBMessages;
constexpr Alternative dlCcchNBClasses[] = {dlCcchNBC1, extensionMessage};
constexpr MessageChoice dlCcchNB = dlCcchNBClasses;

constexpr Alternative dlDcchNBMessages[] = {
    "DLInformationTransfer-NB",    "RRCConnectionReconfiguration-NB",
    "RRCConnectionRelease-NB",     "SecurityModeCommand",
    "UECapabilityEnquiry-NB",      "RRCConnectionResume-NB",
    "UEInformationRequest-NB-r16", spareMessage,
};
constexpr MessageChoice dlDcchNBC1 = dlDcchNBMessages;
constexpr Alternative dlDcchNBClasses[] = {dlDcchNBC1, extensionMessage};
constexpr MessageChoice dlDcchNB = dlDcchNBClasses;

constexpr Alternative ulCcchNBMessages[] = {"RRCConnectionReestablishmentRequest-NB",
                                            "RRCConnectionRequest-NB", "RRCConnectionResumeRequest-NB",
                                            "RRCEarlyDataRequest-NB-r15"};
constexpr MessageChoice ulCcchNBC1 = ulCcchNBMessages;
constexpr Alternative ulCcchNBClasses[] = {ulCcchNBC1, extensionMessage};
constexpr MessageChoice ulCcchNB = ulCcchNBClasses;

constexpr Alternative ulDcchNBMessages[] = {
    "RRCConnectionReconfigurationComplete-NB",
    "RRCConnectionReestablishmentComplete-NB",
    "RRCConnectionSetupComplete-NB",
    "SecurityModeComplete",
    "SecurityModeFailure",
    "UECapabilityInformation-NB",
    "ULInformationTransfer-NB",
    "RRCConnectionResumeComplete-NB",
    "UEInformationResponse-NB-r16",
    "PURConfigurationRequest-NB-r16",
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice ulDcchNBC1 = ulDcchNBMessages;
constexpr Alternative ulDcchNBClasses[] = {ulDcchNBC1, extensionMessage};
constexpr MessageChoice ulDcchNB = ulDcchNBClasses;

// In the order of every numbering.
constexpr MessageChannel channels[] = {
    {"BCCH-BCH", nullptr, "MasterInformationBlock", Direction::Downlink},
    {"BCCH-DL-SCH", &bcchDlSch, {}, Direction::Downlink},
    {"MCCH", &mcch, {}, Direction::Downlink},
    {"PCCH", &pcch, {}, Direction::Downlink},
    {"DL-CCCH", &dlCcch, {}, Direction::Downlink},
    {"DL-DCCH", &dlDcch, {}, Direction::Downlink},
    {"UL-CCCH", &ulCcch, {}, Direction::Uplink},
    {"UL-DCCH", &ulDcch, {}, Direction::Uplink},
};
constexpr MessageChannel narrowbandChannels[] = {
    {"BCCH-BCH-NB", nullptr, "MasterInformationBlock-NB", Direction::Downlink},
    {"BCCH-DL-SCH-NB", &bcchDlSchNB, {}, Direction::Downlink},
    {"PCCH-NB", &pcchNB, {}, Direction::Downlink},
    {"DL-CCCH-NB", &dlCcchNB, {}, Direction::Downlink},
    {"DL-DCCH-NB", &dlDcchNB, {}, Direction::Downlink},
    {"UL-CCCH-NB", &ulCcchNB, {}, Direction::Uplink},
    {"UL-DCCH-NB", &ulDcchNB, {}, Direction::Uplink},
};

// A numbering: the numbers of the channels, and the versions that have it.
struct Numbering {
  std::uint8_t numbers[std::size(channels)];
  std::uint32_t versions;  // bit n: version n
};

consteval std::uint32_t setOf(std::initializer_list<unsigned> versions) {
  std::uint32_t set = 0;
  for (const unsigned version : versions) set |= std::uint32_t{1} << version;
  return set;
}

constexpr Numbering numberings[] = {
    {{1, 2, 3, 4, 5, 6, 7, 8}, setOf({2, 3, 4, 5, 6, 7, 8, 13, 22})},
    {{8, 9, 10, 11, 12, 13, 14, 15}, setOf({9, 12})},
    {{1, 2, 4, 5, 6, 7, 8, 9}, setOf({14, 15, 16, 20, 24, 25})},
    {{1, 3, 6, 7, 8, 9, 10, 11}, setOf({19, 26, 27, 29, 30, 31})},
};

struct NarrowbandNumbering {
  std::uint8_t numbers[std::size(narrowbandChannels)];
  std::uint32_t versions;
};

constexpr NarrowbandNumbering narrowbandNumberings[] = {
    {{45, 46, 47, 48, 49, 50, 52}, setOf({19, 26, 27, 29, 30, 31})},
    {{54, 55, 56, 57, 58, 59, 61}, setOf({20, 24, 25})},
};

constexpr std::size_t versionCount = 32, numberCount = 64;

// By version and number: 1 and up are the channels, then come those of NB-IoT; 0: not known.
constexpr auto channelIndexes = [] {
  std::array<std::array<std::uint8_t, numberCount>, versionCount> indexes{};
  const auto add = [&](const auto& numbering, std::size_t first) {
    for (std::size_t version = 0; version < versionCount; ++version) {
      if ((numbering.versions >> version & 1U) == 0) continue;
      for (std::size_t i = 0; i < std::size(numbering.numbers); ++i)
        indexes.at(version).at(numbering.numbers[i]) = static_cast<std::uint8_t>(first + i);
    }
  };
  for (const Numbering& numbering : numberings) add(numbering, 1);
  for (const NarrowbandNumbering& numbering : narrowbandNumberings) add(numbering, 1 + std::size(channels));
  return indexes;
}();

}  // namespace

const MessageChannel* lteRRCChannel(unsigned packetVersion, unsigned number) {
  if (packetVersion >= versionCount || number >= numberCount) return nullptr;
  const std::size_t index = channelIndexes[packetVersion][number];
  if (index == 0) return nullptr;
  constexpr std::size_t wideCount = std::size(channels);
  return index <= wideCount ? &channels[index - 1] : &narrowbandChannels[index - 1 - wideCount];
}

}  // namespace varnel
