#pragma once

#include <string_view>
#include <vector>

namespace varnel {

/// The states of circuit-switched mobility management; all values from 26 on are "Unknown".
inline const std::vector<std::string_view> mobilityStates = {
    "MM_NULL",
    "Unknown",
    "Unknown",
    "MM_LOCATION_UPDATE_INITIATED",
    "Unknown",
    "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
    "MM_CONNECTION_ACTIVE",
    "MM_IMSI_DETACH_INITIATED",
    "MM_PROCESS_CM_SERVICE_PROMPT",
    "MM_WAIT_FOR_NETWORK_COMMAND",
    "MM_LOCATION_UPDATE_REJECTED",
    "Unknown",
    "Unknown",
    "MM_WAIT_FOR_RR_CONNECTION_LU",
    "MM_WAIT_FOR_RR_CONNECTION_MM",
    "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
    "Unknown",
    "MM_REESTABLISHMENT_INITIATED",
    "MM_WAIT_FOR_RR_ACTIVE",
    "MM_IDLE",
    "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
    "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
    "MM_WAIT_FOR_REESTABLISH_DECISION",
    "MM_LOCATION_UPDATING_PENDING",
    "Unknown",
    "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
};

/// The registration states of all three processes; all values from 7 on are "Unknown".
inline const std::vector<std::string_view> registrationStates = {
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
    "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE",
};

}  // namespace varnel
