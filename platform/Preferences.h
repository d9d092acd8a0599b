#pragma once

#include <string_view>

#include "base/Value.h"

namespace varnel {

/// The application-preferences store, in which each application has a domain. Failures are one line in the
/// log each; no call waits for another program longer than a moment.
class Preferences {
 public:
  virtual ~Preferences() = default;
  /// Sets a key of the domain; on disk it is the same as before until `synchronise`.
  virtual void set(std::string_view domain, std::string_view key, Value value) = 0;
  /// Writes what was set to disk. The domain's other keys stay as they are there.
  virtual void synchronise(std::string_view domain) = 0;
  /// Tells other applications that the key has changed.
  virtual void notifyChanged(std::string_view domain, std::string_view key) = 0;
};

}  // namespace varnel
