#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// A mast's pilot as a phone receives it.
struct ReceivedPilot {
  static constexpr std::int64_t whole = 1 << 16;

  const Cell* cell;
  std::int64_t strength;  ///< its part of all that is received on the channel, of `whole`
};

/// What a phone receives on the one channel that all CDMA masts share.
struct CDMACarrier {
  std::vector<ReceivedPilot> pilots;  ///< the strongest first, however weak
  std::int64_t level_cdbm;            ///< of all masts and the noise together

  /// The strength of a cell's pilot.
  std::int64_t strength(const Cell& cell) const;
};

/// The two CDMA technologies share masts and band, so both are received alike: what the walk says of this one
/// goes for the other.
inline constexpr Access cdmaMasts = Access::HRPD;

/// Of one of the two: 1x sends its pilot beside the traffic, HRPD for itself. The cells are those of
/// `cdmaMasts`.
CDMACarrier receiveCDMACarrier(const Walk& walk, Access access);

/// The power that a phone sends with on its own judgement, at a level that it receives.
std::int64_t openLoopPower_cdbm(std::int64_t level_cdbm);

/// The least and the most that a phone sends with.
inline constexpr std::int64_t leastTransmitPower_cdbm = -50'00, mostTransmitPower_cdbm = 23'00;

/// The channel next to one of a CDMA carrier: another carrier of the same masts.
constexpr int nextCarrierBelow(int channel) { return channel - 41; }

/// The decibels of a strength, in hundredths: 0 of the whole, less than 0 of a part.
std::int64_t strength_cdb(std::int64_t strength);

}  // namespace varnel::simulation
