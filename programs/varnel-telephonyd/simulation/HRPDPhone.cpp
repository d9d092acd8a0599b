#include "programs/varnel-telephonyd/simulation/HRPDPhone.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

using State = HRPDConnection::State;
using Session = HRPDConnection::Session;

constexpr Access access = Access::HRPD;
// -7 and -9 dB.
constexpr PilotSet::Thresholds thresholds{ReceivedPilot::whole * 200 / 1000,
                                          ReceivedPilot::whole * 126 / 1000};

constexpr std::int64_t receiverNoise_cdb = 40, secondReceiverLoss_cdb = 1'50, powerControlNoise_cdb = 80;
// The level of a receiver that is switched off.
constexpr std::int64_t noLevel_cdbm = -106'00;
constexpr std::int64_t highestAddress = (1 << 24) - 1;

constexpr std::size_t fingerCount = 6;
// The shares of a pilot's power on its paths. Any path but the first may be missing.
constexpr std::int64_t pathParts_percent[] = {68, 24, 8};
constexpr std::int64_t carrierUnits = 512;
constexpr std::int64_t weakestFinger = 10;  // -17 dB

constexpr std::int64_t stepsPerSecond = std::chrono::seconds(1) / Walk::stepTime;

std::int64_t carrierToInterference(std::int64_t strength) {
  return strength * carrierUnits / std::max<std::int64_t>(ReceivedPilot::whole - strength, 1);
}

}  // namespace

HRPDPhone::HRPDPhone(const Walk& walk, Random random)
    : _walk(walk),
      _random(random),
      _selection(walk, cdmaMasts),
      _connection(_random.fork()),
      _activeSet(thresholds),
      _channel(_selection.servingCell().channel) {}

HRPDPhone::Changes HRPDPhone::step(std::chrono::milliseconds now, HRPDConnection::Radio radio) {
  const Session session = _connection.session();
  const int area = _selection.servingCell().area;
  Changes changes{.cell = _selection.update()};
  changes.state = _connection.update(now, radio);
  if (changes.state) chooseChannel();
  chooseAddress(session, area);
  const CDMACarrier carrier = receiveCDMACarrier(_walk, access);
  updateActiveSet(carrier);
  if (_connection.carriesData()) transfer(carrier);
  return changes;
}

// Connections are distributed over the carriers.
void HRPDPhone::chooseChannel() {
  const int channel = _selection.servingCell().channel;
  const bool isMoved = _connection.carriesData() && _random.oneIn(2);
  _channel = isMoved ? nextCarrierBelow(channel) : channel;
}

// A session has an address from its start. In another area it gets another address.
void HRPDPhone::chooseAddress(Session previous, int previousArea) {
  const Session session = _connection.session();
  const bool isBegun = previous == Session::Closed && session != Session::Closed;
  const bool isMoved = session == Session::Open && _selection.servingCell().area != previousArea;
  if (session == Session::Closed)
    _address = 0;
  else if (isBegun || isMoved)
    _address = _random.between(1, highestAddress);
}

void HRPDPhone::updateActiveSet(const CDMACarrier& carrier) {
  const Cell& serving = _selection.servingCell();
  if (_connection.state() == State::Connected)
    _activeSet.update(carrier, serving);
  else
    _activeSet.reset(_connection.hasPilot() ? &serving : nullptr);
}

// The masts also serve other phones.
void HRPDPhone::transfer(const CDMACarrier& carrier) {
  constexpr std::int64_t slots = ForwardPackets::slotsPerSecond / stepsPerSecond;
  constexpr std::int64_t subframes = ReversePackets::subframesPerSecond / stepsPerSecond;
  const std::int64_t strength = carrier.strength(_selection.servingCell());
  _received.receive(carrierToInterference(strength), _random.between(slots / 4, slots * 3 / 4), _random);
  const std::int64_t headroom_cdb = mostTransmitPower_cdbm - openLoopPower_cdbm(carrier.level_cdbm);
  _sent.send({_activeSet.pilots(carrier).size(), headroom_cdb / 100}, _random.between(2, subframes), _random);
}

HRPDStatus HRPDPhone::status() {
  const Cell& serving = _selection.servingCell();
  const std::int64_t level_cdbm = receiveCDMACarrier(_walk, access).level_cdbm;
  const std::int64_t noises_cdb[] = {_random.noise(receiverNoise_cdb), _random.noise(receiverNoise_cdb),
                                     _random.noise(powerControlNoise_cdb)};
  const bool isOff = _connection.state() == State::Inactive;
  HRPDStatus status{
      .state = _connection.state(),
      .session = _connection.session(),
      .bandClass = serving.band,
      .channel = _channel,
      .level_cdbm = isOff ? noLevel_cdbm : level_cdbm + noises_cdb[0],
      .secondLevel_cdbm = isOff ? noLevel_cdbm : level_cdbm - secondReceiverLoss_cdb + noises_cdb[1],
      .transmitPower_cdbm = leastTransmitPower_cdbm,
      .servingPilot = std::nullopt,
      .address = _address,
      .colorCode = serving.area % 256};
  if (_connection.hasPilot()) status.servingPilot = serving.code;
  if (_connection.transmits())
    status.transmitPower_cdbm =
        std::min(openLoopPower_cdbm(level_cdbm) + noises_cdb[2], mostTransmitPower_cdbm);
  return status;
}

std::vector<ReceivedPilot> HRPDPhone::activeSet() const {
  return _activeSet.pilots(receiveCDMACarrier(_walk, access));
}

// Fingers without a path keep their places between the others.
std::vector<Finger> HRPDPhone::fingers() {
  std::vector<Finger> fingers;
  if (_connection.state() == State::Inactive) return fingers;
  for (const ReceivedPilot& pilot : activeSet()) {
    for (const std::int64_t part_percent : pathParts_percent) {
      const std::int64_t ratio = carrierToInterference(pilot.strength * part_percent / 100);
      const bool isMissing = part_percent != pathParts_percent[0] && _random.oneIn(3);
      fingers.push_back(isMissing || ratio < weakestFinger ? Finger{} : Finger{pilot.cell, ratio});
    }
  }
  fingers.resize(fingerCount);
  return fingers;
}

}  // namespace varnel::simulation
