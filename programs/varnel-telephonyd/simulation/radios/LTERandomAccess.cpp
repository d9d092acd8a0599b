#include "programs/varnel-telephonyd/simulation/radios/LTERandomAccess.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEPathLoss.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t accessCode = 0xB061, attemptCode = 0xB062, preambleConfigurationCode = 0xB166,
                        preambleCode = 0xB167, responseCode = 0xB168, resolutionCode = 0xB16A;

// Broadcast by the network.
constexpr std::int64_t targetPower_dbm = -104, powerStep_db = 2, mostPreambles = 10, contentionTimer_ms = 48,
                       maximumPower_dbm = 23, mostFirstMessages = 5, responseWindow = 7;
// TS 36.211 table 5.7.1-2: preambles begin in subframe 1 of each frame.
constexpr std::int64_t prachConfiguration = 3, prachSubframe = 1;
// Table 5.7.2-2: with this zone, preambles of a root are 119 apart, so seven fit.
constexpr std::int64_t cyclicShiftZone = 12, cyclicShift = 119, preamblesPerRoot = 7;
// Table 5.7.2-4: the physical roots in their logical order.
constexpr std::int64_t physicalRoots[] = {129, 710, 140, 699, 120, 719, 210, 629, 168, 671, 84,
                                          755, 105, 734, 93,  746, 70,  769, 60,  779, 2,   837};
constexpr int logicalRoots = 12;
constexpr std::int64_t preambles = 52;  // the others are not free to choose

enum Reason { ConnectionRequest };
enum Contention { NoContention, WithContention };

std::int64_t logicalRoot(const Cell& cell) { return cell.identity % logicalRoots; }

// TS 36.213 4.2.3: units of 78.1 m. The level falls by 35 lg of the distance, so by 10.5 dB when it doubles.
std::int64_t timingAdvanceOf(std::int64_t loss_cdb) {
  std::int64_t distance_m = 1;
  for (constexpr std::int64_t perDoubling_cdb = 10'54; loss_cdb >= perDoubling_cdb; distance_m *= 2)
    loss_cdb -= perDoubling_cdb;
  distance_m += distance_m * loss_cdb / 10'54;
  return (distance_m * 10 + 390) / 781;
}

}  // namespace

LTERandomAccess::LTERandomAccess(const Situation& situation, ByteView firstMessage, Random& random)
    : _situation(situation), _firstMessage(firstMessage.begin(), firstMessage.end()) {
  const std::int64_t level_cdbm = situation.walk.level_cdbm(situation.serving);
  _preamble = random.between(0, preambles - 1);
  _temporaryIdentity = random.between(0x3D, 0xFFF3);
  _pathLoss_db = ltePathLoss_db(level_cdbm);
  _timingAdvance = timingAdvanceOf(situation.serving.power_cdbm - level_cdbm);
  _power_dbm = std::min(targetPower_dbm + _pathLoss_db, maximumPower_dbm);
}

std::vector<Bytes> LTERandomAccess::packets() const {
  return {configuration(), preambleConfiguration(), preamble(), response(),
          attempt(),       contentionResolution()};
}

Bytes LTERandomAccess::configuration() const {
  constexpr std::size_t headSize = 17, configurationSize = 28, reasonSize = 20;
  constexpr std::int64_t wholeMask = 0;
  PacketWriter packet(accessCode, _situation.now, headSize);
  packet.u8(13, 1).u8(14, 2);  // version, subpackets
  packet.record(configurationSize)
      .u8(0, 3)
      .u8(1, 2)
      .u16(2, configurationSize)
      .u16(4, targetPower_dbm)
      .u8(6, powerStep_db)
      .u8(9, mostPreambles)
      .u16(10, contentionTimer_ms)
      .u16(12, 7)  // bytes of a message of group A
      .u16(15, maximumPower_dbm)
      .u8(19, prachConfiguration)
      .u8(20, cyclicShiftZone)
      .u16(21, logicalRoot(_situation.serving))
      .u8(23, 4)  // the first resource block
      .u8(25, mostFirstMessages)
      .u8(26, responseWindow);
  PacketWriter& reason = packet.record(reasonSize)
                             .u8(0, 5)
                             .u8(1, 1)
                             .u16(2, reasonSize)
                             .u8(4, ConnectionRequest)
                             .u8(11, WithContention)
                             .u8(12, _preamble)
                             .u8(13, wholeMask)
                             .u8(14, std::ssize(_firstMessage) + 1)
                             .u8(16, _pathLoss_db);
  for (std::size_t i = 0; i < _firstMessage.size(); ++i) reason.u8(5 + i, _firstMessage[i]);
  return packet.finish();
}

Bytes LTERandomAccess::attempt() const {
  constexpr std::size_t headSize = 17, attemptSize = 40, firstMessageStart = 27;
  constexpr std::int64_t success = 0, allMessages = 7, noMask = 255;
  PacketWriter packet(attemptCode, _situation.now, headSize);
  packet.u8(13, 1).u8(14, 1);  // version, subpackets
  packet.record(attemptSize)
      .u8(0, 6)
      .u8(1, 2)
      .u16(2, attemptSize)
      .u8(4, 1)  // the first attempt
      .u8(5, success)
      .u8(6, WithContention)
      .u8(7, allMessages)
      .u8(8, _preamble)
      .u8(9, noMask)
      .u16(10, _power_dbm - _pathLoss_db)
      .u16(12, 0)  // ms of backoff
      .u8(14, 1)
      .u16(15, _temporaryIdentity)
      .u16(17, _timingAdvance)
      .u32(19, 0x1A0C)
      .u16(23, std::ssize(_firstMessage) + 1);
  for (std::size_t i = 0; i < _firstMessage.size(); ++i) packet.u8(firstMessageStart + i, _firstMessage[i]);
  return packet.finish();
}

Bytes LTERandomAccess::preambleConfiguration() const {
  return PacketWriter(preambleConfigurationCode, _situation.now, 29)
      .u8(13, 3)  // version
      .bits(15, 0, 10, logicalRoot(_situation.serving))
      .bits(15, 10, 6, prachConfiguration)
      .finish();
}

Bytes LTERandomAccess::preamble() const {
  constexpr std::int64_t subframesToWindow = 3;
  const FrameClock clock(_situation.serving, _situation.now);
  const auto root = static_cast<std::size_t>(logicalRoot(_situation.serving) + _preamble / preamblesPerRoot);
  return PacketWriter(preambleCode, _situation.now, 41)
      .u8(13, 5)  // version
      .bits(17, 0, 6, _preamble)
      .bits(17, 6, 10, physicalRoots[root])
      .bits(17, 16, 16, _preamble % preamblesPerRoot * cyclicShift)
      .u8(21, _power_dbm)
      .bits(27, 0, 10, clock.frame)
      .bits(27, 10, 4, prachSubframe + subframesToWindow)
      .u16(33, 1 + prachSubframe)  // TS 36.321 5.1.4
      .u32(37, _power_dbm)
      .finish();
}

Bytes LTERandomAccess::response() const {
  const FrameClock clock(_situation.serving, _situation.now);
  return PacketWriter(responseCode, _situation.now, 29)
      .u8(13, 1)  // version
      .bits(17, 0, 10, clock.frame)
      .bits(17, 10, 4, clock.subframe)
      .bits(19, 0, 11, _timingAdvance)
      .bits(21, 8, 16, _temporaryIdentity)
      .finish();
}

Bytes LTERandomAccess::contentionResolution() const {
  const FrameClock clock(_situation.serving, _situation.now);
  return PacketWriter(resolutionCode, _situation.now, 21)
      .u8(13, 1)  // version
      .bits(17, 0, 10, clock.frame)
      .bits(17, 10, 4, clock.subframe)
      .finish();
}

}  // namespace varnel::simulation
