#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// The property lists that ship with the application.
class Resources {
 public:
  virtual ~Resources() = default;
  /// The property list of this name (without the extension "plist"), anywhere below the resource folder.
  /// Absent when there is none, or when it cannot be read.
  virtual Value propertyList(std::string_view name) const = 0;
  /// The path of every property-list resource below the resource folder ("LTE.plist"), sorted by name.
  virtual std::vector<std::string> propertyListPaths() const = 0;
};

}  // namespace varnel
