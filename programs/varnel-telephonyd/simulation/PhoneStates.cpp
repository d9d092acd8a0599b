#include "programs/varnel-telephonyd/simulation/PhoneStates.h"

namespace varnel::simulation {

namespace {

constexpr const char* idle = "MM IDLE, NORMAL SERVICE";
constexpr const char* registered = "GMM-REGISTERED.NORMAL-SERVICE";
constexpr const char* suspended = "GMM-REGISTERED.SUSPENDED";
constexpr const char* noCall = "U0 Null";
constexpr const char* noPackets = "Packet idle";

// By kind.
constexpr PhoneStates states[] = {
    {"Idle", "RR idle", "BCCH + CCCH", idle, registered, noCall, noPackets},
    {"Location access", "RR connection pending", "RACH", "WAIT FOR RR CONNECTION (LOCATION UPDATING)",
     "GMM-REGISTERED.UPDATE-NEEDED", noCall, noPackets},
    {"Location update", "RR connected", "SDCCH/8", "LOCATION UPDATING INITIATED",
     "GMM-ROUTING-AREA-UPDATING-INITIATED", noCall, noPackets},
    {"Call access", "RR connection pending", "RACH", "WAIT FOR RR CONNECTION (MM CONNECTION)", suspended,
     "U0.1 MM connection pending", noPackets},
    {"Call setup", "RR connected", "SDCCH/8", "MM CONNECTION ACTIVE", suspended,
     "U3 Mobile originating call proceeding", noPackets},
    {"Call", "RR connected", "TCH/F", "MM CONNECTION ACTIVE", suspended, "U10 Active", noPackets},
    {"Call release", "RR connected", "TCH/F", "WAIT FOR NETWORK COMMAND", suspended, "U19 Release request",
     noPackets},
    {"Packet access", "RR idle", "RACH", idle, registered, noCall, "Packet access"},
    {"Packet transfer", "RR idle", "PDTCH", idle, registered, noCall, "Packet transfer"},
};

}  // namespace

const PhoneStates& phoneStates(PhoneActivity::Kind kind) { return states[static_cast<int>(kind)]; }

}  // namespace varnel::simulation
