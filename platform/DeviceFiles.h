#pragma once

#include <string>

#include "base/Value.h"

namespace varnel {

/// The device's file system, by the device's own absolute paths.
class DeviceFiles {
 public:
  virtual ~DeviceFiles() = default;
  /// True when a file or a folder stands at the path.
  virtual bool exists(const std::string& path) const = 0;
  /// Writes an XML property list, in place of whatever file is there. False when that fails; no folder is
  /// made.
  virtual bool writePropertyList(const Value& list, const std::string& path) = 0;
};

}  // namespace varnel
