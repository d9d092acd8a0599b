#pragma once

#include <string>

namespace varnel {

struct Font {
  enum class Weight { Regular, Bold };

  std::string family{};  ///< empty for the system's own; the nearest one when the host lacks it
  double size = 0;       ///< logical pixels
  Weight weight = Weight::Regular;

  static Font system(double size) { return {{}, size, Weight::Regular}; }
  static Font boldSystem(double size) { return {{}, size, Weight::Bold}; }
  static Font named(std::string family, double size) { return {std::move(family), size, Weight::Regular}; }

  friend bool operator==(const Font&, const Font&) = default;
};

}  // namespace varnel
