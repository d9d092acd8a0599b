#pragma once

#include "terminal/CellGrid.h"
#include "terminal/Glyphs.h"
#include "terminal/Key.h"

namespace varnel {

/// Something above the panes that takes all keys.
class Overlay {
 public:
  enum class Wish { Stay, Close };
  /// A page stands in the place of the panes and leaves the notice below its first row. A box stands above
  /// the middle of the screen.
  enum class Kind { Page, Box };

  virtual ~Overlay() = default;
  /// The overlay is destroyed after it wished to close.
  virtual Wish take(const Key& key) = 0;
  /// The grid of a page is the screen without the rows of the notice. Mouse keys have its rows too.
  virtual void paint(CellGrid& grid, const Glyphs& glyphs) = 0;
  virtual Kind kind() const { return Kind::Page; }
};

}  // namespace varnel
