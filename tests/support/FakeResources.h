#pragma once

#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/Resources.h"

namespace varnel {

/// Property lists that ship with a test.
class FakeResources final : public Resources {
 public:
  /// Adds a property list by its path below the resource folder, without the extension: "LTE", "folder/LTE".
  void add(std::string_view path, Value list) { _lists[std::string(path) + ".plist"] = std::move(list); }

  void remove(std::string_view path) { _lists.erase(std::string(path) + ".plist"); }

  Value propertyList(std::string_view name) const override {
    _requests.emplace_back(name);
    const std::string file = std::string(name) + ".plist";
    for (const auto& [path, list] : _lists) {
      if (path.substr(path.rfind('/') + 1) == file) return list;
    }
    return {};
  }

  std::vector<std::string> propertyListPaths() const override {
    std::vector<std::string> paths;
    for (const auto& [path, list] : _lists) paths.push_back(path);
    return paths;
  }

  /// The names that were requested, the oldest first.
  const std::vector<std::string>& requests() const { return _requests; }

 private:
  std::map<std::string, Value> _lists;
  mutable std::vector<std::string> _requests;
};

}  // namespace varnel
