#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// The result of writing a file.
struct FileWriting {
  std::string place;         ///< the file, by the name under which users of the host find it
  std::string failure;       ///< why there is no new file, as a phrase; empty on success
  bool hasReplaced = false;  ///< an earlier file of this name is gone

  bool isDone() const { return failure.empty(); }
};

/// The device's file system, by the device's own absolute paths.
class DeviceFiles {
 public:
  virtual ~DeviceFiles() = default;
  /// True when a file or a folder stands at the path.
  virtual bool exists(const std::string& path) const = 0;
  /// Writes an XML property list and replaces an existing file. Makes no folder.
  virtual FileWriting writePropertyList(const Value& list, const std::string& path) = 0;
};

}  // namespace varnel
