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
  /// The property list of that name (without the extension "plist"), wherever below the resource folder it
  /// lies; absent when there is none or it cannot be read.
  virtual Value propertyList(std::string_view name) const = 0;
  /// Every property-list resource as its path below the resource folder ("LTE.plist"), in name order.
  virtual std::vector<std::string> propertyListPaths() const = 0;
};

}  // namespace varnel
