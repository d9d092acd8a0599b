#pragma once

#include <cstdint>

namespace varnel::simulation {

/// The network that every simulated modem is at home in: the test network 001/01.
inline constexpr int testNetworkMCC = 1;
inline constexpr int testNetworkMNC = 1;
inline constexpr int testNetworkMNCDigits = 2;

enum class Access { GSM, UMTS, LTE };

/// One cell beside the street that everybody walks along. Levels are in hundredths of a decibel.
struct Cell {
  Access access;
  int band;                ///< as the technology numbers its bands
  int channel;             ///< ARFCN, downlink UARFCN or downlink EARFCN
  int resourceBlocks;      ///< LTE: the bandwidth; else 0
  int antennas;            ///< that transmit
  int code;                ///< BSIC, scrambling code or physical cell identity
  int area;                ///< location area code or tracking area code
  std::uint32_t identity;  ///< the cell identity

  std::int64_t position_cm;  ///< along the street
  std::int64_t setback_cm;   ///< away from the street
  int direction;             ///< 1: it looks up the street, -1: down, 0: all round
  std::int64_t power_cdbm;   ///< the level at a distance of one metre
};

/// The uplink channel that belongs to an LTE downlink channel; the same one where both share a carrier.
constexpr int uplinkEARFCN(int downlink) {
  constexpr int firstTimeDivisionEARFCN = 36000, duplexOffset = 18000;
  return downlink < firstTimeDivisionEARFCN ? downlink + duplexOffset : downlink;
}

}  // namespace varnel::simulation
