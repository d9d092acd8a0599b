#pragma once

#include <vector>

#include "programs/varnel-telephonyd/simulation/Walk.h"

namespace varnel::simulation {

/// The pilot of a mast, as a phone receives it.
struct ReceivedPilot {
  static constexpr std::int64_t whole = 1 << 16;

  const Cell* cell;
  std::int64_t strength;  ///< its share of everything received on the channel, in parts of `whole`
};

/// What a phone receives on the channel that all CDMA masts share.
struct CDMACarrier {
  std::vector<ReceivedPilot> pilots;  ///< all pilots, the strongest first
  std::int64_t level_cdbm;            ///< all masts and the noise together

  /// The strength of a cell's pilot.
  std::int64_t strength(const Cell& cell) const;
};

/// 1x and HRPD share masts and band, so a phone receives both alike. The walk knows only this one; it stands
/// for both.
inline constexpr Access cdmaMasts = Access::HRPD;

/// Receives one of the two technologies. 1x sends its pilot together with the traffic, HRPD sends it alone.
/// The cells are those of `cdmaMasts`.
CDMACarrier receiveCDMACarrier(const Walk& walk, Access access);

/// The transmit power that a phone chooses by itself from the received level.
std::int64_t openLoopPower_cdbm(std::int64_t level_cdbm);

/// The lowest and the highest transmit power of a phone.
inline constexpr std::int64_t leastTransmitPower_cdbm = -50'00, mostTransmitPower_cdbm = 23'00;

/// The channel below a CDMA carrier: another carrier of the same masts.
constexpr int nextCarrierBelow(int channel) { return channel - 41; }

/// A strength in hundredths of a decibel: 0 for the whole, less than 0 for a part.
std::int64_t strength_cdb(std::int64_t strength);

}  // namespace varnel::simulation
