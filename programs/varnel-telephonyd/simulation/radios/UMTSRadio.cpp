#include "programs/varnel-telephonyd/simulation/radios/UMTSRadio.h"

#include <utility>

#include "programs/varnel-telephonyd/simulation/UMTSCells.h"
#include "programs/varnel-telephonyd/simulation/radios/GSMMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/OlderMessagePackets.h"
#include "programs/varnel-telephonyd/simulation/radios/UMTSMessages.h"

namespace varnel::simulation {

namespace {

using State = UTRANConnection::State;
constexpr std::uint16_t stateCode = 0x4125, cipheringCode = 0x4157;

}  // namespace

UMTSRadio::UMTSRadio(PhoneLink link, Random random)
    : _link(std::move(link)), _random(random), _connection(_random.fork()), _channels(_random.fork()) {
  _temporaryIdentity = static_cast<std::uint32_t>(_random.between(0x10000000, 0x3FFFFFFF));
}

bool UMTSRadio::isBusy() const {
  return _connection.state() == State::Connecting || _connection.state() == State::CellDCH;
}

void UMTSRadio::arrive() {
  const Situation situation = _link.situation();
  _connection.end(situation.now);
  _link.send(umtsServingCell(situation));
  _link.send(umtsCellSets(situation, _connection.state(), _random));
  stateChanged();
}

void UMTSRadio::leave() {
  _connection.end(_link.situation().now);
  stateChanged();
}

void UMTSRadio::step() {
  if (_connection.update(_link.situation().now)) stateChanged();
}

void UMTSRadio::cellChanged(UTRANConnection::Area area) {
  const Situation situation = _link.situation();
  _link.send(umtsServingCell(situation));
  _link.send(umtsCellSets(situation, _connection.state(), _random));
  if (_connection.cellChanged(situation.now, area)) stateChanged();
}

void UMTSRadio::stateChanged() {
  const Situation situation = _link.situation();
  const Network& network = situation.serving.network;
  _channels.configure(_connection.state(), situation.now);
  if (_connection.state() == State::Connecting) {
    _link.send(umtsMessageOfCell(situation, UMTSChannel::Paging, umtsMessages::paging(_temporaryIdentity)));
    _link.send(umtsMessage(situation.now, UMTSChannel::UplinkCommon,
                           umtsMessages::connectionRequest(_temporaryIdentity, network.countryCode,
                                                           network.networkCode, situation.serving.area)));
  } else if (_connection.state() == State::CellDCH) {
    _link.send(olderNASMessage(situation.now, NASDirection::ToNetwork,
                               gsmMessages::serviceRequest(_temporaryIdentity)));
    _link.send(olderNASMessage(situation.now, NASDirection::FromNetwork, gsmMessages::serviceAccept()));
  } else if (_connection.state() == State::Disconnected && _isConnected) {
    _link.send(
        umtsMessage(situation.now, UMTSChannel::UplinkDedicated, umtsMessages::connectionReleaseComplete()));
  }
  _isConnected = _connection.state() != State::Disconnected;
  sendState();
}

void UMTSRadio::sendState() {
  constexpr std::size_t stateSize = 14, cipheringSize = 19;
  const State state = _connection.state();
  const bool isCiphered = state != State::Disconnected && state != State::Connecting;
  const auto now = _link.situation().now;
  _link.send(PacketWriter(stateCode, now, stateSize).u8(13, static_cast<std::int64_t>(state)).finish());
  _link.send(PacketWriter(cipheringCode, now, cipheringSize).u8(13, isCiphered).finish());
}

void UMTSRadio::report() {
  const Situation situation = _link.situation();
  ++_reports;
  if (_reports % 4 == 0) _link.send(umtsServingCell(situation));
  _link.send(umtsCellSets(situation, _connection.state(), _random));
  if (_connection.state() != State::CellDCH)
    _link.send(_reports % 2 == 0 ? umtsRanking(situation) : gsmRanking(situation));
  if (!_connection.hasChannels()) return;
  _link.send(_channels.transmitPower(situation));
  _link.send(_channels.blockErrors(situation));
  if (_connection.state() == State::CellDCH) _link.send(_channels.highSpeed(situation));
}

}  // namespace varnel::simulation
