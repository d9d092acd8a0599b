#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "app/AwaitedUpdates.h"
#include "model/VarnelModel.h"
#include "platform/DeviceFiles.h"

namespace varnel {

/// What the text viewer shows itself on.
class TextOutput {
 public:
  virtual ~TextOutput() = default;
  /// Shows a whole page: a status line and the tree. Each page takes the place of the one before it.
  virtual void show(const std::string& page) = 0;
};

/// The viewer without a window: on every refresh it writes the status line and the whole tree.
class TextViewer final : public VarnelModelObserver {
 public:
  /// Shows the first status and has the model connect once the main queue runs.
  TextViewer(const ModelServices& services, DeviceFiles& files, TextOutput& output);

  /// Calls the task, once, when that many refreshes have been shown.
  void afterUpdates(unsigned count, std::function<void()> task);
  /// Replaces the model by a new one with an empty state.
  void startOver();
  /// Saves a snapshot with an empty description, where the device allows it.
  void save();

  void updateViewControllerFromModel() override;
  void linkWasLost() override;

 private:
  void show(const std::string& status);

  ModelServices _services;
  DeviceFiles& _files;
  TextOutput& _output;
  std::unique_ptr<VarnelModel> _model;
  std::string _tree;  // as it is shown
  AwaitedUpdates _awaitedUpdates;
};

}  // namespace varnel
