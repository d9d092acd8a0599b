#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace varnel {

/// The names of modem technologies that the telephony service uses.
namespace technology {
inline constexpr std::string_view ifxGSM = "ifx-gsm";
inline constexpr std::string_view kalviGSMUMTS = "kalvi-gsm-umts";
inline constexpr std::string_view kalviCDMA = "kalvi-cdma";
inline constexpr std::string_view kalviLTE = "kalvi-lte";
inline constexpr std::string_view kalviUTRAN2 = "kalvi-utran-2";
/// All radios of a modem in one display.
inline constexpr std::string_view allRadios = "all-radios";
}  // namespace technology

/// Keys and constant values of the service's cell-monitor records.
namespace cellMonitor {
inline constexpr std::string_view radioAccessTechnology = "RadioAccessTechnology";
inline constexpr std::string_view cellType = "CellType";
inline constexpr std::string_view mcc = "MCC";
inline constexpr std::string_view mnc = "MNC";
inline constexpr std::string_view lac = "LAC";
inline constexpr std::string_view cellIdentity = "CellIdentity";
inline constexpr std::string_view arfcn = "ARFCN";
inline constexpr std::string_view uarfcn = "UARFCN";
inline constexpr std::string_view bandInfo = "BandInfo";
inline constexpr std::string_view rssi = "RSSI";
inline constexpr std::string_view rscp = "RSCP";
inline constexpr std::string_view ecN0 = "EcN0";
inline constexpr std::string_view scramblingCode = "ScramblingCode";
inline constexpr std::string_view physicalCellIdentity = "PhysicalCellIdentity";
inline constexpr std::string_view trackingAreaCode = "TrackingAreaCode";

inline constexpr std::string_view gsm = "GSM";
inline constexpr std::string_view umts = "UMTS";
inline constexpr std::string_view lte = "LTE";
inline constexpr std::string_view utran = "UTRAN";
inline constexpr std::string_view serving = "Serving";
inline constexpr std::string_view neighbor = "Neighbor";
}  // namespace cellMonitor

/// An open connection to the telephony service. The destructor closes it.
class TelephonyConnection {
 public:
  struct LogChannel {
    std::int64_t error = 0;               ///< 0 when the channel was made
    std::optional<std::string> portName;  ///< the port on which the service takes commands
  };

  virtual ~TelephonyConnection() = default;
  /// Asks for a network-monitor log channel that delivers to the local port of this name.
  virtual LogChannel createLogChannel(std::string_view localPortName) = 0;
};

/// The host's telephony server.
class TelephonyService {
 public:
  virtual ~TelephonyService() = default;
  /// Opens a connection with the access rights "spi" and "internal"; null when the service cannot be reached.
  /// The connection calls the handler for every notification that arrives while it is open.
  virtual std::unique_ptr<TelephonyConnection> connect(std::function<void()> notificationHandler) = 0;
};

}  // namespace varnel
