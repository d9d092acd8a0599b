#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "app/AwaitedUpdates.h"
#include "app/DateFormatter.h"
#include "app/EventHistory.h"
#include "app/NoticeKeeper.h"
#include "app/RecordLists.h"
#include "app/RowFacts.h"
#include "app/SaveControl.h"
#include "app/TreeSearch.h"
#include "app/VarnelPaneController.h"
#include "app/VarnelSaveViewController.h"
#include "base/WhileAlive.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"
#include "platform/Preferences.h"
#include "platform/ui/UserInterface.h"

namespace varnel {

/// The application: the window with its stack of panes, the model whose tree they show, and the save screen.
/// It may be launched again after it was ended.
class VarnelApp final : public VarnelModelObserver, public NavigationStackDelegate, public SaveControl {
 public:
  /// What the application needs from its host. Every object in it must outlive the application.
  struct Host {
    ModelServices model;
    DeviceFiles& files;
    Preferences& preferences;
    UserInterface& userInterface;
    /// What users do to start over, as the notice tells them.
    std::string wayToStartOver = "press Ctrl+R";
    /// Gets the numbers of each display; null when nobody shows their courses.
    ValueHistory* history = nullptr;
    /// Gets what each display tells of the phone; null when nobody wants to know. Needs the history.
    EventHistory* events = nullptr;
    /// What to tell of rows beside their texts: levels, summaries, ages. Null when nobody shows that.
    const RowAnswers* answers = nullptr;
    /// What the rows show of their courses; null: those of the history.
    const RowCourses* courses = nullptr;
    /// The clock of the status and of saved snapshots, when that of the model shows the time of a capture;
    /// null: the model's.
    const Clock* usersClock = nullptr;
  };

  explicit VarnelApp(const Host& host);
  VarnelApp(const VarnelApp&) = delete;
  VarnelApp& operator=(const VarnelApp&) = delete;
  ~VarnelApp() override;

  /// Shows the window. The main queue makes the first attempt to connect.
  void applicationDidFinishLaunching();
  /// Resets the shared preference, removes the window from the screen, and closes the link.
  void applicationWillTerminate();
  /// Replaces the model with a new one that has an empty state, and goes back to the root pane. Does nothing
  /// before the launch and after the end.
  void startOver();
  /// The same, but the panes stay. They show what they showed until the new model has a display, and then go
  /// on with it. Those whose sections are missing there are closed. They are opened again when a later
  /// display has their sections, unless the user has gone elsewhere meanwhile.
  void startOverInPlace();
  /// Replaces the model with one that has no link and shows this display, whose numbers have these formats.
  /// The panes stay as with `startOverInPlace`. The status is shown until the next start.
  void showDisplay(const Value& display, std::string status, NumberFormats formats = {});
  /// Shows what has arrived since the last refresh.
  void refresh();
  /// Saves a snapshot with an empty description at once, if the device allows it.
  void save();
  /// Calls the task once, after this many refreshes were shown.
  void afterUpdates(unsigned count, std::function<void()> task);

  /// Called whenever the link or the display may have changed.
  void setObserver(std::function<void()> observer) { _observer = std::move(observer); }
  bool isConnected() const { return _model && _model->isConnected(); }
  bool hasDisplay() const { return _tree != nullptr; }
  /// Calls this after each change of what the panes show: a refresh, and starting over. There may be several.
  void observeDisplay(std::function<void()> observer) { _displayObservers.push_back(std::move(observer)); }

  /// The nodes of the display with these words in names and values (`findNodes`); none while there is no
  /// display.
  std::vector<FoundNode> find(std::string_view words) const;
  /// The node at the end of these names; null when there is none.
  const VarnelModelNode* nodeAt(const NamePath& path) const;
  /// Whether the node under these names is a list of records.
  bool hasRecordsAt(const NamePath& path) const;
  /// These records; nothing when there is no list under these names.
  std::optional<RecordList> recordsAt(const NamePath& path) const;
  /// The technology that the service named last; empty while there is none.
  std::string technology() const { return _model ? _model->technology() : std::string(); }
  /// Opens the panes above this node and selects its row. Does nothing when there is no such node any more.
  void goTo(const NamePath& path);

  /// Checks whether the device allows snapshots.
  void getSaveButtonPref();
  void updateViewControllerFromModel() override;
  void linkWasLost() override;
  void linkWasOpened() override;
  void linkWasLookedAt() override;
  /// Shows the current status in this pane.
  void updateStatusForViewController(VarnelPaneController& pane);
  void navigationController_willShowViewController_animated(NavigationStack& stack,
                                                            PaneController& controller,
                                                            Animation animation) override;
  void showSaveView() override;
  /// Closes the save screen if it is open.
  void closeSaveView();
  void closeSaveViewLater() override;
  void snapshotWasWritten(const FileWriting& writing) override { _notices.snapshotWasWritten(writing); }

  /// Null before the launch and after the end.
  Window* window() const { return _window.get(); }
  void setWindow(std::unique_ptr<Window> window) { _window = std::move(window); }
  /// Null while there is no save screen.
  const std::shared_ptr<VarnelSaveViewController>& saveViewController() const { return _saveViewController; }
  void setSaveViewController(std::shared_ptr<VarnelSaveViewController> controller);
  /// The status while connected; absent before the launch and after the end.
  const std::optional<std::string>& updateMessage() const { return _updateMessage; }
  void setUpdateMessage(std::optional<std::string> message) { _updateMessage = std::move(message); }
  bool allowSaveButton() const override { return _allowSaveButton; }
  void setAllowSaveButton(bool allow) { _allowSaveButton = allow; }

 private:
  void showFirstStatus(VarnelPaneController& root);
  void renewModel();
  void reloadPanes();
  void rememberPanes();
  void reopenPanes();
  void keepNumbers();
  void setFormats(const NumberFormats& formats);
  void showTree(VarnelPaneController::Node root);
  RowFacts::Display display() const;
  void showFactsAgain();
  VarnelPaneController& topPane() const;
  void tellOfDisplay() const;
  void showNotice();
  void showWindowTitle();
  std::string updateMessageForNow() const;
  const Clock& usersClock() const;
  /// Writes the preference that is shared with the home-screen application.
  void _setGSMRSSI(bool value);

  Host _host;
  bool _allowSaveButton = false;
  std::optional<std::string> _updateMessage;
  std::optional<DateFormatter> _dateFormatter;
  AwaitedUpdates _awaitedUpdates;
  std::vector<std::function<void()>> _displayObservers;
  VarnelPaneController::Node _tree;  // the one that the panes show
  RowFacts _facts;
  NoticeKeeper _notices;
  bool _showsFirstStatus = true;
  std::optional<std::string> _statusWithoutLink;  // of a display that was given
  NamePath _panesToReopen;  // the names of those above the root; empty when there are none
  bool _isReopening = false;
  std::function<void()> _observer;
  NumberFormats _formatsWithoutLink;  // of a display that was given
  std::optional<std::string>
      _technologyOfFormats;  // of those that the history has; none while they were given
  std::unique_ptr<VarnelModel> _model;
  std::shared_ptr<VarnelSaveViewController> _saveViewController;
  std::unique_ptr<NavigationStack> _navController;
  std::unique_ptr<Window> _window;
  WhileAlive _whileAlive;
};

}  // namespace varnel
