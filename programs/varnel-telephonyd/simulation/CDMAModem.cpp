#include "programs/varnel-telephonyd/simulation/CDMAModem.h"

#include "platform/TelephonyService.h"

namespace varnel::simulation {

// Braces fix the order in which the parts of the world draw random numbers.
CDMAModem::CDMAModem(Random random)
    : ScheduledModem(random.fork()),
      _walk{Town::build(random.fork()), random.fork()},
      _voice(_walk, random.fork()),
      _data(_walk, random.fork()) {
  using namespace std::chrono_literals;
  repeat({.first = 0ms, .interval = Walk::stepTime}, [this] { step(); });
  repeat({.first = 15ms, .interval = 20ms}, [this] { sendFrame(); });
  repeat({.first = 20ms, .interval = 1s, .jitter = 40ms}, [this] {
    if (_voice.connection().state() != CDMA1xConnection::State::SlottedSleep) send1xStatus();
  });
  repeat({.first = 30ms, .interval = 1s, .jitter = 40ms}, [this] { sendDataStatus(); });
  repeat({.first = 40ms, .interval = 1s, .jitter = 20ms}, [this] { sendPilots(); });
  repeat({.first = 50ms, .interval = 1s}, [this] { sendTraffic(); });
  repeat({.first = 60ms, .interval = 3s, .jitter = 100ms}, [this] { sendSystem(); });
}

std::string_view CDMAModem::technology() const { return varnel::technology::kalviCDMA; }

// The phone looks for the data network after it has found the voice network. A call uses the radio alone.
void CDMAModem::step() {
  _walk.step();
  const auto voice = _voice.step(now());
  if (voice.state) send1xStatus();
  if (voice.cell) sendSystem();
  using Radio = HRPDConnection::Radio;
  const auto data = _data.step(now(), _voice.connection().isIdle() ? Radio::Free : Radio::Taken);
  if (data.state || data.cell) {
    sendDataStatus();
    sendPilots();
  }
}

void CDMAModem::send1xStatus() { send(cdma1xStatusPacket(now(), _voice.status())); }

void CDMAModem::sendFrame() {
  if (_voice.connection().state() == CDMA1xConnection::State::Traffic)
    send(trafficFramePacket(now(), _voice.nextFrame()));
}

// The phone knows no system before it has read the channels of a cell.
void CDMAModem::sendSystem() {
  const bool isKnown =
      _voice.connection().isIdle() || _voice.connection().state() == CDMA1xConnection::State::Traffic;
  if (isKnown) send(cdmaSystemPacket(now(), _voice.system()));
}

void CDMAModem::sendDataStatus() { send(hrpdStatusPacket(now(), _data.status())); }

void CDMAModem::sendPilots() {
  send(hrpdActiveSetPacket(now(), _data.activeSet()));
  send(hrpdFingersPacket(now(), _data.fingers()));
}

void CDMAModem::sendTraffic() {
  ++_second;
  send(hrpdForwardPacket(now(), _second, _data.received()));
  send(hrpdReversePacket(now(), _second, _data.sent()));
}

}  // namespace varnel::simulation
