#include "programs/varnel-telephonyd/simulation/radios/LTETransmitPower.h"

#include <algorithm>

#include "programs/varnel-telephonyd/simulation/PacketWriter.h"
#include "programs/varnel-telephonyd/simulation/radios/FrameClock.h"
#include "programs/varnel-telephonyd/simulation/radios/LTEPathLoss.h"

namespace varnel::simulation {

namespace {

constexpr std::uint16_t uplinkCode = 0xB139, sharedChannelCode = 0xB16E, controlChannelCode = 0xB16F;
constexpr int records = 5;
constexpr std::chrono::milliseconds recordTime{8};
constexpr std::int64_t maximumPower_dbm = 23, lowestPower_dbm = -40;

// How many resource blocks, the same in decibels, and how many bytes they carry.
struct Allocation {
  std::int64_t blocks, blocks_db, bytes;
};
constexpr Allocation allocations[] = {{2, 3, 41}, {4, 6, 85}, {8, 9, 173}, {16, 12, 373}, {48, 17, 1143}};

// TS 36.213 5.1.1: the base level of the network, the path loss, and the width.
std::int64_t power_dbm(std::int64_t base_dbm, std::int64_t pathLoss_db, std::int64_t blocks_db) {
  return std::max(base_dbm + pathLoss_db + blocks_db, lowestPower_dbm);
}
constexpr std::int64_t sharedBase_dbm = -98, controlBase_dbm = -112;

constexpr std::int64_t signedBits(std::int64_t number, unsigned width) {
  return number & ((std::int64_t{1} << width) - 1);
}

std::int64_t pathLoss_db(const Situation& situation) {
  return ltePathLoss_db(situation.walk.level_cdbm(situation.serving));
}

const Allocation& allocation(Random& random) {
  return allocations[random.between(0, std::ssize(allocations) - 1)];
}

// When a record's transmission was. The last one has just been.
FrameClock clockOf(const Situation& situation, int record) {
  return {situation.serving, situation.now - (records - 1 - record) * recordTime};
}

}  // namespace

Bytes lteUplinkTransmissions(const Situation& situation, TransmitPowerLayouts layouts, Random& random) {
  constexpr std::size_t headSize = 21, olderSize = 64, newerSize = 68;
  const bool isOld = layouts == TransmitPowerLayouts::Older;
  const FrameClock now(situation.serving, situation.now);
  PacketWriter packet(uplinkCode, situation.now, headSize);
  packet
      .u8(13, isOld ? 43 : 102)  // version
      .bits(14, 0, 9, situation.serving.code)
      .bits(14, 9, 5, records)
      .u16(17, 10 * now.frame + now.subframe);
  for (int i = 0; i < records; ++i) {
    const Allocation& sent = allocation(random);
    const FrameClock clock = clockOf(situation, i);
    const std::int64_t power =
        std::min(power_dbm(sharedBase_dbm, pathLoss_db(situation), sent.blocks_db), maximumPower_dbm);
    packet.record(isOld ? olderSize : newerSize)
        .u16(0, 10 * clock.frame + clock.subframe)
        .u16(isOld ? 12 : 8, sent.bytes)
        .bits(24, 0, 7, signedBits(power, 7));
  }
  return packet.finish();
}

Bytes lteSharedChannelPower(const Situation& situation, TransmitPowerLayouts layouts, Random& random) {
  constexpr std::size_t headSize = 17, recordSize = 12;
  constexpr std::int64_t noChange = 1;
  const bool isOld = layouts == TransmitPowerLayouts::Older;
  // Newer modems tell the carrier first, and at the end their highest power.
  const unsigned carrierWidth = isOld ? 0 : 3;
  PacketWriter packet(sharedChannelCode, situation.now, headSize);
  packet.u8(13, isOld ? 5 : 25).u8(16, records);
  for (int i = 0; i < records; ++i) {
    const Allocation& sent = allocation(random);
    const FrameClock clock = clockOf(situation, i);
    const std::int64_t wanted = power_dbm(sharedBase_dbm, pathLoss_db(situation), sent.blocks_db);
    packet.record(recordSize)
        .bits(0, carrierWidth, 10, clock.frame)
        .bits(0, carrierWidth + 10, 4, clock.subframe)
        .bits(0, carrierWidth + 14, 8, signedBits(wanted, 8))
        .bits(4, 0, 8, sent.blocks)
        .bits(4, 8, 14, sent.bytes)
        .bits(4, 22, 8, pathLoss_db(situation))
        .bits(8, 10, 5, noChange)
        .bits(8, 15, 8, signedBits(std::min(wanted, maximumPower_dbm), 8))
        .bits(8, 23, 8, isOld ? 0 : maximumPower_dbm);
  }
  return packet.finish();
}

Bytes lteControlChannelPower(const Situation& situation, TransmitPowerLayouts layouts, Random& random) {
  constexpr std::size_t headSize = 17, recordSize = 12;
  PacketWriter packet(controlChannelCode, situation.now, headSize);
  packet.u8(13, layouts == TransmitPowerLayouts::Older ? 4 : 24).u8(16, records);
  for (int i = 0; i < records; ++i) {
    const FrameClock clock = clockOf(situation, i);
    const std::int64_t wanted = power_dbm(controlBase_dbm, pathLoss_db(situation), 0) + random.between(-1, 1);
    packet.record(recordSize)
        .bits(0, 0, 10, clock.frame)
        .bits(0, 10, 4, clock.subframe)
        .bits(0, 14, 8, signedBits(wanted, 8))
        .bits(4, 11, 8, pathLoss_db(situation))
        .bits(8, 16, 8, signedBits(std::min(wanted, maximumPower_dbm), 8));
  }
  return packet.finish();
}

}  // namespace varnel::simulation
