#include "programs/varnel-telephonyd/simulation/radios/TravelingPhone.h"

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/CDMA1xPackets.h"
#include "programs/varnel-telephonyd/simulation/NetworkIdentity.h"
#include "programs/varnel-telephonyd/simulation/radios/EquivalentNetworks.h"
#include "programs/varnel-telephonyd/simulation/radios/Towns.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;

constexpr std::uint8_t subscription = 1;

}  // namespace

// A phase, and how long it takes at least and at most.
struct TravelingPhone::Stop {
  Phase phase;
  std::int64_t shortest_s, longest_s;
};
// The first connection registers the phone.
const TravelingPhone::Stop TravelingPhone::journey[] = {
    {Phase::Connected, 6, 8}, {Phase::Idle, 4, 6}, {Phase::NRBesideLTE, 9, 12}, {Phase::Idle, 5, 7},
    {Phase::NRAlone, 8, 10},  {Phase::Idle, 3, 5}, {Phase::Connected, 8, 12},   {Phase::UMTS, 20, 28},
    {Phase::GSM, 18, 26},     {Phase::Idle, 5, 8},
};

TravelingPhone::TravelingPhone(Random walkSource, Random own)
    : WalkingModem(
          walkSource, own,
          {.town = townOfHome, .home = homeNetwork, .subscription = subscription, .access = Access::LTE}),
      _random(own.fork()),
      _lte(link(), own.fork(), homeNetwork),
      _nr(link(), own.fork(), homeNetwork),
      _umts(link(), own.fork()),
      _gsm(link(), own.fork()),
      _cdma(walk(), own.fork()) {
  _phaseEnd = 8s;
  repeat({.first = 30ms, .interval = 1000h}, [this] { _lte.switchOn(); });
  repeat({.first = 40ms, .interval = 10ms}, [this] {
    _lte.run();
    _nr.run();
  });
  repeat({.first = 1500ms, .interval = 1s, .jitter = 30ms}, [this] { report(); });
  repeat({.first = 2s, .interval = 4s, .jitter = 50ms}, [this] { sendCDMA(); });
}

std::string_view TravelingPhone::technology() const { return varnel::technology::allRadios; }

PhoneLink TravelingPhone::link() {
  return {.situation = [this] { return situation(); },
          .send = [this](Bytes packet) { send(std::move(packet)); }};
}

TravelingPhone::Phase TravelingPhone::phase() const { return journey[_phase].phase; }

void TravelingPhone::stepWalked() {
  _cdma.step(now());
  stepRadio();
  stepMobility();
  if (now() >= _phaseEnd && canLeavePhase()) nextPhase();
}

void TravelingPhone::stepRadio() {
  if (phase() == Phase::UMTS) _umts.step();
  if (phase() == Phase::GSM || !_gsm.isGone()) _gsm.step();
}

// The registration for circuits follows the older radios. LTE and NR have their own.
void TravelingPhone::stepMobility() {
  const bool isBusy = phase() == Phase::UMTS ? _umts.isBusy() : phase() == Phase::GSM && _gsm.isSpeaking();
  if (isBusy && !_wasBusy) _mobility.callBegan(now(), servingCell().access);
  if (!isBusy && _wasBusy) _mobility.callEnded(now());
  _wasBusy = isBusy;
  if (!_mobility.update(now())) return;
  sendMobility();
  sendNetwork();
}

bool TravelingPhone::canLeavePhase() const {
  if (phase() == Phase::UMTS) return !_umts.isBusy();
  if (phase() == Phase::GSM) return _gsm.isIdle() || _gsm.isGone();
  return true;
}

void TravelingPhone::nextPhase() {
  const std::size_t next = (_phase + 1) % std::size(journey);
  leavePhase(journey[next].phase);
  _phase = next;
  _phaseEnd =
      now() + std::chrono::seconds(_random.between(journey[next].shortest_s, journey[next].longest_s));
  enterPhase();
}

void TravelingPhone::leavePhase(Phase next) {
  switch (phase()) {
    case Phase::Idle:
      break;
    case Phase::Connected:
    case Phase::NRBesideLTE:
      next == Phase::UMTS ? _lte.releaseToUMTS(walk().cells(Access::UMTS).front().cell->channel)
                          : _lte.release();
      break;
    case Phase::NRAlone:
      _nr.leave();
      break;
    case Phase::UMTS:
      _umts.leave();
      break;
    case Phase::GSM:
      _gsm.leave();
      break;
  }
}

void TravelingPhone::enterPhase() {
  switch (phase()) {
    case Phase::Idle:
      if (servingCell().access == Access::LTE) break;
      changeAccess(Access::LTE);
      _lte.arrive();
      break;
    case Phase::Connected:
    case Phase::NRBesideLTE:
      _lte.connect();
      if (phase() == Phase::NRBesideLTE) _nr.addToLTE();
      break;
    case Phase::NRAlone:
      changeAccess(Access::NR);
      _nr.arrive();
      break;
    case Phase::UMTS:
      changeAccess(Access::UMTS);
      _umts.arrive();
      _mobility.areaChanged(now());
      break;
    case Phase::GSM:
      changeAccess(Access::GSM);
      _gsm.arrive();
      _mobility.networkChanged(now());
      break;
  }
}

void TravelingPhone::servingCellChanged(const Cell& previous) {
  const Cell& cell = servingCell();
  // Who comes from another radio arrives.
  if (cell.access != previous.access) return;
  const bool isInAnotherArea = cell.area != previous.area;
  switch (cell.access) {
    case Access::LTE:
      _lte.cellChanged(isInAnotherArea ? LTERadio::Area::Another : LTERadio::Area::Same);
      break;
    case Access::NR:
      _nr.cellChanged();
      break;
    case Access::UMTS:
      _umts.cellChanged(isInAnotherArea ? UTRANConnection::Area::Another : UTRANConnection::Area::Same);
      if (isInAnotherArea) _mobility.areaChanged(now());
      break;
    case Access::GSM:
      _gsm.cellChanged();
      if (isInAnotherArea) _mobility.areaChanged(now());
      break;
    case Access::UTRAN:
    case Access::CDMA1xRTT:
    case Access::HRPD:
      break;
  }
}

void TravelingPhone::report() {
  ++_reports;
  switch (phase()) {
    case Phase::NRBesideLTE:
      _nr.report();
      _lte.report();
      break;
    case Phase::Idle:
    case Phase::Connected:
      _lte.report();
      break;
    case Phase::NRAlone:
      _nr.report();
      break;
    case Phase::UMTS:
      _umts.report();
      break;
    case Phase::GSM:
      _gsm.report();
      break;
  }
  if (phase() != Phase::UMTS && phase() != Phase::GSM) return;
  if (_reports % 6 == 0) sendMobility();
  if (_reports % 5 == 0) sendNetwork();
}

void TravelingPhone::sendMobility() {
  send(_mobility.registrationState(situation()));
  send(_mobility.circuitState(situation()));
  send(_mobility.packetState(situation()));
}

void TravelingPhone::sendNetwork() {
  const Service service = _mobility.isRegistered()  ? Service::CircuitsAndPackets
                          : _mobility.isSearching() ? Service::None
                                                    : Service::Limited;
  send(servingNetwork(situation(), service));
  if (!_mobility.isRegistered())
    send(packedEquivalentNetworks(now(), {}));
  else if (servingCell().network == homeNetwork)
    send(packedEquivalentNetworks(now(), {partnerNetwork, distantNetwork}));
  else
    send(packedEquivalentNetworks(now(), {homeNetwork}));
}

void TravelingPhone::sendCDMA() {
  send(cdma1xStatusPacket(now(), _cdma.status()));
  if (_cdma.connection().isIdle()) send(cdmaSystemPacket(now(), _cdma.system()));
}

}  // namespace varnel::simulation
