#include "programs/varnel-telephonyd/simulation/radios/NRRadio.h"

#include <utility>

#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/NRMessagePackets.h"
#include "programs/varnel-telephonyd/simulation/radios/NRMessages.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;
constexpr auto besideLTE = NRMessageLayout::Version8, alone = NRMessageLayout::Version17;
constexpr int region = 2, set = 5, pointer = 1;

}  // namespace

NRRadio::NRRadio(PhoneLink link, Random random, Network home) : _link(std::move(link)), _random(random) {
  _name = {.network = home,
           .group = region << 10 | set,
           .code = pointer,
           .number = static_cast<std::uint32_t>(_random.between(0x10000000, 0xEFFFFFFF))};
}

void NRRadio::after(std::chrono::milliseconds delay, std::function<void()> task) {
  _script.at(_link.situation().now + delay, std::move(task));
}

const Cell* NRRadio::servingCell(const std::vector<NRMeasurement>& cells) const {
  return isAlone() ? &_link.situation().serving : cells.front().cell;
}

void NRRadio::addToLTE() {
  const auto cells = measureNRCells(_link.situation().walk, _random);
  if (cells.empty()) return;
  const Cell& cell = *cells.front().cell;
  const auto now = _link.situation().now;
  _link.send(nrMessage(now, cell, besideLTE, NRChannel::BareReconfiguration, nrMessages::reconfiguration()));
  after(10ms, [this, &cell] {
    _link.send(nrMessage(_link.situation().now, cell, besideLTE, NRChannel::BareReconfigurationComplete,
                         nrMessages::reconfigurationComplete()));
  });
  after(40ms, [this, &cell] {
    const auto later = _link.situation().now;
    _link.send(nrMessage(later, cell, besideLTE, NRChannel::Broadcast,
                         nrMessages::masterInformation(FrameClock(cell, later).frame)));
    _link.send(nrMasterInformation(later, cell, NRMasterInformationLayout::Version3));
  });
}

void NRRadio::arrive() {
  _state = FiveGMMState::Registering;
  reportCell();
  reportRegistration();
  const auto send = [this](NRChannel channel, ByteView message) {
    const Situation situation = _link.situation();
    _link.send(nrMessage(situation.now, situation.serving, alone, channel, message));
  };
  const auto sendNAS = [this](NRNASKind kind, ByteView message) {
    _link.send(nrNASMessage(_link.situation().now, kind, message));
  };
  send(NRChannel::UplinkCommon, nrMessages::setupRequest(_name));
  after(20ms, [=] { send(NRChannel::DownlinkCommon, nrMessages::setup()); });
  after(30ms, [=, this] {
    const Bytes request = nrMessages::registrationRequest(_name);
    sendNAS(NRNASKind::MobilityToNetwork, request);
    send(NRChannel::UplinkDedicated, nrMessages::setupComplete(request));
  });
  after(200ms, [=, this] {
    sendNAS(NRNASKind::MobilityFromNetwork, nrMessages::registrationAccept());
    sendNAS(NRNASKind::MobilityToNetwork, nrMessages::registrationComplete());
    _state = FiveGMMState::Registered;
    reportRegistration();
  });
  after(300ms, [=] {
    sendNAS(NRNASKind::SessionToNetwork, nrMessages::sessionRequest());
    sendNAS(NRNASKind::SessionFromNetwork, nrMessages::sessionAccept());
  });
}

void NRRadio::cellChanged() { reportCell(); }

void NRRadio::leave() {
  const Situation situation = _link.situation();
  _link.send(nrMessage(situation.now, situation.serving, alone, NRChannel::DownlinkDedicated,
                       nrMessages::release()));
  _state = FiveGMMState::Deregistered;
  reportRegistration();
}

void NRRadio::report() {
  const Situation situation = _link.situation();
  const bool isEven = ++_reports % 2 == 0;
  if (isAlone() && _reports % 3 == 0) {
    reportCell();
    reportRegistration();
  }
  const auto cells = measureNRCells(situation.walk, _random);
  if (cells.empty()) return;
  const Cell* serving = servingCell(cells);
  _link.send(
      nrMeasurements(situation.now, cells, serving,
                     isEven ? NRMeasurementLayout::Version2Minor9 : NRMeasurementLayout::Version3Minor0));
  if (_reports % 5 == 0) {
    const NRMeasurement& best = cells.front();
    _link.send(nrMessage(situation.now, *best.cell, isAlone() ? alone : besideLTE, NRChannel::UplinkDedicated,
                         nrMessages::measurementReport(*best.cell, best.rsrp, best.rsrq)));
  }
}

void NRRadio::reportCell() {
  const Situation situation = _link.situation();
  const bool isEven = _reports % 2 == 0;
  _link.send(nrMasterInformation(
      situation.now, situation.serving,
      isEven ? NRMasterInformationLayout::Version3 : NRMasterInformationLayout::Version2Minor0));
  _link.send(nrServingCell(situation.now, situation.serving,
                           isEven ? NRServingCellLayout::Version4 : NRServingCellLayout::Version3Minor2));
}

void NRRadio::reportRegistration() {
  _link.send(nrRegistration(
      _link.situation(), _state, _name,
      _reports % 2 == 0 ? NRRegistrationLayout::Version1 : NRRegistrationLayout::Version3Minor0));
}

}  // namespace varnel::simulation
