#include "programs/varnel-telephonyd/live/PositionClient.h"

#include <QDateTime>
#include <QHostAddress>
#include <QJsonDocument>
#include <QJsonObject>
#include <cmath>
#include <limits>

namespace varnel {

using namespace std::chrono_literals;

namespace {

constexpr std::chrono::milliseconds reconnectInterval = 10s;
constexpr const char wish[] = "?WATCH={\"enable\":true,\"json\":true};\n";

// A number of the object that lies in these limits.
std::optional<double> number(const QJsonObject& object, const char* key, double least, double most) {
  const QJsonValue value = object.value(QLatin1String(key));
  if (!value.isDouble()) return std::nullopt;
  const double found = value.toDouble();
  return found >= least && found <= most ? std::optional(found) : std::nullopt;
}

// Property lists count seconds from 2001.
std::optional<Date> dateOf(const QJsonValue& value) {
  constexpr std::int64_t secondsUntil2001 = 978'307'200;
  const QDateTime moment = QDateTime::fromString(value.toString().left(32), Qt::ISODateWithMs);
  if (!moment.isValid()) return std::nullopt;
  const std::int64_t milliseconds = moment.toMSecsSinceEpoch() - secondsUntil2001 * 1000;
  if (milliseconds < 0 || milliseconds / 1000 > std::numeric_limits<std::int32_t>::max()) return std::nullopt;
  return Date{static_cast<std::int32_t>(milliseconds / 1000),
              static_cast<std::int32_t>(milliseconds % 1000 * 1000)};
}

}  // namespace

std::optional<std::optional<Position>> positionInLine(const QByteArray& line) {
  const QJsonObject report = QJsonDocument::fromJson(line).object();
  if (report.value(QLatin1String("class")).toString() != QLatin1String("TPV")) return std::nullopt;
  constexpr double flatFix = 2, fullFix = 3;
  const auto mode = number(report, "mode", 0, fullFix);
  const auto latitude = number(report, "lat", -90, 90), longitude = number(report, "lon", -180, 180);
  if (mode.value_or(0) < flatFix || !latitude || !longitude)
    return std::optional<std::optional<Position>>(std::in_place);
  Position position{.latitude = *latitude, .longitude = *longitude, .source = "gpsd"};
  if (*mode == fullFix) {
    position.altitude_m = number(report, "altMSL", -1000, 100'000);
    if (!position.altitude_m) position.altitude_m = number(report, "alt", -1000, 100'000);
  }
  position.time = dateOf(report.value(QLatin1String("time")));
  return position;
}

PositionClient::PositionClient(Setup setup) : _setup(std::move(setup)) {
  QObject::connect(&_socket, &QTcpSocket::connected, [this] { _socket.write(wish); });
  QObject::connect(&_socket, &QTcpSocket::readyRead, [this] { take(_socket.readAll()); });
  QObject::connect(&_socket, &QTcpSocket::stateChanged, [this](QAbstractSocket::SocketState state) {
    if (state == QAbstractSocket::UnconnectedState) connectLater();
  });
  _socket.setReadBufferSize(longestLine);
  connectToService();
}

PositionClient::~PositionClient() { _socket.disconnect(); }

void PositionClient::connectToService() {
  _line.clear();
  _isTooLong = false;
  _socket.connectToHost(QHostAddress(QHostAddress::LocalHost), _setup.port);
}

void PositionClient::connectLater() {
  if (std::exchange(_hasPosition, false)) _setup.moved(std::nullopt);
  _setup.queue.after(reconnectInterval, [this, life = std::weak_ptr(_life)] {
    if (!life.expired()) connectToService();
  });
}

void PositionClient::take(QByteArray bytes) {
  while (!bytes.isEmpty()) {
    const qsizetype end = bytes.indexOf('\n');
    _line += end < 0 ? bytes : bytes.left(end);
    bytes = end < 0 ? QByteArray() : bytes.mid(end + 1);
    if (_line.size() > longestLine) {
      _line.clear();
      _isTooLong = true;
    }
    if (end < 0) return;
    if (!std::exchange(_isTooLong, false)) takeLine(_line);
    _line.clear();
  }
}

void PositionClient::takeLine(const QByteArray& line) {
  const auto position = positionInLine(line);
  if (!position || (!*position && !_hasPosition)) return;
  _hasPosition = position->has_value();
  _setup.moved(*position);
}

}  // namespace varnel
