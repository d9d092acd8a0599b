#include "programs/varnel-telephonyd/simulation/CDMA1xPhone.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

using State = CDMA1xConnection::State;

constexpr Access access = Access::CDMA1xRTT;
// -13 and -15 dB.
constexpr PilotSet::Thresholds thresholds{ReceivedPilot::whole * 50 / 1000, ReceivedPilot::whole * 32 / 1000};

constexpr std::int64_t receiverNoise_cdb = 40, secondReceiverLoss_cdb = 1'50, powerControlNoise_cdb = 80;

// The network sends with the power at which one frame of a hundred is erased, as long as it has that much.
constexpr std::int64_t framesPerErasure = 100;
constexpr std::int64_t neededStrength_cdb = -11'50, fading_cdb = 1'70;

// Another network that accepts the phone.
constexpr CDMASystem partner{.roamingIndicator = 7,
                             .system = 4157,
                             .network = 3,
                             .packetZone = 0,
                             .protocolRevision = 6,
                             .baseStation = 0};
constexpr CDMASystem home{.roamingIndicator = 0,
                          .system = 4139,
                          .network = 1,
                          .packetZone = 0,
                          .protocolRevision = 9,
                          .baseStation = 0};
constexpr int packetZones = 250;

}  // namespace

CDMA1xPhone::CDMA1xPhone(const Walk& walk, Random random)
    : _walk(walk),
      _random(random),
      _selection(walk, cdmaMasts),
      _connection(_random.fork()),
      _activeSet(thresholds),
      _commonChannel(walk.cells(access).front().cell->channel),
      _channel(_commonChannel) {}

CDMA1xPhone::Changes CDMA1xPhone::step(std::chrono::milliseconds now) {
  Changes changes{.cell = _selection.update()};
  changes.state = _connection.update(now);
  if (changes.state) chooseChannel();
  updateActiveSet();
  return changes;
}

// Calls are distributed over the carriers.
void CDMA1xPhone::chooseChannel() {
  const bool isMoved = _connection.state() == State::Traffic && _random.oneIn(2);
  _channel = isMoved ? nextCarrierBelow(_commonChannel) : _commonChannel;
}

void CDMA1xPhone::updateActiveSet() {
  const Cell& serving = _selection.servingCell();
  if (_connection.state() == State::Traffic)
    _activeSet.update(receiveCDMACarrier(_walk, access), serving);
  else
    _activeSet.reset(_connection.hasPilot() ? &serving : nullptr);
}

CDMA1xStatus CDMA1xPhone::status() {
  const CDMACarrier carrier = receiveCDMACarrier(_walk, access);
  const Cell& serving = _selection.servingCell();
  const std::int64_t correction_cdb = _random.noise(powerControlNoise_cdb);
  return {.state = _connection.state(),
          .bandClass = serving.band,
          .channel = _channel,
          .level_cdbm = carrier.level_cdbm + _random.noise(receiverNoise_cdb),
          .secondLevel_cdbm = carrier.level_cdbm - secondReceiverLoss_cdb + _random.noise(receiverNoise_cdb),
          .transmitPower_cdbm =
              std::min(openLoopPower_cdbm(carrier.level_cdbm) + correction_cdb, mostTransmitPower_cdbm),
          .referencePilot = serving.code,
          .pilots = _activeSet.pilots(carrier)};
}

Frame CDMA1xPhone::nextFrame() {
  std::int64_t strength = 0;
  for (const ReceivedPilot& pilot : _activeSet.pilots(receiveCDMACarrier(_walk, access)))
    strength += pilot.strength;
  const bool isFaded = strength_cdb(strength) + _random.noise(fading_cdb) < neededStrength_cdb;
  return isFaded || _random.oneIn(framesPerErasure) ? Frame::Erased : Frame::Good;
}

CDMASystem CDMA1xPhone::system() const {
  const Cell& serving = _selection.servingCell();
  CDMASystem system = serving.area % 3 == 0 ? partner : home;
  system.packetZone = serving.area % packetZones + 1;
  system.baseStation = static_cast<int>(serving.identity);
  return system;
}

}  // namespace varnel::simulation
