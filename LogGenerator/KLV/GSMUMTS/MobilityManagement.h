#pragma once

#include <cstddef>
#include <cstdint>

#include "LogGenerator/Field.h"

namespace varnel {

/// The state of the circuit-switched mobility management (MM, 3GPP TS 24.008), log code 0x7131.
namespace mmState {

inline constexpr std::uint32_t logCode = 0x7131;
inline constexpr std::size_t minimumSize = 16;
inline constexpr Source state = u8(13);
inline constexpr Source subState = u8(14);
inline constexpr Source updateStatus = u8(15);

/// The states of both circuit-switched processes.
/// Kept: two of the names have a blank.
inline constexpr std::string_view states[] = {
    /*  0 */ "MM_NULL",
    /*  1 */ "Unknown",
    /*  2 */ "Unknown",
    /*  3 */ "MM_LOCATION_UPDATE_INITIATED",
    /*  4 */ "Unknown",
    /*  5 */ "MM_WAIT_FOR_OUTGOING_MM_CONNECTION",
    /*  6 */ "MM_CONNECTION_ACTIVE",
    /*  7 */ "MM_IMSI_DETACH_INITIATED",
    /*  8 */ "MM_PROCESS_CM_SERVICE_PROMPT",
    /*  9 */ "MM_WAIT_FOR_NETWORK_COMMAND",
    /* 10 */ "MM_LOCATION_UPDATE_REJECTED",
    /* 11 */ "Unknown",
    /* 12 */ "Unknown",
    /* 13 */ "MM_WAIT_FOR_RR_CONNECTION_LU",
    /* 14 */ "MM_WAIT_FOR_RR_CONNECTION_MM",
    /* 15 */ "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH",
    /* 16 */ "Unknown",
    /* 17 */ "MM_REESTABLISHMENT_INITIATED",
    /* 18 */ "MM_WAIT_FOR_RR_ACTIVE",
    /* 19 */ "MM_IDLE",
    /* 20 */ "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION",
    /* 21 */ "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT",
    /* 22 */ "MM_WAIT_FOR_REESTABLISH_DECISION",
    /* 23 */ "MM_LOCATION_UPDATING_PENDING",
    /* 24 */ "Unknown",
    /* 25 */ "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED",
};

}  // namespace mmState

/// Registration, and the choice of the network, log code 0x7132.
namespace registration {

inline constexpr std::uint32_t logCode = 0x7132;
inline constexpr std::size_t minimumSize = 16;
inline constexpr Source state = u8(13);
inline constexpr Source selectionMode = u8(14);

inline constexpr std::string_view states[] = {
    "REG_STATE_INACTIVE",      "REG_STATE_IDLE",          "REG_STATE_REGISTERING",
    "REG_STATE_DEREGISTERING", "REG_STATE_MANUAL_SEARCH", "REG_STATE_AUTOMATIC_SEARCH",
    "REG_STATE_OFFLINE",
};

/// The entry that all three processes have.
inline constexpr Field serviceState[] = {
    {state, "MM Service State", entry(states)},
};

}  // namespace registration

/// The identity and the service of the network, log code 0x7135.
namespace networkIdentity {

inline constexpr std::uint32_t logCode = 0x7135;
inline constexpr std::size_t minimumSize = 32;
inline constexpr Source operatingMode = u8(13);
inline constexpr Source serviceType = u8(14);
/// Mobile country and network code in three bytes (3GPP TS 24.008, 10.5.1.3).
inline constexpr std::size_t plmn = 15;
/// The location area code, which is the only big-endian number.
inline constexpr std::size_t lac = 18;
inline constexpr Source rac = u8(20);

}  // namespace networkIdentity

}  // namespace varnel
