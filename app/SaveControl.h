#pragma once

#include "platform/DeviceFiles.h"

namespace varnel {

/// What panes and the save screen may ask of the application.
class SaveControl {
 public:
  virtual ~SaveControl() = default;
  /// True on the devices on which snapshots may be saved.
  virtual bool allowSaveButton() const = 0;
  /// Opens the save screen, unless it is open.
  virtual void showSaveView() = 0;
  /// Has the main queue close the save screen, once whoever asks for it has returned.
  virtual void closeSaveViewLater() = 0;
  /// The save screen has written a snapshot, or could not.
  virtual void snapshotWasWritten(const FileWriting& writing) = 0;
};

}  // namespace varnel
