#pragma once

namespace varnel {

/// Lengths are logical pixels. x grows to the right, y grows downward.
struct Size {
  double width = 0;
  double height = 0;

  friend bool operator==(const Size&, const Size&) = default;
};

struct Rect {
  double x = 0;
  double y = 0;
  double width = 0;
  double height = 0;

  friend bool operator==(const Rect&, const Rect&) = default;
};

}  // namespace varnel
