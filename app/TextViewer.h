#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "app/AwaitedUpdates.h"
#include "app/NoticeKeeper.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// One page of the text viewer.
struct TextPage {
  std::string status{};
  std::string notice{};  ///< lines with a newline between them; empty when there is nothing to tell
  std::string tree{};    ///< lines that each end in a newline

  /// The status line, then each line of the notice after "Notice: ", then the tree.
  std::string text() const;
  friend bool operator==(const TextPage&, const TextPage&) = default;
};

/// Where the text viewer shows its pages.
class TextOutput {
 public:
  virtual ~TextOutput() = default;
  /// Each page replaces the one before.
  virtual void show(const TextPage& page) = 0;
};

/// The viewer without a window. On every refresh, and whenever the status or the notice changes, it writes
/// the status line, the notice, and the whole tree.
class TextViewer final : public VarnelModelObserver {
 public:
  /// Shows the first status. The model connects once the main queue runs. `wayToStartOver` is what users have
  /// to do, such as "press R". `usersClock` is the clock of the status and of snapshots; null: the model's.
  TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output,
             std::string wayToStartOver, const Clock* usersClock = nullptr);

  /// Calls the task once, after this many refreshes were shown.
  void afterUpdates(unsigned count, std::function<void()> task);
  /// Replaces the model with a new one that has an empty state.
  void startOver();
  /// Saves a snapshot with an empty description, if the device allows it.
  void save();

  void updateViewControllerFromModel() override;
  void linkWasLost() override;
  void linkWasOpened() override;
  void linkWasLookedAt() override;

 private:
  void show();
  void showIfNew();

  ModelServices _services;
  DeviceFiles& _files;
  TextOutput& _output;
  const Clock& _usersClock;
  TextPage _page;   // the page to show next
  TextPage _shown;  // the page shown last
  NoticeKeeper _notices;
  std::unique_ptr<VarnelModel> _model;
  std::optional<std::string> _updateMessage;  // the status after the last refresh
  AwaitedUpdates _awaitedUpdates;
};

}  // namespace varnel
