#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <string>

#include "base/Dictionary.h"
#include "platform/Preferences.h"

namespace varnel {

/// Preferences as property lists, one file per domain, in var/mobile/Library/Preferences under the device
/// root. Announces changes on the D-Bus session bus, if there is one (docs/formats.md).
class FilePreferences final : public Preferences {
 public:
  explicit FilePreferences(std::filesystem::path deviceRoot) : _deviceRoot(std::move(deviceRoot)) {}

  void set(std::string_view domain, std::string_view key, Value value) override;
  /// Makes the folder when it is missing. A new file has mode 0600; an existing file keeps its mode. The file
  /// is replaced whole or not at all. A file that is no property list is not touched.
  void synchronise(std::string_view domain) override;
  void notifyChanged(std::string_view domain, std::string_view key) override;

 private:
  std::filesystem::path _deviceRoot;
  std::map<std::string, Dictionary, std::less<>> _unwritten;  // by domain
};

}  // namespace varnel
