#include "programs/varnel-telephonyd/simulation/LTEModem.h"

#include "platform/PropertyList.h"
#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/CellMonitor.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t servingCellCode = 0xB0C2, antennasCode = 0xB0C1;
constexpr std::uint16_t simFilesCode = 0, cellMonitorCode = 1, packetDataCode = 2;

}  // namespace

// The braces keep the order in which the parts of the world draw their randomness.
LTEModem::LTEModem(Random random)
    : ScheduledModem(random.fork()),
      _walk{Town::build(random.fork()), random.fork()},
      _selection(_walk, Access::LTE),
      _card(random.fork(), servingCell().area),
      _packetData(random.fork()) {
  using namespace std::chrono_literals;
  repeat({.first = 0ms, .interval = Walk::stepTime}, [this] { walk(); });
  repeat({.first = 0ms, .interval = 1s}, [this] { _packetData.step(); });
  repeat({.first = 10ms, .interval = 60s, .jitter = 2s}, [this] { sendSimFiles(); });
  repeat({.first = 20ms, .interval = 4s, .jitter = 300ms}, [this] { sendServingCell(); });
  repeat({.first = 30ms, .interval = 5s, .jitter = 300ms}, [this] { sendAntennas(); });
  repeat({.first = 150ms, .interval = 1s, .jitter = 40ms}, [this] { sendCellMonitor(); });
  repeat({.first = 1200ms, .interval = 2s, .jitter = 90ms}, [this] { sendPacketDataContexts(); });
}

std::string_view LTEModem::technology() const { return varnel::technology::kalviLTE; }

void LTEModem::walk() {
  const int area = servingCell().area;
  _walk.step();
  if (!_selection.update()) return;
  sendServingCell();
  sendAntennas();
  if (servingCell().area == area) return;
  _card.registerIn(servingCell().area);
  sendSimFiles();
}

void LTEModem::sendServingCell() {
  constexpr std::size_t size = 38;
  const Cell& cell = servingCell();
  send(PacketWriter(PacketWriter::LogType::Modem, servingCellCode, now(), size)
           .u8(13, 3)  // version
           .u16(14, cell.code)
           .u16(16, cell.channel)
           .u16(18, uplinkEARFCN(cell.channel))
           .u8(20, cell.resourceBlocks)
           .u8(21, cell.resourceBlocks)
           .u32(22, cell.identity)
           .u16(26, cell.area)
           .u32(28, cell.band)
           .u16(32, testNetworkMCC)
           .u8(34, testNetworkMNCDigits)
           .u16(35, testNetworkMNC)
           .u8(37, 0)  // access is not barred
           .finish());
}

void LTEModem::sendAntennas() {
  constexpr std::size_t size = 22;
  const Cell& cell = servingCell();
  send(PacketWriter(PacketWriter::LogType::Modem, antennasCode, now(), size)
           .u8(13, 2)  // version
           .u16(14, cell.code)
           .u16(16, cell.channel)
           .u16(18, now().count() / 10 % 1024)  // system frame number
           .u8(20, cell.antennas)
           .u8(21, cell.resourceBlocks)
           .finish());
}

void LTEModem::sendSimFiles() {
  send(serverMessage(simFilesCode, now(), writeXmlPropertyList(_card.files()).value()));
}

void LTEModem::sendCellMonitor() {
  const Value records = cellMonitorRecords(_walk, servingCell());
  send(serverMessage(cellMonitorCode, now(), writeBinaryPropertyList(records).value()));
}

void LTEModem::sendPacketDataContexts() {
  send(serverMessage(packetDataCode, now(), writeXmlPropertyList(_packetData.contexts()).value()));
}

}  // namespace varnel::simulation
