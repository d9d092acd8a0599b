#pragma once

#include "programs/varnel-telephonyd/simulation/CellSelection.h"
#include "programs/varnel-telephonyd/simulation/HRPDConnection.h"
#include "programs/varnel-telephonyd/simulation/HRPDPackets.h"
#include "programs/varnel-telephonyd/simulation/HRPDTraffic.h"
#include "programs/varnel-telephonyd/simulation/PilotSet.h"

namespace varnel::simulation {

/// The HRPD half of a CDMA phone on its walk.
class HRPDPhone {
 public:
  HRPDPhone(const Walk& walk, Random random);

  struct Changes {
    bool state = false, cell = false;
  };
  /// The phone has walked one step.
  Changes step(std::chrono::milliseconds now, HRPDConnection::Radio radio);

  HRPDStatus status();
  std::vector<ReceivedPilot> activeSet() const;
  std::vector<Finger> fingers();
  const ForwardPackets& received() const { return _received; }
  const ReversePackets& sent() const { return _sent; }

 private:
  void chooseChannel();
  void chooseAddress(HRPDConnection::Session previous, int previousArea);
  void updateActiveSet(const CDMACarrier& carrier);
  void transfer(const CDMACarrier& carrier);

  const Walk& _walk;
  Random _random;
  CellSelection _selection;
  HRPDConnection _connection;
  PilotSet _activeSet;
  int _channel;
  std::int64_t _address = 0;
  ForwardPackets _received;
  ReversePackets _sent;
};

}  // namespace varnel::simulation
