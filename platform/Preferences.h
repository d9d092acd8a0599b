#pragma once

#include <string_view>

#include "base/Value.h"

namespace varnel {

/// The store of application preferences, in which each application has a domain. A failure is one line in the
/// log. No call waits long for another program.
class Preferences {
 public:
  virtual ~Preferences() = default;
  /// Sets a key of the domain in memory. Only `synchronise` changes the file.
  virtual void set(std::string_view domain, std::string_view key, Value value) = 0;
  /// Writes the changes to disk. The other keys of the domain stay as they are on disk.
  virtual void synchronise(std::string_view domain) = 0;
  /// Tells other applications that the key has changed.
  virtual void notifyChanged(std::string_view domain, std::string_view key) = 0;
};

}  // namespace varnel
