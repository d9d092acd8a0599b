#pragma once

#include <cstdint>

namespace varnel::simulation {

/// The network that every simulated modem is at home in: the test network 001/01.
inline constexpr int testNetworkMCC = 1;
inline constexpr int testNetworkMNC = 1;
inline constexpr int testNetworkMNCDigits = 2;

/// A radio access technology. UMTS is the frequency-division mode; UTRAN, as the telephony service uses the
/// name, the time-division mode.
enum class Access { GSM, UMTS, LTE, UTRAN, CDMA1xRTT, HRPD };

/// One cell beside the street that everybody walks along. Levels are in hundredths of a decibel.
struct Cell {
  Access access = Access::LTE;
  int band = 0;                ///< as the technology numbers its bands; CDMA: the band class
  int channel = 0;             ///< ARFCN, downlink UARFCN or EARFCN, CDMA channel number
  int resourceBlocks = 0;      ///< LTE: the bandwidth; else 0
  int antennas = 1;            ///< that transmit
  int code = 0;                ///< BSIC, scrambling code, physical cell identity or pilot offset
  int area = 0;                ///< location area code or tracking area code
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

}  // namespace varnel::simulation
