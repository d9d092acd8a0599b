#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "base/Value.h"

namespace varnel {

/// The paths of the values that displays have had, to name those that a mistyped one may mean. Paths of
/// hostile captures that are more than a few megabytes long altogether are not kept.
class NearestPaths {
 public:
  void take(const Value& display);

  /// Those that one gets from the path by the fewest edits, or by going on from a section; at most three, the
  /// nearest first. None where more than a third of the path would have to change. As users write them,
  /// without the first slash.
  std::vector<std::string> to(std::string_view path) const;

 private:
  std::set<std::string, std::less<>> _paths;
  std::size_t _size = 0;  // of all paths together
};

}  // namespace varnel
