#include "programs/varnel-telephonyd/live/PositionClient.h"

#include <QDateTime>
#include <QHostAddress>
#include <QJsonDocument>
#include <QJsonObject>
#include <utility>

#include "programs/varnel-telephonyd/live/FixTime.h"

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
  position.fix = report.value(QLatin1String("time")).toString().left(32).toStdString();
  position.time = dateOf(QDateTime::fromString(QString::fromStdString(position.fix), Qt::ISODateWithMs));
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

void PositionClient::forget() {
  _expiry.reset();
  if (std::exchange(_hasPosition, false)) _setup.moved(std::nullopt);
}

void PositionClient::connectLater() {
  forget();
  _fix.clear();
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
  if (!position) return;
  if (!*position) return forget();
  // The service may repeat a fix while its receiver is silent.
  const bool isOld = !(*position)->fix.empty() && (*position)->fix == _fix;
  if (isOld) return;
  _fix = (*position)->fix;
  _expiry = _setup.queue.repeating(_setup.lifetime, [this] { forget(); });
  _hasPosition = true;
  _setup.moved(*position);
}

}  // namespace varnel
