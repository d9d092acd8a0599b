#pragma once

#include "platform/DeviceFiles.h"

namespace varnel {

/// What panes and the save screen may ask the application to do.
class SaveControl {
 public:
  virtual ~SaveControl() = default;
  /// True on devices that allow snapshots.
  virtual bool allowSaveButton() const = 0;
  /// Opens the save screen if it is not open.
  virtual void showSaveView() = 0;
  /// Closes the save screen from the main queue, after the caller has returned.
  virtual void closeSaveViewLater() = 0;
  /// The save screen has written a snapshot, or could not write it.
  virtual void snapshotWasWritten(const FileWriting& writing) = 0;
};

}  // namespace varnel
