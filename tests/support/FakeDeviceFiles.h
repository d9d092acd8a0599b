#pragma once

#include <set>
#include <string>
#include <vector>

#include "platform/DeviceFiles.h"

namespace varnel {

/// A device whose files exist in memory only.
class FakeDeviceFiles final : public DeviceFiles {
 public:
  struct Write {
    std::string path;
    Value list;
  };

  /// The paths of existing files.
  std::set<std::string> existing;
  bool refusesWrites = false;
  /// Every attempt to write, the oldest first, including refused ones.
  std::vector<Write> writes;

  bool exists(const std::string& path) const override { return existing.contains(path); }
  FileWriting writePropertyList(const Value& list, const std::string& path) override {
    writes.push_back({path, list});
    if (refusesWrites) return {.place = path, .failure = "No space left on device"};
    const bool isThere = !existing.insert(path).second;
    return {.place = path, .failure = {}, .hasReplaced = isThere};
  }
};

}  // namespace varnel
