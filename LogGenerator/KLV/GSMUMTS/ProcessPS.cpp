#include "LogGenerator/KLV/GSMUMTS/ProcessPS.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"

namespace varnel {

namespace {

constexpr std::uint32_t logCode = 0x7130;
constexpr std::size_t minimumSize = 16;

constexpr std::string_view states[] = {
    "GMM_NULL",
    "GMM_DEREGISTERED",
    "GMM_REGISTERED_INITIATED",
    "GMM_REGISTERED",
    "GMM_DEREGISTERED_INITIATED",
    "GMM_ROUTING_AREA_UPDATE_INITIATED",
    "GMM_SERVICE_REQUEST_INITIATED",
};

constexpr std::string_view subStates[] = {
    "GMM_NORMAL_SERVICE",
    "GMM_LIMITED_SERVICE",
    "GMM_ATTACH_NEEDED",
    "GMM_ATTEMPTING_TO_ATTACH",
    "GMM_NO_IMSI",
    "GMM_NO_CELL_AVAILABLE",
    "GMM_PLMN_SEARCH",
    "GMM_SUSPENDED",
    "GMM_UPDATE_NEEDED",
    // Kept: a T is missing.
    "GMM_ATTEMPING_TO_UPDATE",
    "GMM_ATTEMPTING_TO_UPDATE_MM",
    "GMM_IMSI_DETACH_INITIATED",
    "GMM_NULL_SUBSTATE",
};

constexpr std::string_view updateStatuses[] = {
    "GMM_GU1_UPDATED",
    "GMM_GU2_NOT_UPDATED",
    "GMM_GU3_PLMN_NOT_ALLOWED",
    "GMM_GU3_ROUTING_AREA_NOT_ALLOWED",
};

// Kept: the labels say MM, as in the circuit-switched section, instead of GMM.
constexpr Field state[] = {
    {u8(13), "MM State", entry(states)},
    {u8(14), "MM Sub State", entry(subStates)},
    {u8(15), "Attach Reject Cause", entry(updateStatuses)},
};

constexpr PacketHandler packets[] = {
    {logCode, minimumSize, state},
    {registration::logCode, registration::minimumSize, registration::serviceState},
};

}  // namespace

ProcessPS::ProcessPS() : SectionDecoder("Process PS", "ProcessPS", packets) {}

}  // namespace varnel
