#include "programs/varnel-telephonyd/simulation/GSMUMTSModem.h"

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/GPRSBroadcast.h"
#include "programs/varnel-telephonyd/simulation/GSMCells.h"
#include "programs/varnel-telephonyd/simulation/NetworkIdentity.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/UMTSCells.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;
using UMTSState = UTRANConnection::State;
using GSMState = GSMConnection::State;

constexpr std::uint16_t umtsStateCode = 0x4125, cipheringCode = 0x4157;

// The shortest and the longest first stay in UMTS, and the shortest and the longest later stay.
constexpr std::int64_t shortestFirst_s = 14, longestFirst_s = 18, shortest_s = 16, longest_s = 40;

}  // namespace

GSMUMTSModem::GSMUMTSModem(Random random)
    : WalkingModem(random, Access::UMTS),
      _random(random.fork()),
      _umts(random.fork()),
      _channels(random.fork()),
      _gsm(random.fork()) {
  _phaseEnd = std::chrono::seconds(_random.between(shortestFirst_s, longestFirst_s));
  repeat({.first = 20ms, .interval = 8s, .jitter = 300ms}, [this] { sendMobility(); });
  repeat({.first = 30ms, .interval = 6s, .jitter = 300ms}, [this] { sendServingNetwork(); });
  repeat({.first = 40ms, .interval = 15s, .jitter = 300ms}, [this] { sendEquivalentNetworks(); });
  const auto onUMTS = [this](Pace pace, auto task) { repeatOn(Access::UMTS, pace, task); };
  const auto onGSM = [this](Pace pace, auto task) { repeatOn(Access::GSM, pace, task); };
  onUMTS({.first = 50ms, .interval = 5s, .jitter = 300ms}, &GSMUMTSModem::sendUMTSServingCell);
  onUMTS({.first = 60ms, .interval = 7s, .jitter = 100ms}, &GSMUMTSModem::sendUMTSState);
  onUMTS({.first = 70ms, .interval = 9s, .jitter = 100ms}, &GSMUMTSModem::sendCiphering);
  onUMTS({.first = 80ms, .interval = 1500ms, .jitter = 100ms}, &GSMUMTSModem::sendUMTSCells);
  onUMTS({.first = 90ms, .interval = 2s, .jitter = 100ms}, &GSMUMTSModem::sendRanking);
  onUMTS({.first = 500ms, .interval = 2s, .jitter = 100ms}, &GSMUMTSModem::sendChannels);
  onUMTS({.first = 600ms, .interval = 1900ms, .jitter = 50ms}, &GSMUMTSModem::sendHighSpeed);
  onGSM({.first = 50ms, .interval = 5s, .jitter = 300ms}, &GSMUMTSModem::sendGSMServingCell);
  onGSM({.first = 60ms, .interval = 7s, .jitter = 100ms}, &GSMUMTSModem::sendGSMState);
  onGSM({.first = 80ms, .interval = 1400ms, .jitter = 50ms}, &GSMUMTSModem::sendGSMMeasurements);
  onGSM({.first = 90ms, .interval = 11s, .jitter = 100ms}, &GSMUMTSModem::sendBroadcast);
  onGSM({.first = 500ms, .interval = 2s, .jitter = 100ms}, &GSMUMTSModem::sendCall);
}

std::string_view GSMUMTSModem::technology() const { return varnel::technology::kalviGSMUMTS; }

void GSMUMTSModem::repeatOn(Access access, Pace pace, void (GSMUMTSModem::*task)()) {
  repeat(pace, [=, this] {
    if (servingCell().access == access) (this->*task)();
  });
}

void GSMUMTSModem::stepWalked() {
  if (servingCell().access == Access::UMTS)
    stepUMTS();
  else
    stepGSM();
  const bool wasRegistered = _mobility.isRegistered();
  if (_mobility.update(now())) registrationChanged(wasRegistered);
}

void GSMUMTSModem::stepUMTS() {
  if (_umts.update(now())) umtsStateChanged();
  const bool isBusy = _umts.state() == UMTSState::Connecting || _umts.state() == UMTSState::CellDCH;
  if (now() < _phaseEnd || isBusy) return;
  _umts.end(now());
  umtsStateChanged();
  _gsm.arrive(now());
  changePhase(Access::GSM);
}

void GSMUMTSModem::stepGSM() {
  if (_gsm.update(now())) gsmStateChanged();
  if (_gsm.state() == GSMState::Inactive) {
    _umts.end(now());
    changePhase(Access::UMTS);
  } else if (now() >= _phaseEnd && _gsm.state() == GSMState::Idle) {
    _gsm.leave(now());
    gsmStateChanged();
  }
}

void GSMUMTSModem::changePhase(Access access) {
  _phaseEnd = now() + std::chrono::seconds(_random.between(shortest_s, longest_s));
  changeAccess(access);
}

void GSMUMTSModem::servingCellChanged(const Cell& previous) {
  const Cell& cell = servingCell();
  const bool isInAnotherArea = cell.area != previous.area;
  if (cell.network != previous.network)
    _mobility.networkChanged(now());
  else if (isInAnotherArea)
    _mobility.areaChanged(now());
  sendServingNetwork();

  if (cell.access == Access::GSM) {
    if (previous.access != Access::GSM || _gsm.cellChanged(now())) gsmStateChanged();
    sendGSMServingCell();
    sendBroadcast();
    sendGSMMeasurements();
    return;
  }
  using Area = UTRANConnection::Area;
  const bool isStateChanged = previous.access == Access::UMTS &&
                              _umts.cellChanged(now(), isInAnotherArea ? Area::Another : Area::Same);
  sendUMTSServingCell();
  sendUMTSCells();
  if (isStateChanged || previous.access != Access::UMTS) umtsStateChanged();
}

void GSMUMTSModem::umtsStateChanged() {
  const UMTSState state = _umts.state();
  _channels.configure(state, now());
  sendUMTSState();
  if (state == UMTSState::Connecting || state == UMTSState::CellDCH)
    _mobility.callBegan(now(), Access::UMTS);
  else
    _mobility.callEnded(now());
  if (state == UMTSState::Disconnected || state == UMTSState::CellDCH) sendCiphering();
}

void GSMUMTSModem::gsmStateChanged() {
  sendGSMState();
  if (_gsm.isSpeaking()) {
    _mobility.callBegan(now(), Access::GSM);
    sendCall();
  } else {
    _mobility.callEnded(now());
  }
}

void GSMUMTSModem::registrationChanged(bool wasRegistered) {
  sendMobility();
  if (_mobility.isRegistered() == wasRegistered) return;
  sendServingNetwork();
  if (_mobility.isRegistered()) sendEquivalentNetworks();
}

void GSMUMTSModem::sendUMTSServingCell() { send(umtsServingCell(situation())); }

void GSMUMTSModem::sendUMTSState() {
  constexpr std::size_t size = 14;
  send(PacketWriter(umtsStateCode, now(), size).u8(13, static_cast<std::int64_t>(_umts.state())).finish());
}

// A connection is encrypted from its first dedicated channel to its end.
void GSMUMTSModem::sendCiphering() {
  constexpr std::size_t size = 19;
  const bool isCiphered = _umts.state() != UMTSState::Disconnected && _umts.state() != UMTSState::Connecting;
  send(PacketWriter(cipheringCode, now(), size).u8(13, isCiphered).finish());
}

void GSMUMTSModem::sendUMTSCells() { send(umtsCellSets(situation(), _umts.state(), _random)); }

// On a dedicated channel, the network chooses the cells.
void GSMUMTSModem::sendRanking() {
  if (_umts.state() == UMTSState::CellDCH) return;
  send(_ranksGSM ? gsmRanking(situation()) : umtsRanking(situation()));
  _ranksGSM = !_ranksGSM;
}

void GSMUMTSModem::sendChannels() {
  if (!_umts.hasChannels()) return;
  send(_channels.transmitPower(situation()));
  send(_channels.blockErrors(situation()));
}

void GSMUMTSModem::sendHighSpeed() {
  if (_umts.state() == UMTSState::CellDCH) send(_channels.highSpeed(situation()));
}

void GSMUMTSModem::sendGSMServingCell() { send(gsmServingCell(situation())); }

void GSMUMTSModem::sendGSMState() { send(gsmConnectionState(situation(), _gsm)); }

void GSMUMTSModem::sendGSMMeasurements() {
  send(gsmNeighborIdentities(situation()));
  send(gsmMeasurements(situation(), _gsm));
}

void GSMUMTSModem::sendBroadcast() {
  send(gprsInformationPosition(situation()));
  send(gprsCellOptions(situation()));
  send(gprsTimers(situation()));
  send(gprsPacketBroadcastChannel(situation()));
  send(gprsSystemInformation(situation()));
}

void GSMUMTSModem::sendCall() {
  if (!_gsm.isSpeaking()) return;
  send(gsmMobileAllocation(situation()));
  send(gsmDedicatedChannel(situation(), _random));
  send(gsmDiscontinuousTransmission(situation(), _random));
}

void GSMUMTSModem::sendMobility() {
  send(_mobility.registrationState(situation()));
  send(_mobility.circuitState(situation()));
  send(_mobility.packetState(situation()));
}

void GSMUMTSModem::sendServingNetwork() {
  const Service service = _mobility.isRegistered()  ? Service::CircuitsAndPackets
                          : _mobility.isSearching() ? Service::None
                                                    : Service::Limited;
  send(servingNetwork(situation(), service));
}

void GSMUMTSModem::sendEquivalentNetworks() {
  send(equivalentNetworks(situation(), _mobility.isRegistered()));
}

}  // namespace varnel::simulation
