#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// The paths of all values that displays have had. It finds those that a mistyped path may mean. When a
/// hostile capture has more than a few megabytes of paths, the rest is not kept.
class NearestPaths {
 public:
  void take(const Value& display);

  /// The paths that need the fewest edits, and those below the given path if it names a section: at most
  /// three, the nearest first. None if more than a third of the path would have to change. In the form that
  /// users write, without the first slash.
  std::vector<std::string> to(std::string_view path) const;

 private:
  std::set<std::string, std::less<>> _paths;
  std::size_t _size = 0;  // of all paths together
};

/// "did you mean 'A' or 'B'?" of these paths. The other advice when there are none.
std::string adviceOf(const std::vector<std::string>& nearest, std::string_view otherwise);

}  // namespace varnel
