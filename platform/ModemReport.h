#pragma once

#include <cstdint>
#include <string_view>

/// The keys and constant values of the telephony service's modem reports: what a modem tells without a
/// diagnostic port. `docs/formats.md` says which values they have.
namespace varnel::modemReport {

inline constexpr std::uint32_t logCode = 0xFF0003;
inline constexpr std::int64_t version = 1;

inline constexpr std::string_view versionKey = "Version";
inline constexpr std::string_view registrationState = "RegistrationState";
inline constexpr std::string_view operatorName = "Operator";
inline constexpr std::string_view plmn = "PLMN";  ///< of the report, and of each cell
inline constexpr std::string_view accessTechnologies = "AccessTechnologies";
inline constexpr std::string_view signalQuality = "SignalQuality";
inline constexpr std::string_view cells = "Cells";
inline constexpr std::string_view position = "Position";

// ---- Of a cell ----

inline constexpr std::string_view radioAccessTechnology = "RadioAccessTechnology";
inline constexpr std::string_view gsm = "GSM", umts = "UMTS", lte = "LTE", nr = "NR", cdma2000 = "CDMA2000";
inline constexpr std::string_view cellType = "CellType";
inline constexpr std::string_view serving = "Serving", neighbor = "Neighbor";

inline constexpr std::string_view locationAreaCode = "LocationAreaCode";
inline constexpr std::string_view trackingAreaCode = "TrackingAreaCode";
inline constexpr std::string_view cellIdentity = "CellIdentity";
inline constexpr std::string_view arfcn = "ARFCN";
inline constexpr std::string_view baseStationIdentityCode = "BaseStationIdentityCode";
inline constexpr std::string_view uarfcn = "UARFCN";
inline constexpr std::string_view scramblingCode = "ScramblingCode";
inline constexpr std::string_view earfcn = "EARFCN";
inline constexpr std::string_view nrArfcn = "NR-ARFCN";
inline constexpr std::string_view physicalCellIdentity = "PhysicalCellIdentity";
inline constexpr std::string_view bandwidth = "Bandwidth";
inline constexpr std::string_view timingAdvance = "TimingAdvance";
inline constexpr std::string_view systemIdentity = "SystemIdentity";
inline constexpr std::string_view networkIdentity = "NetworkIdentity";
inline constexpr std::string_view baseStationIdentity = "BaseStationIdentity";
inline constexpr std::string_view pilotPN = "PilotPN";

inline constexpr std::string_view rsrp = "RSRP";
inline constexpr std::string_view rsrq = "RSRQ";
inline constexpr std::string_view sinr = "SINR";
inline constexpr std::string_view rssi = "RSSI";
inline constexpr std::string_view rscp = "RSCP";
inline constexpr std::string_view ecIo = "EcIo";
inline constexpr std::string_view pathLoss = "PathLoss";
inline constexpr std::string_view errorRate = "ErrorRate";

// ---- Of the position ----

inline constexpr std::string_view latitude = "Latitude";
inline constexpr std::string_view longitude = "Longitude";
inline constexpr std::string_view altitude = "Altitude";
inline constexpr std::string_view time = "Time";
inline constexpr std::string_view source = "Source";

}  // namespace varnel::modemReport
