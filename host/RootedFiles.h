#pragma once

#include <filesystem>

#include "platform/DeviceFiles.h"

namespace varnel {

/// The device's file system as a folder of this machine: the root is put before the device's absolute paths.
class RootedFiles final : public DeviceFiles {
 public:
  explicit RootedFiles(std::filesystem::path root) : _root(std::move(root)) {}

  bool exists(const std::string& path) const override;
  /// The file is whole or not there, and for its owner alone (mode 0600). What XML cannot hold of a text is
  /// U+FFFD in it.
  FileWriting writePropertyList(const Value& list, const std::string& path) override;

 private:
  std::filesystem::path below(const std::string& path) const;

  std::filesystem::path _root;
};

}  // namespace varnel
