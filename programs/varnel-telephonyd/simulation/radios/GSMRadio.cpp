#include "programs/varnel-telephonyd/simulation/radios/GSMRadio.h"

#include <utility>

#include "programs/varnel-telephonyd/simulation/GPRSBroadcast.h"
#include "programs/varnel-telephonyd/simulation/GSMCells.h"
#include "programs/varnel-telephonyd/simulation/radios/GSMMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/OlderMessagePackets.h"

namespace varnel::simulation {

namespace {
using State = GSMConnection::State;
}  // namespace

GSMRadio::GSMRadio(PhoneLink link, Random random)
    : _link(std::move(link)), _random(random), _connection(_random.fork()) {
  _temporaryIdentity = static_cast<std::uint32_t>(_random.between(0x10000000, 0x3FFFFFFF));
}

void GSMRadio::arrive() {
  _connection.arrive(_link.situation().now);
  stateChanged();
  reportCell();
  sendLocationUpdate();
}

void GSMRadio::leave() {
  _connection.leave(_link.situation().now);
  stateChanged();
}

void GSMRadio::step() {
  if (_connection.update(_link.situation().now)) stateChanged();
}

void GSMRadio::cellChanged() {
  if (_connection.cellChanged(_link.situation().now)) stateChanged();
  reportCell();
}

void GSMRadio::sendLocationUpdate() {
  const Situation situation = _link.situation();
  _link.send(olderNASMessage(situation.now, NASDirection::ToNetwork,
                             gsmMessages::locationUpdateRequest(situation.serving, _temporaryIdentity)));
  _link.send(olderNASMessage(situation.now, NASDirection::FromNetwork,
                             gsmMessages::locationUpdateAccept(situation.serving)));
}

void GSMRadio::stateChanged() {
  const Situation situation = _link.situation();
  _link.send(gsmConnectionState(situation, _connection));
  if (_connection.isSpeaking()) {
    _link.send(olderNASMessage(situation.now, NASDirection::ToNetwork,
                               gsmMessages::serviceRequest(_temporaryIdentity)));
    _link.send(olderNASMessage(situation.now, NASDirection::FromNetwork, gsmMessages::serviceAccept()));
    reportCall();
  }
  if (_connection.state() == State::Release)
    _link.send(gsmMessage(situation.now, GSMChannel::Dedicated, gsmMessages::channelRelease()));
}

void GSMRadio::reportCell() {
  const Situation situation = _link.situation();
  _link.send(gsmServingCell(situation));
  _link.send(
      gsmMessage(situation.now, GSMChannel::Broadcast, gsmMessages::systemInformation3(situation.serving)));
  for (const auto& packet : {gprsInformationPosition, gprsCellOptions, gprsTimers, gprsPacketBroadcastChannel,
                             gprsSystemInformation})
    _link.send(packet(situation));
}

void GSMRadio::reportCall() {
  const Situation situation = _link.situation();
  _link.send(gsmMobileAllocation(situation));
  _link.send(gsmDedicatedChannel(situation, _random));
  _link.send(gsmDiscontinuousTransmission(situation, _random));
}

void GSMRadio::report() {
  const Situation situation = _link.situation();
  ++_reports;
  if (_reports % 5 == 0) reportCell();
  if (_reports % 3 == 0 && isIdle())
    _link.send(gsmMessage(situation.now, GSMChannel::Common, gsmMessages::emptyPaging()));
  _link.send(gsmNeighborIdentities(situation));
  _link.send(gsmMeasurements(situation, _connection));
  if (_connection.isSpeaking()) reportCall();
}

}  // namespace varnel::simulation
