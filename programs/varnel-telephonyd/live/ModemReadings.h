#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// Levels of one cell. An absent one was not measured.
struct CellLevels {
  std::optional<double> rsrp_dbm{}, rsrq_db{}, sinr_db{}, rssi_dbm{}, rscp_dbm{}, ecIo_db{}, pathLoss_db{};
  std::optional<double> errorRate{};  ///< in percent

  bool operator==(const CellLevels&) const = default;
};

/// One cell as ModemManager tells of it. What is absent was not told.
struct CellReading {
  enum class Radio : std::uint8_t { GSM, UMTS, LTE, NR, CDMA2000 };

  Radio radio = Radio::LTE;
  bool isServing = false;
  std::string network{};                    ///< 5 or 6 digits, of which 3 are the country's; else empty
  std::optional<std::uint32_t> area{};      ///< the location area code, or the tracking area code
  std::optional<std::uint64_t> identity{};  ///< unique in the network
  std::optional<std::uint32_t> channel{};   ///< the number of the downlink
  std::optional<std::uint32_t> code{};      ///< BSIC, primary scrambling code, or physical cell identity
  std::optional<std::uint32_t> timingAdvance{};
  /// Of CDMA2000.
  std::optional<std::uint32_t> systemIdentity{}, networkIdentity{}, baseStation{}, pilot{};
  CellLevels levels{};

  bool operator==(const CellReading&) const = default;
};

/// Where ModemManager's location interface says that the modem is in the network.
struct NetworkLocation {
  std::string network{};                      ///< as in a cell
  std::optional<std::uint32_t> lac{}, tac{};  ///< absent when not known
  std::optional<std::uint64_t> identity{};

  bool operator==(const NetworkLocation&) const = default;
};

/// Where a receiver of satellites says that it is.
struct Position {
  double latitude = 0, longitude = 0;  ///< degrees of WGS 84, north and east positive
  std::optional<double> altitude_m{};  ///< above the sea
  std::optional<Date> time{};          ///< of the fix
  std::string source{};                ///< "GNSS" for the modem, or "gpsd"
  /// The receiver's own text of the time, which tells a new fix from an old one; empty when there is none.
  std::string fix{};
};

/// The files of a SIM card that ModemManager knows; empty when it does not.
struct SimReading {
  std::string identifier{};               ///< the card's number, ICCID
  std::vector<std::string> ownNumbers{};  ///< telephone numbers
};

/// One connection to a packet network. What is empty or absent is not known.
struct BearerReading {
  struct Addresses {
    std::string address{}, gateway{}, mtu{};
    std::vector<std::string> nameServers{};
  };

  std::string accessPoint{}, type{}, purpose{}, interface {};
  bool isConnected = false, isSuspended = false;
  std::optional<std::int64_t> profile{};
  Addresses ip4{}, ip6{};
  std::optional<std::uint64_t> downlinkBits{}, uplinkBits{};  ///< per second
  std::optional<std::uint64_t> received_bytes{}, sent_bytes{}, duration_s{};
};

/// What a modem tells of itself and its network.
struct ModemReading {
  std::optional<std::int64_t> registrationState{};
  std::string operatorName{}, network{};          ///< of the network in which the modem is registered
  std::vector<std::string> accessTechnologies{};  ///< in use
  std::optional<std::int64_t> signalQuality{};    ///< in percent
  std::vector<CellReading> cells{};
  std::optional<Position> position{};
};

}  // namespace varnel
