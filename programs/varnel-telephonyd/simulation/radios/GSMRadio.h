#pragma once

#include "programs/varnel-telephonyd/simulation/GSMConnection.h"
#include "programs/varnel-telephonyd/simulation/radios/PhoneLink.h"

namespace varnel::simulation {

/// The GSM part of a phone of today. It sends the packets of the UMTS and GSM modem, and messages.
class GSMRadio {
 public:
  GSMRadio(PhoneLink link, Random random);

  void arrive();
  void leave();
  /// The phone has walked one step.
  void step();
  void cellChanged();
  /// Reports once per second what there is to report.
  void report();

  bool isIdle() const { return _connection.state() == GSMConnection::State::Idle; }
  /// Whether the phone has left for another radio.
  bool isGone() const { return _connection.state() == GSMConnection::State::Inactive; }
  bool isSpeaking() const { return _connection.isSpeaking(); }

 private:
  void stateChanged();
  void reportCell();
  void reportCall();
  void sendLocationUpdate();

  PhoneLink _link;
  Random _random;
  GSMConnection _connection;
  std::uint32_t _temporaryIdentity;
  int _reports = 0;
};

}  // namespace varnel::simulation
