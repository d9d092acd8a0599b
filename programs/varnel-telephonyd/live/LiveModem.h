#pragma once

#include <QDateTime>
#include <chrono>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "platform/MainQueue.h"
#include "programs/varnel-telephonyd/MessageSource.h"
#include "programs/varnel-telephonyd/live/BusReading.h"
#include "programs/varnel-telephonyd/live/LiveFeed.h"
#include "programs/varnel-telephonyd/live/ModemBus.h"
#include "programs/varnel-telephonyd/live/ModemStatus.h"
#include "programs/varnel-telephonyd/live/PositionClient.h"

namespace varnel {

/// What ModemManager tells of one modem, for all viewers together. ModemManager's signals come first. What it
/// does not signal is asked for again and again, as long as there is a viewer. The service and the modem may
/// come and go: the source waits, and comes back by itself. Nothing of the modem is changed but the rate of
/// its signal interface, which has its old value again when there is no viewer any more.
class LiveModem final {
 public:
  struct Setup {
    MainQueue& queue;
    std::function<std::chrono::milliseconds()> uptime;
    /// The modem's index, the path of its object, or its device as ModemManager names it; empty: any.
    std::string wanted{};
    std::chrono::seconds pollInterval{5};
    /// How long an answer of ModemManager may take. A later one counts as an error.
    std::chrono::milliseconds answerPatience{10'000};
    /// Whether positions are told, from the modem or from gpsd. Without it nobody is asked for them.
    bool tellsPosition = false;
    std::uint16_t positionPort = PositionClient::usualPort;
    /// The host's time in UTC, whose date goes with a fix that has a time of day alone.
    std::function<QDateTime()> now = [] { return QDateTime::currentDateTimeUtc(); };
    /// Tells the server's user one sentence.
    std::function<void(const std::string& sentence)> tell;
  };

  explicit LiveModem(Setup setup);
  LiveModem(const LiveModem&) = delete;
  LiveModem& operator=(const LiveModem&) = delete;
  /// The sources must be gone.
  ~LiveModem() = default;

  /// Begins to ask and to listen.
  void start();
  std::unique_ptr<MessageSource> makeSource() { return _feed.makeSource(); }
  /// Gives the modem its old rate of signals, and then calls the function, after 2 s at most.
  void end(std::function<void()> ended);
  bool isEnding() const { return _isEnding; }

  /// One sentence for users.
  const std::string& state() const { return _status.sentence; }
  /// The path of the modem's object; empty while there is none.
  const std::string& path() const { return _path; }
  /// The packets that were made.
  std::uint64_t sent() const { return _feed.sent(); }

 private:
  enum class CellInfo : std::uint8_t { IsAskedFor, IsRefused, IsNotOffered };

  void takeService(ModemBus::Service service, const busReading::Objects& objects);
  void keep(const QString& object, const busReading::Interfaces& interfaces);
  void takeAdded(const std::string& object, const busReading::Interfaces& interfaces);
  void takeRemoved(const std::string& object);
  void takeChanged(const std::string& object, const QString& interface, const QVariantMap& properties);
  void takeCellInfo(const QDBusMessage& answer);
  void takeLocation(const busReading::Location& location);
  void takeRateAnswer(const QDBusMessage& answer, std::uint32_t before);

  std::string choice() const;
  void choose();
  void takeUp(const std::string& path);
  void forget();
  void update();
  void setStatus(ModemStatus status);
  const QVariantMap& properties(const QString& interface) const;

  void updatePolling();
  void poll();
  void askForCells();
  void askForLocation();
  void updateRate();
  /// Returns whether a call was made, after whose answer the function, which may be empty, is called.
  bool restoreRate(std::function<void()> done);
  void finish();
  void askForSim();
  void askForBearers();
  std::vector<std::string> bearerPaths() const;
  void tellOnce(const std::string& sentence);

  bool isUsable() const { return !_path.empty() && _status.use != ModemStatus::Use::None; }
  bool isWatched() const { return isUsable() && _feed.hasViewers() && !_isEnding; }
  void sendLater();
  void send();
  ModemReading reading() const;
  std::optional<Position> position() const;

  const Setup _setup;
  LiveFeed _feed;
  ModemBus _bus;
  std::unique_ptr<PositionClient> _positions;  // null unless positions are told

  ModemBus::Service _service = ModemBus::Service::NotRunning;
  busReading::Objects _modems;  // the objects that are modems
  std::string _path;            // of the chosen one; empty when there is none
  std::string _device, _name;   // of the last one that was chosen
  std::uint64_t _choices = 0;   // answers for an earlier choice are dropped
  ModemStatus _status;
  std::set<std::string> _told;  // sentences that are told once

  QVariantMap _sim;
  std::map<std::string, QVariantMap> _bearers;  // by path
  bool _hasToldSim = false;                     // packets have named a card or its numbers
  std::vector<CellReading> _cells;              // of GetCellInfo
  bool _hasFreshCells = false;                  // since the last packets
  std::optional<NetworkLocation> _location;
  std::optional<Position> _ownPosition, _servicePosition;  // of the modem, and of gpsd
  std::chrono::milliseconds _ownPositionAt{0};

  CellInfo _cellInfo = CellInfo::IsAskedFor;
  bool _awaitsCells = false, _awaitsLocation = false, _awaitsRate = false;
  bool _isRateRefused = false;
  std::optional<std::chrono::milliseconds> _rateRetryAt;  // after an error that may pass
  std::optional<std::uint32_t> _rateBefore;               // absent unless this object has changed it
  std::unique_ptr<RepeatingTimer> _polling;
  bool _isSending = false;  // packets will be made soon
  bool _isEnding = false;
  std::function<void()> _ended;
  std::shared_ptr<bool> _life = std::make_shared<bool>();  // for tasks that may run after this object
};

}  // namespace varnel
