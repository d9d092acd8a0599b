#pragma once

#include <cstdint>
#include <vector>

#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/State.h"
#include "LogGenerator/Packet.h"

/// The decoders of CDMA2000 packets. Each takes a packet of the right length and publishes its display
/// variables through the lookup. What it has to remember until the next packet is in the state.
namespace varnel::c2k {

/// Lengths of packets in bytes, header included. That of the EV-DO status is exact; all others are minimum
/// lengths.
inline constexpr std::uint32_t evdoStatusSize = 50;
inline constexpr std::uint32_t evdoActiveSetSize = 25;
inline constexpr std::uint32_t fingerC2ISize = 23;
inline constexpr std::uint32_t subpacketsSize = 17;
/// Kept: the base station id is after it, at 184.
inline constexpr std::uint32_t systemInfoSize = 171;
inline constexpr std::uint32_t flDataRateSize = 241;
inline constexpr std::uint32_t rlDataRateSize = 1750;

/// The variables that each decoder publishes.
inline constexpr Variable evdoStatusVariables[] = {
    "kChannel", "k1xEVDODeviceState", "kBandClass",    "kRxAGC0", "kRxAGC1",
    "kTxAGC",   "kServingPNOffset",   "kSessionState", "kUATI24", "kColorCode"};
inline constexpr Variable evdoActiveSetVariables[] = {"kActiveSetPilots"};
inline constexpr Variable fingerC2IVariables[] = {"kFingerC2I"};
inline constexpr Variable oneXStatusVariables[] = {
    "k1xDeviceState", "k1xRx0BandClass", "k1xRx0ChanNum", "k1xRxAGC0",        "k1xRx1BandClass",
    "k1xRx1ChanNum",  "k1xRxAGC1",       "k1xTxAGC",      "k1xActiveSetInfo", "k1xTrafficFER"};
inline constexpr Variable oneXTrafficFERVariables[] = {"k1xTrafficFER"};
inline constexpr Variable systemInfoVariables[] = {"k1xRoamingHome", "kSystemId", "kNetworkId",
                                                   "kPacketZoneId",  "kBaseId",   "kProtocolRevision"};
inline constexpr Variable flDataRateVariables[] = {"kFLDataRate"};
inline constexpr Variable rlDataRateVariables[] = {"kRLDataRate"};

/// The formats of numbers with a unit or with other texts around them, per file of decoders. The format of a
/// variable that shows pilots is that of each pilot.
void listEVDOFormats(std::vector<VariableFormat>& formats);
void listSearcherFormats(std::vector<VariableFormat>& formats);
void listDataRateFormats(std::vector<VariableFormat>& formats);

/// 0x1183: state of the EV-DO session, its channel, and its signal levels.
void decodeEVDOStatus(const Packet& packet, State& state, Lookup& lookup);
/// 0x12B6: strengths of the pilots in the EV-DO active set.
void decodeEVDOActiveSet(const Packet& packet, State& state, Lookup& lookup);
/// 0x108A: carrier-to-interference ratio of each EV-DO finger.
void decodeFingerC2I(const Packet& packet, State& state, Lookup& lookup);
/// 0x119C: state of the 1x device, its channels, signal levels, and active set.
void decode1xStatus(const Packet& packet, State& state, Lookup& lookup);
/// 0x119D: one more frame for the average frame error rate on the 1x traffic channel.
void decode1xTrafficFER(const Packet& packet, State& state, Lookup& lookup);
/// 0x134F: the system that serves the phone.
void decodeSystemInfo(const Packet& packet, State& state, Lookup& lookup);
/// 0x1192: the data rate of the EV-DO forward link since the previous packet.
void decodeFLDataRate(const Packet& packet, State& state, Lookup& lookup);
/// 0x127E: the data rate of the EV-DO reverse link since the previous packet.
void decodeRLDataRate(const Packet& packet, State& state, Lookup& lookup);

}  // namespace varnel::c2k
