#pragma once

#include "programs/varnel-telephonyd/simulation/UMTSChannels.h"
#include "programs/varnel-telephonyd/simulation/UTRANConnection.h"
#include "programs/varnel-telephonyd/simulation/radios/PhoneLink.h"

namespace varnel::simulation {

/// The UMTS part of a phone of today. It sends the packets of the UMTS and GSM modem, and messages.
class UMTSRadio {
 public:
  UMTSRadio(PhoneLink link, Random random);

  void arrive();
  void leave();
  /// The phone has walked one step.
  void step();
  void cellChanged(UTRANConnection::Area area);
  /// Reports once per second what there is to report.
  void report();

  /// Whether the phone cannot change to another radio now.
  bool isBusy() const;

 private:
  void stateChanged();
  void sendState();

  PhoneLink _link;
  Random _random;
  UTRANConnection _connection;
  UMTSChannels _channels;
  std::uint32_t _temporaryIdentity;
  bool _isConnected = false;
  int _reports = 0;
};

}  // namespace varnel::simulation
