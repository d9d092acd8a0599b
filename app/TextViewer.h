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

/// What the text viewer shows at a time.
struct TextPage {
  std::string status{};
  std::string notice{};  ///< lines with a newline between them; empty when there is nothing to tell
  std::string tree{};    ///< lines that each end in a newline

  /// The status line, each line of the notice behind "Notice: ", and the tree.
  std::string text() const;
  friend bool operator==(const TextPage&, const TextPage&) = default;
};

/// What the text viewer shows itself on.
class TextOutput {
 public:
  virtual ~TextOutput() = default;
  /// Each page takes the place of the one before it.
  virtual void show(const TextPage& page) = 0;
};

/// The viewer without a window: on every refresh, and whenever status or notice change, it writes the status
/// line, the notice and the whole tree.
class TextViewer final : public VarnelModelObserver {
 public:
  /// Shows the first status and has the model connect once the main queue runs. The way to start over is what
  /// users do for it, as in "press R".
  TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output,
             std::string wayToStartOver);

  /// Calls the task, once, when that many refreshes have been shown.
  void afterUpdates(unsigned count, std::function<void()> task);
  /// Replaces the model by a new one with an empty state.
  void startOver();
  /// Saves a snapshot with an empty description, where the device allows it.
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
  TextPage _page;   // as it is shown next
  TextPage _shown;  // as it was shown last
  NoticeKeeper _notices;
  std::unique_ptr<VarnelModel> _model;
  std::optional<std::string> _updateMessage;  // of the last refresh
  AwaitedUpdates _awaitedUpdates;
};

}  // namespace varnel
