#pragma once

#include <QByteArray>
#include <QObject>
#include <QTcpSocket>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/live/ModemReadings.h"

namespace varnel {

/// Asks gpsd, a service for receivers of satellites, on this machine. Without the service there is no
/// position; when it comes, it is asked.
class PositionClient final {
 public:
  static constexpr std::uint16_t usualPort = 2947;
  /// A longer line is left out.
  static constexpr qsizetype longestLine = 16384;

  struct Setup {
    MainQueue& queue;
    std::uint16_t port = usualPort;
    /// How long a position holds when no new one follows.
    std::chrono::milliseconds lifetime{15'000};
    /// Called with each position, and with nothing when there is none any more.
    std::function<void(const std::optional<Position>& position)> moved;
  };

  explicit PositionClient(Setup setup);
  PositionClient(const PositionClient&) = delete;
  PositionClient& operator=(const PositionClient&) = delete;
  ~PositionClient();

 private:
  void connectToService();
  void connectLater();
  void forget();
  void take(QByteArray bytes);
  void takeLine(const QByteArray& line);

  const Setup _setup;
  QTcpSocket _socket;
  QByteArray _line;         // the beginning of one that is not complete
  bool _isTooLong = false;  // the line is, and what follows until its end is left out
  bool _hasPosition = false;
  std::string _fix;  // the time of the last position, as the service writes it
  std::unique_ptr<RepeatingTimer> _expiry;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

/// The position in a line of gpsd's protocol. Absent for another line; without a position inside for a report
/// that has no fix.
std::optional<std::optional<Position>> positionInLine(const QByteArray& line);

}  // namespace varnel
