#pragma once

#include <sys/types.h>

#include <filesystem>
#include <optional>
#include <string>

namespace varnel {

/// The regular file that a name or an open file stands for, so that two can be compared.
class FileIdentity {
 public:
  /// Links are followed. A file that does not exist yet is known by its folder and its name.
  static FileIdentity ofPath(const std::filesystem::path& path);
  static FileIdentity ofDescriptor(int descriptor);

  /// Whether both are one file. False for anything but regular files: several programs may write to one pipe.
  bool isSameFileAs(const FileIdentity& other) const;

 private:
  struct Node {
    dev_t device;
    ino_t number;
    bool operator==(const Node&) const = default;
  };

  std::optional<Node> _node;  // the file's, or that of the folder in which it would be made
  std::string _newName;       // in that folder; empty for an existing file
};

}  // namespace varnel
