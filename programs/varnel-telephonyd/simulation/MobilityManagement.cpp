#include "programs/varnel-telephonyd/simulation/MobilityManagement.h"

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t packetStateCode = 0x7130, circuitStateCode = 0x7131, registrationCode = 0x7132;

// TS 24.008. The numbers are those of the packets.
enum CircuitState {
  CircuitNull = 0,
  LocationUpdateInitiated = 3,
  WaitForOutgoingConnection = 5,
  ConnectionActive = 6,
  WaitForNetworkCommand = 9,
  WaitForChannelToUpdate = 13,
  WaitForChannelToCall = 14,
  CircuitIdle = 19
};
enum CircuitSubstate { NoSubstate = 0, SearchingNetwork = 2, SearchingAnother = 7, NormalService = 8 };
enum PacketState {
  PacketNull = 0,
  Deregistered = 1,
  RegistrationInitiated = 2,
  Registered = 3,
  AreaUpdateInitiated = 5,
  ServiceRequested = 6
};
enum PacketSubstate { Normal = 0, PacketSearch = 6, Suspended = 7, UpdateNeeded = 8, NoPacketSubstate = 12 };
enum UpdateStatus { Updated = 0, NotUpdated = 1 };
enum RegistrationState { Inactive = 0, Idle = 1, Registering = 2, AutomaticSearch = 5 };
enum SelectionMode { Automatic = 0 };

using Condition = MobilityManagement::Condition;
using Step = MobilityManagement::Step;

constexpr Condition off{CircuitNull,      NoSubstate, NotUpdated, PacketNull,
                        NoPacketSubstate, NotUpdated, Inactive};
constexpr Condition searching{CircuitIdle,  SearchingNetwork, NotUpdated,     Deregistered,
                              PacketSearch, NotUpdated,       AutomaticSearch};
constexpr Condition waitingToRegister{WaitForChannelToUpdate, NoSubstate, NotUpdated, RegistrationInitiated,
                                      NoPacketSubstate,       NotUpdated, Registering};
constexpr Condition registering{LocationUpdateInitiated, NoSubstate, NotUpdated, RegistrationInitiated,
                                NoPacketSubstate,        NotUpdated, Registering};
constexpr Condition searchingAnother{CircuitIdle,  SearchingAnother, NotUpdated,     Registered,
                                     PacketSearch, NotUpdated,       AutomaticSearch};
constexpr Condition waitingToUpdate{WaitForChannelToUpdate, NoSubstate, NotUpdated, Registered,
                                    UpdateNeeded,           NotUpdated, Registering};
constexpr Condition updating{LocationUpdateInitiated, NoSubstate, NotUpdated, AreaUpdateInitiated,
                             NoPacketSubstate,        NotUpdated, Registering};
constexpr Condition updated{WaitForNetworkCommand, NoSubstate, Updated, Registered, Normal, Updated, Idle};
constexpr Condition resting{CircuitIdle, NormalService, Updated, Registered, Normal, Updated, Idle};
constexpr Condition waitingToCall{WaitForChannelToCall, NoSubstate, Updated, ServiceRequested,
                                  NoPacketSubstate,     Updated,    Idle};
constexpr Condition dialling{
    WaitForOutgoingConnection, NoSubstate, Updated, Registered, Normal, Updated, Idle};
constexpr Condition speaking{ConnectionActive, NoSubstate, Updated, Registered, Normal, Updated, Idle};
constexpr Condition speakingOverGSM{ConnectionActive, NoSubstate, Updated, Registered,
                                    Suspended,        Updated,    Idle};

constexpr Step switchingOn[] = {
    {400, off}, {1200, searching}, {300, waitingToRegister}, {700, registering}, {300, updated}};
constexpr Step updatingArea[] = {{200, waitingToUpdate}, {800, updating}, {300, updated}};
constexpr Step changingNetwork[] = {
    {800, searchingAnother}, {200, waitingToUpdate}, {800, updating}, {300, updated}};
constexpr Step calling[] = {{300, waitingToCall}, {500, dialling}};

}  // namespace

MobilityManagement::MobilityManagement() : _condition(off) {
  begin(switchingOn, std::chrono::milliseconds(0));
}

void MobilityManagement::begin(Procedure procedure, std::chrono::milliseconds now) {
  _procedure = procedure;
  _end = now + std::chrono::milliseconds(procedure.front().duration_ms);
}

bool MobilityManagement::update(std::chrono::milliseconds now) {
  while (!_procedure.empty() && now >= _end) {
    _procedure = _procedure.subspan(1);
    if (!_procedure.empty()) _end = now + std::chrono::milliseconds(_procedure.front().duration_ms);
  }
  const Condition previous = _condition;
  _condition = _procedure.empty() ? lasting() : _procedure.front().condition;
  return _condition != previous;
}

const Condition& MobilityManagement::lasting() const {
  if (!_isInCall) return resting;
  return _callAccess == Access::GSM ? speakingOverGSM : speaking;
}

void MobilityManagement::areaChanged(std::chrono::milliseconds now) { tellMove(updatingArea, now); }

void MobilityManagement::networkChanged(std::chrono::milliseconds now) { tellMove(changingNetwork, now); }

void MobilityManagement::tellMove(Procedure procedure, std::chrono::milliseconds now) {
  if (_isInCall)
    _afterCall = procedure;
  else
    begin(procedure, now);
}

void MobilityManagement::callBegan(std::chrono::milliseconds now, Access access) {
  if (_isInCall) return;
  _isInCall = true;
  _callAccess = access;
  // A call waits until the registration has ended.
  if (_procedure.empty()) begin(calling, now);
}

void MobilityManagement::callEnded(std::chrono::milliseconds now) {
  if (!_isInCall) return;
  _isInCall = false;
  if (!_afterCall.empty()) begin(_afterCall, now);
  _afterCall = {};
}

bool MobilityManagement::isRegistered() const { return _condition.registrationState == Idle; }

bool MobilityManagement::isSearching() const {
  return _condition.registrationState == Inactive || _condition.registrationState == AutomaticSearch;
}

Bytes MobilityManagement::circuitState(const Situation& situation) const {
  constexpr std::size_t size = 16;
  return PacketWriter(circuitStateCode, situation.now, size)
      .u8(13, _condition.circuitState)
      .u8(14, _condition.circuitSubstate)
      .u8(15, _condition.locationUpdateStatus)
      .finish();
}

Bytes MobilityManagement::packetState(const Situation& situation) const {
  constexpr std::size_t size = 16;
  return PacketWriter(packetStateCode, situation.now, size)
      .u8(13, _condition.packetState)
      .u8(14, _condition.packetSubstate)
      .u8(15, _condition.packetUpdateStatus)
      .finish();
}

Bytes MobilityManagement::registrationState(const Situation& situation) const {
  constexpr std::size_t size = 16;
  return PacketWriter(registrationCode, situation.now, size)
      .u8(13, _condition.registrationState)
      .u8(14, Automatic)
      .finish();
}

}  // namespace varnel::simulation
