#include "LogGenerator/KLV/GSMUMTS/GPRSInformation.h"

#include "LogGenerator/Field.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSCellOptions.h"
#include "LogGenerator/KLV/GSMUMTS/GPRSPacketControl.h"
#include "LogGenerator/KLV/GSMUMTS/GSMMeasurement.h"
#include "LogGenerator/KLV/GSMUMTS/MobilityManagement.h"

namespace varnel {

namespace {

// Kept: "Available", although the other tables have "Not Available".
constexpr Choice flowContextSupport[] = {
    {0xFF, "Available"},
    {0, "Not Supported"},
    {1, "Supported"},
};
constexpr Field packetControl[] = {
    gprsPacketControl::controlOrder,
    {gprsPacketControl::flowContexts, "PFC Supported", choice(flowContextSupport, "Unknown")},
    gprsPacketControl::accessThreshold,
};

constexpr std::string_view operatingModes[] = {"Class 1", "Class 2", "Class 3"};
constexpr Field operatingMode[] = {
    {networkIdentity::operatingMode, "Network Operating Mode", entry(operatingModes)},
};

constexpr std::string_view t3192Times[] = {
    "500 ms", "1000 ms", "1500 ms", "0 ms", "80 ms", "120 ms", "160 ms", "200 ms",
};
constexpr Choice burstTypes[] = {{0, "8-bit format"}};
constexpr Field cellOptions[] = {
    {gprsCellOptions::t3192, "T3192", entry(t3192Times, "?? ms")},
    {gprsCellOptions::accessBurstType, "Access Burst Type", choice(burstTypes, "11-bit format")},
    {gprsCellOptions::drxTimerMaximum, "DRX Timer Max"},
};

constexpr Field controlChannel[] = {
    {u8(13), "PBCCH Present"},
};

constexpr Choice support[] = {{0, "Not Supported"}};
constexpr Field packetSystemInformation[] = {
    {u8(16), "Ext Measurement Order"},
    {u8(13), "Packet PSI Status"},
    {u8(33), "Packet SI Status", choice(support, "Supported")},
    {u8(14), "Count LR"},
    {u8(15), "Count HR"},
};

constexpr Choice positions[] = {
    {0xFF, "Not Available"},
    {0, "Located on BCCH"},
    {1, "Located on Extended BCCH"},
};
constexpr Field systemInformation13[] = {
    {u8(14), "SI13 Position", choice(positions, "Unknown")},
};

constexpr Choice hysteresis[] = {{0, "Not Applied"}};
constexpr Field reselection[] = {
    {gsmMeasurement::reselectHysteresis, "Cell Reselect Hysteresis", choice(hysteresis, "Applied")},
};

constexpr PacketHandler packets[] = {
    {gprsPacketControl::logCode, gprsPacketControl::minimumSize, packetControl},
    {networkIdentity::logCode, networkIdentity::minimumSize, operatingMode},
    {gprsCellOptions::logCode, gprsCellOptions::minimumSize, cellOptions},
    {0x51FB, 34, controlChannel},
    {0x51FD, 35, packetSystemInformation},
    {0x51F4, 15, systemInformation13},
    {gsmMeasurement::logCode, gsmMeasurement::minimumSize, reselection},
};

}  // namespace

GPRSInformation::GPRSInformation() : SectionDecoder("GPRS Information", "GPRSInformation", packets) {}

}  // namespace varnel
