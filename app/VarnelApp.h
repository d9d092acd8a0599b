#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "app/AwaitedUpdates.h"
#include "app/DateFormatter.h"
#include "app/NoticeKeeper.h"
#include "app/SaveControl.h"
#include "app/VarnelPaneController.h"
#include "app/VarnelSaveViewController.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"
#include "platform/Preferences.h"
#include "platform/ui/UserInterface.h"

namespace varnel {

/// The application: the window with its stack of panes, the model whose tree they show, and the save screen.
/// It may be launched again after it was ended.
class VarnelApp final : public VarnelModelObserver, public NavigationStackDelegate, public SaveControl {
 public:
  /// What the application may ask of its host. Everything outlives it.
  struct Host {
    ModelServices model;
    DeviceFiles& files;
    Preferences& preferences;
    UserInterface& userInterface;
    /// What users do to start over, as notices tell them.
    std::string wayToStartOver = "press Ctrl+R";
  };

  explicit VarnelApp(const Host& host);
  VarnelApp(const VarnelApp&) = delete;
  VarnelApp& operator=(const VarnelApp&) = delete;
  ~VarnelApp() override;

  /// Shows the window and has the main queue make the first attempt to connect.
  void applicationDidFinishLaunching();
  /// Puts the shared preference back, takes the window off the screen and closes the link.
  void applicationWillTerminate();
  /// Replaces the model by a new one with an empty state, and goes back to the root pane. Nothing happens
  /// before launch and after the end.
  void startOver();
  /// Saves a snapshot with an empty description at once, where the device allows it.
  void save();
  /// Calls the task, once, when that many refreshes have been shown.
  void afterUpdates(unsigned count, std::function<void()> task);

  /// Looks whether the device allows snapshots.
  void getSaveButtonPref();
  void updateViewControllerFromModel() override;
  void linkWasLost() override;
  void linkWasOpened() override;
  void linkWasLookedAt() override;
  /// Shows the present status in that pane.
  void updateStatusForViewController(VarnelPaneController& pane);
  void navigationController_willShowViewController_animated(NavigationStack& stack,
                                                            PaneController& controller,
                                                            Animation animation) override;
  void showSaveView() override;
  /// Closes the save screen, if it is open.
  void closeSaveView();
  void closeSaveViewLater() override;
  void snapshotWasWritten(const FileWriting& writing) override { _notices.snapshotWasWritten(writing); }

  /// Null before launch and after the end.
  Window* window() const { return _window.get(); }
  void setWindow(std::unique_ptr<Window> window) { _window = std::move(window); }
  /// Null while no save screen is shown.
  const std::shared_ptr<VarnelSaveViewController>& saveViewController() const { return _saveViewController; }
  void setSaveViewController(std::shared_ptr<VarnelSaveViewController> controller);
  /// The status while connected; absent before launch and after the end.
  const std::optional<std::string>& updateMessage() const { return _updateMessage; }
  void setUpdateMessage(std::optional<std::string> message) { _updateMessage = std::move(message); }
  bool allowSaveButton() const override { return _allowSaveButton; }
  void setAllowSaveButton(bool allow) { _allowSaveButton = allow; }

 private:
  void showFirstStatus(VarnelPaneController& root);
  bool isConnected() const { return _model && _model->isConnected(); }
  void reloadPanes();
  VarnelPaneController& topPane() const;
  void showNotice();
  void showWindowTitle();
  std::string updateMessageForNow() const;
  /// Writes the preference that is shared with the home-screen application.
  void _setGSMRSSI(bool value);

  Host _host;
  bool _allowSaveButton = false;
  std::optional<std::string> _updateMessage;
  std::optional<DateFormatter> _dateFormatter;
  AwaitedUpdates _awaitedUpdates;
  NoticeKeeper _notices;
  bool _showsFirstStatus = true;
  std::unique_ptr<VarnelModel> _model;
  std::shared_ptr<VarnelSaveViewController> _saveViewController;
  std::unique_ptr<NavigationStack> _navController;
  std::unique_ptr<Window> _window;
  std::shared_ptr<VarnelApp*> _alive;
};

}  // namespace varnel
