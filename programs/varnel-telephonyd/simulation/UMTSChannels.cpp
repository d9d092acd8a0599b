#include "programs/varnel-telephonyd/simulation/UMTSChannels.h"

#include <algorithm>

namespace varnel::simulation {

namespace {

constexpr std::uint16_t transmitPowerCode = 0x4031, blockErrorsCode = 0x4116, highSpeedCode = 0x4221;

constexpr std::size_t samples = 10;
constexpr std::int64_t windowSize = 200;  // blocks
constexpr int processes = 6;
constexpr std::size_t processSize = 9;

// The rate of wrong blocks at a strong cell, and the level of a strong cell.
constexpr std::int64_t leastWrong_permille = 8, strong_cdbm = -85'00;

std::int64_t missing_db(const Situation& situation) {
  return std::max<std::int64_t>(strong_cdbm - situation.walk.level_cdbm(situation.serving), 0) / 100;
}

}  // namespace

// Three classes of speech, data, and signaling, or the common channels.
void UMTSChannels::configure(UTRANConnection::State state, std::chrono::milliseconds now) {
  using State = UTRANConnection::State;
  _channels.clear();
  if (state == State::CellDCH)
    _channels = {{1, 50}, {2, 50}, {3, 50}, {5, 100}, {24, 25}};
  else if (state == State::CellFach)
    _channels = {{30, 100}, {31, 25}};
  _sendsInBursts = state == State::CellFach;
  _carriers = _random.oneIn(3) ? 2 : 1;
  _counted = _highSpeedTold = now;
}

Bytes UMTSChannels::transmitPower(const Situation& situation) {
  constexpr std::size_t headSize = 16, recordSize = 14;
  // In tenths of a decibel. -18.8 dBm would be 0, which means that nothing was sent.
  constexpr std::int64_t zero_cdbm = -18'80;
  PacketWriter packet(transmitPowerCode, situation.now, headSize);
  packet.u8(14, samples);
  for (std::size_t i = 0; i < samples; ++i) {
    const bool isSending = i == 0 || !_sendsInBursts || _random.oneIn(3);
    const std::int64_t power = (power_cdbm(situation) - zero_cdbm) / 10;
    packet.record(recordSize).u16(4, !isSending ? 0 : power == 0 ? 1 : power);
  }
  return packet.finish();
}

std::int64_t UMTSChannels::power_cdbm(const Situation& situation) {
  constexpr std::int64_t weakest_cdbm = -49'00, strongest_cdbm = 24'00;
  // The sum of the power that a cell sends and the level that it has to receive.
  constexpr std::int64_t balance_cdbm = -75'00;
  const std::int64_t needed = balance_cdbm - situation.walk.level_cdbm(situation.serving);
  return std::clamp(needed + _random.noise(50), weakest_cdbm, strongest_cdbm);
}

Bytes UMTSChannels::blockErrors(const Situation& situation) {
  constexpr std::size_t headSize = 16, recordSize = 9;
  const std::int64_t elapsed_ms = (situation.now - _counted).count();
  _counted = situation.now;
  PacketWriter packet(blockErrorsCode, situation.now, headSize);
  packet.u8(13, std::ssize(_channels)).u16(14, windowSize);
  for (TransportChannel& channel : _channels) {
    receive(channel, elapsed_ms, leastWrong_permille + 4 * missing_db(situation));
    packet.record(recordSize).u8(0, channel.identity).u32(1, channel.received).u32(5, channel.wrong);
  }
  return packet.finish();
}

void UMTSChannels::receive(TransportChannel& channel, std::int64_t elapsed_ms, std::int64_t wrong_permille) {
  const std::int64_t blocks = channel.blocks * elapsed_ms / 1000;
  channel.received += blocks;
  for (std::int64_t i = 0; i < blocks; ++i) channel.wrong += _random.between(1, 1000) <= wrong_permille;
}

// The processes of a second carrier do not follow those of the first: every process of the first carrier
// moves them by the size of 18 records.
Bytes UMTSChannels::highSpeed(const Situation& situation) {
  constexpr std::size_t headSize = 18, secondCarrierMove = 18 * processSize;
  constexpr std::int64_t subframe_ms = 2, mostSubframes = 1023;
  constexpr std::int64_t singleCarrier = 0, dualCarrier = 2;
  const std::int64_t elapsed_ms = (situation.now - _highSpeedTold).count();
  const std::int64_t subframes = std::min(elapsed_ms / subframe_ms, mostSubframes);
  _highSpeedTold = situation.now;

  const bool isDual = _carriers == 2;
  PacketWriter packet(highSpeedCode, situation.now, headSize);
  packet
      .u8(13, 2)  // version
      .bits(14, 0, 10, subframes)
      .bits(15, 2, 2, isDual ? dualCarrier : singleCarrier)
      .u8(16, processes)
      .u8(17, isDual ? processes : 0);
  putProcesses(packet, subframes);
  if (isDual) putProcesses(packet.padTo(headSize + secondCarrierMove * processes), subframes);
  return packet.finish();
}

void UMTSChannels::putProcesses(PacketWriter& packet, std::int64_t subframes) {
  constexpr std::int64_t smallestBlock_bits = 2404, largestBlock_bits = 14'411;
  const std::int64_t block_bits = _random.between(smallestBlock_bits, largestBlock_bits);
  for (int process = 0; process < processes; ++process) {
    const std::int64_t sent = subframes / processes * _random.between(30, 95) / 100;
    const std::int64_t wrong = sent * _random.between(4, 16) / 100;
    packet.record(processSize).u8(0, process).u32(1, wrong * block_bits).u16(5, sent).u16(7, wrong);
  }
}

}  // namespace varnel::simulation
