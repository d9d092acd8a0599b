#include "programs/varnel-telephonyd/simulation/WalkingModem.h"

#include "base/PropertyList.h"
#include "programs/varnel-telephonyd/simulation/CellMonitor.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {
constexpr std::uint16_t simFilesCode = 0, cellMonitorCode = 1, packetDataCode = 2;
}  // namespace

// Braces fix the order in which the parts of the world draw random numbers.
WalkingModem::WalkingModem(Random& random, Access access)
    : ScheduledModem(random.fork()),
      _walk{Town::build(random.fork()), random.fork()},
      _selection(_walk, access),
      _card(random.fork(), servingCell()),
      _packetData(random.fork()) {
  startTasks();
}

WalkingModem::WalkingModem(Random walk, Random& random, const Phone& phone)
    : ScheduledModem(random.fork(), phone.subscription),
      _walk{phone.town(walk.fork()), walk.fork()},
      _selection(_walk, phone.access),
      _card(random.fork(), servingCell(), phone.home),
      _packetData(random.fork()) {
  startTasks();
}

void WalkingModem::startTasks() {
  using namespace std::chrono_literals;
  repeat({.first = 0ms, .interval = Walk::stepTime}, [this] { step(); });
  repeat({.first = 0ms, .interval = 1s}, [this] { _packetData.step(); });
  repeat({.first = 10ms, .interval = 60s, .jitter = 2s}, [this] { sendSimFiles(); });
  repeat({.first = 150ms, .interval = 1s, .jitter = 40ms}, [this] { sendCellMonitor(); });
  repeat({.first = 1200ms, .interval = 2s, .jitter = 90ms}, [this] { sendPacketDataContexts(); });
}

void WalkingModem::step() {
  const Cell& previous = servingCell();
  _walk.step();
  if (_selection.update()) cellChanged(previous);
  stepWalked();
}

void WalkingModem::changeAccess(Access access) {
  const Cell& previous = servingCell();
  _selection.changeAccess(access);
  cellChanged(previous);
}

void WalkingModem::cellChanged(const Cell& previous) {
  servingCellChanged(previous);
  if (servingCell().area == previous.area && servingCell().network == previous.network) return;
  _card.registerIn(servingCell());
  sendSimFiles();
}

void WalkingModem::sendSimFiles() {
  send(serverMessage(simFilesCode, now(), writeXmlPropertyList(_card.files()).value()));
}

void WalkingModem::sendCellMonitor() {
  const Value records = cellMonitorRecords(_walk, servingCell());
  send(serverMessage(cellMonitorCode, now(), writeBinaryPropertyList(records).value()));
}

void WalkingModem::sendPacketDataContexts() {
  send(serverMessage(packetDataCode, now(), writeXmlPropertyList(_packetData.contexts()).value()));
}

}  // namespace varnel::simulation
