#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// How the writing of a file went.
struct FileWriting {
  std::string place;         ///< the file, by the name that users of the host find it under
  std::string failure;       ///< why there is no new file, as a phrase; empty when there is one
  bool hasReplaced = false;  ///< a file that had the name is gone

  bool isDone() const { return failure.empty(); }
};

/// The device's file system, by the device's own absolute paths.
class DeviceFiles {
 public:
  virtual ~DeviceFiles() = default;
  /// True when a file or a folder stands at the path.
  virtual bool exists(const std::string& path) const = 0;
  /// Writes an XML property list, which takes the place of a file that is there. No folder is made.
  virtual FileWriting writePropertyList(const Value& list, const std::string& path) = 0;
};

}  // namespace varnel
