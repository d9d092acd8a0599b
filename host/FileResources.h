#pragma once

#include <filesystem>

#include "platform/Resources.h"

namespace varnel {

/// Property-list resources: the files "*.plist" in a folder and in the folders below it.
class FileResources final : public Resources {
 public:
  explicit FileResources(std::filesystem::path folder) : _folder(std::move(folder)) {}

  Value propertyList(std::string_view name) const override;
  std::vector<std::string> propertyListPaths() const override;

 private:
  std::filesystem::path fileOf(std::string_view name) const;

  std::filesystem::path _folder;
};

/// The folder of the application's resources: the one that $VARNEL_RESOURCES names; else, for a program that
/// runs from the build tree, the folder in the source tree; else the folder of the installation to which the
/// program belongs. An empty $VARNEL_RESOURCES names no folder.
std::filesystem::path resourceFolder();

/// The same for programs that show nothing without resources. Throws std::runtime_error, which says what to
/// do, when the folder is missing or cannot be read.
std::filesystem::path readableResourceFolder();

}  // namespace varnel
