#pragma once

#include "programs/varnel-telephonyd/simulation/radios/LTEServingMeasurement.h"
#include "programs/varnel-telephonyd/simulation/radios/LTESignaling.h"

namespace varnel::simulation {

/// The LTE part of a phone of today: it idles and is connected by turns. A connected phone receives several
/// carriers at once. Its modem changes the versions of its packets from report to report, as if it were
/// several modems, so that each version occurs.
class LTERadio {
 public:
  LTERadio(PhoneLink link, Random random, Network home);

  /// Does what is due, ten milliseconds after the last time.
  void run() { _signaling.run(); }
  /// Reports once per second what there is to report.
  void report();

  void switchOn();
  /// The phone comes from another radio.
  void arrive();
  void connect();
  void release();
  void releaseToUMTS(int channel);
  enum class Area { Same, Another };
  void cellChanged(Area area);

  bool isConnected() const { return _isConnected; }

 private:
  void reportCell();
  void reportIdle();
  void reportConnected();
  void reportCarrier(const Cell& serving, int servingIndex);
  std::vector<const Cell*> carriers() const;
  std::vector<const Cell*> detectedOn(int channel);

  PhoneLink _link;
  Random _random;
  LTESignaling _signaling;
  bool _isConnected = false;
  int _reports = 0;
  std::size_t _layout = 0;
  std::size_t _idleCarrier = 0;
};

}  // namespace varnel::simulation
