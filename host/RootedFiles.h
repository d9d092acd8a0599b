#pragma once

#include <filesystem>

#include "platform/DeviceFiles.h"

namespace varnel {

/// The device's file system in a folder of this machine: its root is put before the device's absolute paths.
class RootedFiles final : public DeviceFiles {
 public:
  explicit RootedFiles(std::filesystem::path root) : _root(std::move(root)) {}

  bool exists(const std::string& path) const override;
  /// The file appears only when it is whole, and only its owner may read it (mode 0600). Characters that XML
  /// cannot hold become U+FFFD.
  FileWriting writePropertyList(const Value& list, const std::string& path) override;

 private:
  std::filesystem::path below(const std::string& path) const;

  std::filesystem::path _root;
};

}  // namespace varnel
