#include "programs/varnel-telephonyd/live/LiveModem.h"

#include <QDBusError>
#include <algorithm>
#include <charconv>
#include <utility>

#include "LogGenerator/KLV/CellMonitor.h"
#include "LogGenerator/KLV/Subscriber/SimFiles.h"
#include "base/Dictionary.h"
#include "platform/ModemReport.h"
#include "programs/varnel-telephonyd/live/FixTime.h"
#include "programs/varnel-telephonyd/live/ModemInterfaces.h"
#include "programs/varnel-telephonyd/live/ServerRecords.h"

namespace varnel {

using namespace std::chrono_literals;

namespace {

const QString keptInterfaces[] = {modemInterfaces::modem, modemInterfaces::network, modemInterfaces::location,
                                  modemInterfaces::signal};

constexpr std::uint32_t packetDataLogCode = 0xFF0002;
// Signals come in bursts, and make one packet.
constexpr std::chrono::milliseconds burst = 200ms;
constexpr std::chrono::milliseconds patienceAtEnd = 2s;
constexpr std::chrono::milliseconds lifetimeOfPosition = 15s;
constexpr std::chrono::milliseconds rateRetryInterval = 60s;
constexpr qsizetype mostProperties = 128;
// In the enumeration of the location interface's sources.
constexpr std::int64_t networkSource = 1, rawPositionSource = 2;

void merge(QVariantMap& properties, const QVariantMap& changed) {
  for (auto entry = changed.begin(); entry != changed.end(); ++entry)
    if (properties.size() < mostProperties || properties.contains(entry.key()))
      properties.insert(entry.key(), entry.value());
}

// The modem's number at the end of its path; the largest for another path.
unsigned indexOf(const std::string& path) {
  unsigned index = 0;
  const char* const begin = path.data() + path.rfind('/') + 1;
  const char* const end = path.data() + path.size();
  const auto result = std::from_chars(begin, end, index);
  return result.ec == std::errc() && result.ptr == end ? index : ~0U;
}

bool isRefusal(const QDBusMessage& answer) {
  const QString name = answer.errorName();
  return QDBusError(answer).type() == QDBusError::AccessDenied ||
         name == QStringLiteral("org.freedesktop.ModemManager1.Error.Core.Unauthorized");
}

bool isUnsupported(const QDBusMessage& answer) {
  const auto type = QDBusError(answer).type();
  return type == QDBusError::UnknownMethod || type == QDBusError::UnknownInterface ||
         answer.errorName() == QStringLiteral("org.freedesktop.ModemManager1.Error.Core.Unsupported");
}

// Whether the service has made the error itself.
bool isOfService(const QDBusMessage& answer) {
  return answer.errorName().startsWith(QStringLiteral("org.freedesktop.ModemManager1."));
}

}  // namespace

LiveModem::LiveModem(Setup setup)
    : _setup(std::move(setup)),
      _feed({.uptime = _setup.uptime,
             .name = "ModemManager",
             .viewersChanged =
                 [this] {
                   // Deferred: when a viewer only starts over, its next channel comes at once.
                   _setup.queue.async([this, life = std::weak_ptr(_life)] {
                     if (!life.expired()) updatePolling();
                   });
                 }}),
      _bus(_setup.queue, _setup.answerPatience,
           {.serviceChanged = [this](ModemBus::Service service,
                                     const busReading::Objects& objects) { takeService(service, objects); },
            .added = [this](const std::string& object,
                            const busReading::Interfaces& interfaces) { takeAdded(object, interfaces); },
            .removed = [this](const std::string& object) { takeRemoved(object); },
            .changed = [this](const std::string& object, const QString& interface,
                              const QVariantMap& changed) { takeChanged(object, interface, changed); }}) {}

void LiveModem::start() {
  _bus.start();
  if (!_setup.tellsPosition) return;
  _positions = std::make_unique<PositionClient>(
      PositionClient::Setup{.queue = _setup.queue,
                            .port = _setup.positionPort,
                            .moved = [this](const std::optional<Position>& position) {
                              _servicePosition = position;
                              sendLater();
                            }});
}

void LiveModem::end(std::function<void()> ended) {
  _isEnding = true;
  _polling.reset();
  _positions.reset();
  _ended = std::move(ended);
  // The modem may have taken the new rate although its answer is not there yet: then that one restores it.
  if (!_awaitsRate && !restoreRate([this] { finish(); })) return finish();
  _setup.queue.after(patienceAtEnd, [this, life = std::weak_ptr(_life)] {
    if (!life.expired()) finish();
  });
}

void LiveModem::finish() {
  if (const auto call = std::exchange(_ended, nullptr)) call();
}

// ---- The service and its modems ----

void LiveModem::takeService(ModemBus::Service service, const busReading::Objects& objects) {
  _service = service;
  _modems.clear();
  forget();
  for (auto object = objects.begin(); object != objects.end(); ++object) keep(object.key(), object.value());
  choose();
}

// What is no modem is left out.
void LiveModem::keep(const QString& object, const busReading::Interfaces& interfaces) {
  const bool hasRoom = _modems.size() < static_cast<qsizetype>(busReading::mostObjects);
  if (!_modems.contains(object) && !(hasRoom && interfaces.contains(modemInterfaces::modem))) return;
  busReading::Interfaces& kept = _modems[object];
  for (const QString& interface : keptInterfaces)
    if (interfaces.contains(interface)) merge(kept[interface], interfaces.value(interface));
}

void LiveModem::takeAdded(const std::string& object, const busReading::Interfaces& interfaces) {
  keep(QString::fromStdString(object), interfaces);
  if (object == _path) return update();
  if (_path.empty()) choose();
}

void LiveModem::takeRemoved(const std::string& object) {
  _modems.remove(QString::fromStdString(object));
  if (object != _path) return;
  forget();
  choose();
}

void LiveModem::takeChanged(const std::string& object, const QString& interface, const QVariantMap& changed) {
  if (interface == modemInterfaces::bearer) {
    const auto bearer = _bearers.find(object);
    if (bearer == _bearers.end()) return;
    merge(bearer->second, changed);
    return sendLater();
  }
  if (interface == modemInterfaces::sim && !_path.empty() &&
      object == busReading::path(properties(modemInterfaces::modem), "Sim")) {
    merge(_sim, changed);
    return sendLater();
  }
  const auto modem = _modems.find(QString::fromStdString(object));
  const bool isKept = std::ranges::find(keptInterfaces, interface) != std::end(keptInterfaces);
  if (modem == _modems.end() || !isKept) return;
  merge((*modem)[interface], changed);
  if (object != _path) return;
  if (interface == modemInterfaces::modem && changed.contains(QStringLiteral("Sim"))) askForSim();
  if ((interface == modemInterfaces::modem && changed.contains(QStringLiteral("Bearers"))) ||
      (interface == modemInterfaces::network && changed.contains(QStringLiteral("InitialEpsBearer"))))
    askForBearers();
  // Somebody else has switched the signals off.
  if (interface == modemInterfaces::signal && busReading::number(changed, "Rate") == 0 && !_awaitsRate)
    _rateBefore.reset();
  if (interface == modemInterfaces::location && changed.contains(QStringLiteral("Location")))
    takeLocation(busReading::locationOf(changed.value(QStringLiteral("Location"))));
  update();
}

// The modem that was there before comes first, whatever its path is now.
std::string LiveModem::choice() const {
  std::string best;
  for (auto modem = _modems.begin(); modem != _modems.end(); ++modem) {
    std::string path = modem.key().toStdString();
    const std::string device = busReading::deviceOf(modem.value().value(modemInterfaces::modem));
    if (!_device.empty() && device == _device) return path;
    const std::string& wanted = _setup.wanted;
    const bool isWanted =
        wanted.empty() || wanted == path || wanted == device || wanted == path.substr(path.rfind('/') + 1);
    if (isWanted && (best.empty() || indexOf(path) < indexOf(best))) best = path;
  }
  return best;
}

void LiveModem::choose() {
  if (_service != ModemBus::Service::Running) {
    setStatus(statusOf(_service));
  } else if (const std::string path = choice(); !path.empty()) {
    return takeUp(path);
  } else {
    setStatus(_name.empty() ? statusWithoutModem(_setup.wanted) : statusOfLost(_name));
  }
  updatePolling();
  sendLater();
}

void LiveModem::takeUp(const std::string& path) {
  _path = path;
  ++_choices;
  _device = busReading::deviceOf(properties(modemInterfaces::modem));
  _name = nameOfModem(path, _modems.value(QString::fromStdString(path)));
  askForSim();
  askForBearers();
  update();
}

void LiveModem::forget() {
  _path.clear();
  ++_choices;
  _sim.clear();
  _bearers.clear();
  _cells.clear();
  _location.reset();
  _ownPosition.reset();
  _cellInfo = CellInfo::IsAskedFor;
  _awaitsCells = _awaitsLocation = _awaitsRate = false;
  _isRateRefused = false;
  _rateRetryAt.reset();
  _rateBefore.reset();
}

const QVariantMap& LiveModem::properties(const QString& interface) const {
  static const QVariantMap none;
  const auto modem = _modems.constFind(QString::fromStdString(_path));
  if (modem == _modems.constEnd()) return none;
  const auto found = modem->constFind(interface);
  return found == modem->constEnd() ? none : *found;
}

void LiveModem::update() {
  setStatus(statusOf(_path, _modems.value(QString::fromStdString(_path))));
  if (!isUsable()) {
    _ownPosition.reset();
    // It may be taken when the modem is switched on.
    _isRateRefused = false;
    _rateRetryAt.reset();
  }
  updatePolling();
  sendLater();
}

void LiveModem::setStatus(ModemStatus status) {
  if (status == _status) return;
  const ModemStatus before = std::exchange(_status, std::move(status));
  const bool isFull = _status.use == ModemStatus::Use::Full;
  _feed.setNote(isFull ? std::string() : _status.sentence);
  if (!isFull || before.use != ModemStatus::Use::Full) _setup.tell(_status.sentence);
}

void LiveModem::tellOnce(const std::string& sentence) {
  if (_told.insert(sentence).second) _setup.tell(sentence);
}

// ---- What is asked for ----

void LiveModem::updatePolling() {
  if (!isWatched()) {
    _polling.reset();
    restoreRate({});
    // They would be old when the next viewer comes.
    _cells.clear();
    _location.reset();
    return sendLater();
  }
  updateRate();
  if (_polling) return;
  _polling = _setup.queue.repeating(_setup.pollInterval, [this] { poll(); });
  poll();
}

void LiveModem::poll() {
  updateRate();
  askForCells();
  askForLocation();
}

void LiveModem::askForCells() {
  if (_cellInfo != CellInfo::IsAskedFor || _awaitsCells) return;
  _awaitsCells = _bus.call(_path, modemInterfaces::modem, "GetCellInfo", {},
                           [this, choice = _choices](const QDBusMessage& answer) {
                             if (choice == _choices) takeCellInfo(answer);
                           });
}

void LiveModem::takeCellInfo(const QDBusMessage& answer) {
  _awaitsCells = false;
  if (isRefusal(answer)) {
    _cellInfo = CellInfo::IsRefused;
    tellOnce(
        "ModemManager tells the neighboring cells only to root; the serving cell is shown; section NEIGHBOR "
        "CELLS of varnel-telephonyd(8) says how to allow it");
  } else if (isUnsupported(answer)) {
    _cellInfo = CellInfo::IsNotOffered;
    tellOnce(_name + " does not tell its neighboring cells to ModemManager; the serving cell is shown");
  }
  if (!isWatched()) return;
  auto cells = busReading::cellsOf(answer);
  _hasFreshCells = cells.has_value();
  // What was measured long ago is not shown.
  _cells = cells ? *std::move(cells) : std::vector<CellReading>();
  sendLater();
}

void LiveModem::askForLocation() {
  const QVariantMap& location = properties(modemInterfaces::location);
  if (location.isEmpty() || _awaitsLocation) return;
  const std::int64_t wanted = networkSource | (_setup.tellsPosition ? rawPositionSource : 0);
  const std::int64_t enabled = busReading::number(location, "Enabled").value_or(wanted);
  if ((enabled & networkSource) == 0 && _cellInfo != CellInfo::IsAskedFor)
    tellOnce("ModemManager does not tell the location of " + _name +
             " in the network; mmcli -m any --location-enable-3gpp switches it on");
  if ((enabled & wanted) == 0) return;
  _awaitsLocation = _bus.call(_path, modemInterfaces::location, "GetLocation", {},
                              [this, choice = _choices](const QDBusMessage& answer) {
                                if (choice != _choices) return;
                                _awaitsLocation = false;
                                if (isRefusal(answer))
                                  tellOnce(
                                      "ModemManager does not tell this user where the modem is; section "
                                      "AS A SERVICE of varnel-telephonyd(8) has a rule of polkit");
                                takeLocation(busReading::locationOf(answer));
                                sendLater();
                              });
}

void LiveModem::takeLocation(const busReading::Location& location) {
  if (!isUsable()) return;
  _location = location.network;
  if (!_setup.tellsPosition) return;
  // The service repeats a position when there is no new one.
  const bool isOld = location.position && _ownPosition && !location.position->fix.empty() &&
                     location.position->fix == _ownPosition->fix;
  if (!isOld) _ownPositionAt = _setup.uptime();
  const std::optional<Date> time = isOld ? _ownPosition->time : std::nullopt;
  _ownPosition = location.position;
  if (_ownPosition) _ownPosition->time = isOld ? time : dateOfFix(_ownPosition->fix, _setup.now());
}

void LiveModem::updateRate() {
  const QVariantMap& signal = properties(modemInterfaces::signal);
  if (signal.isEmpty() || _rateBefore || _awaitsRate || _isRateRefused) return;
  if (_rateRetryAt && _setup.uptime() < *_rateRetryAt) return;
  const std::int64_t rate = busReading::number(signal, "Rate").value_or(0);
  const auto wanted = static_cast<std::uint32_t>(_setup.pollInterval.count());
  if (rate < 0 || rate > UINT32_MAX || (rate > 0 && rate <= wanted)) return;
  _awaitsRate = _bus.call(
      _path, modemInterfaces::signal, "Setup", {wanted},
      [this, choice = _choices, rate = static_cast<std::uint32_t>(rate)](const QDBusMessage& answer) {
        if (choice == _choices) takeRateAnswer(answer, rate);
      });
}

void LiveModem::takeRateAnswer(const QDBusMessage& answer, std::uint32_t before) {
  _awaitsRate = false;
  if (answer.type() == QDBusMessage::ReplyMessage) {
    _rateBefore = before;
    if (!_isEnding) return updatePolling();  // the viewers may have gone meanwhile
  }
  if (_isEnding) {
    if (!restoreRate([this] { finish(); })) finish();
    return;
  }
  _isRateRefused = isRefusal(answer) || isUnsupported(answer);
  if (isRefusal(answer)) {
    tellOnce(
        "ModemManager does not let this user ask for levels; section AS A SERVICE of varnel-telephonyd(8) "
        "has a rule of polkit");
  } else if (isUnsupported(answer)) {
    tellOnce(_name + " does not tell its levels to ModemManager");
  } else {
    _rateRetryAt = _setup.uptime() + rateRetryInterval;
    // An answer that is lost says nothing about the modem: the bus or the service may just have gone.
    if (isOfService(answer))
      tellOnce(_name + " does not tell its levels to ModemManager now; the server asks again every minute");
  }
}

bool LiveModem::restoreRate(std::function<void()> done) {
  if (!_rateBefore || _path.empty()) return false;
  const std::uint32_t rate = *std::exchange(_rateBefore, std::nullopt);
  return _bus.call(_path, modemInterfaces::signal, "Setup", {rate},
                   [done = std::move(done)](const QDBusMessage&) {
                     if (done) done();
                   });
}

void LiveModem::askForSim() {
  _sim.clear();
  const std::string sim = busReading::path(properties(modemInterfaces::modem), "Sim");
  if (sim.empty()) return;
  _bus.getAll(sim, modemInterfaces::sim, [this, choice = _choices](const QDBusMessage& answer) {
    const auto found = busReading::propertiesOf(answer);
    if (choice != _choices || !found) return;
    merge(_sim, *found);
    sendLater();
  });
}

std::vector<std::string> LiveModem::bearerPaths() const {
  std::vector<std::string> paths = busReading::paths(properties(modemInterfaces::modem), "Bearers");
  const std::string initial = busReading::path(properties(modemInterfaces::network), "InitialEpsBearer");
  if (!initial.empty() && std::ranges::find(paths, initial) == paths.end()) paths.push_back(initial);
  return paths;
}

void LiveModem::askForBearers() {
  const auto paths = bearerPaths();
  std::erase_if(_bearers,
                [&](const auto& bearer) { return std::ranges::find(paths, bearer.first) == paths.end(); });
  for (const std::string& path : paths)
    _bus.getAll(path, modemInterfaces::bearer, [this, path, choice = _choices](const QDBusMessage& answer) {
      const auto found = busReading::propertiesOf(answer);
      if (choice != _choices || !found) return;
      const auto listed = bearerPaths();
      if (std::ranges::find(listed, path) == listed.end()) return;
      merge(_bearers[path], *found);
      sendLater();
    });
}

// ---- Packets ----

void LiveModem::sendLater() {
  if (_name.empty() || _isSending || _isEnding) return;  // no modem was chosen yet, or it waits already
  _isSending = true;
  _setup.queue.after(burst, [this, life = std::weak_ptr(_life)] {
    if (life.expired()) return;
    _isSending = false;
    if (!_isEnding) send();
  });
}

void LiveModem::send() {
  using Repetition = LiveFeed::Repetition;
  const bool isFresh = std::exchange(_hasFreshCells, false);
  const ModemReading modem = reading();
  const bool isRepeated = isFresh && hasPassingCells(modem.cells);
  _feed.send(cellMonitorLogCode, cellMonitorOf(modem.cells),
             isRepeated ? Repetition::IsSent : Repetition::IsLeftOut);
  std::vector<BearerReading> bearers;
  for (const auto& [path, properties] : _bearers) bearers.push_back(busReading::bearerOf(properties));
  _feed.send(packetDataLogCode, packetDataOf(bearers));
  const SimReading sim{.identifier = busReading::simIdentifierOf(_sim),
                       .ownNumbers = busReading::textsOf(properties(modemInterfaces::modem), "OwnNumbers")};
  // Empty texts take back those of a card that has gone.
  _hasToldSim = _hasToldSim || !sim.identifier.empty() || !sim.ownNumbers.empty();
  if (_hasToldSim) _feed.send(simFilesLogCode, simFilesOf(sim));
  _feed.send(modemReport::logCode, modemReportOf(modem),
             modem.position ? Repetition::IsSent : Repetition::IsLeftOut);
}

ModemReading LiveModem::reading() const {
  ModemReading reading{.position = position()};
  if (!isUsable()) return reading;
  const QVariantMap &modem = properties(modemInterfaces::modem),
                    &network = properties(modemInterfaces::network);
  const std::int64_t technologies = busReading::number(modem, "AccessTechnologies").value_or(0);
  reading.registrationState = busReading::number(network, "RegistrationState");
  reading.operatorName = busReading::text(network, "OperatorName");
  reading.network = busReading::text(network, "OperatorCode");
  reading.accessTechnologies = busReading::accessTechnologiesOf(technologies);
  reading.signalQuality = busReading::signalQualityOf(modem);
  reading.cells = joined(_cells, busReading::signalsOf(properties(modemInterfaces::signal)), _location,
                         busReading::servingRadioOf(technologies));
  return reading;
}

std::optional<Position> LiveModem::position() const {
  if (!_setup.tellsPosition) return std::nullopt;
  if (_ownPosition && _setup.uptime() - _ownPositionAt <= lifetimeOfPosition) return _ownPosition;
  return _servicePosition;
}

}  // namespace varnel
