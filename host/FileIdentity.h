#pragma once

#include <sys/types.h>

#include <filesystem>
#include <optional>
#include <string>

namespace varnel {

/// Which regular file a name or an open file stands for, so that two can be held against each other.
class FileIdentity {
 public:
  /// Links are followed. A file that is not there yet is known by its folder and its name.
  static FileIdentity ofPath(const std::filesystem::path& path);
  static FileIdentity ofDescriptor(int descriptor);

  /// Whether both are one file. Never true of what is no regular file: several may write to one pipe.
  bool isSameFileAs(const FileIdentity& other) const;

 private:
  struct Node {
    dev_t device;
    ino_t number;
    bool operator==(const Node&) const = default;
  };

  std::optional<Node> _node;  // of the file, or of the folder that it would be made in
  std::string _newName;       // in that folder; empty for a file that is there
};

}  // namespace varnel
