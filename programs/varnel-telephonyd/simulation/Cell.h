#pragma once

#include <cstdint>

namespace varnel::simulation {

/// A mobile network: its country code and its network code.
struct Network {
  int countryCode;
  int networkCode;
  int networkCodeDigits;  ///< 2 or 3

  bool operator==(const Network&) const = default;
};
/// All simulated modems have the test network 001/01 as their home. It has no GSM cells. Its phones may use
/// the GSM cells of a partner. The cells of the third network do not reach the town.
inline constexpr Network homeNetwork{1, 1, 2}, partnerNetwork{1, 100, 3}, distantNetwork{1, 101, 3};

/// A radio access technology. UMTS is the frequency-division mode. UTRAN is the time-division mode, as in the
/// names of the telephony service.
enum class Access { GSM, UMTS, LTE, UTRAN, CDMA1xRTT, HRPD, NR };

/// One cell beside the street along which people walk. Levels are in hundredths of a decibel.
struct Cell {
  Access access = Access::LTE;
  int band = 0;            ///< the band number of the technology; CDMA: the band class
  int channel = 0;         ///< ARFCN, downlink UARFCN or EARFCN, CDMA channel number, NR-ARFCN
  int resourceBlocks = 0;  ///< LTE: the bandwidth; else 0
  int antennas = 1;        ///< transmit antennas
  int code = 0;            ///< BSIC, scrambling code, physical cell identity or pilot offset
  int area = 0;            ///< location area code or tracking area code
  Network network = homeNetwork;
  std::uint32_t identity = 0;  ///< the cell identity

  std::int64_t position_cm = 0;  ///< along the street
  std::int64_t setback_cm = 0;   ///< away from the street
  int direction = 0;             ///< 1: toward the end of the street, -1: toward its start, 0: all directions
  std::int64_t power_cdbm = 0;   ///< the level at a distance of one meter
};

/// The uplink channel of an LTE downlink channel; the same number if both share a carrier.
constexpr int uplinkEARFCN(int downlink) {
  constexpr int firstTimeDivisionEARFCN = 36000, duplexOffset = 18000;
  return downlink < firstTimeDivisionEARFCN ? downlink + duplexOffset : downlink;
}

/// The uplink channel of a UMTS downlink channel in the band of 2100 MHz.
constexpr int uplinkUARFCN(int downlink) {
  constexpr int duplexOffset = 950;
  return downlink - duplexOffset;
}

}  // namespace varnel::simulation
