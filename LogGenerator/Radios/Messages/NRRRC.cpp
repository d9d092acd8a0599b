#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>

#include "LogGenerator/Radios/Messages/RRCChannels.h"

namespace varnel {

namespace {

using Direction = AirMessage::Direction;
using Alternative = MessageChoice::Alternative;

// TS 38.331 6.2.1. The names are those of the message types, some of which end in the release that
// brought them.

constexpr Alternative bcchBchClasses[] = {"MIB", extensionMessage};
constexpr MessageChoice bcchBch = bcchBchClasses;

constexpr Alternative bcchDlSchMessages[] = {"SystemInformation", "SIB1"};
constexpr MessageChoice bcchDlSchC1 = bcchDlSchMessages;
constexpr Alternative bcchDlSchClasses[] = {bcchDlSchC1, extensionMessage};
constexpr MessageChoice bcchDlSch = bcchDlSchClasses;

constexpr Alternative dlCcchMessages[] = {"RRCReject", "RRCSetup", spareMessage, spareMessage};
constexpr MessageChoice dlCcchC1 = dlCcchMessages;
constexpr Alternative dlCcchClasses[] = {dlCcchC1, extensionMessage};
constexpr MessageChoice dlCcch = dlCcchClasses;

constexpr Alternative dlDcchMessages[] = {
    "RRCReconfiguration",
    "RRCResume",
    "RRCRelease",
    "RRCReestablishment",
    "SecurityModeCommand",
    "DLInformationTransfer",
    "UECapabilityEnquiry",
    "CounterCheck",
    "MobilityFromNRCommand",
    "DLDedicatedMessageSegment-r16",
    "UEInformationRequest-r16",
    "DLInformationTransferMRDC-r16",
    "LoggedMeasurementConfiguration-r16",
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice dlDcchC1 = dlDcchMessages;
constexpr Alternative dlDcchClasses[] = {dlDcchC1, extensionMessage};
constexpr MessageChoice dlDcch = dlDcchClasses;

constexpr Alternative mcchMessages[] = {"MBSBroadcastConfiguration-r17", spareMessage};
constexpr MessageChoice mcchC1 = mcchMessages;
constexpr Alternative mcchClasses[] = {mcchC1, extensionMessage};
constexpr MessageChoice mcch = mcchClasses;

constexpr Alternative pcchMessages[] = {"Paging", spareMessage};
constexpr MessageChoice pcchC1 = pcchMessages;
constexpr Alternative pcchClasses[] = {pcchC1, extensionMessage};
constexpr MessageChoice pcch = pcchClasses;

constexpr Alternative ulCcchMessages[] = {"RRCSetupRequest", "RRCResumeRequest", "RRCReestablishmentRequest",
                                          "RRCSystemInfoRequest"};
constexpr MessageChoice ulCcchC1 = ulCcchMessages;
constexpr Alternative ulCcchClasses[] = {ulCcchC1, extensionMessage};
constexpr MessageChoice ulCcch = ulCcchClasses;

constexpr Alternative ulCcch1Messages[] = {"RRCResumeRequest1", spareMessage, spareMessage, spareMessage};
constexpr MessageChoice ulCcch1C1 = ulCcch1Messages;
constexpr Alternative ulCcch1Classes[] = {ulCcch1C1, extensionMessage};
constexpr MessageChoice ulCcch1 = ulCcch1Classes;

constexpr Alternative ulDcchMessages[] = {
    "MeasurementReport",          "RRCReconfigurationComplete", "RRCSetupComplete",
    "RRCReestablishmentComplete", "RRCResumeComplete",          "SecurityModeComplete",
    "SecurityModeFailure",        "ULInformationTransfer",      "LocationMeasurementIndication",
    "UECapabilityInformation",    "CounterCheckResponse",       "UEAssistanceInformation",
    "FailureInformation",         "ULInformationTransferMRDC",  "SCGFailureInformation",
    "SCGFailureInformationEUTRA",
};
constexpr MessageChoice ulDcchC1 = ulDcchMessages;
constexpr Alternative ulDcchMessages2[] = {
    "ULDedicatedMessageSegment-r16",
    "DedicatedSIBRequest-r16",
    "MCGFailureInformation-r16",
    "UEInformationResponse-r16",
    "SidelinkUEInformationNR-r16",
    "ULInformationTransferIRAT-r16",
    "IABOtherInformation-r16",
    "MBSInterestIndication-r17",
    "UEPositioningAssistanceInfo-r17",
    "MeasurementReportAppLayer-r17",
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
    spareMessage,
};
constexpr MessageChoice ulDcchC2 = ulDcchMessages2;
constexpr Alternative ulDcchExtensions[] = {ulDcchC2, extensionMessage};
constexpr MessageChoice ulDcchExtension = ulDcchExtensions;
constexpr Alternative ulDcchClasses[] = {ulDcchC1, ulDcchExtension};
constexpr MessageChoice ulDcch = ulDcchClasses;

// The order of the numberings below. The last five are types of messages by themselves, which LTE messages
// carry to a phone that has NR beside LTE.
constexpr MessageChannel channels[] = {
    {"BCCH-BCH", &bcchBch, {}, Direction::Downlink},
    {"BCCH-DL-SCH", &bcchDlSch, {}, Direction::Downlink},
    {"DL-CCCH", &dlCcch, {}, Direction::Downlink},
    {"DL-DCCH", &dlDcch, {}, Direction::Downlink},
    {"MCCH", &mcch, {}, Direction::Downlink},
    {"PCCH", &pcch, {}, Direction::Downlink},
    {"UL-CCCH", &ulCcch, {}, Direction::Uplink},
    {"UL-CCCH1", &ulCcch1, {}, Direction::Uplink},
    {"UL-DCCH", &ulDcch, {}, Direction::Uplink},
    {"UL-DCCH", &ulDcch, {}, Direction::Uplink},
    {"", nullptr, "RRCReconfiguration", Direction::Downlink},
    {"", nullptr, "RRCReconfigurationComplete", Direction::Uplink},
    {"", nullptr, "RadioBearerConfig", Direction::Downlink},
    {"", nullptr, "UE-MRDC-Capability", Direction::Uplink},
    {"", nullptr, "UE-NR-Capability", Direction::Uplink},
    {"", nullptr, "UE-NR-Capability", Direction::Uplink},
};

// The numbers of the channels in some versions; 0: they have none.
struct Numbering {
  std::uint8_t versions[3];
  std::uint8_t numbers[std::size(channels)];
};

constexpr Numbering numberings[] = {
    {{8}, {1, 0, 0, 0, 0, 0, 0, 0, 8, 0, 9, 10, 26, 0, 0, 0}},
    {{9, 12}, {1, 2, 3, 4, 0, 5, 6, 7, 8, 0, 9, 10, 25, 28, 29, 0}},
    {{14}, {1, 2, 3, 4, 0, 5, 6, 7, 8, 0, 9, 10, 28, 31, 32, 33}},
    {{17, 19, 25}, {1, 2, 3, 4, 0, 5, 6, 7, 8, 0, 9, 10, 29, 0, 0, 0}},
    {{20, 23, 24}, {1, 2, 3, 4, 5, 6, 7, 8, 9, 0, 10, 11, 36, 0, 0, 0}},
    {{26}, {1, 2, 3, 4, 5, 6, 7, 8, 9, 0, 11, 12, 36, 0, 0, 0}},
    {{28}, {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 36, 0, 0, 0}},
};

}  // namespace

const MessageChannel* nrRRCChannel(unsigned packetVersion, unsigned number) {
  if (packetVersion == 0 || number == 0) return nullptr;
  for (const Numbering& numbering : numberings) {
    if (std::ranges::find(numbering.versions, packetVersion) == std::end(numbering.versions)) continue;
    const auto* const found = std::ranges::find(numbering.numbers, number);
    if (found == std::end(numbering.numbers)) return nullptr;
    return &channels[static_cast<std::size_t>(found - std::begin(numbering.numbers))];
  }
  return nullptr;
}

}  // namespace varnel
