#pragma once

#include <cstdint>

namespace varnel::simulation {

/// A mobile network, named by its country and its own code.
struct Network {
  int countryCode;
  int networkCode;
  int networkCodeDigits;  ///< 2 or 3

  bool operator==(const Network&) const = default;
};
/// The network that every simulated modem is at home in: the test network 001/01. It has no GSM cells of its
/// own; its phones may use those of a partner, and the cells of another one that does not reach the town.
inline constexpr Network homeNetwork{1, 1, 2}, partnerNetwork{1, 100, 3}, distantNetwork{1, 101, 3};

/// A radio access technology. UMTS is the frequency-division mode; UTRAN, as the telephony service uses the
/// name, the time-division mode.
enum class Access { GSM, UMTS, LTE, UTRAN, CDMA1xRTT, HRPD };

/// One cell beside the street that everybody walks along. Levels are in hundredths of a decibel.
struct Cell {
  Access access = Access::LTE;
  int band = 0;            ///< as the technology numbers its bands; CDMA: the band class
  int channel = 0;         ///< ARFCN, downlink UARFCN or EARFCN, CDMA channel number
  int resourceBlocks = 0;  ///< LTE: the bandwidth; else 0
  int antennas = 1;        ///< that transmit
  int code = 0;            ///< BSIC, scrambling code, physical cell identity or pilot offset
  int area = 0;            ///< location area code or tracking area code
  Network network = homeNetwork;
  std::uint32_t identity = 0;  ///< the cell identity

  std::int64_t position_cm = 0;  ///< along the street
  std::int64_t setback_cm = 0;   ///< away from the street
  int direction = 0;             ///< 1: it looks up the street, -1: down, 0: all round
  std::int64_t power_cdbm = 0;   ///< the level at a distance of one metre
};

/// The uplink channel that belongs to an LTE downlink channel; the same one where both share a carrier.
constexpr int uplinkEARFCN(int downlink) {
  constexpr int firstTimeDivisionEARFCN = 36000, duplexOffset = 18000;
  return downlink < firstTimeDivisionEARFCN ? downlink + duplexOffset : downlink;
}

/// The uplink channel that belongs to a UMTS downlink channel of the band of 2100 MHz.
constexpr int uplinkUARFCN(int downlink) {
  constexpr int duplexOffset = 950;
  return downlink - duplexOffset;
}

}  // namespace varnel::simulation
