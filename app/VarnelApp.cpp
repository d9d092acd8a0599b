#include "app/VarnelApp.h"

#include <utility>

#include "app/Snapshot.h"
#include "app/Status.h"

namespace varnel {

namespace {

// Kept: no dots, unlike every later status of this kind.
constexpr std::string_view firstStatus = "Connecting";

constexpr std::string_view applicationName = "Varnel";
constexpr std::string_view titleSeparator = " — ";

constexpr std::string_view homeScreenDomain = "com.orvane.dockhall";
constexpr std::string_view signalStrengthKey = "DHShowGSMRSSI";

// Every pane on the stack is of this class: only this file pushes panes.
VarnelPaneController& varnelPane(PaneController& controller) {
  return static_cast<VarnelPaneController&>(controller);
}

}  // namespace

VarnelApp::VarnelApp(const Host& host)
    : _host(host),
      _facts({host.model.generator.clock, host.history, host.answers, host.courses}),
      _notices(host.model, host.wayToStartOver, [this] { showNotice(); }) {}

VarnelApp::~VarnelApp() = default;

void VarnelApp::applicationDidFinishLaunching() {
  getSaveButtonPref();
  setWindow(_host.userInterface.makeWindow(_host.userInterface.screenBounds()));
  _model = std::make_unique<VarnelModel>(_host.model, *this);
  _notices.begin(*_model);
  setUpdateMessage(std::string(notConnectedStatus));
  _dateFormatter.emplace(updateStatusPattern);

  const auto root = std::make_shared<VarnelPaneController>(_host.userInterface, *this, nullptr, "/", &_facts);
  showFirstStatus(*root);
  _navController = _host.userInterface.makeNavigationStack(root);
  _navController->setDelegate(this);
  _window->setRoot(*_navController);
  _window->makeKeyAndVisible();
  showWindowTitle();

  _model->restartMonitorLater();
}

void VarnelApp::showFirstStatus(VarnelPaneController& root) {
  _showsFirstStatus = true;
  root.setStatus_isLoading(firstStatus, true);
}

void VarnelApp::startOver() {
  if (!_model) return;
  closeSaveView();
  setUpdateMessage(std::string(notConnectedStatus));
  renewModel();
  _panesToReopen.clear();
  const auto root = _navController->controllers().front();
  _navController->popTo(*root, Animation::None);
  showTree(nullptr);
  varnelPane(*root).reloadWithNode(nullptr);
  showFirstStatus(varnelPane(*root));
  showNotice();
  showWindowTitle();
  tellOfDisplay();
  _model->restartMonitorLater();
}

void VarnelApp::renewModel() {
  _notices.end();
  if (_host.history) _host.history->clear();
  if (_host.events) _host.events->clear();
  _statusWithoutLink.reset();
  _model.reset();  // only one model at a time can have the log channel
  _model = std::make_unique<VarnelModel>(_host.model, *this);
  _notices.begin(*_model);
}

void VarnelApp::startOverInPlace() {
  if (!_model) return;
  closeSaveView();
  rememberPanes();
  renewModel();
  updateStatusForViewController(topPane());
  showNotice();
  _model->restartMonitorLater();
}

void VarnelApp::showDisplay(const Value& display, std::string status, NumberFormats formats) {
  if (!_model) return;
  closeSaveView();
  rememberPanes();
  renewModel();
  _notices.end();  // there is no link to tell about
  _statusWithoutLink = std::move(status);
  _formatsWithoutLink = std::move(formats);
  _technologyOfFormats.reset();
  setFormats(_formatsWithoutLink);
  showNotice();
  _model->showDisplay(display);
}

void VarnelApp::refresh() {
  if (_model) _model->refresh();
}

void VarnelApp::save() {
  if (!_model) return;
  if (_statusWithoutLink) return _notices.snapshotIsOpen();
  const auto writing = saveSnapshotWithoutDescription(_host.files, usersClock(), _model->getSaveContents());
  if (writing) {
    _notices.snapshotWasWritten(*writing);
  } else {
    _notices.snapshotIsNotAllowed();
  }
}

void VarnelApp::getSaveButtonPref() {
  setAllowSaveButton(_host.files.exists(std::string(internalDeviceMarker)));
}

void VarnelApp::afterUpdates(unsigned count, std::function<void()> task) {
  _awaitedUpdates.await(count, std::move(task));
}

void VarnelApp::updateViewControllerFromModel() {
  keepNumbers();
  reloadPanes();
  if (isConnected()) setUpdateMessage(updateMessageForNow());
  _showsFirstStatus = false;
  updateStatusForViewController(topPane());
  showWindowTitle();
  reopenPanes();
  linkWasLookedAt();
  tellOfDisplay();
  _awaitedUpdates.countOne();
}

void VarnelApp::setFormats(const NumberFormats& formats) {
  if (_host.history) _host.history->setFormats(formats);
  if (_host.answers) _facts.setFormats(formats);
}

void VarnelApp::tellOfDisplay() const {
  for (const auto& observer : _displayObservers) observer();
}

void VarnelApp::linkWasLost() {
  if (_navController) updateStatusForViewController(topPane());
  linkWasLookedAt();
}

void VarnelApp::linkWasOpened() {
  if (!_showsFirstStatus) updateStatusForViewController(topPane());
  showWindowTitle();
  linkWasLookedAt();
}

void VarnelApp::linkWasLookedAt() {
  if (_notices.update()) showNotice();
  showFactsAgain();
  if (_observer) _observer();
}

// Before the panes are reloaded: their rows ask the history for their courses.
void VarnelApp::keepNumbers() {
  if (!_host.history && !_host.answers) return;
  // A display that stands still is that of another generator.
  const bool hasOtherFormats = _technologyOfFormats != _model->technology() && !_model->standingDisplay();
  if (hasOtherFormats && !_statusWithoutLink) {
    _technologyOfFormats = _model->technology();
    setFormats(_model->numberFormats());
  }
  if (!_host.history) return;
  const Time now = _host.model.generator.clock.now();
  _host.history->add(_model->topLevelNodes(), now);
  if (_host.events) {
    const auto whole = _host.history->whole();
    _host.events->look(_model->display(), now, whole.end);
    _host.events->dropBefore(whole.begin);
  }
  _notices.tellOfHistory(_host.history->notice());
}

VarnelPaneController& VarnelApp::topPane() const { return varnelPane(*_navController->topController()); }

void VarnelApp::showNotice() {
  if (_navController) _navController->setNotice(_notices.text());
}

void VarnelApp::showWindowTitle() {
  if (!_window || !_model) return;
  std::string title;
  // The root pane shows no section.
  if (_navController->controllers().size() > 1) title.append(topPane().title()).append(titleSeparator);
  if (!_model->technology().empty()) title.append(_model->technology()).append(titleSeparator);
  _window->setTitle(title.append(applicationName));
}

void VarnelApp::reloadPanes() {
  const auto panes = _navController->controllers();
  showTree(_model->topLevelNodes());
  for (std::size_t i = 0; i < panes.size(); ++i) {
    VarnelPaneController& pane = varnelPane(*panes[i]);
    const auto node = i == 0 ? _tree : _model->nodeAtPath(pane.path());
    if (i > 0 && !node) {
      // Kept: this pane and those above it leave without showing the new tree. Only the panes below show it.
      _isReopening = true;
      _navController->popTo(*panes[i - 1], Animation::Animated);
      _isReopening = false;
      return;
    }
    pane.reloadWithNode(node);
  }
}

void VarnelApp::rememberPanes() {
  // Those that were missing in the display of before are still wanted.
  const auto panes = _navController->controllers();
  if (!_panesToReopen.empty() && panes.size() <= _panesToReopen.size()) return;
  _panesToReopen.clear();
  for (std::size_t i = 1; i < panes.size(); ++i) _panesToReopen.emplace_back(varnelPane(*panes[i]).title());
}

void VarnelApp::reopenPanes() {
  _isReopening = true;
  for (std::size_t depth = _navController->controllers().size() - 1; depth < _panesToReopen.size(); ++depth) {
    const NamePath path(_panesToReopen.begin(),
                        _panesToReopen.begin() + static_cast<std::ptrdiff_t>(depth) + 1);
    const VarnelModelNode* const node = nodeAt(path);
    if (!node || !node->childNodes()) break;
    topPane().openRow(path.back());
  }
  _isReopening = false;
  if (_navController->controllers().size() > _panesToReopen.size()) _panesToReopen.clear();
}

void VarnelApp::showTree(VarnelPaneController::Node root) {
  _tree = std::move(root);
  _facts.follow(_tree, display());
}

// A display that was given is as it is meant to be.
RowFacts::Display VarnelApp::display() const {
  const bool isRenewed = _statusWithoutLink || (isConnected() && !_model->standingDisplay());
  return isRenewed ? RowFacts::Display::Renewed : RowFacts::Display::Standing;
}

void VarnelApp::showFactsAgain() {
  if (!_navController || !_facts.haveChanged(display())) return;
  for (const auto& pane : _navController->controllers()) varnelPane(*pane).showFactsAgain();
}

std::vector<FoundNode> VarnelApp::find(std::string_view words) const {
  return _tree ? findNodes(*_tree, words) : std::vector<FoundNode>();
}

const VarnelModelNode* VarnelApp::nodeAt(const NamePath& path) const {
  return _tree ? nodeUnderNames(*_tree, path) : nullptr;
}

bool VarnelApp::hasRecordsAt(const NamePath& path) const {
  const VarnelModelNode* const node = path.empty() ? nullptr : nodeAt(path);
  return node && isListOfRecords(*node);
}

std::optional<RecordList> VarnelApp::recordsAt(const NamePath& path) const {
  if (!_tree) return std::nullopt;
  if (_statusWithoutLink) return recordsOf(*_tree, path, _formatsWithoutLink);
  return recordsOf(*_tree, path, _model ? _model->numberFormats() : NumberFormats());
}

void VarnelApp::goTo(const NamePath& path) {
  if (path.empty() || !nodeAt(path)) return;
  _navController->popTo(*_navController->controllers().front(), Animation::None);
  for (std::size_t i = 0; i + 1 < path.size(); ++i) topPane().openRow(path[i]);
  topPane().selectRow(path.back());
}

const Clock& VarnelApp::usersClock() const {
  return _host.usersClock ? *_host.usersClock : _host.model.generator.clock;
}

std::string VarnelApp::updateMessageForNow() const {
  const Clock& clock = usersClock();
  const Time now = clock.now();
  return _dateFormatter->string(now, clock.zoneAt(now));
}

void VarnelApp::updateStatusForViewController(VarnelPaneController& pane) {
  if (_statusWithoutLink) {
    pane.setStatus_isLoading(*_statusWithoutLink, false);
  } else if (isConnected()) {
    pane.setStatus_isLoading(_updateMessage, false);
  } else {
    pane.setStatus_isLoading(notConnectedStatus, true);
  }
}

void VarnelApp::navigationController_willShowViewController_animated(NavigationStack&,
                                                                     PaneController& controller, Animation) {
  if (!_isReopening) _panesToReopen.clear();  // the user goes elsewhere
  updateStatusForViewController(varnelPane(controller));
  showWindowTitle();
}

void VarnelApp::showSaveView() {
  if (_saveViewController || !_model) return;
  if (_statusWithoutLink) return _notices.snapshotIsOpen();
  const VarnelSaveViewController::Host host{_host.userInterface, _host.model.generator.resources, _host.files,
                                            usersClock(), *this};
  setSaveViewController(VarnelSaveViewController::initWithSaveHistory(host, _model->getSaveContents()));
  if (!_saveViewController) return;
  _navController->present(_saveViewController, Animation::Animated);
  _notices.snapshotIsWanted();
}

void VarnelApp::closeSaveView() {
  if (!_saveViewController) return;
  _navController->dismiss(Animation::Animated);
  setSaveViewController(nullptr);
}

void VarnelApp::closeSaveViewLater() {
  _host.model.queue.async(_whileAlive([this] { closeSaveView(); }));
}

void VarnelApp::setSaveViewController(std::shared_ptr<VarnelSaveViewController> controller) {
  _saveViewController = std::move(controller);
}

void VarnelApp::applicationWillTerminate() {
  _setGSMRSSI(false);
  _notices.end();
  setUpdateMessage(std::nullopt);
  showTree(nullptr);
  _dateFormatter.reset();
  setSaveViewController(nullptr);
  if (_window) _window->hide();
  setWindow(nullptr);
  _model.reset();
}

void VarnelApp::_setGSMRSSI(bool value) {
  _host.preferences.set(homeScreenDomain, signalStrengthKey, Value::ofBoolean(value));
  _host.preferences.synchronise(homeScreenDomain);
  _host.preferences.notifyChanged(homeScreenDomain, signalStrengthKey);
}

}  // namespace varnel
