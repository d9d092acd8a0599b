#include "programs/varnel-telephonyd/live/BusReading.h"

#include <QByteArray>
#include <QDBusArgument>
#include <QDBusObjectPath>
#include <QDBusVariant>
#include <QStringList>
#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string_view>
#include <utility>

namespace varnel {

namespace busReading {

namespace {

// What begins to read a container must also end it, else the toolkit keeps the message.

using Radio = CellReading::Radio;

QVariant valueOf(const QVariantMap& entries, const char* key) {
  return entries.value(QString::fromLatin1(key));
}

// Whether the value still has to be taken apart, and has this type on the bus.
bool isArgument(const QVariant& value, const char* signature) {
  return value.metaType() == QMetaType::fromType<QDBusArgument>() &&
         value.value<QDBusArgument>().currentSignature() == QString::fromLatin1(signature);
}

std::string printableText(const QString& text, std::size_t longest = longestText) {
  const std::string bytes = text.toStdString();
  const auto controls = [](unsigned char byte) { return byte < 0x20 || byte == 0x7F; };
  return bytes.size() <= longest && std::ranges::none_of(bytes, controls) ? bytes : std::string();
}

std::string objectPath(const QVariant& value) {
  if (value.metaType() != QMetaType::fromType<QDBusObjectPath>()) return {};
  const std::string found = printableText(value.value<QDBusObjectPath>().path(), longestPath);
  return found == "/" ? std::string() : found;
}

QVariantMap dictionaryOf(const QVariant& value) {
  if (value.metaType() == QMetaType::fromType<QVariantMap>()) return value.toMap();
  return isArgument(value, "a{sv}") ? qdbus_cast<QVariantMap>(value.value<QDBusArgument>()) : QVariantMap();
}

template <class Number>
std::optional<Number> inRange(std::optional<std::int64_t> number, std::int64_t least, std::int64_t most) {
  if (!number || *number < least || *number > most) return std::nullopt;
  return static_cast<Number>(*number);
}

std::optional<std::uint32_t> small(const QVariantMap& entries, const char* key, std::uint32_t most) {
  return inRange<std::uint32_t>(number(entries, key), 0, most);
}

std::optional<std::uint64_t> count(const QVariantMap& entries, const char* key) {
  return inRange<std::uint64_t>(number(entries, key), 0, std::numeric_limits<std::int64_t>::max());
}

std::optional<std::uint64_t> hexNumber(std::string_view digits, std::uint64_t most) {
  std::uint64_t found = 0;
  const char* const end = digits.data() + digits.size();
  const auto result = std::from_chars(digits.data(), end, found, 16);
  const bool isWhole = result.ec == std::errc() && result.ptr == end;
  return isWhole && found <= most ? std::optional(found) : std::nullopt;
}

std::optional<std::uint64_t> wideHex(const QVariantMap& entries, const char* key, std::uint64_t most) {
  return hexNumber(text(entries, key), most);
}
std::optional<std::uint32_t> hex(const QVariantMap& entries, const char* key, std::uint32_t most) {
  const auto found = wideHex(entries, key, most);
  return found ? std::optional(static_cast<std::uint32_t>(*found)) : std::nullopt;
}

std::optional<double> level(const QVariantMap& entries, const char* key, double least, double most) {
  const auto found = real(entries, key);
  return found && *found >= least && *found <= most ? found : std::nullopt;
}
std::optional<double> decibelMilliwatts(const QVariantMap& entries, const char* key) {
  return level(entries, key, -200, 50);
}
std::optional<double> decibels(const QVariantMap& entries, const char* key) {
  return level(entries, key, -100, 100);
}

bool isDigits(std::string_view digits) {
  return std::ranges::all_of(digits, [](char digit) { return digit >= '0' && digit <= '9'; });
}

// Country and network, 5 or 6 digits; else empty.
std::string networkCode(std::string code) {
  return (code.size() == 5 || code.size() == 6) && isDigits(code) ? std::move(code) : std::string();
}

// ---- Cells ----

// In the service's enumeration of cells.
enum CellType : std::uint8_t { CDMACell = 1, GSMCell = 2, UMTSCell = 3, LTECell = 5, NRCell = 6 };

constexpr std::uint32_t sixteenBits = 0xFFFF;
constexpr std::uint64_t twentyEightBits = 0xFFF'FFFF, thirtySixBits = 0xF'FFFF'FFFF;

// 3GPP TS 45.008, 8.1.4: RXLEV 0 is less than -110 dBm, and each step is 1 dB. This is the upper edge of a
// step; 63 has none, and stands for its lower edge.
std::optional<double> receivedLevel_dbm(const QVariantMap& entries) {
  constexpr std::int64_t largest = 63;
  const auto step = inRange<int>(number(entries, "rx-level"), 0, largest);
  if (!step) return std::nullopt;
  return std::min(*step, 62) - 110.0;
}

void readGSM(CellReading& cell, const QVariantMap& entries) {
  cell.area = hex(entries, "lac", sixteenBits);
  cell.identity = wideHex(entries, "ci", sixteenBits);
  cell.channel = small(entries, "arfcn", 1023);
  cell.code = hex(entries, "base-station-id", 63);
  cell.timingAdvance = small(entries, "timing-advance", sixteenBits);
  cell.levels.rssi_dbm = receivedLevel_dbm(entries);
}

void readUMTS(CellReading& cell, const QVariantMap& entries) {
  cell.area = hex(entries, "lac", sixteenBits);
  cell.identity = wideHex(entries, "ci", twentyEightBits);
  cell.channel = small(entries, "uarfcn", 16383);
  cell.code = small(entries, "psc", 511);
  cell.levels.rscp_dbm = decibelMilliwatts(entries, "rscp");
  cell.levels.ecIo_db = decibels(entries, "ecio");
  cell.levels.pathLoss_db = level(entries, "path-loss", 0, 300);
}

void readLTE(CellReading& cell, const QVariantMap& entries) {
  cell.area = hex(entries, "tac", sixteenBits);
  cell.identity = wideHex(entries, "ci", twentyEightBits);
  cell.channel = small(entries, "earfcn", 262143);
  cell.code = hex(entries, "physical-ci", 503);
  cell.timingAdvance = small(entries, "timing-advance", sixteenBits);
  cell.levels.rsrp_dbm = decibelMilliwatts(entries, "rsrp");
  cell.levels.rsrq_db = decibels(entries, "rsrq");
}

void readNR(CellReading& cell, const QVariantMap& entries) {
  cell.area = hex(entries, "tac", 0xFFFFFF);
  cell.identity = wideHex(entries, "ci", thirtySixBits);
  cell.channel = small(entries, "nrarfcn", 3279165);
  cell.code = hex(entries, "physical-ci", 1007);
  cell.timingAdvance = small(entries, "timing-advance", sixteenBits);
  cell.levels.rsrp_dbm = decibelMilliwatts(entries, "rsrp");
  cell.levels.rsrq_db = decibels(entries, "rsrq");
  cell.levels.sinr_db = decibels(entries, "sinr");
}

void readCDMA(CellReading& cell, const QVariantMap& entries) {
  cell.systemIdentity = hex(entries, "sid", 0x7FFF);
  cell.networkIdentity = hex(entries, "nid", sixteenBits);
  cell.baseStation = hex(entries, "base-station-id", sixteenBits);
  cell.pilot = hex(entries, "ref-pn", 511);
}

struct CellKind {
  std::int64_t type;
  Radio radio;
  void (*read)(CellReading& cell, const QVariantMap& entries);
};
constexpr CellKind cellKinds[] = {
    {GSMCell, Radio::GSM, readGSM}, {UMTSCell, Radio::UMTS, readUMTS},     {LTECell, Radio::LTE, readLTE},
    {NRCell, Radio::NR, readNR},    {CDMACell, Radio::CDMA2000, readCDMA},
};

// ---- Signals ----

struct SignalKind {
  const char* property;
  Radio radio;
};
constexpr SignalKind signalKinds[] = {{"Gsm", Radio::GSM},       {"Umts", Radio::UMTS},
                                      {"Lte", Radio::LTE},       {"Nr5g", Radio::NR},
                                      {"Cdma", Radio::CDMA2000}, {"Evdo", Radio::CDMA2000}};

CellLevels levelsOf(const QVariantMap& entries) {
  CellLevels levels{.rsrp_dbm = decibelMilliwatts(entries, "rsrp"),
                    .rsrq_db = decibels(entries, "rsrq"),
                    .sinr_db = decibels(entries, "snr"),
                    .rssi_dbm = decibelMilliwatts(entries, "rssi"),
                    .rscp_dbm = decibelMilliwatts(entries, "rscp"),
                    .ecIo_db = decibels(entries, "ecio"),
                    .errorRate = level(entries, "error-rate", 0, 100)};
  if (!levels.sinr_db) levels.sinr_db = decibels(entries, "sinr");  // of EV-DO
  return levels;
}

// ---- Technologies ----

struct Technology {
  const char* name;
  int bit;
  Radio radio;
};
// In the service's enumeration of access technologies.
constexpr Technology technologies[] = {
    {"GSM", 1, Radio::GSM},           {"GSM Compact", 2, Radio::GSM},   {"GPRS", 3, Radio::GSM},
    {"EDGE", 4, Radio::GSM},          {"UMTS", 5, Radio::UMTS},         {"HSDPA", 6, Radio::UMTS},
    {"HSUPA", 7, Radio::UMTS},        {"HSPA", 8, Radio::UMTS},         {"HSPA+", 9, Radio::UMTS},
    {"1xRTT", 10, Radio::CDMA2000},   {"EV-DO 0", 11, Radio::CDMA2000}, {"EV-DO A", 12, Radio::CDMA2000},
    {"EV-DO B", 13, Radio::CDMA2000}, {"LTE", 14, Radio::LTE},          {"5GNR", 15, Radio::NR},
    {"LTE-M", 16, Radio::LTE},        {"NB-IoT", 17, Radio::LTE},
};

bool hasBit(std::int64_t mask, int bit) { return (mask >> bit & 1) != 0; }

// ---- Bearers ----

std::string ipTypeOf(std::optional<std::int64_t> type) {
  switch (type.value_or(0)) {
    case 1:
      return "IPv4";
    case 2:
      return "IPv6";
    case 4:
      return "IPv4v6";
    case 8:
      return "Non-IP";
    default:
      return {};
  }
}

// In the service's enumeration of purposes, by bits.
constexpr const char* purposes[] = {"initial", "default",   "ims",     "mms",      "management",
                                    "voice",   "emergency", "private", "purchase", "video share",
                                    "local",   "app",       "xcap",    "tethering"};

std::string purposeOf(std::int64_t mask) {
  std::string names;
  for (int bit = 0; bit < static_cast<int>(std::size(purposes)); ++bit)
    if (hasBit(mask, bit)) names.append(names.empty() ? "" : ", ").append(purposes[bit]);
  return names;
}

BearerReading::Addresses addressesOf(const QVariantMap& configuration) {
  BearerReading::Addresses addresses{.address = text(configuration, "address"),
                                     .gateway = text(configuration, "gateway")};
  const auto prefix = small(configuration, "prefix", 128);
  if (!addresses.address.empty() && prefix) addresses.address += '/' + std::to_string(*prefix);
  if (const auto mtu = small(configuration, "mtu", sixteenBits); mtu && *mtu > 0)
    addresses.mtu = std::to_string(*mtu);
  for (const char* key : {"dns1", "dns2", "dns3"})
    if (std::string server = text(configuration, key); !server.empty())
      addresses.nameServers.push_back(std::move(server));
  return addresses;
}

// ---- Locations ----

// In the service's enumeration of sources.
constexpr std::uint32_t networkSource = 1, rawPositionSource = 2;

Location locationIn(const QVariant& value) {
  Location location;
  if (!isArgument(value, "a{uv}")) return location;
  const auto sources = value.value<QDBusArgument>();
  sources.beginMap();
  for (std::size_t i = 0; i < mostListed && !sources.atEnd(); ++i) {
    std::uint32_t source = 0;
    QDBusVariant content;
    sources.beginMapEntry();
    sources >> source >> content;
    sources.endMapEntry();
    const QVariant inner = content.variant();
    if (source == networkSource && inner.metaType() == QMetaType::fromType<QString>())
      location.network = networkLocationOf(printableText(inner.toString()));
    if (source == rawPositionSource) location.position = positionOf(dictionaryOf(inner));
  }
  sources.endMap();
  return location;
}

}  // namespace

std::string text(const QVariantMap& entries, const char* key) {
  const QVariant value = valueOf(entries, key);
  return value.metaType() == QMetaType::fromType<QString>() ? printableText(value.toString()) : std::string();
}

std::string deviceOf(const QVariantMap& modemProperties) {
  const QVariant value = valueOf(modemProperties, "Device");
  if (value.metaType() != QMetaType::fromType<QString>()) return {};
  return printableText(value.toString(), longestPath);
}

std::optional<std::int64_t> number(const QVariantMap& entries, const char* key) {
  const QVariant value = valueOf(entries, key);
  switch (value.typeId()) {
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::Short:
    case QMetaType::UShort:
    case QMetaType::UChar:
    case QMetaType::LongLong:
      return value.toLongLong();
    case QMetaType::ULongLong: {
      constexpr std::uint64_t most = std::numeric_limits<std::int64_t>::max();
      const std::uint64_t found = value.toULongLong();
      return found <= most ? std::optional(static_cast<std::int64_t>(found)) : std::nullopt;
    }
    default:
      return std::nullopt;
  }
}

std::optional<double> real(const QVariantMap& entries, const char* key) {
  const QVariant value = valueOf(entries, key);
  if (value.typeId() == QMetaType::Double)
    return std::isfinite(value.toDouble()) ? std::optional(value.toDouble()) : std::nullopt;
  const auto whole = number(entries, key);
  return whole ? std::optional(static_cast<double>(*whole)) : std::nullopt;
}

std::optional<bool> boolean(const QVariantMap& entries, const char* key) {
  const QVariant value = valueOf(entries, key);
  return value.typeId() == QMetaType::Bool ? std::optional(value.toBool()) : std::nullopt;
}

std::string path(const QVariantMap& entries, const char* key) { return objectPath(valueOf(entries, key)); }

std::vector<std::string> paths(const QVariantMap& entries, const char* key) {
  std::vector<std::string> found;
  const QVariant value = valueOf(entries, key);
  if (!isArgument(value, "ao")) return found;
  const auto list = value.value<QDBusArgument>();
  list.beginArray();
  while (!list.atEnd() && found.size() < mostListed) {
    QDBusObjectPath each;
    list >> each;
    if (std::string one = objectPath(QVariant::fromValue(each)); !one.empty())
      found.push_back(std::move(one));
  }
  list.endArray();
  return found;
}

std::vector<std::string> textsOf(const QVariantMap& entries, const char* key) {
  std::vector<std::string> found;
  const QVariant value = valueOf(entries, key);
  if (value.metaType() != QMetaType::fromType<QStringList>()) return found;
  for (const QString& each : value.toStringList()) {
    if (found.size() == mostListed) break;
    if (std::string one = printableText(each); !one.empty()) found.push_back(std::move(one));
  }
  return found;
}

QVariantMap dictionary(const QVariantMap& entries, const char* key) {
  return dictionaryOf(valueOf(entries, key));
}

std::optional<Objects> objectsOf(const QDBusMessage& answer) {
  if (answer.type() != QDBusMessage::ReplyMessage || answer.signature() != QStringLiteral("a{oa{sa{sv}}}"))
    return std::nullopt;
  Objects objects;
  const auto list = answer.arguments().value(0).value<QDBusArgument>();
  list.beginMap();
  while (!list.atEnd() && objects.size() < static_cast<qsizetype>(mostObjects)) {
    QDBusObjectPath object;
    Interfaces interfaces;
    list.beginMapEntry();
    list >> object >> interfaces;
    list.endMapEntry();
    objects.insert(object.path(), interfaces);
  }
  list.endMap();
  return objects;
}

std::optional<QVariantMap> propertiesOf(const QDBusMessage& answer) {
  if (answer.type() != QDBusMessage::ReplyMessage || answer.signature() != QStringLiteral("a{sv}"))
    return std::nullopt;
  return dictionaryOf(answer.arguments().value(0));
}

std::optional<CellReading> cellOf(const QVariantMap& entries) {
  const auto type = number(entries, "cell-type");
  const auto* const kind =
      std::ranges::find_if(cellKinds, [&](const CellKind& candidate) { return candidate.type == type; });
  if (kind == std::end(cellKinds)) return std::nullopt;
  CellReading cell{.radio = kind->radio,
                   .isServing = boolean(entries, "serving").value_or(false),
                   .network = networkCode(text(entries, "operator-id"))};
  kind->read(cell, entries);
  return cell;
}

std::optional<std::vector<CellReading>> cellsOf(const QDBusMessage& answer) {
  if (answer.type() != QDBusMessage::ReplyMessage || answer.signature() != QStringLiteral("aa{sv}"))
    return std::nullopt;
  std::vector<CellReading> cells;
  const auto list = answer.arguments().value(0).value<QDBusArgument>();
  list.beginArray();
  while (!list.atEnd() && cells.size() < mostCells) {
    QVariantMap entries;
    list >> entries;
    if (auto cell = cellOf(entries)) cells.push_back(*std::move(cell));
  }
  list.endArray();
  return cells;
}

Location locationOf(const QDBusMessage& answer) {
  if (answer.type() != QDBusMessage::ReplyMessage) return {};
  return locationIn(answer.arguments().value(0));
}

Location locationOf(const QVariant& property) { return locationIn(property); }

std::optional<NetworkLocation> networkLocationOf(const std::string& text) {
  std::array<std::string, 5> parts;
  std::size_t count = 0;
  for (const char letter : text) {
    if (letter != ',') {
      parts.at(count) += letter;
    } else if (++count == parts.size()) {
      return std::nullopt;
    }
  }
  if (count < 3) return std::nullopt;
  // The service writes 0 for what it does not know.
  const auto known = [](const std::string& digits, std::uint64_t most) {
    const auto found = hexNumber(digits, most);
    return found && *found > 0 ? found : std::nullopt;
  };
  NetworkLocation location;
  if (parts[0].size() == 3) location.network = networkCode(parts[0] + parts[1]);
  location.lac = known(parts[2], sixteenBits);
  location.identity = known(parts[3], thirtySixBits);
  location.tac = known(parts[4], 0xFFFFFF);
  if (location.network.empty() && !location.identity) return std::nullopt;
  return location;
}

std::optional<Position> positionOf(const QVariantMap& entries) {
  const auto latitude = level(entries, "latitude", -90, 90),
             longitude = level(entries, "longitude", -180, 180);
  if (!latitude || !longitude) return std::nullopt;
  return Position{.latitude = *latitude,
                  .longitude = *longitude,
                  .altitude_m = level(entries, "altitude", -1000, 100'000),
                  .source = "GNSS",
                  .fix = text(entries, "utc-time")};
}

std::vector<CellReading> signalsOf(const QVariantMap& properties) {
  std::vector<CellReading> cells;
  for (const SignalKind& kind : signalKinds) {
    const CellLevels levels = levelsOf(dictionary(properties, kind.property));
    if (levels != CellLevels()) cells.push_back({.radio = kind.radio, .isServing = true, .levels = levels});
  }
  return cells;
}

std::vector<std::string> accessTechnologiesOf(std::int64_t mask) {
  std::vector<std::string> names;
  for (const Technology& technology : technologies)
    if (hasBit(mask, technology.bit)) names.emplace_back(technology.name);
  return names;
}

// NR beside LTE is a second carrier of an LTE cell.
std::optional<Radio> servingRadioOf(std::int64_t mask) {
  for (const Radio radio : {Radio::LTE, Radio::NR, Radio::UMTS, Radio::GSM})
    for (const Technology& technology : technologies)
      if (technology.radio == radio && hasBit(mask, technology.bit)) return radio;
  return std::nullopt;
}

// The property is (quality, whether it was measured lately).
std::optional<std::int64_t> signalQualityOf(const QVariantMap& modemProperties) {
  const QVariant value = valueOf(modemProperties, "SignalQuality");
  if (!isArgument(value, "(ub)")) return std::nullopt;
  const auto pair = value.value<QDBusArgument>();
  std::uint32_t quality = 0;
  bool isRecent = false;
  pair.beginStructure();
  pair >> quality >> isRecent;
  pair.endStructure();
  return isRecent && quality <= 100 ? std::optional<std::int64_t>(quality) : std::nullopt;
}

BearerReading bearerOf(const QVariantMap& properties) {
  const QVariantMap wish = dictionary(properties, "Properties"), counts = dictionary(properties, "Stats");
  BearerReading bearer{.accessPoint = text(wish, "apn"),
                       .type = ipTypeOf(number(wish, "ip-type")),
                       .purpose = purposeOf(number(wish, "apn-type").value_or(0)),
                       .interface = text(properties, "Interface"),
                       .isConnected = boolean(properties, "Connected").value_or(false),
                       .isSuspended = boolean(properties, "Suspended").value_or(false),
                       .profile = inRange<std::int64_t>(number(properties, "ProfileId"), 0, 1'000'000)};
  if (!bearer.isConnected) return bearer;
  bearer.ip4 = addressesOf(dictionary(properties, "Ip4Config"));
  bearer.ip6 = addressesOf(dictionary(properties, "Ip6Config"));
  bearer.received_bytes = count(counts, "rx-bytes");
  bearer.sent_bytes = count(counts, "tx-bytes");
  bearer.duration_s = count(counts, "duration");
  // 0 stands for a rate that is not known.
  if (const auto rate = count(counts, "downlink-speed"); rate && *rate > 0) bearer.downlinkBits = rate;
  if (const auto rate = count(counts, "uplink-speed"); rate && *rate > 0) bearer.uplinkBits = rate;
  return bearer;
}

std::string simIdentifierOf(const QVariantMap& properties) {
  const std::string digits = text(properties, "SimIdentifier");
  return digits.size() <= 22 ? digits : std::string();
}

}  // namespace busReading

namespace {

void complete(std::optional<double>& level, const std::optional<double>& newer) {
  if (newer) level = newer;
}

void complete(CellLevels& levels, const CellLevels& newer) {
  complete(levels.rsrp_dbm, newer.rsrp_dbm);
  complete(levels.rsrq_db, newer.rsrq_db);
  complete(levels.sinr_db, newer.sinr_db);
  complete(levels.rssi_dbm, newer.rssi_dbm);
  complete(levels.rscp_dbm, newer.rscp_dbm);
  complete(levels.ecIo_db, newer.ecIo_db);
  complete(levels.pathLoss_db, newer.pathLoss_db);
  complete(levels.errorRate, newer.errorRate);
}

CellReading* servingCellOf(std::vector<CellReading>& cells, CellReading::Radio radio) {
  const auto found = std::ranges::find_if(
      cells, [radio](const CellReading& cell) { return cell.isServing && cell.radio == radio; });
  return found == cells.end() ? nullptr : &*found;
}

CellReading& servingCellIn(std::vector<CellReading>& cells, CellReading::Radio radio) {
  if (CellReading* const cell = servingCellOf(cells, radio)) return *cell;
  return cells.emplace_back(CellReading{.radio = radio, .isServing = true});
}

template <class Number>
bool differ(const std::optional<Number>& one, const std::optional<Number>& other) {
  return one && other && *one != *other;
}

// The area of a cell of this radio.
std::optional<std::uint32_t> areaOf(const NetworkLocation& location, CellReading::Radio radio) {
  using Radio = CellReading::Radio;
  if (radio == Radio::NR) return location.tac;
  if (radio != Radio::LTE) return location.lac;
  // A tracking area of NR is not one of LTE.
  return location.tac.value_or(0) <= busReading::sixteenBits ? location.tac : std::nullopt;
}

// A cell of another network or area, or with another identity, keeps what it has: one of the two is older.
void complete(CellReading& cell, const NetworkLocation& location) {
  const auto area = areaOf(location, cell.radio);
  const bool isOfOtherNetwork =
      !cell.network.empty() && !location.network.empty() && cell.network != location.network;
  if (isOfOtherNetwork || differ(cell.area, area) || differ(cell.identity, location.identity)) return;
  if (cell.network.empty()) cell.network = location.network;
  if (!cell.identity) cell.identity = location.identity;
  if (!cell.area) cell.area = area;
}

std::uint64_t largestIdentityOf(CellReading::Radio radio) {
  using Radio = CellReading::Radio;
  if (radio == Radio::GSM) return busReading::sixteenBits;
  return radio == Radio::NR ? busReading::thirtySixBits : busReading::twentyEightBits;
}

}  // namespace

std::vector<CellReading> joined(std::vector<CellReading> cells, const std::vector<CellReading>& signals,
                                const std::optional<NetworkLocation>& location,
                                std::optional<CellReading::Radio> servingRadio) {
  if (location && servingRadio && *servingRadio != CellReading::Radio::CDMA2000 &&
      location->identity.value_or(0) <= largestIdentityOf(*servingRadio))
    complete(servingCellIn(cells, *servingRadio), *location);
  for (const CellReading& signal : signals)
    complete(servingCellIn(cells, signal.radio).levels, signal.levels);
  return cells;
}

}  // namespace varnel
