#include "programs/varnel-telephonyd/simulation/LTEModem.h"

#include <algorithm>

#include "platform/TelephonyService.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel::simulation {

namespace {

using namespace std::chrono_literals;

constexpr std::uint16_t antennasCode = 0xB0C1, servingCellCode = 0xB0C2, connectedMeasurementCode = 0xB179,
                        servingMeasurementCode = 0xB17F, neighborsCode = 0xB180, candidatesCode = 0xB186;

// Broadcast by the network.
constexpr std::int64_t minimumLevel_dbm = -124, maximumPower_dbm = 23;
constexpr std::int64_t intraFrequencySearch_db = 58, otherSearch_db = 44;

// Levels are sent as steps above a lowest level.
struct Scale {
  std::int64_t lowest_cdb, stepsPerDecibel;

  constexpr std::int64_t steps(std::int64_t level_cdb) const {
    return (level_cdb - lowest_cdb) * stepsPerDecibel / 100;
  }
};
constexpr Scale rsrp{-140'00, 4}, rsrq{-30'00, 4}, rssi{-140'00, 2};
constexpr Scale neighborRSRP{-140'00, 2}, connectedRSRQ{-20'00, 8};

// Powers, and levels relative to the minimum, are sent in decibels above -30; minimum levels in steps of 2 dB
// above -140 dBm; search thresholds in steps of 2 dB.
constexpr std::int64_t power(std::int64_t power_dbm) { return power_dbm + 30; }
constexpr std::int64_t minimumLevel(std::int64_t level_dbm) { return (level_dbm + 140) / 2; }
constexpr std::int64_t threshold(std::int64_t threshold_db) { return threshold_db / 2; }

std::int64_t aboveMinimum_db(std::int64_t level_cdbm) { return level_cdbm / 100 - minimumLevel_dbm; }

// How much the network wants the phone to use a technology and its bands. 7 is the most.
int priority(const Cell& cell) {
  switch (cell.access) {
    case Access::LTE:
      return cell.band == 3 ? 6 : 5;
    case Access::UMTS:
    case Access::UTRAN:
      return 4;
    case Access::HRPD:
      return 3;
    case Access::GSM:
      return 2;
    case Access::CDMA1xRTT:
      return 1;
    case Access::NR:
      return 7;
  }
  return 0;
}

const LTEMeasurement& measurementOf(const Cell& cell, const std::vector<LTEMeasurement>& carrier) {
  return *std::ranges::find(carrier, &cell, &LTEMeasurement::cell);
}

// Every cell has its own timing, which differs from others by a part of a frame.
struct CellTiming {
  explicit CellTiming(const Cell& cell) : scattered(cell.identity * 2654435761u) {}

  std::uint32_t scattered;
  std::int64_t frame() const { return scattered >> 22; }
  std::int64_t sample() const { return scattered % 307'200; }
  std::int64_t frequency() const { return scattered >> 12 & 0xFF; }
};

}  // namespace

LTEModem::LTEModem(Random random) : WalkingModem(random, Access::LTE), _random(random.fork()) {
  _phaseEnd = std::chrono::seconds(_random.between(15, 30));
  repeat({.first = 20ms, .interval = 4s, .jitter = 300ms}, [this] { sendServingCell(); });
  repeat({.first = 30ms, .interval = 5s, .jitter = 300ms}, [this] { sendAntennas(); });
  repeatIn(Phase::Idle, {.first = 40ms, .interval = 1280ms, .jitter = 20ms},
           &LTEModem::sendServingMeasurement);
  repeatIn(Phase::Idle, {.first = 60ms, .interval = 2560ms, .jitter = 40ms}, &LTEModem::sendNeighbors);
  repeatIn(Phase::Idle, {.first = 900ms, .interval = 3s, .jitter = 100ms}, &LTEModem::considerReselection);
  repeatIn(Phase::Connected, {.first = 80ms, .interval = 480ms, .jitter = 10ms},
           &LTEModem::sendConnectedMeasurement);
}

std::string_view LTEModem::technology() const { return varnel::technology::kalviLTE; }

void LTEModem::repeatIn(Phase phase, Pace pace, void (LTEModem::*task)()) {
  repeat(pace, [=, this] {
    if (_phase == phase) (this->*task)();
  });
}

void LTEModem::stepWalked() {
  if (now() < _phaseEnd) return;
  _phase = _phase == Phase::Idle ? Phase::Connected : Phase::Idle;
  _phaseEnd =
      now() + std::chrono::seconds(_phase == Phase::Idle ? _random.between(15, 30) : _random.between(8, 20));
}

void LTEModem::servingCellChanged(const Cell& previous) {
  if (_phase == Phase::Idle) sendReselectionCandidate(previous, servingCell());
  sendServingCell();
  sendAntennas();
}

void LTEModem::sendServingCell() {
  constexpr std::size_t size = 38;
  const Cell& cell = servingCell();
  send(PacketWriter(servingCellCode, now(), size)
           .u8(13, 2)  // version
           .u16(14, cell.code)
           .u16(16, cell.channel)
           .u16(18, uplinkEARFCN(cell.channel))
           .u8(20, cell.resourceBlocks)
           .u8(21, cell.resourceBlocks)
           .u32(22, cell.identity)
           .u16(26, cell.area)
           .u32(28, cell.band)
           .u16(32, homeNetwork.countryCode)
           .u8(34, homeNetwork.networkCodeDigits)
           .u16(35, homeNetwork.networkCode)
           .u8(37, 0)  // access is not barred
           .finish());
}

void LTEModem::sendAntennas() {
  constexpr std::size_t size = 22;
  const Cell& cell = servingCell();
  send(PacketWriter(antennasCode, now(), size)
           .u8(13, 1)  // version
           .u16(14, cell.code)
           .u16(16, cell.channel)
           .u16(18, now().count() / 10 % 1024)  // system frame number
           .u8(20, cell.antennas)
           .u8(21, cell.resourceBlocks)
           .finish());
}

void LTEModem::sendServingMeasurement() {
  constexpr std::size_t size = 33;
  constexpr std::int64_t lteRules = 0b001, otherTechnologiesRule = 0b100;
  const Cell& cell = servingCell();
  const auto carrier = measureLTECarrier(walk(), cell.channel, _random);
  const LTEMeasurement& serving = measurementOf(cell, carrier);
  const std::int64_t left_db = aboveMinimum_db(serving.averageRSRP_cdbm);
  const std::int64_t rules = left_db > otherSearch_db ? lteRules : lteRules | otherTechnologiesRule;
  send(PacketWriter(servingMeasurementCode, now(), size)
           .u8(13, 3)  // version
           .u16(17, cell.channel)
           .bits(19, 0, 9, cell.code)
           .bits(20, 1, 4, priority(cell))
           .bits(21, 0, 9, rsrp.steps(serving.measuredRSRP_cdbm))
           .bits(22, 1, 9, rsrp.steps(serving.averageRSRP_cdbm))
           .bits(23, 2, 7, rsrq.steps(serving.measuredRSRQ_cdb))
           .bits(24, 1, 7, rsrq.steps(serving.averageRSRQ_cdb))
           .bits(25, 0, 9, rssi.steps(serving.rssi_cdbm))
           .bits(26, 1, 6, minimumLevel(minimumLevel_dbm))
           .bits(26, 7, 7, power(maximumPower_dbm))
           .bits(27, 6, 6, power(maximumPower_dbm))  // the phone's own limit
           .bits(29, 0, 7, power(left_db))
           .bits(29, 7, 6, 0)  // no cycle without coverage
           .bits(30, 5, 6, threshold(intraFrequencySearch_db))
           .bits(31, 3, 6, threshold(otherSearch_db))
           .bits(32, 1, 1, rules != _measurementRules)
           .bits(32, 2, 4, rules)
           .finish());
  _measurementRules = rules;
}

// One carrier per report: the next one on which the phone receives a neighbor.
void LTEModem::sendNeighbors() {
  std::vector<int> channels;
  for (const ReceivedCell& received : walk().cells(Access::LTE)) {
    if (std::ranges::count(channels, received.cell->channel) == 0) channels.push_back(received.cell->channel);
  }
  std::ranges::sort(channels);
  for (std::size_t tries = 0; tries < channels.size(); ++tries) {
    if (sendNeighborsOn(channels[_nextCarrier++ % channels.size()])) return;
  }
}

bool LTEModem::sendNeighborsOn(int channel) {
  constexpr std::size_t headSize = 21, recordSize = 20, mostCells = 32;
  auto cells = measureLTECarrier(walk(), channel, _random);
  std::erase_if(cells, [this](const LTEMeasurement& measurement) {
    return measurement.cell == &servingCell() || !measurement.isMeasurable();
  });
  if (cells.empty()) return false;
  cells.resize(std::min(cells.size(), mostCells));

  PacketWriter packet(neighborsCode, now(), headSize);
  packet
      .u8(13, 3)  // version
      .u16(17, channel)
      .bits(19, 0, 6, minimumLevel(minimumLevel_dbm))
      .bits(19, 6, 5, std::ssize(cells) - 1);
  for (const LTEMeasurement& measurement : cells) {
    const CellTiming timing(*measurement.cell);
    packet.record(recordSize)
        .bits(0, 0, 9, measurement.cell->code)
        .bits(1, 1, 8, rssi.steps(measurement.rssi_cdbm))
        .bits(2, 1, 9, neighborRSRP.steps(measurement.measuredRSRP_cdbm))
        .bits(4, 0, 9, neighborRSRP.steps(measurement.averageRSRP_cdbm))
        .bits(5, 1, 7, rsrq.steps(measurement.measuredRSRQ_cdb))
        .bits(6, 0, 7, rsrq.steps(measurement.averageRSRQ_cdb))
        .bits(6, 7, 7, power(aboveMinimum_db(measurement.averageRSRP_cdbm)))
        .u16(8, timing.frequency() + _random.between(0, 20))
        .bits(12, 0, 11, timing.frame())
        .bits(13, 3, 19, timing.sample() + _random.between(0, 3));
  }
  send(packet.finish());
  return true;
}

void LTEModem::sendConnectedMeasurement() {
  constexpr std::size_t headSize = 29, neighborSize = 6, detectedSize = 2;
  const Cell& cell = servingCell();
  const auto carrier = measureLTECarrier(walk(), cell.channel, _random);
  const LTEMeasurement& serving = measurementOf(cell, carrier);
  std::vector<LTEMeasurement> neighbors, detected;
  for (const LTEMeasurement& measurement : carrier) {
    if (measurement.cell == &cell) continue;
    if (measurement.isMeasurable())
      neighbors.push_back(measurement);
    else if (measurement.isDetectable())
      detected.push_back(measurement);
  }

  PacketWriter packet(connectedMeasurementCode, now(), headSize);
  packet
      .u8(13, 2)  // version
      .u16(17, cell.channel)
      .u16(19, cell.code)
      .u16(21, now().count() % 10'240)  // subframe, counted over all frames
      .bits(23, 0, 16, rsrp.steps(serving.averageRSRP_cdbm))
      .bits(25, 0, 16, connectedRSRQ.steps(serving.averageRSRQ_cdb))
      .u8(27, std::ssize(neighbors))
      .u8(28, std::ssize(detected));
  for (const LTEMeasurement& neighbor : neighbors)
    packet.record(neighborSize)
        .u16(0, neighbor.cell->code)
        .bits(2, 0, 16, rsrp.steps(neighbor.averageRSRP_cdbm))
        .bits(4, 0, 16, connectedRSRQ.steps(neighbor.averageRSRQ_cdb));
  for (const LTEMeasurement& found : detected) packet.record(detectedSize).u16(0, found.cell->code);
  send(packet.finish());
}

// The strongest cell of each technology in turn, since a phone watches all of them.
void LTEModem::considerReselection() {
  constexpr Access technologies[] = {Access::LTE, Access::UMTS, Access::GSM, Access::CDMA1xRTT, Access::HRPD};
  for (const ReceivedCell& received :
       walk().cells(technologies[_nextCandidate++ % std::size(technologies)])) {
    if (received.cell == &servingCell()) continue;
    sendReselectionCandidate(servingCell(), *received.cell);
    return;
  }
}

// One candidate per report. Records begin every 4 bytes, so channel and cell of one candidate would overlap
// priority and technology of the next.
void LTEModem::sendReselectionCandidate(const Cell& serving, const Cell& candidate) {
  constexpr std::size_t headSize = 21, recordSize = 8, recordSizeOfCDMA = 12;
  enum Technology { LTE, UTRAN, GERAN, CDMA1xRTT, CDMAHRPD };
  const bool isCDMA = candidate.access == Access::CDMA1xRTT || candidate.access == Access::HRPD;
  PacketWriter packet(candidatesCode, now(), headSize);
  packet
      .u8(13, 1)  // version
      .u16(15, serving.channel)
      .u16(17, serving.code)
      .u16(19, 1)  // candidate
      .record(isCDMA ? recordSizeOfCDMA : recordSize)
      .u16(0, priority(candidate));
  switch (candidate.access) {
    case Access::LTE:
      packet.u16(2, LTE).u16(4, candidate.channel).bits(6, 7, 9, candidate.code);
      break;
    case Access::UMTS:
    case Access::UTRAN:
      packet.u16(2, UTRAN).u16(4, candidate.channel).u16(6, candidate.code);
      break;
    case Access::GSM:
      // LTE uses number 8 for the band of 900 MHz.
      packet.u16(2, GERAN).u16(4, candidate.channel).u8(6, 8).u8(7, candidate.code);
      break;
    case Access::CDMA1xRTT:
    case Access::HRPD:
      packet.u16(2, candidate.access == Access::HRPD ? CDMAHRPD : CDMA1xRTT)
          .u8(4, candidate.band)
          .u16(8, candidate.channel)
          .u16(10, candidate.code);
      break;
    case Access::NR:
      break;  // this packet knows no NR
  }
  send(packet.finish());
}

}  // namespace varnel::simulation
