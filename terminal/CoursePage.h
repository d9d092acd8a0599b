#pragma once

#include <chrono>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "terminal/Overlay.h"

namespace varnel {

/// The course of a value over a stretch of time, in columns of equal length.
struct CourseColumns {
  struct Range {
    double lowest = 0;
    double highest = 0;
  };

  std::string name{};                           ///< what the value is
  std::string unit{};                           ///< empty for a number without one
  std::string summary{};                        ///< one line about the whole stretch
  std::string begin{};                          ///< the time at the left edge
  std::string end{};                            ///< the time at the right edge
  std::vector<std::optional<Range>> columns{};  ///< nothing where there was no value
  unsigned decimals = 0;                        ///< of the numbers at the axis
};

/// Draws the course of a value. + and - change the length of time.
class CoursePage final : public Overlay {
 public:
  /// Yields the course again at each refresh; nothing when the value has gone.
  using Source = std::function<std::optional<CourseColumns>(std::chrono::minutes length, int columns)>;

  explicit CoursePage(Source source) : _source(std::move(source)) {}

  Wish take(const Key& key) override;
  void paint(CellGrid& grid, const Glyphs& glyphs) override;

 private:
  std::chrono::minutes length() const;

  const Source _source;
  std::size_t _length = 1;  // the number of one of the lengths
};

}  // namespace varnel
