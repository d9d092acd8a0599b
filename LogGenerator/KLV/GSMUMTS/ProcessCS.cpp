#include "LogGenerator/KLV/GSMUMTS/ProcessCS.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"

namespace varnel {

namespace {

constexpr std::string_view subStates[] = {
    "MM_NULL_SUBSTATE",        "MM_NO_IMSI",
    "MM_PLMN_SEARCH",          "MM_LIMITED_SERVICE",
    "MM_ATTEMPTING_TO_UPDATE", "MM_LOCATION_UPDATE_NEEDED",
    "MM_NO_CELL_AVAILABLE",    "MM_PLMN_SEARCH_NORMAL_SERVICE",
    "MM_NORMAL_SERVICE",
};

constexpr std::string_view updateStatuses[] = {
    "UPDATED",
    "NOT_UPDATED",
    "ROAMING_NOT_ALLOWED",
    "LOCATION_AREA_NOT_ALLOWED",
};

constexpr Field state[] = {
    {mmState::state, "MM State", entry(mmState::states)},
    {mmState::subState, "MM Sub State", entry(subStates)},
    {mmState::updateStatus, "LU Reject Cause", entry(updateStatuses)},
};

constexpr PacketHandler packets[] = {
    {mmState::logCode, mmState::minimumSize, state},
    {registration::logCode, registration::minimumSize, registration::serviceState},
};

}  // namespace

ProcessCS::ProcessCS() : SectionDecoder("Process CS", "ProcessCS", packets) {}

}  // namespace varnel
