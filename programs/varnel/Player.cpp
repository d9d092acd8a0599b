#include "programs/varnel/Player.h"

#include <QFileDialog>
#include <QFileInfo>
#include <QInputDialog>
#include <algorithm>
#include <cmath>
#include <limits>
#include <stdexcept>
#include <utility>

#include "LogGenerator/LogGenerator.h"
#include "app/DateFormatter.h"
#include "host/Printable.h"
#include "programs/shared/FileDialogs.h"
#include "programs/varnel/PlayedFile.h"
#include "programs/varnel/PortNames.h"
#include "widgets/FileDrop.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

using namespace std::chrono_literals;
using Button = PlayBarState::Button;
using Command = ControlRequest::Command;

constexpr auto intervalOfPlaying = 500ms, intervalOfSeeking = 100ms, intervalOfJump = 20ms;
// When nothing comes for so long, everything that was sent has arrived. It is looked at only so often.
constexpr auto timeToArrive = 10ms;
constexpr unsigned mostLooks = 100;
// A server that takes longer is told of.
constexpr auto timeToStart = 500ms;
constexpr int stepOfSlider_ms = 5000;
constexpr const char* automaticPort = "auto";

// The name of a technology for people who do not know its identifier.
struct ModemName {
  std::string_view technology;
  const char* name;
};
constexpr ModemName modemNames[] = {
    {technology::allRadios, "LTE, NR, UMTS, and GSM"},
    {technology::kalviLTE, "LTE"},
    {technology::kalviUTRAN2, "UTRAN"},
    {technology::kalviGSMUMTS, "GSM and UMTS"},
    {technology::kalviCDMA, "CDMA2000"},
    {technology::ifxGSM, "GSM as whole pictures"},
};

QString text(const std::string& utf8Text) { return QString::fromStdString(utf8Text); }

int milliseconds(std::chrono::milliseconds duration) {
  return static_cast<int>(
      std::clamp<std::chrono::milliseconds::rep>(duration.count(), 0, std::numeric_limits<int>::max()));
}

// Such as 0:49, or 1:00:49.
QString duration(int milliseconds) {
  const int seconds = milliseconds / 1000;
  const int hours = seconds / 3600;
  const QString rest = QStringLiteral("%1:%2")
                           .arg(seconds / 60 % 60, hours > 0 ? 2 : 1, 10, QChar(u'0'))
                           .arg(seconds % 60, 2, 10, QChar(u'0'));
  return hours > 0 ? QStringLiteral("%1:%2").arg(hours).arg(rest) : rest;
}

std::string localTime(Time time, std::string_view pattern) {
  return DateFormatter(pattern).string(time, SystemClock().zoneAt(time));
}

void showMoment(PlayBarState& state, Time time) {
  state.date = text(localTime(time, "yyyy-MM-dd"));
  state.clock = text(localTime(time, "HH:mm:ss"));
}

std::vector<StartPage::Choice> simulatedModems() {
  std::vector<StartPage::Choice> choices;
  for (const auto& [technology, name] : modemNames) {
    const QString id = QString::fromUtf8(technology.data(), static_cast<qsizetype>(technology.size()));
    choices.push_back({id, QStringLiteral("%1 (%2)").arg(QString::fromLatin1(name), id)});
  }
  return choices;
}

std::vector<StartPage::Choice> ports() {
  std::vector<StartPage::Choice> choices{
      {QString::fromLatin1(automaticPort), QStringLiteral("Look for a modem")}};
  for (const std::string& path : portNames()) choices.push_back({text(path), text(printable(path))});
  choices.push_back({QString(), QStringLiteral("Another port…")});
  return choices;
}

}  // namespace

Player::Player(const Parts& parts) : _parts(parts) {
  _parts.app.setObserver([this] { applicationHasChanged(); });
}

Player::~Player() {
  _parts.app.setObserver({});
  // Both are asked to end before the first of them is waited for.
  endServerOf(_starting);
  endServerOf(_own);
}

void Player::furnish(WindowWidget& window) {
  _window = &window;
  window.addCommand(QStringLiteral("Open a file"), {QKeySequence(Qt::CTRL | Qt::Key_O)},
                    [this] { chooseFile(); });
  const QAction& play =
      window.addCommand(QStringLiteral("Play or pause"), {QKeySequence(Qt::CTRL | Qt::Key_P)}, [this] {
        if (_window && _window->bar()) bar().playButton().click();
      });
  window.offerOnlyIf(play, [this] { return _window->bar() && bar().playButton().isVisible(); });
  _close = &window.addCommand(wayToClose(), {QKeySequence(Qt::CTRL | Qt::Key_W)}, [this] {
    if (hasOwn()) close();
  });
  window.offerOnlyIf(*_close, [this] { return hasOwn(); });
  new FileDrop(window, [this](const std::string& path) { open(path); });
}

void Player::begin() {
  if (!_parts.options.file) return;
  open(*_parts.options.file, _parts.options.technology);
  // Until the server is ready, no other one is shown.
  if (_starting.server) _parts.services.connectTo(_starting.server->folder());
}

void Player::open(const std::string& path, const std::optional<std::string>& technology) {
  try {
    if (auto displays = savedDisplays(path)) return showSaved(*std::move(displays), path);
  } catch (const std::runtime_error& error) {
    return alert("The file cannot be opened", error.what());
  }
  start({.kind = Kind::Replay,
         .name = path,
         .technology = technology,
         .arguments = argumentsForReplay(_parts.options, path, technology),
         .firstTime = firstTimeOf(path)});
}

void Player::simulate(const std::string& technology) {
  start({.kind = Kind::Simulation, .name = technology, .arguments = {"--simulate=" + technology}});
}

void Player::connectToPort(const std::string& port) {
  start({.kind = Kind::Port, .name = port, .arguments = {"--port=" + port}});
}

void Player::startAgain() {
  start({.kind = _own.kind,
         .name = _own.name,
         .technology = _own.technology,
         .arguments = _own.arguments,
         .firstTime = _own.firstTime,
         .keepsPanes = true});
}

void Player::start(Own own) {
  const unsigned number = ++_starts;
  // Deferred: the handlers must not destroy the server.
  const auto later = [this](std::function<void()> task) {
    _parts.services.queue().async(_whileAlive(std::move(task)));
  };
  endServerOf(_starting);
  _starting = std::move(own);
  _starting.number = number;
  try {
    _starting.server = std::make_unique<ChildServer>(
        serverProgram(), _starting.arguments,
        ChildServer::Handlers{
            .ready = [this, later, number] { later([this, number] { serverIsReady(number); }); },
            .ended =
                [this, later, number](const std::string& why) {
                  later([this, number, why] { serverHasEnded(number, why); });
                }});
  } catch (const std::runtime_error& error) {
    serverHasEnded(number, error.what());
  }
  _parts.services.queue().after(timeToStart, _whileAlive([this, number] { startTakesLong(number); }));
  showBar();
  showStartPage();
}

// A pipe may be empty, and a disk may be far away.
void Player::startTakesLong(unsigned number) {
  if (number != _starting.number || !_starting.server) return;
  _starting.isSlow = true;
  showBar();
}

void Player::serverIsReady(unsigned number) {
  if (number != _starting.number) return;
  endServerOf(_own);
  _own = std::exchange(_starting, {});
  _displays.clear();
  _control = std::make_unique<ControlClient>(_own.server->folder());
  _status.reset();
  forgetJump();
  _parts.services.connectTo(_own.server->folder());
  setClock();
  if (_own.keepsPanes) {
    _parts.app.startOverInPlace();
  } else {
    tellOfCapture();
    _parts.app.startOver();
  }
  showBar();
  poll();
}

void Player::serverHasEnded(unsigned number, const std::string& why) {
  if (number == _own.number) {
    _own.whyItEnded = why;
    _parts.services.link().setEndOfOwnServer("The server of " + printable(_own.name) +
                                             " has ended: " + printable(why) + "; start it again below");
    forgetJump();
    _parts.services.playedClock().stand();
    pollAsNeeded();
    return showBar();
  }
  if (number != _starting.number) return;
  const Kind kind = _starting.kind;
  giveUpStarting();
  alert(kind == Kind::Replay ? "The file cannot be opened"
        : kind == Kind::Port ? "There is no link to the modem"
                             : "The modem cannot be simulated",
        why);
}

// The user need not wait for that.
void Player::endServerOf(Own& own) { _ending.add(std::move(own.server)); }

void Player::giveUpStarting() {
  endServerOf(_starting);
  _starting = {};
  if (_own.kind == Kind::Usual) {
    // It may have waited for that server.
    _parts.services.connectToUsualServer();
    _parts.app.startOver();
  }
  showBar();
  showStartPage();
}

void Player::tellOfCapture() const {
  if (!_parts.captureChanged) return;
  const bool isCapture = _own.kind == Kind::Replay;
  _parts.captureChanged(isCapture ? std::optional(Capture{_own.name, _own.technology}) : std::nullopt);
}

std::optional<Time> Player::playedTime() const {
  return _own.kind == Kind::Replay && _status ? _status->time : std::nullopt;
}

std::optional<Time> Player::savedTime() const {
  return _own.kind == Kind::Snapshot && _display < _displays.size() ? std::optional(_displays[_display].time)
                                                                    : std::nullopt;
}

std::string Player::openFile() const {
  return _own.kind == Kind::Replay || _own.kind == Kind::Snapshot ? _own.name : std::string();
}

void Player::leaveServer() {
  endServerOf(_own);
  _own = {};
  setClock();
  tellOfCapture();
  endServerOf(_starting);
  _starting = {};
  _displays.clear();
  _control.reset();
  _status.reset();
  forgetJump();
  pollAsNeeded();
}

void Player::showSaved(std::vector<Generation> displays, const std::string& name) {
  leaveServer();
  _own.kind = Kind::Snapshot;
  _own.name = name;
  _displays = std::move(displays);
  _formats = formatsOfSaved(_displays.back().display, _parts.services.model().generator);
  if (_parts.savedIsShown) _parts.savedIsShown({_own.name, _displays, _formats});
  showDisplay(_displays.size() - 1);
}

void Player::showDisplay(std::size_t number) {
  if (number >= _displays.size()) return;
  _display = number;
  _parts.app.showDisplay(_displays[number].display, statusOfSaved(_displays[number].time), _formats);
  showBar();
}

void Player::close() {
  leaveServer();
  _parts.services.connectToUsualServer();
  _parts.app.startOver();
  showBar();
  if (_window) _window->takeKeyboard();
}

void Player::startOver() {
  if (_own.kind == Kind::Snapshot) return showDisplay(_display);
  if (_own.whyItEnded) return startAgain();
  endJump();
  if (_own.kind == Kind::Replay) setJump(JumpStages(0));  // until the server has the new link alone
  setClock();
  _wasConnected = false;  // the new link is asked how far the stream is
  _parts.app.startOver();
}

void Player::alert(const std::string& title, const std::string& message) {
  _parts.userInterface.showAlert({title, printable(message), "OK"});
}

void Player::applicationHasChanged() {
  _hasLooked = true;
  const bool isConnected = _parts.app.isConnected();
  if (isConnected && !std::exchange(_wasConnected, isConnected)) poll();
  _wasConnected = isConnected;
  showStartPage();
}

void Player::play() {
  if (_jump && _status->isPaused) {
    _goesOnAfterJump = true;
    return showBar();
  }
  if (!isAtEnd()) return ask({.command = Command::Continue});
  if (_status->isPaused) ask({.command = Command::Continue});
  startOverFor(JumpStages(0));
}

void Player::pause() {
  const bool isHeld = std::exchange(_goesOnAfterJump, false) && _jump;
  if (!isHeld) return ask({.command = Command::Pause});
  showBar();
}

void Player::setSpeed(double speed) { ask({.command = Command::SetSpeed, .speed = speed}); }

void Player::jump(int place) {
  if (_own.kind == Kind::Snapshot) return showDisplay(static_cast<std::size_t>(place));
  if (!_status || !_status->position || _own.whyItEnded) return;
  // At the very start nothing would have arrived.
  const int wanted = std::max(place, 1);
  // The stream has gone on since its last status.
  const double margin_ms = isPaused() ? 0 : 2000 * _status->speed;
  const bool isAhead = !_jump && wanted > milliseconds(*_status->position) + margin_ms;
  if (!isAhead) return startOverFor(JumpStages(wanted));
  setJump(JumpStages(wanted));
  hold();
  beginStages();
  showBar();
}

// Between two stages nothing else may come, and the stream must not overtake the jump.
void Player::hold() {
  if (isPaused()) return;
  _goesOnAfterJump = true;
  ask({.command = Command::Pause});
  _status->isPaused = true;
}

void Player::setJump(const JumpStages& stages) {
  _jump = stages;
  _step = Step::AwaitsChannel;
  ++_jumps;
}

void Player::forgetJump() {
  _jump.reset();
  _goesOnAfterJump = false;
}

void Player::endJump() {
  _jump.reset();
  if (!_goesOnAfterJump || !_control) return;
  _control->ask({.command = Command::Continue}, [this](const std::optional<ControlReply>& reply) {
    if (!_jump) _goesOnAfterJump = false;
    take(reply);
  });
}

bool Player::isPaused() const { return _status->isPaused && !_goesOnAfterJump; }

// A display is made of all messages before it, so an earlier one needs a new model.
void Player::startOverFor(const JumpStages& stages) {
  setJump(stages);
  if (stages.place() > 0) hold();
  _wasConnected = false;
  setClock();
  _parts.app.startOverInPlace();
  showBar();
}

// Before a new model gets its first message.
void Player::setClock() {
  PlayedClock& clock = _parts.services.playedClock();
  if (_own.kind != Kind::Replay) return clock.followHost();
  const auto time = _own.firstTime || !_status ? _own.firstTime : _status->firstTime;
  if (time) return clock.standAt(*time);
  if (!_jump) clock.followHost();
}

void Player::beginStages() {
  _jump->begin(milliseconds(*_status->position));
  sendStage();
}

void Player::sendStage() {
  _step = Step::IsSent;
  if (_status->time && _status->position) {
    const Time time = _jump->expect(milliseconds(*_status->position), *_status->time);
    _parts.services.playedClock().standAt(time);
  }
  const ControlRequest request{.command = Command::Seek, .place = std::chrono::milliseconds(_jump->next())};
  _control->ask(request, [this, number = _jumps](const std::optional<ControlReply>& reply) {
    if (_jump && number == _jumps) _step = Step::IsTaken;
    take(reply);
  });
}

void Player::followJump(const ServerStatus* status) {
  if (_step == Step::AwaitsChannel && status) return takeChannel(*status);
  if (_step != Step::IsTaken || (status && status->isSeeking)) return;
  if (!status) return endJump();
  _step = Step::Arrives;
  awaitArrival(0);
}

// The server has sent a stage.
void Player::awaitArrival(unsigned looks) {
  const auto taken = _parts.services.messagesTaken();
  const auto look = [this, number = _jumps, taken, looks] {
    if (!_jump || number != _jumps) return;
    if (taken != _parts.services.messagesTaken() && looks < mostLooks) return awaitArrival(looks + 1);
    stageHasArrived();
  };
  _parts.services.queue().after(timeToArrive, _whileAlive(look));
}

void Player::stageHasArrived() {
  _jump->reach(_status->time);
  if (!_jump->isDone()) return sendStage();
  // Else what has come would be taken for much older than it is.
  if (const auto again = _jump->repetition()) return startOverFor(*again);
  endJump();
  _parts.app.refresh();
  followPlaying();
  showBar();
  pollAsNeeded();
}

void Player::ask(const ControlRequest& request) {
  if (!_control || _own.whyItEnded) return;
  _control->ask(request, [this](const std::optional<ControlReply>& reply) { take(reply); });
}

void Player::poll() {
  if (_own.kind != Kind::Replay && _own.kind != Kind::Simulation) return;
  if (_control && !_control->isWaiting()) ask({});
}

// Without a reply the server has ended, and its end is told elsewhere.
void Player::take(const std::optional<ControlReply>& reply) {
  const auto* const status = reply ? std::get_if<ServerStatus>(&*reply) : nullptr;
  if (status) _status = *status;
  if (_jump) followJump(status);
  followPlaying();
  showBar();
  pollAsNeeded();
}

void Player::followPlaying() {
  if (_own.kind != Kind::Replay || _jump || !_status || !_status->time || _own.whyItEnded) return;
  const bool stands = isPaused() || _status->isSeeking || isAtEnd();
  _parts.services.playedClock().follow(*_status->time, stands ? 0 : _status->speed);
}

// The new model's channel has a stream, and that of the former model has gone.
void Player::takeChannel(const ServerStatus& status) {
  if (!_parts.app.isConnected() || status.channels != 1 || !status.position) return;
  if (_jump->place() > 0) return beginStages();
  endJump();
}

bool Player::isAtEnd() const {
  return _own.kind == Kind::Replay && _status && !_jump && !_status->isSeeking && _status->position &&
         _status->length && *_status->position >= *_status->length;
}

std::optional<std::chrono::milliseconds> Player::pollInterval() const {
  if (!_control || _own.whyItEnded || !_status) return std::nullopt;
  if (_jump) return intervalOfJump;
  if (_status->isSeeking) return intervalOfSeeking;
  if (_own.kind == Kind::Replay && !_status->length) return intervalOfPlaying;
  if (isPaused() || isAtEnd()) return std::nullopt;
  return intervalOfPlaying;
}

void Player::pollAsNeeded() {
  const auto interval = pollInterval();
  if (!interval) return _polling.reset();
  if (_polling && _pollingInterval == *interval) return;
  _pollingInterval = *interval;
  _polling = _parts.services.queue().repeating(*interval, [this] { poll(); });
}

PlayBar& Player::bar() {
  if (auto* const shown = dynamic_cast<PlayBar*>(_window->bar())) return *shown;
  auto made = std::make_unique<PlayBar>();
  PlayBar& added = *made;
  QObject::connect(&added, &PlayBar::playWanted, &added, [this] { play(); });
  QObject::connect(&added, &PlayBar::againWanted, &added, [this] { play(); });
  QObject::connect(&added, &PlayBar::pauseWanted, &added, [this] { pause(); });
  QObject::connect(&added, &PlayBar::speedWanted, &added, [this](double speed) { setSpeed(speed); });
  QObject::connect(&added, &PlayBar::dragged, &added, [this](int place) { dragTo(place); });
  QObject::connect(&added, &PlayBar::jumpWanted, &added, [this](int place) { jump(place); });
  QObject::connect(&added, &PlayBar::remedyWanted, &added,
                   [this] { _starting.server ? giveUpStarting() : startAgain(); });
  QObject::connect(&added, &PlayBar::closeWanted, &added, [this] { close(); });
  QObject::connect(&added, &PlayBar::keyboardLeft, &added, [this] { _window->takeKeyboard(); });
  _window->setBar(std::move(made));
  return added;
}

void Player::dragTo(int place) {
  if (_own.kind == Kind::Snapshot) {
    showDisplay(static_cast<std::size_t>(place));
    return bar().setProgress(stateOfSnapshot().progress);
  }
  bar().setProgress(progressAt(place));
}

void Player::showBar() {
  if (!_window) return;
  _close->setText(wayToClose());
  if (hasOwn()) {
    bar().setState(barState());
    return bar().setWayToClose(wayToClose());
  }
  _window->setBar(nullptr);
}

QString Player::wayToClose() const {
  switch (_own.kind == Kind::Usual ? _starting.kind : _own.kind) {
    case Kind::Simulation:
      return QStringLiteral("End the simulated modem");
    case Kind::Port:
      return QStringLiteral("Leave the port");
    case Kind::Snapshot:
      return QStringLiteral("Close the snapshot");
    case Kind::Usual:
    case Kind::Replay:
      break;
  }
  return QStringLiteral("Close the file");
}

bool Player::hasOwn() const { return _own.kind != Kind::Usual || showsStart(); }

// Most files and a simulation are there at once.
bool Player::showsStart() const {
  return _starting.server && (_starting.kind == Kind::Port || _starting.isSlow);
}

PlayBarState Player::barState() const {
  if (showsStart()) return stateOfStart();
  if (_own.kind == Kind::Snapshot) return stateOfSnapshot();
  if (!_own.whyItEnded) return stateOfStream();
  PlayBarState state{.name = text(printable(_own.name))};
  state.message = text(printable(*_own.whyItEnded));
  state.message[0] = state.message[0].toUpper();
  state.remedy = QStringLiteral("Start again");
  return state;
}

PlayBarState Player::stateOfStart() const {
  const QString name = text(printable(_starting.name));
  PlayBarState state{.name = name};
  state.message = _starting.name == automaticPort ? QStringLiteral("Looking for a modem…")
                                                  : QStringLiteral("Opening %1…").arg(name);
  state.remedy = QStringLiteral("Cancel");
  return state;
}

PlayBarState Player::stateOfSnapshot() const {
  PlayBarState state{.name = text(printable(_own.name))};
  state.place = static_cast<int>(_display);
  state.length = static_cast<int>(_displays.size()) - 1;
  showMoment(state, _displays[_display].time);
  state.progress = QStringLiteral("Display %1 of %2").arg(_display + 1).arg(_displays.size());
  return state;
}

PlayBarState Player::stateOfStream() const {
  const QString name = text(printable(_own.name));
  PlayBarState state{.name = name};
  if (_own.kind == Kind::Port) state.progress = QStringLiteral("Port %1").arg(name);
  if (_own.kind == Kind::Port || !_status) return state;
  state.button = isAtEnd() ? Button::Again : isPaused() ? Button::Play : Button::Pause;
  state.speed = _status->speed;
  const int position = _jump ? _jump->place() : milliseconds(_status->position.value_or(0ms));
  if (_own.kind == Kind::Simulation) {
    state.progress = QStringLiteral("Simulated · %1").arg(duration(position));
    return state;
  }
  state.step = stepOfSlider_ms;
  state.length = milliseconds(_status->length.value_or(0ms));
  state.place = std::min(position, state.length);
  if (_status->time && !_jump) showMoment(state, *_status->time);
  state.progress = isAtEnd() ? QStringLiteral("End · %1").arg(duration(state.length)) : progressAt(position);
  return state;
}

QString Player::progressAt(int place) const {
  if (!_status || !_status->length) return duration(place);
  return QStringLiteral("%1 / %2").arg(duration(place), duration(milliseconds(*_status->length)));
}

void Player::showStartPage() {
  if (!_window || !_window->stack()) return;
  const bool isWanted = _hasLooked && _own.kind == Kind::Usual && !_starting.server &&
                        !_parts.app.hasDisplay() && !_parts.app.isConnected();
  if (isWanted == (_startPage != nullptr)) return;
  if (!isWanted) {
    const bool hadKeyboard = _startPage->isAncestorOf(_window->focusWidget());
    _startPage->hide();
    _startPage->deleteLater();  // one of its buttons may have caused the call
    _startPage.clear();
    if (hadKeyboard) _window->takeKeyboard();
    return;
  }
  TableWidget& table = _window->stack()->topPane().tableWidget();
  _startPage = new StartPage(table);
  _startPage->setModems(simulatedModems());
  _startPage->setPortsSource(ports);
  QObject::connect(_startPage, &StartPage::modemWanted, _startPage,
                   [this](const QString& id) { simulate(id.toStdString()); });
  QObject::connect(_startPage, &StartPage::fileWanted, _startPage, [this] { chooseFile(); });
  QObject::connect(_startPage, &StartPage::portWanted, _startPage,
                   [this](const QString& id) { choosePort(id.toStdString()); });
  _startPage->show();
  if (_window->focusWidget() == &table) _startPage->takeKeyboard();
}

void Player::chooseFile() {
  auto* const dialog = new QFileDialog(_window, QStringLiteral("Open a capture or a snapshot"), _folder);
  dialog->setAttribute(Qt::WA_DeleteOnClose);
  dialog->setFileMode(QFileDialog::ExistingFile);
  QObject::connect(dialog, &QFileDialog::fileSelected, _window, [this](const QString& path) {
    _folder = QFileInfo(path).path();
    open(QFile::encodeName(path).toStdString());
  });
  openWithinScreen(*dialog);
}

void Player::choosePort(const std::string& id) {
  if (!id.empty()) return connectToPort(id);
  auto* const dialog = new QInputDialog(_window);
  dialog->setAttribute(Qt::WA_DeleteOnClose);
  dialog->setWindowTitle(QStringLiteral("Connect to a port"));
  dialog->setLabelText(QStringLiteral("The device of a modem's diagnostic port:"));
  dialog->setTextValue(QStringLiteral("/dev/ttyUSB0"));
  QObject::connect(dialog, &QInputDialog::textValueSelected, _window, [this](const QString& name) {
    if (!name.trimmed().isEmpty()) connectToPort(QFile::encodeName(name.trimmed()).toStdString());
  });
  dialog->open();
}

}  // namespace varnel
