#include "programs/varnel-telephonyd/simulation/radios/LTESignaling.h"

#include <utility>

#include "programs/varnel-telephonyd/simulation/radios/LTENASMessages.h"
#include "programs/varnel-telephonyd/simulation/radios/LTERandomAccess.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;
using Cause = lteMessages::Cause;

// Substates of TS 24.301 5.1.3.2, numbered as in the packets.
enum Deregistered { SearchingNetwork = 1, AboutToAttach = 7 };
enum Registering { WaitingForNetwork = 0, WaitingForSession = 1 };
enum Registered { NormalService = 0 };

constexpr Bearer dataBearer{.identity = 5, .qualityClass = 9, .guaranteedRateCode = 0};
constexpr Bearer voiceBearer{.identity = 7, .qualityClass = 1, .guaranteedRateCode = 49};

constexpr int mobilityGroup = 0x8003, mobilityCode = 17;

// Bit n tells block n.
constexpr std::uint32_t block1 = 1u << 1;

}  // namespace

LTESignaling::LTESignaling(PhoneLink link, Random random, Network home)
    : _link(std::move(link)), _random(random), _substate(SearchingNetwork) {
  _name = {.network = home,
           .group = mobilityGroup,
           .code = mobilityCode,
           .number = static_cast<std::uint32_t>(_random.between(0xC0000000, 0xFFFFFFFE))};
}

void LTESignaling::after(Milliseconds delay, std::function<void()> task) {
  _script.at(_link.situation().now + delay, std::move(task));
}

void LTESignaling::send(LTEChannel channel, const Bytes& message, std::uint32_t blocks) {
  _link.send(lteMessage(_link.situation(), LTEMessageLayout::Version26, channel, message, blocks));
}

void LTESignaling::sendPlain(NASKind kind, const Bytes& message) {
  _link.send(lteNASMessage(_link.situation().now, kind, message));
}

// Within a connection, messages of the network's core travel in messages of the radio.
void LTESignaling::toNetwork(const Bytes& message) {
  const Bytes sent = lteNAS::integrityProtected(message, ++_sequence);
  sendPlain(NASKind::MobilityToNetwork, message);
  sendPlain(NASKind::ProtectedMobilityToNetwork, sent);
  send(LTEChannel::UplinkDedicated, lteMessages::uplinkInformationTransfer(sent));
}

void LTESignaling::toPhone(const Bytes& message) {
  const Bytes sent = lteNAS::integrityProtected(message, ++_sequence);
  send(LTEChannel::DownlinkDedicated, lteMessages::downlinkInformationTransfer(sent));
  sendPlain(NASKind::ProtectedMobilityFromNetwork, sent);
  sendPlain(NASKind::MobilityFromNetwork, message);
}

void LTESignaling::enter(EMMState state, int substate) {
  _state = state;
  _substate = substate;
  sendRegistration();
}

void LTESignaling::sendRegistration() {
  _link.send(lteRegistration(_link.situation(), _state, _substate, _isRegistered ? &_name : nullptr));
}

void LTESignaling::setBearer(const Bearer& bearer, Bearer::State state) {
  const Milliseconds now = _link.situation().now;
  _link.send(lteBearerState(now, bearer, state));
  _link.send(lteBearerInformation(now, bearer, state));
}

void LTESignaling::begin(Cause cause, const Bytes& message) {
  const Bytes request = lteMessages::connectionRequest(_name, cause);
  for (Bytes& packet : LTERandomAccess(_link.situation(), request, _random).packets())
    _link.send(std::move(packet));
  send(LTEChannel::UplinkCommon, request);
  after(20ms, [this] { send(LTEChannel::DownlinkCommon, lteMessages::connectionSetup()); });
  after(30ms, [this, message] {
    sendPlain(NASKind::MobilityToNetwork, message);
    send(LTEChannel::UplinkDedicated, lteMessages::connectionSetupComplete(message));
  });
}

void LTESignaling::attach() {
  enter(EMMState::Deregistered, SearchingNetwork);
  after(200ms, [this] { enter(EMMState::Deregistered, AboutToAttach); });
  after(300ms, [this] {
    sendPlain(NASKind::SessionToNetwork, lteNAS::connectivityRequest());
    begin(Cause::Signaling, lteNAS::attachRequest(_name));
    enter(EMMState::Registering, WaitingForNetwork);
  });
  after(400ms, [this] { authenticate(); });
  after(650ms, [this] {
    send(LTEChannel::DownlinkDedicated, lteMessages::securityModeCommand());
    send(LTEChannel::UplinkDedicated, lteMessages::securityModeComplete());
  });
  after(700ms, [this] { finishAttach(); });
}

void LTESignaling::authenticate() {
  const auto challenge = static_cast<std::uint64_t>(_random.between(1, 0x7FFF'FFFF'FFFF));
  sendPlain(NASKind::MobilityFromNetwork, lteNAS::authenticationRequest(challenge));
  send(LTEChannel::DownlinkDedicated,
       lteMessages::downlinkInformationTransfer(lteNAS::authenticationRequest(challenge)));
  after(60ms, [this, challenge] {
    sendPlain(NASKind::MobilityToNetwork, lteNAS::authenticationResponse(challenge));
    send(LTEChannel::UplinkDedicated,
         lteMessages::uplinkInformationTransfer(lteNAS::authenticationResponse(challenge)));
  });
  after(120ms, [this] { toPhone(lteNAS::securityModeCommand()); });
  after(130ms, [this] { toNetwork(lteNAS::securityModeComplete()); });
}

void LTESignaling::finishAttach() {
  enter(EMMState::Registering, WaitingForSession);
  setBearer(dataBearer, Bearer::State::Inactive);
  toPhone(lteNAS::attachAccept(_name, _link.situation().serving.area));
  sendPlain(NASKind::SessionFromNetwork, lteNAS::activateDefaultBearerRequest());
  setBearer(dataBearer, Bearer::State::ActivePending);
  reconfigure();
  after(40ms, [this] {
    sendPlain(NASKind::SessionToNetwork, lteNAS::activateDefaultBearerAccept());
    toNetwork(lteNAS::attachComplete());
    setBearer(dataBearer, Bearer::State::Active);
    _isRegistered = true;
    enter(EMMState::Registered, NormalService);
  });
}

void LTESignaling::connect() {
  if (std::exchange(_mustTellArea, false)) {
    begin(Cause::Signaling, lteNAS::areaUpdateRequest(_name));
    enter(EMMState::UpdatingArea, NormalService);
    after(150ms, [this] { finishAreaUpdate(); });
    return;
  }
  const bool isPaged = _random.oneIn(2);
  if (isPaged) sendPaging();
  enter(EMMState::RequestingService, NormalService);
  begin(isPaged ? Cause::MobileTerminated : Cause::Data, lteNAS::serviceRequest(++_sequence));
  after(70ms, [this] {
    send(LTEChannel::DownlinkDedicated, lteMessages::securityModeCommand());
    send(LTEChannel::UplinkDedicated, lteMessages::securityModeComplete());
    reconfigure();
    enter(EMMState::Registered, NormalService);
  });
}

void LTESignaling::finishAreaUpdate() {
  toPhone(lteNAS::areaUpdateAccept());
  toNetwork(lteNAS::areaUpdateComplete());
  enter(EMMState::Registered, NormalService);
}

void LTESignaling::call(Milliseconds duration) {
  setBearer(voiceBearer, Bearer::State::Inactive);
  sendPlain(NASKind::SessionFromNetwork,
            lteNAS::activateDedicatedBearerRequest(voiceBearer.guaranteedRateCode));
  setBearer(voiceBearer, Bearer::State::ActivePending);
  after(60ms, [this] {
    sendPlain(NASKind::SessionToNetwork, lteNAS::activateDedicatedBearerAccept());
    setBearer(voiceBearer, Bearer::State::Active);
  });
  after(duration, [this] {
    sendPlain(NASKind::SessionFromNetwork, lteNAS::deactivateBearerRequest());
    sendPlain(NASKind::SessionToNetwork, lteNAS::deactivateBearerAccept());
    setBearer(voiceBearer, Bearer::State::Inactive);
  });
}

void LTESignaling::reconfigure() {
  send(LTEChannel::DownlinkDedicated, lteMessages::connectionReconfiguration());
  after(10ms,
        [this] { send(LTEChannel::UplinkDedicated, lteMessages::connectionReconfigurationComplete()); });
}

void LTESignaling::release() { send(LTEChannel::DownlinkDedicated, lteMessages::connectionRelease()); }

void LTESignaling::releaseToUMTS(int channel) {
  send(LTEChannel::DownlinkDedicated, lteMessages::connectionReleaseToUMTS(channel));
}

void LTESignaling::sendSystemInformation() {
  send(LTEChannel::Broadcast, lteMessages::systemInformationBlock1(_link.situation().serving), block1);
}

void LTESignaling::sendPaging() { send(LTEChannel::Paging, lteMessages::paging(_name)); }

void LTESignaling::sendMeasurementReport(std::int64_t rsrp, std::int64_t rsrq) {
  send(LTEChannel::UplinkDedicated, lteMessages::measurementReport(rsrp, rsrq));
}

}  // namespace varnel::simulation
