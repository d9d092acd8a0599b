#pragma once

#include <filesystem>

#include "platform/Resources.h"

namespace varnel {

/// Property-list resources as files "*.plist" of a folder and the folders below it.
class FileResources final : public Resources {
 public:
  explicit FileResources(std::filesystem::path folder) : _folder(std::move(folder)) {}

  Value propertyList(std::string_view name) const override;
  std::vector<std::string> propertyListPaths() const override;

 private:
  std::filesystem::path fileOf(std::string_view name) const;

  std::filesystem::path _folder;
};

/// Where the application's resources are: the folder that $VARNEL_RESOURCES names; else, for a program that
/// runs from the build tree, the source tree's; else those of the installation that the program is part of.
/// An empty $VARNEL_RESOURCES names none.
std::filesystem::path resourceFolder();

/// The same for programs, which show nothing without it. Throws std::runtime_error, with what to do about it,
/// when the folder is missing or cannot be read.
std::filesystem::path readableResourceFolder();

}  // namespace varnel
