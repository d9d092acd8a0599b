#include <cmath>
#include <optional>

#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/DisplayVariables.h"
#include "LogGenerator/C2K/PacketDecoders.h"
#include "LogGenerator/C2K/PilotStrengths.h"
#include "LogGenerator/C2K/Subpackets.h"
#include "base/Log.h"

namespace varnel::c2k {

namespace {

constexpr std::string_view deviceStates[] = {
    "Inactive [0]",
    "Deep sleep in start state [1]",
    "Initial state for CDMA operation [2]",
    "Acquisition [3]",
    "Sync [4]",
    "Slew [5]",
    "Paging [6]",
    "Slotted mode sleep state [7]",
    "Traffic [8]",
    "UnSlew [9]",
    "Operation in PCG state [10]",
    "Powerup state [11]",
};
constexpr std::uint8_t trafficState = 8;

constexpr Source deviceState = u8(4);
constexpr VariableField systemState[] = {
    {deviceState, "k1xDeviceState", entry(deviceStates, integer("[Bad Value %d]"))},
};
constexpr VariableField firstChain[] = {
    {u8(4), "k1xRx0BandClass", bandClass},
    {u16(6), "k1xRx0ChanNum"},
};
constexpr VariableField secondChain[] = {
    {u8(5), "k1xRx1BandClass", bandClass},
    {u16(8), "k1xRx1ChanNum"},
};
constexpr Variable firstReceiveLevel = "k1xRxAGC0";
constexpr Variable secondReceiveLevel = "k1xRxAGC1";
constexpr Variable transmitLevel = "k1xTxAGC";
constexpr Variable levels[] = {firstReceiveLevel, secondReceiveLevel, transmitLevel};
constexpr Variable inTrafficOnly[] = {"k1xRx1BandClass", "k1xRx1ChanNum", secondReceiveLevel, transmitLevel};
constexpr Format dBm = real("%+.2f dBm");

constexpr Variable activeSetVariable = "k1xActiveSetInfo";
constexpr Format referencePilot = real("(ref pilot) %+.2f dB");

constexpr Variable trafficFERVariable = "k1xTrafficFER";
constexpr Format errorRate = real("%.02f%%");
constexpr Format oldErrorRate = real("%.02f%% (old)");

double receiveAGC(std::int8_t raw) { return raw * 334 / 1000.0 - 63.248; }

double transmitPower(std::uint16_t tenths) { return static_cast<std::int16_t>(tenths) / 10.0; }

void showRF(const Packet& rf, bool isInTraffic, Lookup& lookup) {
  storeDisplayFields(rf, firstChain, lookup);
  storeDisplayNumber(firstReceiveLevel, dBm, receiveAGC(static_cast<std::int8_t>(rf.u8(10))), lookup);
  if (isInTraffic) {
    storeDisplayFields(rf, secondChain, lookup);
    storeDisplayNumber(secondReceiveLevel, dBm, receiveAGC(static_cast<std::int8_t>(rf.u8(11))), lookup);
    storeDisplayNumber(transmitLevel, dBm, transmitPower(rf.u16(12)), lookup);
  } else {
    for (const Variable variable : inTrafficOnly) storeDisplayText(variable, "N/A", lookup);
  }
}

// The scale of the energies that the searcher measures.
struct Integration {
  double length;
  double gain;
  int exponent;
};

// The strength of a pilot, Ec/Io. A NaN, or a value that is too small, shows as the minimum, -50 dB.
double pilotStrength(const Integration& integration, std::uint16_t energy) {
  constexpr double floor = 0.00001;
  const double n = integration.length;
  const double ratio =
      std::ldexp(1.0, 2 * integration.exponent - 3) * energy / (9.0 * n * n * integration.gain) - 1.0 / n;
  return decibels(ratio > floor ? ratio : floor);
}

void showActiveSet(const Packet& activeSet, Lookup& lookup) {
  const Integration integration{.length = static_cast<double>(activeSet.u16(4)),
                                .gain = static_cast<double>(activeSet.u8(6)),
                                .exponent = activeSet.u8(7)};
  const std::uint8_t count = activeSet.u8(8);
  const std::size_t extensions = activeSet.u8(9);
  const std::uint16_t referencePN = activeSet.u16(10);
  const std::size_t stride = (6 * extensions + 15) & 0xFFC;
  PilotStrengths pilots(activeSetVariable, lookup);
  for (std::uint8_t i = 0; i < count; ++i) {
    const std::uint16_t pn = activeSet.u16(12 + i * stride);
    const std::uint16_t energy = activeSet.u16(24 + 4 * extensions + i * stride);
    pilots.add(i, pn, pn == referencePN ? referencePilot : decibelFormat, pilotStrength(integration, energy));
  }
  // Kept: unlike in EV-DO, an active set without pilots shows no text.
  pilots.publish();
}

// The frame error rate between 0 and 1. Every step is computed in single precision.
std::optional<float> trafficFER(const State& state) {
  const Value& rate = state.bound.trafficFER.get(state.entries);
  if (const auto real = rate.real()) return static_cast<float>(*real);
  if (const auto integer = rate.integer()) return static_cast<float>(*integer);
  return std::nullopt;
}

// Shows the rate of the ended call once more. The next call starts a new average.
void endTrafficFER(State& state, Lookup& lookup) {
  const auto rate = trafficFER(state);
  if (!rate) return;
  storeDisplayNumber(trafficFERVariable, oldErrorRate, *rate * 100.0F, lookup);
  state.entries.remove(state.bound.trafficFER.key());
}

}  // namespace

void decode1xStatus(const Packet& packet, State& state, Lookup& lookup) {
  const auto system = findSubpacket(packet, SubpacketId::SystemState);
  const auto rf = findSubpacket(packet, SubpacketId::RF);
  const auto activeSet = findSubpacket(packet, SubpacketId::ActiveSetInfo);
  const auto fingers = findSubpacket(packet, SubpacketId::FingerInfo);
  // Kept: the fingers are required, but nothing reads them.
  if (!system || !rf || !activeSet || !fingers) {
    logWarning("Log code 0x119c: missing subpacket (ss=%d,rf=%d,ai=%d,fi=%d).", system.has_value(),
               rf.has_value(), activeSet.has_value(), fingers.has_value());
    return;
  }
  const bool isInTraffic = system->u8(deviceState.byte) == trafficState;
  storeDisplayFields(*system, systemState, lookup);
  showRF(*rf, isInTraffic, lookup);
  showActiveSet(*activeSet, lookup);
  if (!isInTraffic) endTrafficFER(state, lookup);
}

void decode1xTrafficFER(const Packet& packet, State& state, Lookup& lookup) {
  constexpr std::size_t erasureOffset = 24;
  const auto demodulation = findSubpacket(packet, SubpacketId::TrafficDemodulation);
  if (!demodulation) {
    logWarning("Log code 0x119d: missing traffic demod subpacket.");
    return;
  }
  const float sample = demodulation->u8(erasureOffset) ? 1.0F / 64 : 0.0F;
  const auto previous = trafficFER(state);
  const float rate = previous ? sample + *previous * (63.0F / 64) : sample;
  state.bound.trafficFER.set(state.entries, Value::ofReal(rate));
  storeDisplayNumber(trafficFERVariable, errorRate, rate * 100.0F, lookup);
}

void listSearcherFormats(std::vector<VariableFormat>& formats) {
  for (const Variable variable : levels) formats.push_back({variable, dBm});
  for (const Format& format : {referencePilot, decibelFormat}) formats.push_back({activeSetVariable, format});
  for (const Format& format : {errorRate, oldErrorRate}) formats.push_back({trafficFERVariable, format});
}

}  // namespace varnel::c2k
