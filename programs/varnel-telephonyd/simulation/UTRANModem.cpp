#include "programs/varnel-telephonyd/simulation/UTRANModem.h"

#include <algorithm>
#include <span>

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;
using State = UTRANConnection::State;

constexpr std::uint16_t neighborsCode = 0xD00A, channelsCode = 0xD00C, gsmNeighborsCode = 0xD00E,
                        stateCode = 0xD0E0, servingCellCode = 0xD0E2;

constexpr std::int64_t weakestNeighbor_cdbm = -105'00;
constexpr std::int64_t weakestGSM_cdbm = -100'00, weakestIdentified_cdbm = -92'00;
// The list of neighbors reaches to the next site.
constexpr std::int64_t listedDistance_cm = 260'00;

struct TransportChannel {
  int identity;
  std::int64_t target;  // the target of the block error rate
};
// Error rates are sent as in 25.133, from 0 (none) to 63 (all), on a logarithmic scale in steps of 0.065. 31
// is one block of a hundred. Voice and signaling come before data.
constexpr TransportChannel dedicatedChannels[] = {{1, 27}, {2, 30}, {3, 31}, {5, 43}};
constexpr TransportChannel commonChannels[] = {{32, 31}};
constexpr std::int64_t mostErrors = 63;

// A composite of transport channels.
struct Composite {
  int identity, timeslot;
};
constexpr Composite dedicatedComposites[] = {{1, 4}, {2, 5}};
constexpr Composite commonComposites[] = {{1, 6}};
constexpr std::size_t codesOfComposite = 6;

constexpr std::int64_t targetSIR_cdb = 9'00;
// Ratios are sent in steps of half a decibel above -11 dB.
constexpr std::int64_t ratio(std::int64_t sir_cdb) {
  return std::clamp<std::int64_t>((sir_cdb + 11'00) / 50, 0, 63);
}

}  // namespace

UTRANModem::UTRANModem(Random random)
    : WalkingModem(random, Access::UTRAN), _random(random.fork()), _connection(random.fork()) {
  repeat({.first = 20ms, .interval = 4s, .jitter = 300ms}, [this] { sendServingCell(); });
  repeat({.first = 30ms, .interval = 5s, .jitter = 100ms}, [this] { sendState(); });
  repeat({.first = 40ms, .interval = 2s, .jitter = 100ms}, [this] { sendNeighbors(); });
  repeat({.first = 60ms, .interval = 3s, .jitter = 100ms}, [this] { sendGSMNeighbors(); });
  repeat({.first = 80ms, .interval = 1s, .jitter = 30ms}, [this] {
    if (_connection.hasChannels()) sendChannels();
  });
}

std::string_view UTRANModem::technology() const { return varnel::technology::kalviUTRAN2; }

void UTRANModem::stepWalked() {
  if (_connection.update(now())) stateChanged();
}

void UTRANModem::servingCellChanged(const Cell& previous) {
  using Area = UTRANConnection::Area;
  sendServingCell();
  sendNeighbors();
  const Area area = servingCell().area == previous.area ? Area::Same : Area::Another;
  if (_connection.cellChanged(now(), area)) stateChanged();
}

void UTRANModem::stateChanged() {
  sendState();
  // Sent even without channels: this report then replaces the earlier ones.
  sendChannels();
}

void UTRANModem::sendState() {
  constexpr std::size_t size = 15;
  send(PacketWriter(stateCode, now(), size)
           .u8(13, 1)  // version
           .u8(14, static_cast<std::int64_t>(_connection.state()))
           .finish());
}

void UTRANModem::sendServingCell() {
  constexpr std::size_t size = 26;
  const Cell& cell = servingCell();
  send(PacketWriter(servingCellCode, now(), size)
           .u8(13, 1)                // version
           .u8(14, 0)                // no restrictions
           .u8(15, cell.area % 256)  // each location area is a registration area
           .u16(17, cell.channel)    // uplink and downlink share
           .u16(19, cell.channel)    // the carrier
           .u32(21, cell.identity)
           .bits(25, 0, 1, 0)  // access is not barred
           .finish());
}

// The records always begin at the same place.
void UTRANModem::sendNeighbors() {
  constexpr std::size_t headSize = 168, recordSize = 16;
  auto cells = walk().cells(Access::UTRAN);
  std::erase_if(cells, [this](const ReceivedCell& received) { return !isHeard(received); });

  PacketWriter packet(neighborsCode, now(), headSize);
  packet
      .u8(13, 1)  // version
      .bits(16, 1, 7, std::ssize(cells));
  for (const auto& [cell, level_cdbm] : cells)
    packet.record(recordSize)
        .bits(0, 0, 14, cell->channel)
        .bits(1, 6, 7, cell->code)
        .bits(2, 5, 8, (level_cdbm + 140'00) / 50)  // in steps of half a decibel
        .bits(3, 5, 2, static_cast<std::int64_t>(setOf(*cell)))
        .bits(3, 7, 1, cell->channel == servingCell().channel);
  send(packet.finish());
}

// Only on a dedicated channel does the phone tell apart cells that are not in the list. The serving cell
// counts as one only while it is active.
bool UTRANModem::isHeard(const ReceivedCell& received) const {
  if (received.level_cdbm < weakestNeighbor_cdbm) return false;
  if (received.cell == &servingCell()) return _connection.hasChannels();
  return setOf(*received.cell) == CellSet::Monitored || _connection.state() == State::CellDCH;
}

UTRANModem::CellSet UTRANModem::setOf(const Cell& cell) const {
  if (&cell == &servingCell()) return CellSet::Active;
  return walk().distance_cm(cell, servingCell()) <= listedDistance_cm ? CellSet::Monitored
                                                                      : CellSet::Detected;
}

void UTRANModem::sendGSMNeighbors() {
  constexpr std::size_t headSize = 17, recordSize = 8;
  auto cells = walk().cells(Access::GSM);
  std::erase_if(cells, [](const ReceivedCell& received) { return received.level_cdbm < weakestGSM_cdbm; });

  PacketWriter packet(gsmNeighborsCode, now(), headSize);
  packet
      .u8(13, 1)  // version
      .u8(16, std::ssize(cells));
  for (const auto& [cell, level_cdbm] : cells) {
    const bool isIdentified = level_cdbm >= weakestIdentified_cdbm;
    packet.record(recordSize)
        .bits(0, 0, 14, cell->identity)
        .bits(1, 6, 1, 0)  // the band is not that of 1900 MHz
        .bits(1, 7, 1, isIdentified)
        .u8(2, isIdentified ? cell->code / 8 : 0)
        .u8(3, isIdentified ? cell->code % 8 : 0)
        .u16(4, cell->channel)
        .u16(6, level_cdbm / 100);
  }
  send(packet.finish());
}

// The composites do not follow the transport channels directly: every transport channel moves them by more
// than the size of its record.
void UTRANModem::sendChannels() {
  constexpr std::size_t headSize = 17, channelSize = 2;
  constexpr std::size_t compositesStart = 289, compositesMove = 34, compositeSize = 8;
  std::span<const TransportChannel> channels;
  std::span<const Composite> composites;
  if (_connection.state() == State::CellDCH) {
    channels = dedicatedChannels;
    composites = dedicatedComposites;
  } else if (_connection.state() == State::CellFach) {
    channels = commonChannels;
    composites = commonComposites;
  }

  PacketWriter packet(channelsCode, now(), headSize);
  packet
      .u8(13, 1)  // version
      .bits(14, 6, 6, std::ssize(channels))
      .bits(15, 4, 4, std::ssize(composites));
  const std::int64_t missing_db = (targetSIR_cdb - signalToInterference_cdb()) / 100;
  for (const TransportChannel& channel : channels)
    packet.record(channelSize)
        .u8(0, channel.identity)
        .u8(1, std::clamp<std::int64_t>(channel.target + 2 * missing_db + _random.noise(2), 0, mostErrors));
  packet.padTo(compositesStart + compositesMove * channels.size());
  for (const Composite& composite : composites) {
    packet.record(compositeSize).u8(0, composite.identity).u8(1, composite.timeslot);
    for (std::size_t code = 0; code < codesOfComposite; ++code)
      packet.u8(2 + code, ratio(signalToInterference_cdb()));
  }
  send(packet.finish());
}

// Power control holds the target as long as the cell is strong enough.
std::int64_t UTRANModem::signalToInterference_cdb() {
  constexpr std::int64_t strongEnough_cdbm = -85'00, noise_cdb = 40;
  const std::int64_t missing_cdb =
      std::max<std::int64_t>(strongEnough_cdbm - walk().level_cdbm(servingCell()), 0);
  return targetSIR_cdb - missing_cdb / 2 + _random.noise(noise_cdb);
}

}  // namespace varnel::simulation
